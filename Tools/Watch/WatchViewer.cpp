#include "Tools/Watch/WatchViewer.h"

#include "Model/ChannelNote.h"
#include "Tools/Watch/WatchFrame.h"

#include <unistd.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

constexpr auto tick = 1s;
constexpr int secondsBetweenUpdates = 2; // of the channel's rows

} // namespace

WatchViewer::WatchViewer(const Platform& platform, VentrikModel& model, ChannelPane& tree,
                         int mostErrorLines, std::function<void()> end)
    : _platform(platform),
      _model(model),
      _tree(tree),
      _end(std::move(end)),
      _panes(tree),
      _screen(mostErrorLines, [this] { draw(); }),
      _signals({.resized =
                    [this] {
                        _screen.redrawAll();
                        draw();
                    },
                .stopping = [this] { _screen.leave(); },
                .goingOn =
                    [this] {
                        _screen.enter();
                        draw();
                    }}),
      _input(STDIN_FILENO, QSocketNotifier::Read)
{
    QObject::connect(&_input, &QSocketNotifier::activated, [this] { readKeys(); });
    _model.setChannelCallback([this] { draw(); });
    _ticks = _platform.mainQueue.repeatEvery(tick, [this] {
        _screen.errors().trim();
        updateChannel();
        draw();
    });
    draw();
}

WatchViewer::~WatchViewer()
{
    _model.setChannelCallback({});
}

void WatchViewer::refresh()
{
    _tree.takeDisplay();
    _panes.reload();
    if (_model.isConnected())
        _lastUpdate = _platform.clock.now();
    draw();
}

void WatchViewer::readKeys()
{
    bool quits = _screen.hasEnded();
    for (const KeyPress press : _screen.readKeys()) {
        if (quits)
            break; // what was typed behind it is for nobody
        const auto outcome = _panes.handle(press);
        quits = outcome == WatchPanes::Outcome::Quits;
        if (outcome == WatchPanes::Outcome::TogglesChannel)
            toggleChannel();
    }
    if (!quits)
        return draw();
    _input.setEnabled(false);
    _end();
}

void WatchViewer::toggleChannel()
{
    const bool leadsThere = _tree.toggle(_panes.pane().path);
    _panes.goToRoot();
    _panes.reload();
    if (leadsThere)
        _panes.goToLastOfRoot();
}

// Also while nothing comes; then above all.
void WatchViewer::updateChannel()
{
    if (++_seconds % secondsBetweenUpdates != 0 || !_tree.holds(_panes.pane().path))
        return;
    _tree.update();
    _panes.reload();
}

void WatchViewer::draw()
{
    _wasConnected = _wasConnected || _model.isConnected();
    if (_screen.canDraw())
        _screen.draw(composeFrame(_panes, status(), _screen.size()));
}

// While the channel stands the time of the last refresh is told here; the note tells it otherwise.
WatchStatus WatchViewer::status() const
{
    const ChannelState channel = ChannelState::of(_model);
    const bool isConnected = _model.isConnected();
    WatchStatus result;
    result.technology = _model.technologyName();
    result.state = isConnected ? "connected" : _wasConnected ? "lost" : "waiting for the service";
    if (isConnected && _lastUpdate)
        result.updated = timeOfDay(_platform.clock, *_lastUpdate);
    result.note = channelNote(channel, _platform.clock, _lastUpdate);
    result.reasonForNoData = reasonForNoData(channel);
    return result;
}

} // namespace ventrik

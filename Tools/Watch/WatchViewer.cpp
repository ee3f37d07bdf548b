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

} // namespace

WatchViewer::WatchViewer(const Platform& platform, VentrikModel& model, int mostErrorLines,
                         std::function<void()> end)
    : _platform(platform),
      _model(model),
      _end(std::move(end)),
      _panes(model),
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
    _panes.reload();
    if (_model.isConnected())
        _lastUpdate = _platform.clock.now();
    draw();
}

void WatchViewer::readKeys()
{
    bool quits = _screen.hasEnded();
    for (const KeyPress press : _screen.readKeys())
        quits = quits || _panes.handle(press) == WatchPanes::Outcome::Quits;
    if (!quits)
        return draw();
    _input.setEnabled(false);
    _end();
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

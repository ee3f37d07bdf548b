#include "Tests/Process/HeadlessViewer.h"

#include "Model/TreePrinter.h"
#include "Tests/Process/Program.h"

namespace ventrik
{

std::vector<TimedSystemLog::Time> TimedSystemLog::timesOf(std::string_view start) const
{
    std::vector<Time> times;
    for (std::size_t i = 0; i < lines().size(); ++i)
        if (lines()[i].text.starts_with(start))
            times.push_back(_times[i]);
    return times;
}

void TimedSystemLog::write(int priority, std::string_view text)
{
    _times.push_back(std::chrono::steady_clock::now());
    CapturingSystemLog::write(priority, text);
}

HeadlessViewer::HeadlessViewer(const std::string& runtimeDirectory, RecordsMode records)
    : _ports(runtimeDirectory, _log),
      _model(
          {_mainQueue, _ports, _telephony, _log, _resources, _preferences, _clock},
          [this] {
              if (_model.topLevelNodes())
                  ++_redraws;
          },
          LogGenerator::generatorsReading(records))
{
}

void HeadlessViewer::start()
{
    _mainQueue.async([this] { _model.restartMonitor(); });
}

std::string HeadlessViewer::shown(const std::string& path)
{
    const auto node = _redraws > 0 ? _model.nodeAtPath(path) : nullptr;
    return node && node->value() ? *node->value() : std::string();
}

std::string HeadlessViewer::tree()
{
    refreshNow();
    const auto root = _redraws > 0 ? _model.nodeAtPath("/") : nullptr;
    return root ? printTree(*root) : std::string();
}

bool HeadlessViewer::comesToShow(const std::string& path, const std::string& value)
{
    refreshNow();
    return shown(path) == value;
}

bool HeadlessViewer::comesToShow(const std::string& path)
{
    refreshNow();
    const std::string value = shown(path);
    return !value.empty() && value != "-";
}

PlistArray HeadlessViewer::saveContents() const
{
    const auto contents = _model.getSaveContents();
    return contents && contents->array() ? *contents->array() : PlistArray();
}

std::vector<std::string> HeadlessViewer::errors() const
{
    std::vector<std::string> result;
    for (const std::string& text : _log.texts(LogPriority::error))
        result.push_back(withoutAddresses(text));
    return result;
}

} // namespace ventrik

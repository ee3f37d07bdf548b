#include "Tools/MetricsFile.h"

#include "Files/PrivateFile.h"
#include "LogGenerator/Core/StateKeys.h"
#include "Model/DisplayChanges.h"
#include "Model/DisplayNames.h"
#include "PropertyList/TerminalText.h"

#include <algorithm>
#include <array>
#include <cmath>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr int noIndex = -1;

// Under these names a group or a row of a list tells which cell it is of.
constexpr std::array<std::string_view, 5> cellNames{"Physical Cell ID", "PCI", "PSC",
                                                    "Primary Scrambling Code", "BSIC"};

// Letters and digits in lower case; all else becomes one underscore.
void appendName(std::string& metric, std::string_view name)
{
    for (const char character : name) {
        const bool isUpper = character >= 'A' && character <= 'Z';
        const bool isPlain = isUpper || (character >= 'a' && character <= 'z') ||
                             (character >= '0' && character <= '9');
        if (isPlain)
            metric += isUpper ? static_cast<char>(character - 'A' + 'a') : character;
        else if (!metric.ends_with('_'))
            metric += '_';
    }
    while (metric.ends_with('_'))
        metric.pop_back();
}

std::string metricOf(std::string_view name, std::string_view unit)
{
    std::string metric = "ventrik_";
    appendName(metric, name);
    if (!unit.empty()) {
        metric += '_';
        appendName(metric, unit == "%" ? "percent" : unit);
    }
    return metric;
}

void addLabel(std::string& labels, std::string_view name, std::string_view value)
{
    if (value.empty())
        return;
    std::string line;
    appendTerminalText(line, value);
    labels += fmt::format("{}{}=\"", labels.empty() ? "" : ",", name);
    for (const char character : line) {
        if (character == '"' || character == '\\')
            labels += '\\';
        labels += character;
    }
    labels += '"';
}

std::string_view cellOf(const PlistValue& group)
{
    const PlistDictionary* dictionary = group.dictionary();
    for (const std::string_view name : cellNames)
        if (const PlistValue* cell = dictionary ? dictionary->find(name) : nullptr)
            if (cell->string())
                return *cell->string();
    return {};
}

std::string lineOf(std::string_view metric, std::string_view labels, double number)
{
    return labels.empty() ? fmt::format("{} {}\n", metric, number)
                          : fmt::format("{}{{{}}} {}\n", metric, labels, number);
}

} // namespace

void MetricsFile::useGenerator(const LogGenerator* generator, std::string_view technology)
{
    _generator = generator;
    _technology = technology;
    _state = {};
}

void MetricsFile::messageTaken(Clock::TimePoint, ByteView message, const PlistDictionary& state)
{
    ++_messages;
    _bytes += message.size();
    _state = state;
}

void MetricsFile::addGroup(Metrics& metrics, const PlistValue& group, Keys& keys, int index) const
{
    const auto addEntry = [&](std::string_view key, const PlistValue& value, int itsIndex) {
        keys.push_back(key);
        if (value.string())
            addValue(metrics, group, keys, itsIndex, *value.string());
        else if (value.dictionary() || value.array())
            addGroup(metrics, value, keys, itsIndex);
        keys.pop_back();
    };
    if (const PlistDictionary* dictionary = group.dictionary()) {
        for (const auto& [key, value] : *dictionary) {
            if (key != sortedMarker)
                addEntry(key, value, index);
        }
    } else if (const PlistArray* array = group.array()) {
        for (std::size_t i = 0; i < array->size(); ++i)
            addEntry(fmt::format_int(i).str(), (*array)[i], static_cast<int>(i));
    }
}

void MetricsFile::addValue(Metrics& metrics, const PlistValue& group, const Keys& keys, int index,
                           std::string_view text) const
{
    std::optional<double> number = plainNumber(text);
    std::string_view unit;
    auto place = _generator->cellPlaceAt(_state, keys);
    if (const auto cell = place ? _generator->cellAt(*place) : std::nullopt) {
        number = cell->number();
        unit = cell->field->shown.unit;
    }
    if (!number || !std::isfinite(*number))
        return;
    std::string labels;
    addLabel(labels, "technology", _technology);
    addLabel(labels, "section", _generator->sectionAt(_state, keys));
    addLabel(labels, "cell", cellOf(group));
    if (index != noIndex)
        addLabel(labels, "index", fmt::format_int(index).c_str());
    std::string path;
    for (const std::string_view key : keys)
        joinPath(path, labelOfSortedKey(key));
    addLabel(labels, "path", path);
    const std::string metric = metricOf(labelOfSortedKey(keys.back()), unit);
    metrics[metric].insert_or_assign(labels, *number);
}

std::string MetricsFile::text(const VentrikModel& model) const
{
    Metrics metrics;
    const PlistValue* display = _generator ? _state.find(StateKey::display) : nullptr;
    if (display) {
        Keys keys;
        addGroup(metrics, *display, keys, noIndex);
    }
    const auto addCount = [&](const char* metric, double number) {
        metrics[metric].insert_or_assign({}, number);
    };
    addCount("ventrik_channel_open", model.isConnected() ? 1 : 0);
    addCount("ventrik_channel_opened_total", static_cast<double>(model.timesOpened()));
    addCount("ventrik_channel_messages_total", static_cast<double>(_messages));
    addCount("ventrik_channel_bytes_total", static_cast<double>(_bytes));
    if (const auto time = model.lastMessageTime())
        addCount("ventrik_channel_last_message_seconds",
                 std::chrono::duration<double>(
                     std::chrono::floor<std::chrono::milliseconds>(time->time_since_epoch()))
                     .count());
    std::string text;
    for (const auto& [metric, numbers] : metrics) {
        text +=
            fmt::format("# TYPE {} {}\n", metric, metric.ends_with("_total") ? "counter" : "gauge");
        for (const auto& [labels, number] : numbers)
            text += lineOf(metric, labels, number);
    }
    return text;
}

bool MetricsFile::write(const VentrikModel& model, std::string& error) const
{
    auto file = PrivateFile::createForAll(_path, error);
    if (!file)
        return false;
    file->write(text(model));
    return file->commit(error);
}

} // namespace ventrik

#include "Tools/OptionValues.h"

#include "Platform/SystemLog.h"

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <string_view>
#include <utility>
#include <vector>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

struct LogLevel {
    std::string_view name;
    int priority;
};
constexpr LogLevel logLevels[] = {
    {"debug", LogPriority::debug},   {"info", LogPriority::info},
    {"notice", LogPriority::notice}, {"warning", LogPriority::warning},
    {"error", LogPriority::error},   {"critical", LogPriority::critical},
    {"alert", LogPriority::alert},   {"emergency", LogPriority::emergency}};

// Of a size in bytes, or of a time in seconds.
struct RotationUnit {
    std::string_view name;
    std::uint64_t bytes;
    std::uint64_t seconds;
};
constexpr RotationUnit rotationUnits[] = {{"K", std::uint64_t{1} << 10, 0},
                                          {"M", std::uint64_t{1} << 20, 0},
                                          {"G", std::uint64_t{1} << 30, 0},
                                          {"s", 0, 1},
                                          {"min", 0, 60},
                                          {"h", 0, 3600},
                                          {"d", 0, 86400}};
constexpr std::uint64_t longestTime = 3'000'000'000; // in seconds; it can be counted in ns
constexpr std::uint64_t smallestFile = std::uint64_t{64} << 10;
constexpr std::uint64_t smallestHistory = std::uint64_t{8} << 20;

// "a, b or c"
std::string alternatives(std::vector<std::string> names)
{
    const std::string last = names.back();
    names.pop_back();
    return fmt::format("{} or {}", fmt::join(names, ", "), last);
}

} // namespace

std::string textValue(const std::string& text)
{
    return text;
}

std::uint32_t wholeNumberValue(const std::string& text)
{
    char* end = nullptr;
    errno = 0;
    const unsigned long number = std::strtoul(text.c_str(), &end, 10);
    if (end == text.c_str() || *end != '\0' || errno != 0 || number > UINT32_MAX)
        throw WrongValue(fmt::format("'{}' is no whole number below 2^32", text));
    return static_cast<std::uint32_t>(number);
}

std::uint32_t positiveWholeNumberValue(const std::string& text)
{
    const std::uint32_t number = wholeNumberValue(text);
    if (number == 0)
        throw WrongValue(fmt::format("'{}' is not above 0", text));
    return number;
}

double positiveNumberValue(const std::string& text)
{
    char* end = nullptr;
    const double number = std::strtod(text.c_str(), &end);
    if (end == text.c_str() || *end != '\0' || !std::isfinite(number) || number <= 0)
        throw WrongValue(fmt::format("'{}' is no number above 0", text));
    return number;
}

std::optional<double> speedValue(const std::string& text)
{
    return text == "max" ? std::nullopt : std::optional(positiveNumberValue(text));
}

namespace
{

// Of any size; neither for what is none.
Rotation sizeOrTimeIn(const std::string& text)
{
    std::uint32_t number = 0; // far enough: 2^32 of the largest units
    const char* end = text.data() + text.size();
    const auto [unitStart, error] = std::from_chars(text.data(), end, number);
    const auto* unit =
        std::ranges::find(rotationUnits, std::string_view(unitStart, end), &RotationUnit::name);
    if (error != std::errc() || number == 0 || unit == std::end(rotationUnits))
        return {};
    if (unit->seconds > 0)
        return {std::nullopt, std::chrono::seconds(std::min(number * unit->seconds, longestTime))};
    return {number * unit->bytes, std::nullopt};
}

} // namespace

Rotation rotationValue(const std::string& text)
{
    const Rotation rotation = sizeOrTimeIn(text);
    if (!rotation.size && !rotation.time)
        throw WrongValue(fmt::format("'{}' is no size such as 100M and no time such as 1h", text));
    if (rotation.size && *rotation.size < smallestFile)
        throw WrongValue(fmt::format("'{}' is less than 64K", text));
    return rotation;
}

std::size_t historySizeValue(const std::string& text)
{
    const auto size = sizeOrTimeIn(text).size;
    if (!size)
        throw WrongValue(fmt::format("'{}' is no size such as 64M", text));
    if (*size < smallestHistory)
        throw WrongValue(fmt::format("'{}' is less than 8M", text));
    return *size;
}

std::chrono::nanoseconds historyAgeValue(const std::string& text)
{
    const auto time = sizeOrTimeIn(text).time;
    if (!time)
        throw WrongValue(fmt::format("'{}' is no time such as 24h", text));
    return *time;
}

void addAlert(std::vector<ValueAlert>& alerts, const std::string& text)
{
    AlertReading reading = parseAlert(text);
    if (!reading.alert)
        throw WrongValue(reading.error);
    alerts.push_back(std::move(*reading.alert));
}

void changeBands(QualityBands& bands, const std::string& text)
{
    if (const auto error = bands.change(text))
        throw WrongValue(*error);
}

std::string directoryValue(const std::string& text)
{
    std::error_code error;
    if (!std::filesystem::is_directory(text, error))
        throw WrongValue(fmt::format("'{}' is no directory", text));
    return text;
}

Technology technologyValue(const std::string& text)
{
    const auto technology = technologyNamed(text);
    if (!technology)
        throw WrongValue(fmt::format("there is no technology '{}'", text));
    return *technology;
}

RecordsMode recordsValue(const std::string& text)
{
    const auto mode = recordsModeNamed(text);
    if (!mode)
        throw WrongValue(fmt::format("'{}' is none of base, newer and extended", text));
    return *mode;
}

int logLevelValue(const std::string& text)
{
    const auto* level = std::ranges::find(logLevels, text, &LogLevel::name);
    if (level == std::end(logLevels))
        throw WrongValue(fmt::format("there is no log level '{}'", text));
    return level->priority;
}

std::string technologyNames()
{
    std::vector<std::string> names;
    for (const Technology& technology : technologies())
        names.emplace_back(technology.name);
    return alternatives(std::move(names));
}

std::string recordsNames()
{
    return "base: each by its first layout; newer: by the layout that its version and its size "
           "tell "
           "(default); extended: also those that have no first layout";
}

std::string logLevelNames(int defaultLevel)
{
    std::vector<std::string> names;
    for (const auto& [name, priority] : logLevels)
        names.push_back(fmt::format("{}{}", name, priority == defaultLevel ? " (default)" : ""));
    return alternatives(std::move(names));
}

} // namespace ventrik

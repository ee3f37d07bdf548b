#include "Tools/OptionValues.h"

#include "Platform/SystemLog.h"

#include <algorithm>
#include <cerrno>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <string_view>
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

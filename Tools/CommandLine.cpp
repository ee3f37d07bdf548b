#include "Tools/CommandLine.h"

#include "Platform/Linux/StandardStreams.h"
#include "Platform/SystemLog.h"

#include <algorithm>
#include <cerrno>
#include <cmath>
#include <cstdlib>

#include <fmt/format.h>
#include <getopt.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

constexpr int wrongUsage = 2;

struct LogLevel {
    std::string_view name;
    int priority;
};
constexpr LogLevel logLevels[] = {
    {"emergency", LogPriority::emergency}, {"alert", LogPriority::alert},
    {"critical", LogPriority::critical},   {"error", LogPriority::error},
    {"warning", LogPriority::warning},     {"notice", LogPriority::notice},
    {"info", LogPriority::info},           {"debug", LogPriority::debug}};

} // namespace

CommandLine::CommandLine(std::string_view program, int argc, char** argv)
    : _program(program), _argc(argc), _argv(argv)
{
    opterr = 0;
}

int CommandLine::next(const option* options)
{
    const int letter = getopt_long(_argc, _argv, ":", options, nullptr);
    if (letter == ':')
        refuse(fmt::format("{} needs a value", _argv[optind - 1]));
    if (letter == '?')
        refuse(fmt::format("there is no option '{}'", _argv[optind - 1]));
    _value = optarg;
    return letter;
}

std::vector<std::string> CommandLine::arguments() const
{
    return {_argv + optind, _argv + _argc};
}

void CommandLine::refuse(std::string_view reason) const
{
    complain(_program, fmt::format("{}; see --help", reason));
    std::exit(wrongUsage);
}

void CommandLine::tell(std::string_view text) const
{
    if (writeText(STDOUT_FILENO, text, Patience::Endless))
        std::exit(EXIT_SUCCESS);
    std::exit(tellOutputFailure(_program, "standard output", errno));
}

double CommandLine::positiveNumber(std::string_view option) const
{
    char* end = nullptr;
    const double number = std::strtod(_value, &end);
    if (end == _value || *end != '\0' || !std::isfinite(number) || number <= 0)
        refuse(fmt::format("{} takes a number above 0, not '{}'", option, _value));
    return number;
}

int CommandLine::logLevel() const
{
    const auto* level = std::ranges::find(logLevels, std::string_view(_value), &LogLevel::name);
    if (level == std::end(logLevels))
        refuse(fmt::format("there is no log level '{}'", _value));
    return level->priority;
}

} // namespace ventrik

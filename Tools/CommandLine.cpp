#include "Tools/CommandLine.h"

#include <cmath>
#include <cstdlib>

#include <fmt/format.h>
#include <getopt.h>

namespace ventrik
{

namespace
{

constexpr int wrongUsage = 2;

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
    fmt::print(stderr, "{}: {}; see --help\n", _program, reason);
    std::exit(wrongUsage);
}

double CommandLine::positiveNumber(std::string_view option) const
{
    char* end = nullptr;
    const double number = std::strtod(_value, &end);
    if (end == _value || *end != '\0' || !std::isfinite(number) || number <= 0)
        refuse(fmt::format("{} takes a number above 0, not '{}'", option, _value));
    return number;
}

void tell(std::string_view text)
{
    fmt::print("{}", text);
    std::exit(EXIT_SUCCESS);
}

} // namespace ventrik

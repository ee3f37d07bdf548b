#pragma once

#include <string>
#include <string_view>
#include <vector>

struct option;

namespace ventrik
{

/// Walks over a program's options (getopt_long's table) and refuses what is wrong in one line on
/// standard error, with exit status 2.
class CommandLine
{
  public:
    CommandLine(std::string_view program, int argc, char** argv);

    /// The next option's letter, or -1 after the last; `value` is then its value.
    int next(const option* options);
    const char* value() const { return _value; }
    /// What stands behind the options.
    std::vector<std::string> arguments() const;

    [[noreturn]] void refuse(std::string_view reason) const;
    /// Prints to standard output and ends the program, with success where that takes it: for --help
    /// and --version.
    [[noreturn]] void tell(std::string_view text) const;
    /// A positive number; anything else is refused under the option's name.
    double positiveNumber(std::string_view option) const;
    /// The priority (see LogPriority) whose name the value is; anything else is refused.
    int logLevel() const;

  private:
    std::string_view _program;
    int _argc;
    char** _argv;
    const char* _value = nullptr;
};

} // namespace ventrik

#pragma once

#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace ventrik
{

/// A program's options, each declared once: its name, its help, its check and where it goes. What
/// is wrong is refused in one line on standard error, with exit status 2.
///
/// An option that is given again is checked each time, and its last value counts.
class CommandLine
{
  public:
    /// Takes the value of an option; throws WrongValue for one that is no good.
    using Take = std::function<void(const std::string& value)>;

    CommandLine(std::string program, std::string purpose);
    ~CommandLine();
    CommandLine(const CommandLine&) = delete;
    CommandLine& operator=(const CommandLine&) = delete;

    /// What usage shows behind the program's name, once for each way to use it; where there is
    /// none, "[OPTION]..." and the argument.
    void addUsage(std::string_view form);
    /// The help's heading for what is declared from then on; "Options" before.
    void beginGroup(std::string heading);
    void addFlag(std::string name, std::string help, std::function<void()> take);
    void addFlag(std::string name, std::string help, bool& target);
    /// The name and the value's name in one, as in "--seed N".
    void addOption(std::string_view nameAndValue, std::string help, Take take);
    /// `read` makes the target's value of the text, see OptionValues.h.
    template <typename Target, typename Read>
    void addOption(std::string_view nameAndValue, std::string help, Target& target, Read read)
    {
        addOption(nameAndValue, std::move(help),
                  [&target, read](const std::string& value) { target = read(value); });
    }
    /// The one argument, which must be there.
    void addArgument(std::string name, std::string help, std::string& target);
    enum class Arguments { AtLeastOne, Any };
    void addArguments(std::string name, std::string help, std::vector<std::string>& target,
                      Arguments count = Arguments::AtLeastOne);
    /// A flag that has the text told, as --help does, in the place of all else.
    void addInformation(std::string name, std::string help, std::string text);
    /// --log-level and --verbose, with their present values as the defaults. The level's help says
    /// which lines it is about.
    void addLogOptions(std::string_view lines, int& level, std::string verboseHelp, bool& verbose);
    /// For the help; 2, wrong usage, is there already.
    void addExitStatus(int status, std::string_view meaning);

    /// Gives every option its value. Ends the program for --help and --version (which go to
    /// standard output, with success where that takes them) and for wrong usage.
    void parse(int argc, char** argv);
    bool has(const std::string& option) const;
    [[noreturn]] void refuse(std::string_view reason) const;

  private:
    struct Parser; // keeps the library's header, which takes long to read, out of the programs
    std::unique_ptr<Parser> _parser;
};

} // namespace ventrik

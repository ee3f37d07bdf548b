#include "Tools/CommandLine.h"

#include "Platform/Linux/StandardStreams.h"
#include "Tools/OptionValues.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <span>
#include <sstream>
#include <vector>

#include <CLI/CLI.hpp>
#include <fmt/format.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

constexpr int wrongUsage = 2;
constexpr std::size_t lineWidth = 80;
constexpr std::size_t helpColumn = 28; // behind the longest option

// Breaks the text at spaces into lines of that width; an indentation is up to the caller.
std::string wrapped(std::string_view text, std::size_t width)
{
    std::string result;
    std::size_t column = 0;
    for (const std::string& word : CLI::detail::split(std::string(text), ' ')) {
        const bool fits = column + 1 + word.size() <= width;
        if (column > 0)
            result += fits ? ' ' : '\n';
        column = (column > 0 && fits ? column + 1 : 0) + word.size();
        result += word;
    }
    return result;
}

// The help of all programs; man pages are made of it as well, which see a form of usage behind
// "or:" and a section in a heading with a colon.
class HelpText : public CLI::Formatter
{
  public:
    HelpText()
    {
        column_width(helpColumn);
        label("Positionals", "Arguments");
        label("REQUIRED", ""); // usage shows that
    }
    void addUsage(std::string_view form) { _forms.emplace_back(form); }
    void addExitStatus(int status, std::string_view meaning)
    {
        _exitStatuses += row(std::to_string(status), meaning);
    }

    std::string make_help(const CLI::App* app, std::string, CLI::AppFormatMode mode) const override
    {
        const std::string text =
            make_usage(app, app->get_name()) + "\n" + wrapped(app->get_description(), lineWidth) +
            "\n" + make_positionals(app) + make_groups(app, mode) + "\nExit status:\n" +
            _exitStatuses + row(std::to_string(wrongUsage), "wrong usage") +
            row("141", "the reader of what it prints has gone");
        return CLI::detail::find_and_replace(text, "\n\n\n", "\n\n");
    }
    std::string make_usage(const CLI::App* app, std::string name) const override
    {
        std::string text;
        for (const std::string& form : _forms.empty() ? usualForm(*app) : _forms)
            text += fmt::format("{} {} {}\n", text.empty() ? "Usage:" : "  or: ", name, form);
        return text;
    }
    std::string make_option_desc(const CLI::Option* option) const override
    {
        return wrapped(option->get_description(), lineWidth - helpColumn);
    }

  private:
    static std::vector<std::string> usualForm(const CLI::App& app)
    {
        std::string form = "[OPTION]...";
        for (const CLI::Option* option : app.get_options())
            if (option->get_positional())
                form += " " + option->get_name(true);
        return {form};
    }
    static std::string row(std::string name, std::string_view text)
    {
        constexpr std::size_t indentation = 7;
        std::ostringstream line;
        CLI::detail::format_help(line, std::move(name), wrapped(text, lineWidth - indentation),
                                 indentation);
        return line.str();
    }

    std::vector<std::string> _forms;
    std::string _exitStatuses;
};

[[noreturn]] void tell(std::string_view program, std::string_view text)
{
    if (writeText(STDOUT_FILENO, text, Patience::Endless))
        std::exit(EXIT_SUCCESS);
    std::exit(tellOutputFailure(program, "standard output", errno));
}

bool takesValue(const CLI::Option& option)
{
    return option.get_items_expected_max() > 0;
}

[[noreturn]] void refuseArgument(std::string reason)
{
    throw CLI::ParseError(std::move(reason), CLI::ExitCodes::ArgumentMismatch);
}

// The arguments with each "--option=value" as two: the library would miss an empty value, and let a
// flag have one.
std::vector<std::string> separated(const CLI::App& app, std::span<char* const> arguments)
{
    std::vector<std::string> result;
    bool isValue = false;
    bool isBehindOptions = false;
    for (const std::string argument : arguments) {
        const std::size_t equals = argument.find('=');
        const std::string name = argument.substr(0, equals);
        const bool mayBeOption = !isValue && !isBehindOptions && name.starts_with("--");
        const CLI::Option* option = mayBeOption ? app.get_option_no_throw(name) : nullptr;
        const bool hasValue = option && equals != std::string::npos;
        if (hasValue && !takesValue(*option))
            refuseArgument(fmt::format("{} takes no value", name));
        isBehindOptions |= !isValue && argument == "--";
        isValue = option && !hasValue && takesValue(*option);
        result.push_back(hasValue ? name : argument);
        if (hasValue)
            result.push_back(argument.substr(equals + 1));
    }
    if (isValue)
        refuseArgument(fmt::format("{} needs a value", result.back()));
    return result;
}

// What is wrong with arguments that nobody takes; "--" among them has ended the options.
std::string reasonOfExtras(const std::vector<std::string>& extras)
{
    const auto first = std::ranges::find_if(extras, [](const auto& text) { return text != "--"; });
    const bool isOption = first == extras.begin() && first->starts_with("-");
    return fmt::format("{} '{}'{}", isOption ? "there is no option" : "what is", *first,
                       isOption ? "" : "?");
}

} // namespace

struct CommandLine::Parser {
    Parser(std::string program, std::string purpose) : app(std::move(purpose), std::move(program))
    {
        app.formatter(help);
        app.set_help_flag();
    }

    CLI::Option* add(std::string name, std::string text, Take take)
    {
        auto takeEach = [name, take = std::move(take)](const CLI::results_t& values) {
            try {
                std::ranges::for_each(values, take);
            } catch (const WrongValue& error) {
                throw CLI::ValidationError(name, error.what());
            }
            return true;
        };
        return app.add_option(name, std::move(takeEach), std::move(text))
            ->group(group)
            ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
    }

    CLI::App app;
    std::shared_ptr<HelpText> help = std::make_shared<HelpText>();
    std::string group = "Options";
};

CommandLine::CommandLine(std::string program, std::string purpose)
    : _parser(std::make_unique<Parser>(std::move(program), std::move(purpose)))
{
}

CommandLine::~CommandLine() = default;

void CommandLine::addUsage(std::string_view form)
{
    _parser->help->addUsage(form);
}

void CommandLine::beginGroup(std::string heading)
{
    _parser->group = std::move(heading);
}

void CommandLine::addFlag(std::string name, std::string help, std::function<void()> take)
{
    _parser->app.add_flag_callback(std::move(name), std::move(take), std::move(help))
        ->group(_parser->group);
}

void CommandLine::addFlag(std::string name, std::string help, bool& target)
{
    addFlag(std::move(name), std::move(help), [&target] { target = true; });
}

void CommandLine::addOption(std::string_view nameAndValue, std::string help, Take take)
{
    const std::size_t space = nameAndValue.find(' ');
    _parser->add(std::string(nameAndValue.substr(0, space)), std::move(help), std::move(take))
        ->type_name(std::string(nameAndValue.substr(space + 1)));
}

void CommandLine::addArgument(std::string name, std::string help, std::string& target)
{
    _parser->add(std::move(name), std::move(help), [&target](const auto& value) { target = value; })
        ->type_name("")
        ->required();
}

void CommandLine::addArguments(std::string name, std::string help, std::vector<std::string>& target,
                               Arguments count)
{
    _parser
        ->add(std::move(name), std::move(help),
              [&target](const auto& value) { target.push_back(value); })
        ->expected(-1)
        ->type_name("")
        ->required(count == Arguments::AtLeastOne);
}

void CommandLine::addInformation(std::string name, std::string help, std::string text)
{
    _parser->app
        .add_flag_callback(
            std::move(name),
            [this, text = std::move(text)] { tell(_parser->app.get_name(), text); },
            std::move(help))
        ->group("Information");
}

void CommandLine::addLogOptions(std::string_view lines, int& level, std::string verboseHelp,
                                bool& verbose)
{
    beginGroup("Log");
    addOption("--log-level LEVEL",
              fmt::format("the least urgent lines that {}: {}", lines, logLevelNames(level)), level,
              logLevelValue);
    addFlag("--verbose", std::move(verboseHelp), verbose);
}

void CommandLine::addExitStatus(int status, std::string_view meaning)
{
    _parser->help->addExitStatus(status, meaning);
}

void CommandLine::parse(int argc, char** argv)
{
    CLI::App& app = _parser->app;
    const std::string program = app.get_name();
    app.option_defaults()->group("Information");
    app.set_help_flag("--help", "tells the options");
    app.set_version_flag("--version", program + " " VENTRIK_VERSION, "tells the version");
    try {
        // A program may be started without even its own name.
        auto arguments = separated(app, std::span(argv + std::min(argc, 1), argv + argc));
        std::ranges::reverse(arguments); // the library takes them from the end
        app.parse(arguments);
    } catch (const CLI::CallForHelp&) {
        tell(program, app.help());
    } catch (const CLI::CallForVersion& version) {
        tell(program, std::string(version.what()) + "\n");
    } catch (const CLI::ExtrasError&) {
        refuse(reasonOfExtras(app.remaining()));
    } catch (const CLI::ParseError& error) {
        refuse(error.what());
    }
}

bool CommandLine::has(const std::string& option) const
{
    return _parser->app.count(option) > 0;
}

void CommandLine::refuse(std::string_view reason) const
{
    complain(_parser->app.get_name(), fmt::format("{}; see --help", reason));
    std::exit(wrongUsage);
}

} // namespace ventrik

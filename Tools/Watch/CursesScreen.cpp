#include "Tools/Watch/CursesScreen.h"

#include "PropertyList/Utf8.h"

#include <algorithm>
#include <array>
#include <clocale>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <stdexcept>

#include <fcntl.h>
#include <fmt/format.h>
#include <langinfo.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <sys/mman.h>
#include <unistd.h>

#define NCURSES_NOMACROS
#include <curses.h>
#include <term.h>
#undef columns
#undef lines

namespace ventrik
{

namespace
{

constexpr int escapeDelay = 50; // milliseconds after which an Escape is the key of that name
constexpr int mostKeysAtOnce = 256;

// All texts of ours are UTF-8, as all that is printed.
void useUtf8()
{
    std::setlocale(LC_CTYPE, "");
    if (std::strcmp(nl_langinfo(CODESET), "UTF-8") != 0)
        std::setlocale(LC_CTYPE, "C.UTF-8");
}

/// Keeps the signals' actions as they are: the library's own would draw and end the process.
class SignalActions
{
  public:
    SignalActions()
    {
        for (std::size_t place = 0; place < numbers.size(); ++place)
            sigaction(numbers[place], nullptr, &_actions[place]);
    }
    ~SignalActions()
    {
        for (std::size_t place = 0; place < numbers.size(); ++place)
            sigaction(numbers[place], &_actions[place], nullptr);
    }
    SignalActions(const SignalActions&) = delete;
    SignalActions& operator=(const SignalActions&) = delete;

  private:
    static constexpr std::array numbers{SIGINT, SIGTERM, SIGTSTP, SIGWINCH};
    std::array<struct sigaction, numbers.size()> _actions = {};
};

std::wstring wide(std::string_view text)
{
    std::wstring result;
    while (!text.empty()) {
        const Utf8Character character = decodeUtf8(text);
        result += static_cast<wchar_t>(character.code);
        text.remove_prefix(std::max<std::size_t>(character.length, 1));
    }
    return result;
}

std::string capability(const char* name)
{
    const char* text = tigetstr(name);
    return text && text != reinterpret_cast<const char*>(-1) ? text : "";
}

// Where a terminal has no other screen, ours is wiped off.
bool hasOtherScreen()
{
    return !capability("rmcup").empty();
}

// What only delays, as "$<2>", is for the library.
std::string withoutDelays(std::string text)
{
    for (std::size_t start = 0; (start = text.find("$<", start)) != std::string::npos;) {
        const std::size_t end = text.find('>', start);
        if (end == std::string::npos)
            break;
        text.erase(start, end - start + 1);
    }
    return text;
}

std::string restoringSequence()
{
    return withoutDelays(capability("rmkx") + capability("sgr0") + capability("op") +
                         capability("cnorm") + capability(hasOtherScreen() ? "rmcup" : "clear"));
}

attr_t attributesOf(const FramePart& part)
{
    const attr_t selection = part.isSelected ? A_REVERSE : A_NORMAL;
    switch (part.ink) {
    case Ink::Bar:
        return A_REVERSE;
    case Ink::Title:
    case Ink::Changed:
    case Ink::Doubt:
    case Ink::Lead:
        return selection | A_BOLD;
    case Ink::Quiet:
        return selection | A_DIM;
    default:
        return selection;
    }
}

// The colors only stress what is told without them.
short colorPairOf(const FramePart& part)
{
    if (part.ink == Ink::Doubt || part.ink == Ink::Notice)
        return 1;
    return part.ink == Ink::Changed ? 2 : 0;
}

void useColors()
{
    const char* unwanted = std::getenv("NO_COLOR");
    if ((unwanted && *unwanted) || !has_colors())
        return;
    start_color();
    use_default_colors();
    init_pair(1, COLOR_YELLOW, -1);
    init_pair(2, COLOR_CYAN, -1);
}

KeyPress::Key keyOf(int code)
{
    using Key = KeyPress::Key;
    switch (code) {
    case KEY_UP:
        return Key::Up;
    case KEY_DOWN:
        return Key::Down;
    case KEY_LEFT:
        return Key::Left;
    case KEY_RIGHT:
        return Key::Right;
    case KEY_PPAGE:
        return Key::PageUp;
    case KEY_NPAGE:
        return Key::PageDown;
    case KEY_HOME:
        return Key::Home;
    case KEY_END:
        return Key::End;
    case KEY_ENTER:
        return Key::Enter;
    case KEY_BACKSPACE:
        return Key::Backspace;
    default:
        return Key::Character;
    }
}

KeyPress pressOf(wint_t character)
{
    using Key = KeyPress::Key;
    switch (character) {
    case '\r':
    case '\n':
        return {Key::Enter};
    case '\b':
    case 0x7f:
        return {Key::Backspace};
    case 0x1b:
        return {Key::Escape};
    default:
        return {Key::Character, static_cast<char32_t>(character)};
    }
}

// Why the terminal cannot be a screen; empty when it can.
std::string reasonAgainst()
{
    const char* name = std::getenv("TERM");
    if (!name || !*name)
        return "TERM is not set, so the terminal's kind is not known";
    int status = 0;
    if (setupterm(nullptr, STDOUT_FILENO, &status) != OK)
        return fmt::format("the terminal's kind is not known (TERM={})", name);
    const bool canPlaceText = !capability("cup").empty() && !capability("clear").empty();
    del_curterm(cur_term);
    return canPlaceText ? std::string()
                        : fmt::format("the terminal cannot place text (TERM={})", name);
}

} // namespace

/// The library's screen. It is set up on the terminal, and from then on draws into memory: its own
/// writing would wait for a terminal that takes nothing.
struct CursesScreen::Curses {
    Curses() : drawing(memfd_create("ventrik-screen", MFD_CLOEXEC))
    {
        output = fdopen(fcntl(STDOUT_FILENO, F_DUPFD_CLOEXEC, STDERR_FILENO + 1), "w");
        const SignalActions actions;
        screen = output ? newterm(nullptr, output, stdin) : nullptr;
        if (!screen || !drawing.isOpen())
            throw std::runtime_error("the terminal's screen cannot be set up");
        cbreak();
        noecho();
        nonl();
        set_escdelay(escapeDelay);
        typeahead(-1);
        useColors();
        // Reading from a window of its own draws nothing by itself.
        keys = newpad(1, 1);
        keypad(keys, TRUE);
        nodelay(keys, TRUE);
    }
    ~Curses()
    {
        if (keys)
            delwin(keys);
        if (screen)
            delscreen(screen);
        if (output)
            std::fclose(output);
    }
    Curses(const Curses&) = delete;
    Curses& operator=(const Curses&) = delete;

    void drawIntoMemory() { dup3(drawing.get(), fileno(output), O_CLOEXEC); }
    std::string takeDrawing()
    {
        std::string bytes(static_cast<std::size_t>(lseek(drawing.get(), 0, SEEK_CUR)), '\0');
        const ssize_t size = pread(drawing.get(), bytes.data(), bytes.size(), 0);
        bytes.resize(static_cast<std::size_t>(std::max<ssize_t>(size, 0)));
        lseek(drawing.get(), 0, SEEK_SET);
        return ftruncate(drawing.get(), 0) == 0 ? bytes : std::string();
    }

    FileDescriptor drawing;
    FILE* output = nullptr;
    SCREEN* screen = nullptr;
    WINDOW* keys = nullptr;
};

CursesScreen::CursesScreen(int mostErrorLines, std::function<void()> ready)
    : _errors(mostErrorLines), _output(STDOUT_FILENO, std::move(ready))
{
    if (const std::string reason = reasonAgainst(); !reason.empty())
        throw std::runtime_error(reason);
    useUtf8();
    tcgetattr(STDIN_FILENO, &_former);
    _curses = std::make_unique<Curses>();
    tcgetattr(STDIN_FILENO, &_own);
    _rescue.emplace(_output.descriptor(), _former, restoringSequence(), _errors);
    _curses->drawIntoMemory();
    sizeUp();
}

CursesScreen::~CursesScreen()
{
    leave();
    _rescue.reset();
}

void CursesScreen::leave()
{
    if (!std::exchange(_isShown, false))
        return;
    if (!hasOtherScreen()) {
        wclear(stdscr);
        wrefresh(stdscr);
    }
    endwin();
    send();
    _output.finish();
    tcsetattr(STDIN_FILENO, TCSANOW, &_former);
    _rescue->setShown(false);
}

void CursesScreen::enter()
{
    _isShown = true;
    _rescue->setShown(true);
    tcsetattr(STDIN_FILENO, TCSANOW, &_own);
    sizeUp();
    keypad(_curses->keys, TRUE);
    redrawAll();
}

ScreenSize CursesScreen::size() const
{
    winsize size = {};
    if (ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) != 0 || size.ws_col == 0 || size.ws_row == 0)
        return {};
    return {size.ws_col, size.ws_row};
}

void CursesScreen::sizeUp()
{
    const ScreenSize now = size();
    if (is_term_resized(now.lines, now.columns))
        resizeterm(now.lines, now.columns);
}

void CursesScreen::redrawAll()
{
    sizeUp();
    clearok(curscr, TRUE);
    _drawn.reset();
}

void CursesScreen::draw(const WatchFrame& frame)
{
    if (!_isShown || _drawn == frame)
        return;
    werase(stdscr);
    for (std::size_t line = 0; line < frame.lines.size(); ++line)
        for (const FramePart& part : frame.lines[line]) {
            wattr_set(stdscr, attributesOf(part), colorPairOf(part), nullptr);
            mvwaddwstr(stdscr, static_cast<int>(line), part.column, wide(part.text).c_str());
        }
    wattr_set(stdscr, A_NORMAL, 0, nullptr);
    curs_set(frame.cursorColumn ? 1 : 0);
    wmove(stdscr, frame.size.lines - 1, frame.cursorColumn.value_or(0));
    wnoutrefresh(stdscr);
    doupdate();
    send();
    _drawn = frame;
}

void CursesScreen::send()
{
    _output.add(_curses->takeDrawing());
}

std::vector<KeyPress> CursesScreen::readKeys()
{
    std::vector<KeyPress> presses;
    for (int count = 0; count < mostKeysAtOnce; ++count) {
        wint_t character = 0;
        const int kind = wget_wch(_curses->keys, &character);
        if (kind == ERR)
            break;
        constexpr wint_t controlL = 0x0c;
        if (kind != KEY_CODE_YES && character == controlL)
            redrawAll();
        else if (kind != KEY_CODE_YES)
            presses.push_back(pressOf(character));
        else if (const auto key = keyOf(static_cast<int>(character));
                 key != KeyPress::Key::Character)
            presses.push_back({key});
    }
    return presses;
}

bool CursesScreen::hasEnded() const
{
    pollfd place{STDIN_FILENO, POLLIN, 0};
    return poll(&place, 1, 0) > 0 && (place.revents & (POLLHUP | POLLERR | POLLNVAL)) != 0;
}

} // namespace ventrik

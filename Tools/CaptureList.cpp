#include "Tools/CaptureList.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <system_error>
#include <utility>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

namespace fs = std::filesystem;

// Longer ones are none.
constexpr std::size_t maximumNameSize = 65536;

bool isDirectory(const std::string& name)
{
    std::error_code error;
    return fs::is_directory(name, error);
}

bool isHidden(const fs::path& path)
{
    return path.filename().native().starts_with('.');
}

} // namespace

void CaptureList::Closer::operator()(std::FILE* stream) const
{
    if (stream != stdin)
        std::fclose(stream);
}

CaptureList::CaptureList(std::vector<std::string> captures, std::vector<std::string> lists)
    : _captures(std::move(captures)), _lists(std::move(lists))
{
    _isSingle = _lists.empty() && _captures.size() == 1 && !isDirectory(_captures.front());
    std::ranges::reverse(_captures);
    std::ranges::reverse(_lists);
}

std::optional<std::string> CaptureList::next()
{
    for (;;) {
        const bool isNamed = _pending.empty();
        if (isNamed)
            tellEmptyDirectory();
        auto name = nextName();
        if (!name || !isDirectory(*name)) {
            _directory.reset();
            return name;
        }
        if (isNamed)
            _directory = *name;
        enter(*name);
    }
}

void CaptureList::tellEmptyDirectory()
{
    if (_directory)
        _errors.push_back(fmt::format("{}: there are no captures in it", *_directory));
    _directory.reset();
}

std::optional<std::string> CaptureList::nextName()
{
    for (std::vector<std::string>* names : {&_pending, &_captures})
        if (!names->empty()) {
            std::string name = std::move(names->back());
            names->pop_back();
            return name;
        }
    return nextLine();
}

std::optional<std::string> CaptureList::nextLine()
{
    while (_list || openNextList()) {
        std::string line;
        int character = 0;
        while ((character = std::getc(_list.get())) != EOF && character != '\n')
            if (line.size() < maximumNameSize)
                line += static_cast<char>(character);
        if (!line.empty())
            return line;
        if (character == EOF)
            _list.reset();
    }
    return std::nullopt;
}

bool CaptureList::openNextList()
{
    while (!_list && !_lists.empty()) {
        const std::string name = std::move(_lists.back());
        _lists.pop_back();
        _list.reset(name == "-" ? stdin : std::fopen(name.c_str(), "re"));
        if (!_list)
            _errors.push_back(fmt::format("{}: {}", name, std::strerror(errno)));
    }
    return _list != nullptr;
}

void CaptureList::enter(const std::string& directory)
{
    std::error_code error;
    std::vector<std::string> names;
    for (fs::directory_iterator entry(directory, error), end; !error && entry != end;
         entry.increment(error)) {
        std::error_code none;
        // A link to a directory may lead back.
        const bool isLinkedDirectory =
            entry->is_symlink(none) && fs::is_directory(entry->path(), none);
        if (!isHidden(entry->path()) && !isLinkedDirectory)
            names.push_back(entry->path().native());
    }
    if (error) {
        _errors.push_back(fmt::format("{}: {}", directory, error.message()));
        _directory.reset(); // nobody knows what is in it
    }
    std::ranges::sort(names, std::ranges::greater());
    _pending.insert(_pending.end(), names.begin(), names.end());
}

std::vector<std::string> CaptureList::takeErrors()
{
    return std::exchange(_errors, {});
}

} // namespace ventrik

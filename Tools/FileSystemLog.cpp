#include "Tools/FileSystemLog.h"

#include <cerrno>
#include <cstring>
#include <iterator>

namespace ventrik
{

std::unique_ptr<FileSystemLog> FileSystemLog::create(const std::string& path, std::string& error)
{
    std::FILE* file = std::fopen(path.c_str(), "wbe");
    if (!file) {
        error = fmt::format("{}: {}", path, std::strerror(errno));
        return nullptr;
    }
    return std::unique_ptr<FileSystemLog>(new FileSystemLog(file));
}

bool FileSystemLog::flush()
{
    return std::fflush(_file.get()) == 0 && std::ferror(_file.get()) == 0;
}

void FileSystemLog::write(int priority, std::string_view text)
{
    _line.clear();
    fmt::format_to(std::back_inserter(_line), "{}\t", priority);
    for (const char character : text) {
        if (character == '\\')
            _line += "\\\\";
        else if (character == '\n')
            _line += "\\n";
        else if (character == '\t')
            _line += "\\t";
        else
            _line += character;
    }
    _line += '\n';
    std::fwrite(_line.data(), 1, _line.size(), _file.get());
}

} // namespace ventrik

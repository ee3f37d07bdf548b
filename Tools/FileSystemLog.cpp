#include "Tools/FileSystemLog.h"

#include <iterator>

namespace ventrik
{

std::unique_ptr<FileSystemLog> FileSystemLog::create(const std::string& path, std::string& error)
{
    auto file = PrivateFile::create(path, error);
    if (!file)
        return nullptr;
    return std::unique_ptr<FileSystemLog>(new FileSystemLog(std::move(*file)));
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
    _file.write(_line);
}

} // namespace ventrik

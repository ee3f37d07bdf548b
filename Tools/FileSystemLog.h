#pragma once

#include "Files/PrivateFile.h"
#include "Platform/SystemLog.h"

#include <memory>
#include <string>
#include <utility>

namespace ventrik
{

/// A system log that writes to a file, one line an entry: the priority, a tab, and the text with
/// backslash, newline and tab as \\, \n and \t. The file is there once it is committed.
class FileSystemLog : public SystemLog
{
  public:
    /// On failure `error` says why in one line.
    static std::unique_ptr<FileSystemLog> create(const std::string& path, std::string& error);

    /// After the last line. False, and the error in one line, when something did not reach the
    /// file.
    bool commit(std::string& error) { return _file.commit(error); }

  protected:
    void write(int priority, std::string_view text) override;

  private:
    explicit FileSystemLog(PrivateFile file) : SystemLog(LogPriority::debug), _file(std::move(file))
    {
    }

    PrivateFile _file;
    std::string _line;
};

} // namespace ventrik

#pragma once

#include "Platform/SystemLog.h"

#include <cstdio>
#include <memory>
#include <optional>
#include <string>

namespace ventrik
{

/// A system log that writes to a file, one line an entry: the priority, a tab, and the text with
/// backslash, newline and tab as \\, \n and \t.
class FileSystemLog : public SystemLog
{
  public:
    /// On failure `error` says why in one line.
    static std::unique_ptr<FileSystemLog> create(const std::string& path, std::string& error);

    /// False when something did not reach the file.
    bool flush();

  protected:
    void write(int priority, std::string_view text) override;

  private:
    struct Closer {
        void operator()(std::FILE* file) const { std::fclose(file); }
    };
    explicit FileSystemLog(std::FILE* file) : SystemLog(LogPriority::debug), _file(file) {}

    std::unique_ptr<std::FILE, Closer> _file;
    std::string _line;
};

/// A system log that nobody reads; its lines are never formatted.
class SilentSystemLog : public SystemLog
{
  public:
    SilentSystemLog() : SystemLog(-1) {}

  protected:
    void write(int, std::string_view) override {}
};

} // namespace ventrik

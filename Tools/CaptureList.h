#pragma once

#include <cstdio>
#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

/// Captures as they are named: files, directories with all files below them in the order of their
/// names (but for hidden ones), and lists of names, one a line. It keeps no more names than one
/// directory at each level has.
class CaptureList
{
  public:
    /// "-" is standard input, for a capture or a list.
    CaptureList(std::vector<std::string> captures, std::vector<std::string> lists);

    /// None at the end.
    std::optional<std::string> next();
    /// Whether it is one file that was named, and not a directory or a list.
    bool isSingle() const { return _isSingle; }
    /// A line for each list or directory that cannot be read, and for each empty directory.
    std::vector<std::string> takeErrors();

  private:
    struct Closer {
        void operator()(std::FILE* stream) const;
    };
    std::optional<std::string> nextName();
    std::optional<std::string> nextLine();
    bool openNextList();
    void enter(const std::string& directory);
    void tellEmptyDirectory();

    std::vector<std::string> _captures; // the next one is the last
    std::vector<std::string> _lists;    // likewise
    std::unique_ptr<std::FILE, Closer> _list;
    std::vector<std::string> _pending;     // of directories that were entered; likewise
    std::optional<std::string> _directory; // that was named, while no file was found below
    std::vector<std::string> _errors;
    bool _isSingle;
};

} // namespace ventrik

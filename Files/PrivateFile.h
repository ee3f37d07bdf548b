#pragma once

#include <cstdio>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace ventrik
{

/// A file that is whole and private, or is not there: its content gathers in a file without a name
/// (or, where the disk knows none such, under another one) in the same directory, of mode 0600, and
/// takes the name when all of it is on the disk. Until then, and when anything fails, what had the
/// name before stays as it was.
///
/// A link, a pipe or a socket of that name is never opened; the file takes its place. Devices and
/// directories, also behind a link, are refused. Errors are one line, "PATH: reason".
class PrivateFile
{
  public:
    /// None, and the error, when there can be no such file.
    static std::optional<PrivateFile> create(const std::string& path, std::string& error);
    /// One that everybody may read, and for which nothing waits for the disk: of what is written
    /// anew all the time.
    static std::optional<PrivateFile> createForAll(const std::string& path, std::string& error);
    /// Forgets what was not committed.
    ~PrivateFile();
    PrivateFile(PrivateFile&& other) noexcept;
    PrivateFile& operator=(PrivateFile&& other) noexcept;

    const std::string& path() const { return _path; }
    /// Where the content goes: buffered, and owned by this object.
    std::FILE* stream() const { return _stream.get(); }
    void write(std::string_view text);

    /// Brings everything to the disk and gives the file its name. False, and the error, when
    /// something did not get there. Nothing may be written afterwards.
    bool commit(std::string& error);

  private:
    struct Closer {
        void operator()(std::FILE* stream) const { std::fclose(stream); }
    };

    enum class Kind { Private, ForAll };

    PrivateFile(std::string path, Kind kind) : _path(std::move(path)), _kind(kind) {}
    static std::optional<PrivateFile> create(const std::string& path, Kind kind,
                                             std::string& error);
    bool flush(int descriptor) const;
    bool open();
    bool openNameless(const std::string& directory);
    bool openNamed(const std::string& directory);
    bool bringToDisk();
    bool takeName();
    void discard();

    std::string _path;
    Kind _kind;
    std::string _temporaryName; // empty while it has none
    int _writeError = 0;        // errno of the first write that failed
    std::unique_ptr<std::FILE, Closer> _stream;
};

/// Makes a directory of mode 0700 and its missing parents alike. Those that are there already stay
/// as they are. False and errno when it is not there afterwards.
bool makePrivateDirectories(const std::string& path);

} // namespace ventrik

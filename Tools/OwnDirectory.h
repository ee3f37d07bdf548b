#pragma once

#include <string>

#include <sys/types.h>

namespace ventrik
{

/// A directory of mode 0700 that is gone, with all that is in it, when this object or its process
/// ends, even where the process is killed: a small process of its own waits for that and removes
/// it. To be made before any thread is started.
class OwnDirectory
{
  public:
    OwnDirectory();
    ~OwnDirectory();
    OwnDirectory(const OwnDirectory&) = delete;
    OwnDirectory& operator=(const OwnDirectory&) = delete;

    /// Empty when it could not be made; `error` says why then.
    const std::string& path() const { return _path; }
    const std::string& error() const { return _error; }

  private:
    bool make();
    bool startKeeper();
    void fail();

    std::string _path;
    std::string _error;
    int _lifeline = -1; // the keeper sees its end when this process is gone
    pid_t _keeper = -1;
};

} // namespace ventrik

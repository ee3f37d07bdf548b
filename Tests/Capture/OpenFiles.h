#pragma once

#include <cstddef>
#include <filesystem>
#include <iterator>

#include <sys/resource.h>

namespace ventrik
{

/// How many files this process has open; the directory that is read for it counts each time.
inline std::size_t openFileCount()
{
    const std::filesystem::directory_iterator files("/proc/self/fd");
    return static_cast<std::size_t>(std::distance(begin(files), end(files)));
}

/// Lowers one of this process's limits while it lives.
class LoweredLimit
{
  public:
    LoweredLimit(__rlimit_resource resource, rlim_t limit) : _resource(resource)
    {
        getrlimit(_resource, &_before);
        const rlimit lowered{limit, _before.rlim_max};
        setrlimit(_resource, &lowered);
    }
    ~LoweredLimit() { setrlimit(_resource, &_before); }
    LoweredLimit(const LoweredLimit&) = delete;
    LoweredLimit& operator=(const LoweredLimit&) = delete;

  private:
    __rlimit_resource _resource;
    rlimit _before{};
};

} // namespace ventrik

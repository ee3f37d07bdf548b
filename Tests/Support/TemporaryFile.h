#pragma once

#include <algorithm>
#include <cstdio>
#include <string>
#include <string_view>

#include <fmt/format.h>
#include <gtest/gtest.h>
#include <unistd.h>

namespace ventrik
{

/// A path for a file of the running test, which no other test and no other run uses; what is there
/// at the end is removed.
class TemporaryFile
{
  public:
    explicit TemporaryFile(std::string_view name) : _path(uniquePath(name)) {}
    ~TemporaryFile() { std::remove(_path.c_str()); }
    TemporaryFile(const TemporaryFile&) = delete;
    TemporaryFile& operator=(const TemporaryFile&) = delete;

    const std::string& path() const { return _path; }

  private:
    static std::string uniquePath(std::string_view name)
    {
        const auto* test = testing::UnitTest::GetInstance()->current_test_info();
        std::string file =
            fmt::format("{}.{}.{}.{}", test->test_suite_name(), test->name(), getpid(), name);
        std::ranges::replace(file, '/', '-');
        return testing::TempDir() + file;
    }

    std::string _path;
};

} // namespace ventrik

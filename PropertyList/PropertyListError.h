#pragma once

#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

#include <fmt/format.h>

namespace ventrik
{

/// Carries the one error line out of the depths of a reader or the writer. Never leaves this
/// folder: the public functions turn it into their result.
class PropertyListError : public std::runtime_error
{
  public:
    using std::runtime_error::runtime_error;
};

template <typename... Arguments>
[[noreturn]] void failPropertyList(fmt::format_string<Arguments...> format,
                                   Arguments&&... arguments)
{
    throw PropertyListError(fmt::format(format, std::forward<Arguments>(arguments)...));
}

/// Text from outside made fit for an error line: bytes that do not print as \xNN, cut after about
/// 64 bytes.
std::string printable(std::string_view text);

} // namespace ventrik

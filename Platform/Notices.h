#pragma once

#include <string>

namespace ventrik
{

/// Notices that the desktop shows for a while, whatever window is in front.
class Notices
{
  public:
    virtual ~Notices() = default;
    /// One line of plain text. Never waits; a notice that nobody can show is lost.
    virtual void post(const std::string& text) = 0;
};

} // namespace ventrik

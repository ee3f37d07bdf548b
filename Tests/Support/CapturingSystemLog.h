#pragma once

#include "Platform/SystemLog.h"

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// A system log that keeps its entries.
class CapturingSystemLog : public SystemLog
{
  public:
    struct Line {
        int priority = 0;
        std::string text;
        bool operator==(const Line&) const = default;
    };

    explicit CapturingSystemLog(int threshold = LogPriority::debug) : SystemLog(threshold) {}

    const std::vector<Line>& lines() const { return _lines; }
    std::vector<std::string> texts() const;
    /// The texts of one priority.
    std::vector<std::string> texts(int priority) const;
    /// Is there an entry of exactly this text?
    bool contains(std::string_view text) const { return count(text) > 0; }
    /// The number of entries of exactly this text.
    std::size_t count(std::string_view text) const;
    void clear() { _lines.clear(); }

  protected:
    void write(int priority, std::string_view text) override;

  private:
    std::vector<Line> _lines;
};

} // namespace ventrik

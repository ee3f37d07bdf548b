#include "Tests/Support/CapturingSystemLog.h"

#include <algorithm>

namespace ventrik
{

std::vector<std::string> CapturingSystemLog::texts() const
{
    std::vector<std::string> texts;
    for (const Line& line : _lines)
        texts.push_back(line.text);
    return texts;
}

std::vector<std::string> CapturingSystemLog::texts(int priority) const
{
    std::vector<std::string> texts;
    for (const Line& line : _lines)
        if (line.priority == priority)
            texts.push_back(line.text);
    return texts;
}

std::size_t CapturingSystemLog::count(std::string_view text) const
{
    return static_cast<std::size_t>(std::ranges::count(_lines, text, &Line::text));
}

void CapturingSystemLog::write(int priority, std::string_view text)
{
    _lines.push_back({priority, std::string(text)});
}

} // namespace ventrik

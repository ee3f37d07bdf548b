#pragma once

#include "Packets/Record.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

/// The texts of the numbers that fields showed lately. Levels go up and down among few values, and
/// forming a text of a number takes many times as long as finding it here. The fields outlive it.
class TextMemory
{
  public:
    /// What the field shows for the raw number. Valid until the next call.
    const std::optional<std::string>& textOf(const Field& field, std::int64_t raw);

  private:
    struct Known {
        const Field* field = nullptr;
        std::int64_t raw = 0;
        std::optional<std::string> text;
    };

    std::vector<Known> _known; // each at the place that its field and number give
};

} // namespace ventrik

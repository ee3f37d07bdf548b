#include "Tools/ChosenTechnology.h"

#include <fmt/format.h>

namespace ventrik
{

ChosenTechnology chooseTechnology(const std::string& capture, const std::optional<Technology>& said,
                                  CaptureReader& reader)
{
    if (said)
        return {said, {}};
    if (const auto technology = reader.technology())
        return {technology, {}};
    if (const auto type = reader.linkType())
        return {std::nullopt,
                fmt::format("{}: link type {} names no technology; say which with --technology",
                            capture, *type)};
    const auto guess = reader.guessTechnology();
    if (guess)
        return {guess, fmt::format("{}: by its records it is of {}", capture, guess->name)};
    return {
        std::nullopt,
        fmt::format("{}: no record tells the technology; say which with --technology", capture)};
}

} // namespace ventrik

#pragma once

#include <cstddef>
#include <string_view>

namespace ventrik
{

/// Whether `isPlain` takes all of so many characters. Where it has no branches, the compiler makes
/// vector instructions of it.
template <auto isPlain, std::size_t length>
bool areAllPlain(const char* characters)
{
    unsigned char isOther = 0;
    for (std::size_t i = 0; i < length; ++i)
        isOther |= !isPlain(characters[i]);
    return isOther == 0;
}

/// Where the run of characters that `isPlain` takes ends which starts at the place. It looks at
/// whole chunks: at long ones, for of short ones the compiler makes single steps when it optimises
/// most, and at a short one for the rest.
template <auto isPlain>
std::size_t endOfRun(std::string_view text, std::size_t place)
{
    constexpr std::size_t longChunk = 32;
    constexpr std::size_t shortChunk = 16;
    while (place + longChunk <= text.size() && areAllPlain<isPlain, longChunk>(text.data() + place))
        place += longChunk;
    if (place + shortChunk <= text.size() && areAllPlain<isPlain, shortChunk>(text.data() + place))
        place += shortChunk;
    while (place < text.size() && isPlain(text[place]))
        ++place;
    return place;
}

} // namespace ventrik

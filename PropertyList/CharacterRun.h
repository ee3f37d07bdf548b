#pragma once

#include <cstddef>
#include <string_view>

namespace ventrik
{

/// Where the run of characters that `isPlain` takes ends which starts at the place. It looks at
/// whole chunks: where `isPlain` has no branches, the compiler makes vector instructions of it.
template <auto isPlain>
std::size_t endOfRun(std::string_view text, std::size_t place)
{
    constexpr std::size_t chunkLength = 16;
    const auto isPlainChunk = [](const char* chunk) {
        unsigned char isOther = 0;
        for (std::size_t i = 0; i < chunkLength; ++i)
            isOther |= !isPlain(chunk[i]);
        return isOther == 0;
    };
    while (place + chunkLength <= text.size() && isPlainChunk(text.data() + place))
        place += chunkLength;
    while (place < text.size() && isPlain(text[place]))
        ++place;
    return place;
}

} // namespace ventrik

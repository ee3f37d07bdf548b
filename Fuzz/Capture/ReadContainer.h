#pragma once

#include "Capture/ByteSource.h"
#include "Capture/CaptureContainer.h"

#include <memory>

namespace ventrik
{

/// The bytes behind the first one, which tells the size of the blocks in which they come.
inline std::unique_ptr<ByteSource> sourceOf(ByteView input)
{
    constexpr std::size_t stride = 97;
    const ByteView bytes = input.subspan(1);
    return std::make_unique<ByteSource>(Bytes(bytes.begin(), bytes.end()),
                                        1 + input.front() * stride);
}

/// Reads to the end; all that was taken must be there.
inline void drain(CaptureContainer& container)
{
    std::size_t sum = 0;
    while (const auto message = container.next())
        for (const std::uint8_t byte : message->data)
            sum += byte;
    [[maybe_unused]] volatile std::size_t seen = sum;
    container.notes();
    container.error();
}

/// Reads a container from such bytes.
template <typename Container>
void readContainer(ByteView input)
{
    if (input.empty())
        return;
    Container::isIn(input.subspan(1));
    Container container(sourceOf(input), "x");
    drain(container);
}

} // namespace ventrik

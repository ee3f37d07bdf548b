#pragma once

#include "Capture/ByteSource.h"
#include "Capture/CaptureContainer.h"

#include <memory>

namespace ventrik
{

/// Reads the bytes behind the first one, which tells the size of the blocks in which they come, to
/// their end.
template <typename Container>
void readContainer(ByteView input)
{
    if (input.empty())
        return;
    constexpr std::size_t stride = 97;
    const std::size_t blockSize = 1 + input[0] * stride;
    const ByteView bytes = input.subspan(1);
    Container::isIn(bytes);
    Container container(std::make_unique<ByteSource>(Bytes(bytes.begin(), bytes.end()), blockSize),
                        "x");
    while (const auto message = container.next()) {
        // A copy, so that the sanitizer sees whether the bytes are there.
        const Bytes data(message->data.begin(), message->data.end());
        if (data.empty())
            __builtin_trap();
    }
    container.notes();
    container.error();
}

} // namespace ventrik

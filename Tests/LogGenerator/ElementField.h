#pragma once

#include "Packets/PacketBuilder.h"

#include <array>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include <fmt/format.h>
#include <gtest/gtest.h>

namespace ventrik
{

/// What a row shows for one field of its element in the record.
struct ElementField {
    std::size_t offset; // in the element
    unsigned width;     // bits
    std::uint32_t raw;
    std::string_view key;
    std::string_view text;
};

/// Each field of the element, so many bytes at an offset of the record, shows its text whatever
/// stands around it. `show` feeds a record and gives the text that stands under a key then.
template <typename Show>
void expectElementFields(std::span<const ElementField> fields, const PacketBuilder& record,
                         std::size_t element, std::size_t size, Show show)
{
    for (const ElementField& field : fields)
        for (const std::uint8_t around : std::array<std::uint8_t, 2>{0x00, 0xFF}) {
            PacketBuilder packet = record;
            packet.bytes(element, Bytes(size, around))
                .bits(element + field.offset, 0, field.width, field.raw);
            EXPECT_EQ(show(packet, field.key), field.text)
                << fmt::format("{} raw {} amid {:02X}", field.key, field.raw, around);
        }
}

} // namespace ventrik

#pragma once

#include "Tests/LogGenerator/GeneratorFixture.h"

#include <algorithm>
#include <span>

#include <fmt/format.h>

namespace ventrik
{

struct RecordSize {
    std::uint32_t code;
    std::size_t minimum;
};

/// What a section shows for one field of a record.
struct RecordField {
    std::uint32_t code;
    std::size_t offset;
    unsigned width; // bits
    std::uint32_t raw;
    std::string_view key;
    std::string_view text;
};

/// A section of keys and values that reads several records.
template <typename Section>
class RecordFixture : public SectionFixture<Section>
{
  protected:
    /// Each field shows its text, in the shortest record there may be, whatever stands around it.
    void expectFields(std::span<const RecordField> fields, std::span<const RecordSize> sizes)
    {
        for (const RecordField& field : fields)
            for (const std::uint8_t around : {std::uint8_t{0}, std::uint8_t{0xFF}}) {
                this->feed(shortest(field.code, sizes, around)
                               .bits(field.offset, 0, field.width, field.raw));
                EXPECT_EQ(this->shown(field.key), field.text)
                    << fmt::format("{} raw {} amid {:02X}", field.key, field.raw, around);
            }
    }

    /// A record that is one byte too short changes nothing; the shortest one shows its keys.
    void expectMinimumSizes(std::span<const RecordSize> sizes, std::string_view trace)
    {
        for (const RecordSize& size : sizes) {
            this->values.clear();
            this->log.clear();
            this->feed(shortest(size.code, sizes, 0).size(size.minimum - 1));
            EXPECT_TRUE(this->values.empty()) << fmt::format("{:X}", size.code);
            EXPECT_THAT(this->log.texts(), testing::ElementsAre(trace));
            this->feed(shortest(size.code, sizes, 0));
            EXPECT_FALSE(this->values.empty()) << fmt::format("{:X}", size.code);
        }
    }

    /// The keys that a record shows, in their order, when nothing was shown before.
    std::vector<std::string> keysOfRecord(const PacketBuilder& record)
    {
        this->values.clear();
        this->feed(record);
        return keysOf(this->values);
    }

  private:
    static PacketBuilder shortest(std::uint32_t code, std::span<const RecordSize> sizes,
                                  std::uint8_t filler)
    {
        const auto size = std::ranges::find(sizes, code, &RecordSize::code);
        const Bytes payload(size->minimum - logPacketHeaderSize, filler);
        return PacketBuilder(code).bytes(logPacketHeaderSize, payload);
    }
};

} // namespace ventrik

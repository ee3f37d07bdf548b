#include "Capture/CaptureFile.h"
#include "Capture/CaptureReader.h"
#include "Tests/Support/TemporaryFile.h"

#include <fstream>

#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

class PcapngWriterTest : public testing::Test
{
  protected:
    std::unique_ptr<CaptureFile> create(std::string_view technology = "lte")
    {
        auto writer = CaptureFile::create(file.path(), *technologyNamed(technology), "9.8", error);
        EXPECT_TRUE(writer) << error;
        return writer;
    }
    std::string written() const
    {
        std::ifstream stream(file.path(), std::ios::binary);
        return {std::istreambuf_iterator<char>(stream), {}};
    }
    static std::string u32(std::uint32_t number)
    {
        std::string bytes;
        for (unsigned shift = 0; shift < 32; shift += 8)
            bytes += static_cast<char>(number >> shift & 0xFFU);
        return bytes;
    }

    const TemporaryFile file{"written.pcapng"};
    std::string error;
};

} // namespace

TEST_F(PcapngWriterTest, WritesAMessageByteByByte)
{
    const auto writer = create();
    const std::uint64_t time = 1700000000123456789;
    EXPECT_TRUE(writer->write(Clock::TimePoint(std::chrono::nanoseconds(time)), Bytes{1, 2, 3}));
    ASSERT_TRUE(writer->commit(error)) << error;
    // 32 bytes around 3, which are made up to 4.
    const std::string block = u32(6) + u32(36) + u32(0) +
                              u32(static_cast<std::uint32_t>(time >> 32)) +
                              u32(static_cast<std::uint32_t>(time)) + u32(3) + u32(3) +
                              std::string("\1\2\3\0", 4) + u32(36);
    EXPECT_TRUE(written().ends_with(block));
}

TEST_F(PcapngWriterTest, BeginsWithASectionThatNamesUsAndTheTechnology)
{
    ASSERT_TRUE(create()->commit(error)) << error;
    const std::string bytes = written();
    EXPECT_TRUE(bytes.starts_with(u32(0x0A0D0D0A)));
    EXPECT_EQ(bytes.substr(8, 16), u32(0x1A2B3C4D) + u32(1) + u32(0xFFFFFFFF) + u32(0xFFFFFFFF));
    // Its comment and its application.
    const std::string comment = "Messages of a baseband's log channel, technology lte (LTE)";
    EXPECT_EQ(bytes.substr(24, 4 + comment.size()),
              std::string("\1\0", 2) + static_cast<char>(comment.size()) + '\0' + comment);
    EXPECT_NE(bytes.find("Ventrik 9.8"), std::string::npos);
}

TEST_F(PcapngWriterTest, HasAnInterfaceOfTheTechnologysLinkType)
{
    ASSERT_TRUE(create("gsm")->commit(error)) << error;
    const auto reader = CaptureReader::open(file.path(), error);
    ASSERT_TRUE(reader) << error;
    EXPECT_EQ(reader->linkType(), 148);
    EXPECT_EQ(reader->technology()->name, "gsm");
}

TEST_F(PcapngWriterTest, IsReadBackAsItWasWritten)
{
    const Clock::TimePoint time(1700000000s + 5ns);
    const auto writer = create();
    writer->write(time, Bytes{1});
    writer->write(time + 1ns, Bytes{2, 3, 4, 5, 6});
    writer->write(time + 2ns, Bytes{});
    ASSERT_TRUE(writer->commit(error)) << error;
    auto reader = CaptureReader::open(file.path(), error);
    ASSERT_TRUE(reader) << error;
    const std::vector<Bytes> messages{{1}, {2, 3, 4, 5, 6}, {}};
    for (std::size_t i = 0; i < messages.size(); ++i) {
        const auto message = reader->next();
        ASSERT_TRUE(message) << reader->error();
        EXPECT_EQ(Bytes(message->data.begin(), message->data.end()), messages[i]);
        EXPECT_EQ(message->time, time + std::chrono::nanoseconds(i));
    }
    EXPECT_FALSE(reader->next());
    EXPECT_EQ(reader->error(), "");
}

TEST_F(PcapngWriterTest, RefusesAMessageThatNoReaderTakes)
{
    const auto writer = create();
    EXPECT_TRUE(writer->write({}, Bytes(262144)));
    EXPECT_FALSE(writer->write({}, Bytes(262145)));
}

TEST_F(PcapngWriterTest, RefusesAPlaceItCannotWriteTo)
{
    EXPECT_FALSE(CaptureFile::create("/nowhere/x.pcapng", *technologyNamed("lte"), "1", error));
    EXPECT_EQ(error, "/nowhere/x.pcapng: No such file or directory");
}

TEST_F(PcapngWriterTest, IsForNamesThatEndSo)
{
    const TemporaryFile plain("written.pcap");
    const auto writer = CaptureFile::create(plain.path(), *technologyNamed("lte"), "1", error);
    ASSERT_TRUE(writer && writer->commit(error)) << error;
    std::ifstream stream(plain.path(), std::ios::binary);
    std::string magic(4, '\0');
    stream.read(magic.data(), 4);
    EXPECT_EQ(magic, "\xD4\xC3\xB2\xA1");
}

} // namespace ventrik

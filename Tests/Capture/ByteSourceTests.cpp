#include "Capture/ByteSource.h"

#include "Capture/CaptureReader.h"
#include "Capture/PcapFile.h"
#include "Tests/Capture/OpenFiles.h"
#include "Tests/Capture/PcapBytes.h"
#include "Tests/Support/TemporaryFile.h"

#include <archive.h>
#include <archive_entry.h>
#include <gmock/gmock.h>

#include <cstdio>
#include <fstream>

namespace ventrik
{

namespace
{

Bytes countedBytes(std::size_t size)
{
    Bytes bytes(size);
    for (std::size_t i = 0; i < size; ++i)
        bytes[i] = static_cast<std::uint8_t>(i * 7 + i / 251);
    return bytes;
}

Bytes copyOf(ByteView view)
{
    return {view.begin(), view.end()};
}

void writeBytes(const std::string& path, ByteView bytes)
{
    std::ofstream(path, std::ios::binary)
        .write(reinterpret_cast<const char*>(bytes.data()),
               static_cast<std::streamsize>(bytes.size()));
}

/// The bytes, compressed by the filter of that name.
Bytes compressed(const std::string& filter, const Bytes& bytes)
{
    Bytes result(bytes.size() * 2 + 65536);
    std::size_t size = 0;
    archive* handle = archive_write_new();
    EXPECT_EQ(archive_write_add_filter_by_name(handle, filter.c_str()), ARCHIVE_OK) << filter;
    archive_write_set_format_raw(handle);
    EXPECT_EQ(archive_write_open_memory(handle, result.data(), result.size(), &size), ARCHIVE_OK);
    archive_entry* entry = archive_entry_new();
    archive_entry_set_filetype(entry, AE_IFREG);
    archive_write_header(handle, entry);
    archive_write_data(handle, bytes.data(), bytes.size());
    archive_entry_free(entry);
    archive_write_close(handle);
    archive_write_free(handle);
    result.resize(size);
    return result;
}

std::vector<Bytes> messagesIn(CaptureContainer& container)
{
    std::vector<Bytes> messages;
    while (const auto message = container.next())
        messages.push_back(copyOf(message->data));
    return messages;
}

PcapBytes threeMessages()
{
    return PcapBytes(150).record(100, 0, {1, 2}).record(101, 0, {}).record(102, 0, {3, 4, 5});
}

/// What is in the stream from where it stands, and closes it.
Bytes restOf(std::FILE* stream)
{
    Bytes rest;
    for (int byte = std::fgetc(stream); byte != EOF; byte = std::fgetc(stream))
        rest.push_back(static_cast<std::uint8_t>(byte));
    std::fclose(stream);
    return rest;
}

class CompressedCapture : public testing::TestWithParam<std::string>
{
};

} // namespace

TEST(ByteSource, GivesItsBytesWhateverTheBlocks)
{
    const Bytes bytes = countedBytes(1000);
    for (const std::size_t blockSize : {1U, 2U, 7U, 999U, 5000U}) {
        ByteSource source(bytes, blockSize);
        Bytes read;
        for (std::size_t size = 1; !source.peek(1).empty(); size = size % 37 + 1) {
            const Bytes next = copyOf(source.peek(size));
            read.insert(read.end(), next.begin(), next.end());
            source.skip(next.size());
        }
        EXPECT_EQ(read, bytes) << blockSize;
        EXPECT_EQ(source.offset(), bytes.size());
    }
}

TEST(ByteSource, PeekingTakesNothing)
{
    ByteSource source({1, 2, 3}, 1);
    EXPECT_EQ(copyOf(source.peek(2)), (Bytes{1, 2}));
    EXPECT_EQ(copyOf(source.peek(9)), (Bytes{1, 2, 3}));
    EXPECT_EQ(source.offset(), 0U);
}

TEST(ByteSource, SkippingEndsAtWhatWasPeeked)
{
    ByteSource source({1, 2, 3}, 3);
    source.peek(2);
    source.skip(100);
    EXPECT_EQ(source.offset(), 3U);
    EXPECT_TRUE(source.peek(1).empty());
}

// A pipe's reader must not wait for bytes that nobody sends yet.
TEST(ByteSource, PeekingSomeWaitsForOneByteOnly)
{
    int reads = 0;
    ByteSource source([&](std::span<std::uint8_t> room, std::string&) {
        ++reads;
        room[0] = 9;
        return std::size_t{1};
    });
    EXPECT_EQ(copyOf(source.peekSome(100)), (Bytes{9}));
    EXPECT_EQ(reads, 1);
}

TEST(ByteSource, ReadingTakesWhatWasPeekedFirst)
{
    ByteSource source({1, 2, 3, 4, 5}, 2);
    source.peek(3); // and so has four
    Bytes room(10);
    EXPECT_EQ(source.read(room), 4U);
    EXPECT_EQ(source.read(std::span(room).subspan(4)), 1U);
    EXPECT_EQ(source.read(std::span(room).subspan(5)), 0U);
    EXPECT_EQ(room, (Bytes{1, 2, 3, 4, 5, 0, 0, 0, 0, 0}));
    EXPECT_EQ(source.offset(), 5U);
    EXPECT_TRUE(source.peek(1).empty());
}

TEST(ByteSource, ReadingNothingIsNotItsEnd)
{
    ByteSource source({1}, 1);
    EXPECT_EQ(source.read({}), 0U);
    EXPECT_EQ(copyOf(source.peek(1)), (Bytes{1}));
}

TEST(ByteSource, ReadingTellsWhyItEnds)
{
    ByteSource source([](std::span<std::uint8_t>, std::string& error) {
        error = "broken";
        return std::size_t{0};
    });
    Bytes room(10);
    EXPECT_EQ(source.read(room), 0U);
    EXPECT_EQ(source.error(), "broken");
}

TEST(ByteSource, TellsAMissingFileInOneLine)
{
    std::string error;
    EXPECT_FALSE(ByteSource::open("/nowhere/x", error));
    EXPECT_EQ(error, "/nowhere/x: No such file or directory");
}

TEST(ByteSource, AnEmptyFileIsEmpty)
{
    const TemporaryFile file("empty");
    writeBytes(file.path(), {});
    std::string error;
    const auto source = ByteSource::open(file.path(), error);
    ASSERT_TRUE(source) << error;
    EXPECT_TRUE(source->peek(1).empty());
    EXPECT_EQ(source->error(), "");
}

TEST(ByteSource, LeavesNoFileOpen)
{
    const TemporaryFile file("bytes");
    writeBytes(file.path(), countedBytes(10));
    const std::size_t before = openFileCount();
    std::string error;
    ByteSource::open(file.path(), error);
    EXPECT_EQ(openFileCount(), before);
}

TEST(ByteSource, AStreamGivesWhatIsNotTaken)
{
    const Bytes bytes = countedBytes(200000);
    for (const std::size_t blockSize : {7U, 100000U}) {
        ByteSource source(bytes, blockSize);
        source.peek(100);
        source.skip(30);
        EXPECT_EQ(restOf(source.stream()), Bytes(bytes.begin() + 30, bytes.end())) << blockSize;
        EXPECT_EQ(source.offset(), 200000U);
    }
}

TEST(ByteSource, AStreamEndsInAnErrorWhereTheSourceDoes)
{
    ByteSource source([](std::span<std::uint8_t>, std::string& error) {
        error = "broken";
        return std::size_t{0};
    });
    std::FILE* stream = source.stream();
    EXPECT_EQ(std::fgetc(stream), EOF);
    EXPECT_TRUE(std::ferror(stream));
    std::fclose(stream);
}

TEST(ByteSource, APlainFileIsItsOwnStream)
{
    const Bytes bytes = countedBytes(200000);
    const TemporaryFile file("bytes");
    writeBytes(file.path(), bytes);
    std::string error;
    const auto source = ByteSource::open(file.path(), error);
    ASSERT_TRUE(source) << error;
    source->peek(100);
    source->skip(30);
    std::FILE* stream = source->stream();
    EXPECT_GE(fileno(stream), 0);
    EXPECT_EQ(restOf(stream), Bytes(bytes.begin() + 30, bytes.end()));
}

TEST(ByteSource, AClosedStreamLeavesNoFileOpen)
{
    const TemporaryFile file("bytes");
    writeBytes(file.path(), countedBytes(10));
    const std::size_t before = openFileCount();
    std::string error;
    std::fclose(ByteSource::open(file.path(), error)->stream());
    EXPECT_EQ(openFileCount(), before);
}

TEST(PcapFile, ReadsRecordsThatStraddleBlocks)
{
    for (const std::size_t blockSize : {1U, 3U, 16U, 100U}) {
        std::string error;
        const auto file = PcapFile::open(
            std::make_unique<ByteSource>(threeMessages().bytes(), blockSize), "x", error);
        ASSERT_TRUE(file) << error;
        EXPECT_EQ(messagesIn(*file), (std::vector<Bytes>{{1, 2}, {}, {3, 4, 5}})) << blockSize;
        EXPECT_EQ(file->error(), "");
    }
}

TEST(PcapFile, IsToldByItsFirstBytes)
{
    EXPECT_TRUE(PcapFile::isIn(threeMessages().bytes()));
    EXPECT_TRUE(PcapFile::isIn(PcapBytes(150, 0xA1B23C4D).bytes()));
    EXPECT_TRUE(PcapFile::isIn(Bytes{0x0A, 0x0D, 0x0D, 0x0A}));
    EXPECT_FALSE(PcapFile::isIn(Bytes{0xD4, 0xC3, 0xB2}));
    EXPECT_FALSE(PcapFile::isIn(Bytes{0x7E, 0x10, 0, 0}));
}

TEST_P(CompressedCapture, IsReadAsItWas)
{
    const TemporaryFile file("compressed");
    writeBytes(file.path(), compressed(GetParam(), threeMessages().bytes()));
    std::string error;
    auto reader = CaptureReader::open(file.path(), error);
    ASSERT_TRUE(reader) << error;
    std::vector<Bytes> messages;
    while (const auto message = reader->next())
        messages.push_back(copyOf(message->data));
    EXPECT_EQ(messages, (std::vector<Bytes>{{1, 2}, {}, {3, 4, 5}}));
    EXPECT_EQ(reader->error(), "");
    EXPECT_EQ(reader->technology()->name, "lte");
}

TEST_P(CompressedCapture, StreamsAsItWas)
{
    const Bytes bytes = countedBytes(200000);
    const TemporaryFile file("compressed");
    writeBytes(file.path(), compressed(GetParam(), bytes));
    std::string error;
    const auto source = ByteSource::open(file.path(), error);
    ASSERT_TRUE(source) << error;
    source->peek(100);
    source->skip(30);
    EXPECT_EQ(restOf(source->stream()), Bytes(bytes.begin() + 30, bytes.end()));
}

TEST_P(CompressedCapture, GivesWhatIsInFrontOfItsDamage)
{
    PcapBytes capture(150);
    for (std::uint32_t i = 0; i < 20000; ++i)
        capture.record(100 + i, i * 31 % 1000000, countedBytes(20 + i % 50));
    Bytes bytes = compressed(GetParam(), capture.bytes());
    bytes.resize(bytes.size() / 2);
    const TemporaryFile file("cut");
    writeBytes(file.path(), bytes);
    std::string error;
    auto reader = CaptureReader::open(file.path(), error);
    std::size_t count = 0;
    while (reader && reader->next())
        ++count;
    EXPECT_LT(count, 20000U);
    EXPECT_THAT(reader ? reader->error() : error, testing::StartsWith(file.path() + ": "));
}

INSTANTIATE_TEST_SUITE_P(Filters, CompressedCapture,
                         testing::Values("gzip", "bzip2", "xz", "zstd"));

} // namespace ventrik

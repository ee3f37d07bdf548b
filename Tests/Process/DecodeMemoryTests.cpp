#include "Capture/CaptureWriter.h"
#include "TelephonyService/LTEScenario.h"
#include "Tests/Process/DecodeFixture.h"

#include <array>
#include <filesystem>
#include <fstream>

namespace ventrik
{

namespace
{

class DecodeMemory : public DecodeFixture
{
  protected:
    /// A drive through the LTE scenario.
    std::string makeCapture(std::size_t messages)
    {
        std::string error;
        const std::string file = path("drive.pcap");
        auto writer = CaptureWriter::create(file, *technologyNamed("lte"), error);
        LTEScenario scenario(1);
        for (std::size_t i = 0; i < messages; ++i) {
            const auto message = scenario.next();
            const Clock::TimePoint time{std::chrono::seconds(captureStart) + message->due};
            EXPECT_TRUE(writer->write(time, message->data));
        }
        EXPECT_TRUE(writer->commit(error)) << error;
        return readFile(file);
    }
    /// A capture file of 250 kB messages, most of it a hole in the disk; the times are these, over
    /// and over.
    std::string makeLargeCapture(int messages, const std::vector<std::uint32_t>& times) const
    {
        constexpr std::uint32_t size = 250'000;
        const std::string file = writeFile("large.pcap", PcapBytes(lteLinkType).bytes());
        std::fstream stream(file, std::ios::binary | std::ios::in | std::ios::out);
        std::streamoff place = 24;
        for (int i = 0; i < messages; ++i, place += 16 + std::streamoff{size}) {
            const std::uint32_t time = times[static_cast<std::size_t>(i) % times.size()];
            const std::array<std::uint32_t, 4> header{time, 0, size, size};
            const Bytes start = PacketBuilder(0xB0C1).u8(20, 2).size(22).build();
            stream.seekp(place);
            for (const std::uint32_t field : header)
                for (unsigned shift = 0; shift < 32; shift += 8)
                    stream.put(static_cast<char>(field >> shift));
            for (const std::uint8_t byte : start)
                stream.put(static_cast<char>(byte));
        }
        stream.close();
        std::filesystem::resize_file(file, static_cast<std::uintmax_t>(place));
        return file;
    }
    /// The most memory, in KiB, that a run of the decoder took.
    long peakOf(const Arguments& arguments) const
    {
        const std::string report = path("peak");
        Arguments all{"-c",
                      "import resource, subprocess, sys\n"
                      "subprocess.run(sys.argv[2:], check=True, stdout=subprocess.DEVNULL)\n"
                      "print(resource.getrusage(resource.RUSAGE_CHILDREN).ru_maxrss,\n"
                      "      file=open(sys.argv[1], 'w'))",
                      report, VENTRIK_PROGRAMS "/ventrik-decode"};
        const Arguments ours = withResources(arguments);
        all.insert(all.end(), ours.begin(), ours.end());
        Program python("/usr/bin/python3", all, environment);
        EXPECT_EQ(python.waitForEnd(), 0) << python.errors();
        return std::atol(readFile(report).c_str());
    }
    /// The decoder's peak in KiB after it took all of the capture, in KiB.
    long peakFor(std::string_view capture)
    {
        // Only while standard input is open the process is still there to be asked.
        const auto program = start("ventrik-decode", withResources({"--format", "jsonl", "-"}),
                                   Program::Output::Discarded);
        program->write(Bytes(capture.begin(), capture.end()));
        EXPECT_TRUE(waitUntil([&] {
            return program->hasTakenInput() && program->statusField("State").starts_with("S");
        }));
        const long peak = program->peakMemory();
        program->closeInput();
        EXPECT_EQ(program->waitForEnd(), 0) << program->errors();
        return peak;
    }
};

} // namespace

TEST_F(DecodeMemory, DoesNotGrowWithTheCapture)
{
    environment.insert("ASAN_OPTIONS", "quarantine_size_mb=1");
    constexpr std::size_t many = isSanitized ? 100000 : 200000;
    const std::string large = makeCapture(many);
    ASSERT_GT(large.size(), many * 50);
    // Held whole, the capture alone would take more than this.
    constexpr long growthLimit = isSanitized ? 6 * 1024 : 8 * 1024;
    ASSERT_GT(large.size(), std::size_t{growthLimit} * 1024 * 5 / 4);

    const long small = peakFor(makeCapture(2000));
    EXPECT_GT(small, 0);
    EXPECT_LT(peakFor(large) - small, growthLimit);
}

// 500 MB of messages of which the packets of one period may stay.
TEST_F(DecodeMemory, KeepsNoMoreThanAPeriodsShareWhenTimesStandStill)
{
    const std::string file = makeLargeCapture(2000, {captureStart});
    EXPECT_LT(peakOf({file}), isSanitized ? 700'000 : 220'000);
}

TEST_F(DecodeMemory, KeepsASnapshotSmallWhenTimesRunBack)
{
    environment.insert("ASAN_OPTIONS", "quarantine_size_mb=1");
    const std::string snapshot = path("snapshot");
    const std::string file =
        makeLargeCapture(200, {captureStart + 5000, captureStart + 4000, captureStart + 3000});
    EXPECT_LT(peakOf({"--snapshot", snapshot, file}), isSanitized ? 400'000 : 100'000);
    // Five periods of a message each, and the same once more as a DLF; in base 64.
    EXPECT_LT(std::filesystem::file_size(snapshot), std::uintmax_t{2 * 5 * 250'000 * 3 / 2});
}

} // namespace ventrik

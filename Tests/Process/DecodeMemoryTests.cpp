#include "Capture/CaptureWriter.h"
#include "TelephonyService/LTEScenario.h"
#include "Tests/Process/DecodeFixture.h"

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

} // namespace ventrik

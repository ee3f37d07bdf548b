#include "Capture/CaptureReader.h"
#include "Model/VentrikModel.h"
#include "Packets/PacketBuilder.h"
#include "Platform/TelephonyConstants.h"
#include "PropertyList/PropertyListWriter.h"
#include "Tests/Support/FakePlatform.h"
#include "Tests/Support/TemporaryFile.h"
#include "Tools/Recording.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

RecordingOptions optionsFor(const std::string& path)
{
    return {.path = path, .rotationSize = {}, .rotationTime = {}};
}

/// A model's life with a channel that changes its technology: what its platform and its log see.
struct Life {
    explicit Life(const std::string& path) : recording("test", fake.platform(), optionsFor(path))
    {
        fake.ports.listen(FakeTelephonyClient::defaultRemotePortName);
        answerTechnology(Technologies::lte.identifier);
        model.restartMonitor();
        arrive(1);
        answerTechnology(Technologies::gsm.identifier);
        fake.ports.localPort(logChannelLocalPortName)->loseStream();
        fake.mainQueue.advance(2s);
        arrive(2);
        fake.mainQueue.advance(10s);
    }
    void answerTechnology(const PlistValue& technology)
    {
        fake.ports.setDefaultResult({PortError::success, propertyListBytes(PlistDictionary{
                                                             {"GetTechnology", technology}})});
    }
    void arrive(std::uint8_t number)
    {
        EXPECT_TRUE(fake.ports.deliver(logChannelLocalPortName, 0,
                                       PacketBuilder(0xB0C2).u8(14, number).size(38).build()));
        fake.mainQueue.run();
    }

    FakePlatform fake;
    Recording recording;
    int redraws = 0;
    VentrikModel model{recording.platform(), [this] { ++redraws; }};
};

std::size_t messageCount(const std::string& path)
{
    std::size_t count = 0;
    std::string error;
    auto reader = CaptureReader::open(path, error);
    EXPECT_TRUE(reader) << error;
    while (reader && reader->next())
        ++count;
    return count;
}

} // namespace

TEST(Recording, WithoutAPathLeavesTheViewerItsPorts)
{
    FakePlatform fake;
    Recording recording("test", fake.platform(), {});
    EXPECT_TRUE(recording.isPossible());
    EXPECT_EQ(&recording.platform().ports, &fake.ports);
}

TEST(Recording, ChangesNothingOfWhatTheModelDoes)
{
    const TemporaryFile file("recorded.pcap");
    const std::string second = file.path().substr(0, file.path().size() - 5) + "-0002.pcap";
    const Life plain("");
    {
        const Life recorded(file.path());
        EXPECT_EQ(recorded.fake.record->operations(), plain.fake.record->operations());
        EXPECT_EQ(recorded.fake.ports.sends().size(), plain.fake.ports.sends().size());
        EXPECT_EQ(recorded.redraws, plain.redraws);
        EXPECT_GT(plain.redraws, 0);
    }
    EXPECT_EQ(messageCount(file.path()), 1U);
    EXPECT_EQ(messageCount(second), 1U);
    std::remove(second.c_str());
}

TEST(Recording, OfAFileThatIsThereIsNotPossible)
{
    const TemporaryFile file("recorded.pcap");
    std::ofstream(file.path()) << "precious";
    FakePlatform fake;
    Recording recording("test", fake.platform(), optionsFor(file.path()));
    EXPECT_FALSE(recording.isPossible());
}

TEST(Recording, TellsTheLogWhatEndsIt)
{
    Life life("/dev/full");
    EXPECT_THAT(life.fake.log.count("the recording ends: /dev/full: No space left on device"), 1U);
}

} // namespace ventrik

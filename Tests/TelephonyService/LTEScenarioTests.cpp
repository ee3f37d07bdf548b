#include "LogGenerator/Orbel/LTE/LTELogGenerator.h"
#include "LogGenerator/Orbel/LogPacket.h"
#include "TelephonyService/LTEScenario.h"
#include "Tests/Support/FakePlatform.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <set>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

std::vector<TimedMessage> messagesUpTo(std::chrono::seconds end, std::uint32_t seed = 1)
{
    LTEScenario scenario(seed);
    std::vector<TimedMessage> messages;
    for (auto message = scenario.next(); message && message->due < end; message = scenario.next())
        messages.push_back(std::move(*message));
    return messages;
}

std::uint32_t codeOf(const TimedMessage& message)
{
    return effectiveLogCode(LogPacket(stripPrefix(message.data)));
}

bool areSame(const std::vector<TimedMessage>& a, const std::vector<TimedMessage>& b)
{
    return std::ranges::equal(a, b, [](const TimedMessage& x, const TimedMessage& y) {
        return x.due == y.due && x.data == y.data;
    });
}

// What the decoders show, sampled over a long drive.
class DriveTest : public testing::Test
{
  protected:
    DriveTest()
    {
        std::ifstream file(VENTRIK_RESOURCES "/LTE.plist", std::ios::binary);
        fake.resources.add("/res/LTE.plist", Bytes{std::istreambuf_iterator<char>(file), {}});
        const auto generator = LTELogGenerator::generator({fake.log, fake.resources, fake.clock});
        PlistDictionary state;
        for (const TimedMessage& message : messagesUpTo(400s)) {
            generator->updateState(state, message.data);
            collect(*state.find("Display")->dictionary());
        }
    }

    // Texts by the last two steps of their paths.
    void collect(const PlistDictionary& display, const std::string& name = "")
    {
        for (const auto& [key, value] : display) {
            if (value.string())
                shown[name + "/" + key].insert(*value.string());
            else if (value.dictionary())
                collect(*value.dictionary(), key);
            else if (value.array())
                for (const PlistValue& row : *value.array())
                    collect(*row.dictionary(), key);
        }
    }
    std::pair<double, double> rangeOf(const std::string& key)
    {
        double low = 1e9;
        double high = -1e9;
        for (const std::string& text : shown[key])
            if (text != "-") {
                low = std::min(low, std::stod(text));
                high = std::max(high, std::stod(text));
            }
        return {low, high};
    }

    FakePlatform fake;
    std::map<std::string, std::set<std::string>> shown;
};

} // namespace

TEST(LTEScenario, IsTheSameForTheSameSeed)
{
    EXPECT_TRUE(areSame(messagesUpTo(60s, 7), messagesUpTo(60s, 7)));
}

TEST(LTEScenario, IsAnotherDriveForAnotherSeed)
{
    EXPECT_FALSE(areSame(messagesUpTo(60s, 7), messagesUpTo(60s, 8)));
}

TEST(LTEScenario, SendsAbout20MessagesASecondInOrder)
{
    const auto messages = messagesUpTo(100s);
    EXPECT_GE(messages.size(), 2000U);
    EXPECT_LE(messages.size(), 2500U);
    EXPECT_TRUE(std::ranges::is_sorted(messages, {}, &TimedMessage::due));
}

TEST(LTEScenario, HasBursts)
{
    std::map<std::chrono::nanoseconds, int> perStep;
    for (const auto& message : messagesUpTo(100s))
        ++perStep[message.due];
    const auto busiest = std::ranges::max_element(
        perStep, {}, &std::map<std::chrono::nanoseconds, int>::value_type::second);
    EXPECT_GE(busiest->second, 6);
}

TEST(LTEScenario, SendsEveryCodeThatTheStartCommandAsksFor)
{
    std::set<std::uint32_t> codes;
    for (const auto& message : messagesUpTo(60s))
        codes.insert(codeOf(message));
    EXPECT_THAT(codes, testing::ElementsAre(0xB0C1, 0xB0C2, 0xB179, 0xB17F, 0xB180, 0xB186,
                                            0xFF0000, 0xFF0001, 0xFF0002));
}

TEST(LTEScenario, SendsACellMonitorArrayEveryFewSeconds)
{
    std::chrono::nanoseconds last{};
    for (const auto& message : messagesUpTo(100s))
        if (codeOf(message) == 0xFF0001) {
            EXPECT_LE(message.due - last, 3s);
            last = message.due;
        }
    EXPECT_GT(last, 96s);
}

TEST(LTEScenario, SomeMessagesCarryTheTransportPrefix)
{
    const auto messages = messagesUpTo(60s);
    const auto prefixed = std::ranges::count_if(
        messages, [](const TimedMessage& message) { return message.data[0] == 0x81; });
    EXPECT_GT(prefixed, 50);
    EXPECT_LT(prefixed, 600);
}

TEST_F(DriveTest, GoesThroughSeveralCellsBandsAndBandwidths)
{
    EXPECT_GE(shown["Serving Cell Info/Physical Cell ID"].size(), 5U);
    EXPECT_GE(shown["Serving Cell Info/Freq Band Indicator"].size(), 3U);
    EXPECT_GE(shown["Serving Cell Info/Download Bandwidth"].size(), 4U);
    EXPECT_EQ(shown["Serving Cell Info/Download Bandwidth"].count("Unknown"), 0U);
    EXPECT_GE(shown["Serving Cell Info/Tracking Area Code"].size(), 2U);
}

TEST_F(DriveTest, ShowsBelievableLevels)
{
    const auto [lowRsrp, highRsrp] = rangeOf("Serving Cell Measurements/Measured RSRP");
    EXPECT_GT(lowRsrp, -125);
    EXPECT_LT(lowRsrp, -90);
    EXPECT_GT(highRsrp, -80);
    EXPECT_LT(highRsrp, -50);
    const auto [lowRsrq, highRsrq] = rangeOf("Serving Cell Measurements/Measured RSRQ");
    EXPECT_GE(lowRsrq, -19.5);
    EXPECT_LE(highRsrq, -3);
    const auto [lowRssi, highRssi] = rangeOf("Serving Cell Measurements/Measured RSSI");
    EXPECT_GT(lowRssi, -110);
    EXPECT_LT(highRssi, -20);
}

TEST_F(DriveTest, FillsEveryKeyOfEverySection)
{
    for (const auto& [key, texts] : shown)
        EXPECT_GT(texts.size(), texts.count("-")) << key;
    for (const char* key :
         {"Measured Neighbor Cells/Filtered RSRP", "Neighbor Cells List/Srxlev",
          "Reselection Candidates List/Cell ID", "PDP Context Info/APN", "SIM Info/EF-OPLMNAcT"})
        EXPECT_TRUE(shown.contains(key)) << key;
}

TEST_F(DriveTest, PdpContextsComeAndGo)
{
    EXPECT_THAT(shown["PDP Context Info/APN"], testing::ElementsAre("ims", "internet"));
}

} // namespace ventrik

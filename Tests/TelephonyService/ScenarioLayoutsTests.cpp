// The same drives in the records of different times.

#include "Packets/RecordCensus.h"
#include "TelephonyService/Scenarios.h"
#include "Tests/Support/ResourceFiles.h"
#include "Tests/TelephonyService/ScenarioFixture.h"

#include <cmath>
#include <cstdlib>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

std::vector<TimedMessage> messagesOf(std::string_view technology, RecordsMode records)
{
    return messagesUpTo(*makeScenario(*technologyNamed(technology), 1, records), 60s);
}

std::map<RecordCensus::Kind, RecordCensus::Counted> kindsOf(std::string_view technology,
                                                            RecordsMode records, RecordsMode readBy)
{
    RecordCensus census(readBy);
    for (const TimedMessage& message : messagesOf(technology, records))
        census.take(message.data);
    return census.kinds();
}

using Texts = std::map<std::string, std::string>;

void collect(const PlistValue& value, const std::string& path, Texts& texts)
{
    if (value.string())
        texts[path] = *value.string();
    else if (value.dictionary())
        for (const auto& [key, entry] : *value.dictionary())
            collect(entry, path + "/" + key, texts);
    else if (value.array())
        for (std::size_t i = 0; i < value.array()->size(); ++i)
            collect((*value.array())[i], fmt::format("{}/{}", path, i), texts);
}

/// A generator with its display.
struct Decoder {
    Decoder(std::string_view technology, RecordsMode records)
    {
        addTemplates(fake.resources, VENTRIK_RESOURCES);
        GeneratorServices services{fake.log, fake.resources, fake.clock};
        services.records = records;
        generator = LogGenerator::generatorFromTechnology(technologyNamed(technology)->identifier,
                                                          services);
        fake.log.clear(); // its lines hold addresses
    }
    void take(const Bytes& message) { generator->updateState(state, message); }
    Texts texts() const
    {
        Texts result;
        if (const PlistValue* display = state.find("Display"))
            collect(*display, "", result);
        return result;
    }

    FakePlatform fake;
    PlistDictionary state;
    std::unique_ptr<LogGenerator> generator;
};

// Numbers differ by no more than half a step of the coarser layout, 0.5 dB, and the finer's.
bool areAlike(const std::string& a, const std::string& b)
{
    constexpr double tolerance = 0.25 + 0.0625;
    if (a == b)
        return true;
    char* endOfA = nullptr;
    char* endOfB = nullptr;
    const double numberOfA = std::strtod(a.c_str(), &endOfA);
    const double numberOfB = std::strtod(b.c_str(), &endOfB);
    return endOfA != a.c_str() && std::string_view(endOfA) == endOfB &&
           std::abs(numberOfA - numberOfB) <= tolerance;
}

// What tells of the layout itself, or stands in one of them only.
bool isOfTheLayout(std::string_view path)
{
    for (const std::string_view key :
         {"/Version", "/Measurement Rules", "/Measurement Rules Updated"})
        if (path.ends_with(key))
            return true;
    return false;
}

class ScenarioLayouts : public testing::TestWithParam<std::string>
{
};

} // namespace

TEST_P(ScenarioLayouts, BaseRecordsShowTheSameByNewerLayouts)
{
    Decoder base(GetParam(), RecordsMode::Base);
    Decoder newer(GetParam(), RecordsMode::Newer);
    for (const TimedMessage& message : messagesOf(GetParam(), RecordsMode::Base)) {
        base.take(message.data);
        newer.take(message.data);
        ASSERT_EQ(base.texts(), newer.texts());
    }
    EXPECT_EQ(base.fake.log.texts(LogPriority::error), newer.fake.log.texts(LogPriority::error));
}

TEST_P(ScenarioLayouts, BaseRecordsHaveKnownLayouts)
{
    for (const auto& [kind, counted] : kindsOf(GetParam(), RecordsMode::Base, RecordsMode::Newer))
        EXPECT_NE(kind.layout, LayoutKind::NotKnown) << std::hex << kind.logCode;
}

INSTANTIATE_TEST_SUITE_P(Technologies, ScenarioLayouts, testing::Values("lte", "gsm", "utran"));

TEST(NewerScenarios, NewerRecordsHaveNewerLayoutsWhereThereAreSome)
{
    for (const std::string_view technology : {"lte", "gsm"})
        for (const auto& [kind, counted] :
             kindsOf(technology, RecordsMode::Newer, RecordsMode::Newer))
            EXPECT_EQ(nameOf(kind.layout.value()),
                      layoutsOf(kind.logCode).empty() ? "base" : "newer")
                << std::hex << kind.logCode;
}

// The drive is the same, so what the two tell differs by the steps of their scales.
TEST(NewerScenarios, NewerRecordsTellTheSameDrive)
{
    Decoder base("lte", RecordsMode::Base);
    Decoder newer("lte", RecordsMode::Newer);
    const auto ofBase = messagesOf("lte", RecordsMode::Base);
    const auto ofNewer = messagesOf("lte", RecordsMode::Newer);
    ASSERT_EQ(ofBase.size(), ofNewer.size());
    for (std::size_t i = 0; i < ofBase.size(); ++i) {
        base.take(ofBase[i].data);
        newer.take(ofNewer[i].data);
        const Texts newerTexts = newer.texts();
        for (const auto& [path, text] : base.texts())
            if (!isOfTheLayout(path)) {
                ASSERT_TRUE(newerTexts.contains(path)) << path;
                ASSERT_TRUE(areAlike(text, newerTexts.at(path)))
                    << path << ": " << text << " and " << newerTexts.at(path);
            }
    }
}

TEST(NewerScenarios, ExtendedRecordsHoldAllThatExtendsTheBase)
{
    std::set<std::uint32_t> codes;
    for (const auto& [kind, counted] :
         kindsOf("lte", RecordsMode::Extended, RecordsMode::Extended)) {
        EXPECT_NE(kind.layout, LayoutKind::NotKnown) << std::hex << kind.logCode;
        codes.insert(kind.logCode);
    }
    for (const std::uint32_t code : {0xB0C0U, 0xB0EEU, 0xB192U, 0xB193U, 0xB195U})
        EXPECT_TRUE(codes.contains(code)) << std::hex << code;
}

} // namespace ventrik

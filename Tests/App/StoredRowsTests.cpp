#include "App/StoredRows.h"
#include "LogGenerator/Core/StateKeys.h"
#include "Platform/Technology.h"
#include "TelephonyService/ScenarioCapture.h"
#include "TelephonyService/Scenarios.h"
#include "Tests/Support/FakePlatform.h"
#include "Tests/Support/IdleGenerator.h"
#include "Tests/Support/ResourceFiles.h"
#include "Tests/Support/TemporaryFile.h"
#include "Tools/DecodeCommand.h"
#include "Tools/OpenedCapture.h"

#include <gmock/gmock.h>

#include <cstdio>
#include <memory>
#include <sstream>
#include <vector>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::SizeIs;

std::vector<std::string> linesOf(const std::string& text)
{
    std::istringstream stream(text);
    std::vector<std::string> lines;
    for (std::string line; std::getline(stream, line);)
        lines.push_back(line);
    return lines;
}

std::string rowsOf(const ChangeStore& store, const std::string& capture,
                   const StoredRowsRange& range)
{
    std::string text;
    StoredRows(store, capture).write(range, [&](std::string_view block) { text += block; });
    return text;
}

std::string allRowsOf(const ChangeStore& store, const std::string& capture)
{
    return rowsOf(store, capture, {store.firstTime(), store.lastTime()});
}

/// A scenario's messages as a capture.
class ScenarioRowsTest : public testing::TestWithParam<Technology>
{
  protected:
    ScenarioRowsTest()
    {
        addTemplates(fake.resources, VENTRIK_RESOURCES);
        std::string error;
        const auto scenario = makeScenario(GetParam(), 1);
        EXPECT_TRUE(writeScenarioCapture(*scenario, 600, GetParam(), file.path(), error)) << error;
    }

    /// Those of values, as the decoder prints them.
    std::vector<std::string> decodedRows() const
    {
        DecodeOptions options;
        options.capture = file.path();
        options.technology = GetParam();
        options.format = DecodeFormat::Rows;
        options.rows.format = RowFormat::Csv;
        options.resourceDirectories = {VENTRIK_RESOURCES};
        char* text = nullptr;
        std::size_t size = 0;
        std::FILE* output = open_memstream(&text, &size);
        EXPECT_EQ(decodeCapture(options, output), DecodeStatus::done);
        std::fclose(output);
        std::vector<std::string> lines = linesOf(std::string(text, size));
        std::free(text);
        lines.pop_back(); // which closes the capture
        return lines;
    }
    std::vector<std::string> storedRows()
    {
        std::string error;
        const auto opened = OpenedCapture::open({file.path(), GetParam()}, fake.platform(), error);
        opened->setObserver(store);
        while (opened->readOn()) {
        }
        std::vector<std::string> lines = linesOf(allRowsOf(store, file.path()));
        lines.erase(lines.begin()); // the heading
        return lines;
    }

    FakePlatform fake;
    TemporaryFile file{"drive.pcap"};
    ChangeStore store{RecordsMode::Newer};
};

std::string nameOfScenario(const testing::TestParamInfo<Technology>& tested)
{
    return std::string(tested.param.name);
}

/// A store that is shown displays made by hand, one a second.
class StoredRowsTest : public testing::Test
{
  protected:
    StoredRowsTest() { store.useGenerator(&generator, "lte"); }

    void show(const PlistValue& display)
    {
        state.set(StateKey::display, display);
        store.messageTaken(time, {}, state);
        time += 1s;
    }

    IdleGenerator generator;
    PlistDictionary state;
    Clock::TimePoint time{};
    ChangeStore store{RecordsMode::Newer};
};

} // namespace

TEST_P(ScenarioRowsTest, OfAWholeCaptureAreThoseOfTheDecoder)
{
    const std::vector<std::string> decoded = decodedRows();
    const std::vector<std::string> stored = storedRows();
    EXPECT_GT(decoded.size(), 100U);
    for (std::size_t i = 0; i < std::min(decoded.size(), stored.size()); ++i)
        ASSERT_EQ(stored[i], decoded[i]) << "row " << i;
    EXPECT_EQ(stored.size(), decoded.size());
}

INSTANTIATE_TEST_SUITE_P(Scenarios, ScenarioRowsTest,
                         testing::Values(Technologies::cellMonitor, Technologies::gsm,
                                         Technologies::c2k, Technologies::lte, Technologies::utran),
                         nameOfScenario);

TEST_F(StoredRowsTest, TellOnlyOfTheRange)
{
    for (const char* text : {"1", "2", "3", "4"})
        show(PlistDictionary{{"a", text}});
    EXPECT_THAT(linesOf(rowsOf(store, "live", {Clock::TimePoint(1s), Clock::TimePoint(2s)})),
                ElementsAre(testing::StartsWith("capture,record,time,"),
                            "live,1,1970-01-01T00:00:01.000000Z,,lte,,,,\"\",/a,,a,2,,2,,,,,,,",
                            "live,2,1970-01-01T00:00:02.000000Z,,lte,,,,\"\",/a,,a,3,,3,,,,,,,"));
}

TEST_F(StoredRowsTest, CountMessagesThatChangedNothing)
{
    show(PlistDictionary{{"a", "1"}});
    show(PlistDictionary{{"a", "1"}});
    show(PlistDictionary{{"a", "2"}});
    const auto lines = linesOf(allRowsOf(store, "live"));
    ASSERT_THAT(lines, SizeIs(3));
    EXPECT_THAT(lines[2], testing::StartsWith("live,2,"));
}

TEST_F(StoredRowsTest, NameEachTechnologyThatThereWas)
{
    show(PlistDictionary{{"a", "1"}});
    store.useGenerator(&generator, "utran");
    show(PlistDictionary{{"a", "2"}});
    const auto lines = linesOf(allRowsOf(store, "live"));
    ASSERT_THAT(lines, SizeIs(3));
    EXPECT_THAT(lines[1], HasSubstr(",lte,"));
    EXPECT_THAT(lines[2], HasSubstr(",utran,"));
}

} // namespace ventrik

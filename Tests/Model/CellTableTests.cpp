#include "LogGenerator/Core/StateKeys.h"
#include "Model/CellTable.h"
#include "Platform/Technology.h"
#include "TelephonyService/Scenarios.h"
#include "Tests/Support/IdleGenerator.h"
#include "Tests/Support/ResourceFiles.h"

#include <set>

#include <fmt/format.h>
#include <gmock/gmock.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

const Clock::TimePoint start = FixedClock().now();

std::string textOf(const std::optional<CellLevel>& level)
{
    return level ? fmt::format(" {} {} {}", level->name, level->number, level->unit) : "";
}

/// "Serving LTE 1300 B3 1815 PCI 301 RSRP -90 dBm RSRQ -7 dB", with "difference" behind it.
std::string lineOf(const CellRow& row)
{
    std::string line = fmt::format("{} {}", nameOf(row.kind), nameOf(row.system));
    if (row.channel)
        line += fmt::format(" {}", *row.channel);
    if (!row.band.empty())
        line += " " + row.band;
    if (row.megahertz)
        line += fmt::format(" {}", *row.megahertz);
    if (!row.identity.empty())
        line += fmt::format(" {} {}", identityNameOf(row.system), row.identity);
    line += textOf(row.level) + textOf(row.quality);
    return row.difference ? line + fmt::format(" difference {}", *row.difference) : line;
}

/// Says that all was told by the record of a code.
class TellingGenerator : public IdleGenerator
{
  public:
    const ReadLayout* lastRead() const override { return &read; }

    ReadLayout read{};
};

/// Displays made by hand, one a second.
class CellTableTest : public testing::Test
{
  protected:
    void use(std::string_view technology) { store.useGenerator(&generator, technology); }
    void show(const PlistValue& display, std::uint32_t logCode = 1)
    {
        generator.read.logCode = logCode;
        state.set(StateKey::display, display);
        store.messageTaken(time, {}, state);
        time += 1s;
    }
    std::vector<CellRow> rows()
    {
        DisplayMoment now = store.at(store.present());
        return cellsOf(now);
    }
    std::vector<std::string> lines()
    {
        std::vector<std::string> lines;
        for (const CellRow& row : rows())
            lines.push_back(lineOf(row));
        return lines;
    }

    TellingGenerator generator;
    ChangeStore store{RecordsMode::Base};
    PlistDictionary state;
    Clock::TimePoint time = start;
};

PlistDictionary lteServing(std::string_view identity, std::string_view level)
{
    return {{"E-ARFCN", "1300"},
            {"Physical Cell ID", identity},
            {"Measured RSRP", level},
            {"Measured RSRQ", "-7.25 dB"}};
}

PlistDictionary lteNeighbor(std::string_view identity, std::string_view level)
{
    return {
        {"Physical Cell ID", identity}, {"Measured RSRP", level}, {"Measured RSRQ", "-11.50 dB"}};
}

PlistDictionary lteNeighbors(const PlistArray& cells)
{
    return {{"Neighbor Cells List", cells},
            {"Neighbor Measurements", PlistDictionary{{"E-ARFCN", "6300"}}}};
}

} // namespace

TEST_F(CellTableTest, IsEmptyWithoutADisplay)
{
    EXPECT_THAT(lines(), IsEmpty());
    use("lte");
    EXPECT_THAT(lines(), IsEmpty());
}

TEST_F(CellTableTest, IsEmptyWhereATemplateSaysNothingYet)
{
    use("lte");
    show(PlistDictionary{{"Serving Cell Measurements", lteServing("-", "-")},
                         {"Serving Cell Info", PlistDictionary{{"Download Frequency", "-"}}}});
    EXPECT_THAT(lines(), ElementsAre("Serving LTE 1300 B3 1815 RSRQ -7.25 dB"));
    show(PlistDictionary{{"Serving Cell Measurements", PlistDictionary{{"E-ARFCN", "-"}}}});
    EXPECT_THAT(lines(), IsEmpty());
}

TEST_F(CellTableTest, HasTheServingCellAndItsNeighborsTheStrongestFirst)
{
    use("lte");
    show(PlistDictionary{{"Serving Cell Measurements", lteServing("301", "-90.00 dBm")},
                         {"Neighbors", lteNeighbors({lteNeighbor("118", "-104.50 dBm"),
                                                     lteNeighbor("119", "-88.00 dBm")})}});
    EXPECT_THAT(lines(),
                ElementsAre("Serving LTE 1300 B3 1815 PCI 301 RSRP -90 dBm RSRQ -7.25 dB",
                            "Neighbor LTE 6300 B20 806 PCI 119 RSRP -88 dBm RSRQ -11.5 dB "
                            "difference 2",
                            "Neighbor LTE 6300 B20 806 PCI 118 RSRP -104.5 dBm RSRQ -11.5 dB "
                            "difference -14.5"));
}

TEST_F(CellTableTest, TellsThePaneOfEachCell)
{
    use("lte");
    show(PlistDictionary{{"Serving Cell Measurements", lteServing("301", "-90.00 dBm")},
                         {"Neighbors", lteNeighbors({lteNeighbor("118", "-104.50 dBm")})}});
    ASSERT_EQ(rows().size(), 2U);
    EXPECT_EQ(rows()[0].path, "/Serving Cell Measurements");
    EXPECT_EQ(rows()[1].path, "/Neighbors/Neighbor Cells List/0");
}

TEST_F(CellTableTest, HasOneRowForACellOfSeveralLists)
{
    use("lte");
    const PlistArray measured{
        PlistDictionary{{"Physical Cell ID", "302"}, {"Filtered RSRP", "-95.00 dBm"}}};
    const PlistDictionary candidate{{"Candidate Priority", "5"},
                                    {"Candidate RAT Type", "LTE"},
                                    {"E ARFCN", "1300"},
                                    {"Cell ID", "302"}};
    show(PlistDictionary{
        {"Serving Cell Measurements", lteServing("301", "-90.00 dBm")},
        {"Connected mode LTE Intra-frequency Measurement", PlistDictionary{{"E-ARFCN", "1300"}}},
        {"Neighbors", PlistDictionary{{"Measured Neighbor Cells", measured}}},
        {"Reselection", PlistDictionary{{"Reselection Candidates List", PlistArray{candidate}}}}});
    EXPECT_THAT(lines(),
                ElementsAre("Serving LTE 1300 B3 1815 PCI 301 RSRP -90 dBm RSRQ -7.25 dB",
                            "Measured LTE 1300 B3 1815 PCI 302 RSRP -95 dBm difference -5"));
}

TEST_F(CellTableTest, TakesTheServingCellThatWasToldLast)
{
    use("lte");
    PlistDictionary display{{"Serving Cell Measurements", lteServing("301", "-90.00 dBm")}};
    show(display, 1);
    display.set("Serving Cell Info",
                PlistDictionary{{"Download Frequency", "1300"}, {"Physical Cell ID", "302"}});
    show(display, 2);
    EXPECT_THAT(lines(), ElementsAre("Serving LTE 1300 B3 1815 PCI 302"));
    show(display, 1); // says it once more
    EXPECT_THAT(lines(),
                ElementsAre("Serving LTE 1300 B3 1815 PCI 301 RSRP -90 dBm RSRQ -7.25 dB"));
}

TEST_F(CellTableTest, KeepsTheLevelOfACellThatWasNamedWithoutOneSince)
{
    use("lte");
    PlistDictionary display{{"Serving Cell Measurements", lteServing("301", "-90.00 dBm")}};
    show(display, 1);
    display.set("Serving Cell Info",
                PlistDictionary{{"Download Frequency", "1300"}, {"Physical Cell ID", "301"}});
    show(display, 2);
    EXPECT_THAT(lines(),
                ElementsAre("Serving LTE 1300 B3 1815 PCI 301 RSRP -90 dBm RSRQ -7.25 dB"));
    EXPECT_EQ(rows().front().age, 1s);
}

TEST_F(CellTableTest, TakesTheLevelThatWasToldLast)
{
    use("lte");
    const PlistDictionary connected{{"E-ARFCN", "1300"},
                                    {"Serving Physical Cell ID", "301"},
                                    {"Serving Filtered RSRP", "-93.50 dBm"}};
    PlistDictionary display{{"Serving Cell Measurements", lteServing("301", "-90.00 dBm")}};
    show(display, 1);
    display.set("Connected mode LTE Intra-frequency Measurement", connected);
    show(display, 2);
    EXPECT_THAT(lines(), ElementsAre("Serving LTE 1300 B3 1815 PCI 301 RSRP -93.5 dBm"));
    show(display, 1);
    EXPECT_THAT(lines(),
                ElementsAre("Serving LTE 1300 B3 1815 PCI 301 RSRP -90 dBm RSRQ -7.25 dB"));
}

TEST_F(CellTableTest, LeavesOutAListThatIsOlderThanItsChannel)
{
    use("gsm");
    PlistDictionary umts{{"Downlink Frequency", "10738"}, {"Scrambling Code", "58"}};
    PlistDictionary cells{
        {"UMTS RR Info", umts},
        {"Active Set", PlistArray{PlistDictionary{{"Scrambling Code", "9"}, {"RSCP", "-85 dB"}}}}};
    const PlistDictionary display{{"Serving Cell", cells}};
    show(display, 1);
    EXPECT_EQ(rows().size(), 2U);
    time += 5s;
    umts.set("Downlink Frequency", "10713");
    show(display, 2);
    EXPECT_THAT(lines(), ElementsAre("Serving UMTS 10713 I 2142.6 PSC 58"));
}

TEST_F(CellTableTest, HasCandidatesOfEachTechnology)
{
    use("lte");
    const PlistArray candidates{PlistDictionary{{"U ARFCN", "10738"}, {"PSC", "58"}},
                                PlistDictionary{{"ARFCN", "66"}, {"Band", "0"}, {"BSIC ID", "43"}},
                                PlistDictionary{{"Band", "1"}, {"Channel", "425"}, {"Pilot", "12"}},
                                PlistDictionary{{"Candidate RAT Type", "??"}}};
    show(PlistDictionary{
        {"Reselection", PlistDictionary{{"Reselection Candidates List", candidates}}}});
    EXPECT_THAT(lines(), ElementsAre("Candidate UMTS 10738 I 2147.6 PSC 58",
                                     "Candidate GSM 66 P-GSM 900 948.2 BSIC 43",
                                     "Candidate 1x 425 1 PN 12"));
}

TEST_F(CellTableTest, TellsTheCarriersThatServeBesideTheFirst)
{
    use("lte");
    const auto cell = [](std::string_view earfcn, std::string_view identity, std::string_view rsrp,
                         std::string_view serving, std::string_view carrier) {
        return PlistDictionary{{"E-ARFCN", earfcn},  {"Physical Cell ID", identity},
                               {"RSRP", rsrp},       {"RSRQ", "-8.00 dB"},
                               {"Serving", serving}, {"Carrier Index", carrier}};
    };
    show(PlistDictionary{
        {"More", PlistDictionary{{"Signal by Cell",
                                  PlistArray{cell("1300", "301", "-90.00 dBm", "True", "0"),
                                             cell("3050", "47", "-99.00 dBm", "True", "1"),
                                             cell("1300", "302", "-95.00 dBm", "False", "0")}}}}});
    EXPECT_THAT(
        lines(),
        ElementsAre("Serving LTE 1300 B3 1815 PCI 301 RSRP -90 dBm RSRQ -8 dB",
                    "Secondary LTE 3050 B7 2650 PCI 47 RSRP -99 dBm RSRQ -8 dB difference -9",
                    "Measured LTE 1300 B3 1815 PCI 302 RSRP -95 dBm RSRQ -8 dB difference -5"));
}

TEST_F(CellTableTest, HasTheCellsOfGSMWithTheSignThatRecordsLeaveOut)
{
    use("gsm");
    show(PlistDictionary{
        {"Serving Cell",
         PlistDictionary{{"GSM Serving Cell",
                          PlistDictionary{{"ARFCN", "66"}, {"BSIC", "43"}, {"RSSI", "54 dBm"}}}}},
        {"Neighbors",
         PlistDictionary{
             {"Neighboring Cells", PlistArray{PlistDictionary{{"ARFCN", "66"}, {"RSSI", "55"}},
                                              PlistDictionary{{"ARFCN", "79"}, {"RSSI", "100"}}}},
             {"GSM Set", PlistArray{PlistDictionary{
                             {"ARFCN", "561"}, {"BSIC", "14"}, {"RSSI", "-64 dBm"}}}}}}});
    EXPECT_THAT(lines(),
                ElementsAre("Serving GSM 66 P-GSM 900 948.2 BSIC 43 RxLev -54 dBm",
                            "Ranked GSM 561 DCS 1800 / PCS 1900 BSIC 14 RxLev -64 dBm "
                            "difference -10",
                            "Neighbor GSM 79 P-GSM 900 950.8 RxLev -100 dBm difference -46"));
}

TEST_F(CellTableTest, TellsWhichOfTwoGSMBandsIsMeantByTheCountry)
{
    use("gsm");
    const auto bandIn = [&](std::string_view country) {
        show(PlistDictionary{
            {"Registration",
             PlistDictionary{{"Serving PLMN", PlistDictionary{{"Mobile Country Code", country}}}}},
            {"Serving Cell",
             PlistDictionary{{"GSM Serving Cell", PlistDictionary{{"ARFCN", "561"}}}}}});
        return rows().front().band;
    };
    EXPECT_EQ(bandIn("262"), "DCS 1800");
    EXPECT_EQ(bandIn("655"), "DCS 1800");
    EXPECT_EQ(bandIn("310"), "PCS 1900");
    EXPECT_EQ(bandIn("724"), "DCS 1800 / PCS 1900");
    EXPECT_EQ(bandIn("-"), "DCS 1800 / PCS 1900");
    EXPECT_EQ(bandIn("001"), "DCS 1800 / PCS 1900");
}

TEST_F(CellTableTest, HasTheActiveSetOfUMTSOnTheServingChannel)
{
    use("gsm");
    const auto cell = [](std::string_view code, std::string_view rscp, std::string_view ratio) {
        return PlistDictionary{
            {"Scrambling Code", code}, {"RSCP", rscp}, {"Energy Per Chip", ratio}};
    };
    show(PlistDictionary{
        {"Serving Cell",
         PlistDictionary{{"UMTS RR Info", PlistDictionary{{"Downlink Frequency", "10738"},
                                                          {"Scrambling Code", "58"}}},
                         {"Active Set", PlistArray{cell("58", "-79 dB", "-8 dB"),
                                                   cell("9", "-85 dB", "-14 dB")}}}},
        {"Neighbors",
         PlistDictionary{{"UMTS Set", PlistArray{PlistDictionary{{"UARFCN", "10713"},
                                                                 {"Scrambling Code", "422"},
                                                                 {"RSCP", "-109 dBm"},
                                                                 {"Energy Per Chip", "-44 dB"}},
                                                 PlistDictionary{{"Downlink Frequency", "10688"},
                                                                 {"Scrambling Code", "7"}}}}}}});
    EXPECT_THAT(
        lines(),
        ElementsAre("Serving UMTS 10738 I 2147.6 PSC 58 RSCP -79 dBm Ec/Io -8 dB",
                    "Active UMTS 10738 I 2147.6 PSC 9 RSCP -85 dBm Ec/Io -14 dB difference -6",
                    "Ranked UMTS 10688 I 2137.6 PSC 7",
                    "Neighbor UMTS 10713 I 2142.6 PSC 422 RSCP -109 dBm Ec/Io -44 dB "
                    "difference -30"));
}

TEST_F(CellTableTest, HasTheSetsOfUTRAN)
{
    use("utran");
    const auto cell = [](std::string_view uarfcn, std::string_view identity, std::string_view level,
                         std::string_view status) {
        return PlistDictionary{
            {"UARFCN", uarfcn}, {"Cell ID", identity}, {"Filter RSCP", level}, {"Status", status}};
    };
    show(PlistDictionary{
        {"Serving Cell Info",
         PlistDictionary{{"Cell Scrambling Code", "31"}, {"Downlink UARFCN", "9500"}}},
        {"Neighbor Cell List",
         PlistArray{cell("9500", "31", "0.750000", "ASET"), cell("10054", "47", "0.250000", "DSET"),
                    cell("10062", "118", "0.500000", "MSET"),
                    cell("10062", "119", "0.125000", "ASET")}}});
    EXPECT_THAT(lines(), ElementsAre("Serving TD-SCDMA 9500 TDD f 1900 CPI 31 RSCP 0.75 ",
                                     "Active TD-SCDMA 10062 TDD a 2012.4 CPI 119 RSCP 0.125  "
                                     "difference -0.625",
                                     "Monitored TD-SCDMA 10062 TDD a 2012.4 CPI 118 RSCP 0.5  "
                                     "difference -0.25",
                                     "Detected TD-SCDMA 10054 TDD a 2010.8 CPI 47 RSCP 0.25  "
                                     "difference -0.5"));
}

TEST_F(CellTableTest, HasThePilotsOfCDMA)
{
    use("c2k");
    show(PlistDictionary{
        {"1x", PlistDictionary{{"Radio", PlistDictionary{{"Rx 0 Band Class", "PCS band"},
                                                         {"Rx 0 Channel", "425"}}},
                               {"Active Set", PlistDictionary{{"_sorted", ""},
                                                              {"0;180", "-10.50 dB"},
                                                              {"1;348", "(ref pilot) -6.75 dB"}}}}},
        {"EV-DO",
         PlistDictionary{
             {"Radio", PlistDictionary{{"Channel", "475"}, {"Serving PN Offset", "24"}}},
             {"Active Set Pilots",
              PlistDictionary{{"_sorted", ""}, {"0;24", "-1.25 dB"}, {"1;36", "-3.00 dB"}}}}}});
    EXPECT_THAT(lines(), ElementsAre("Serving 1x 425 PCS band PN 348",
                                     "Serving EV-DO 475 PN 24 Ec/Io -1.25 dB",
                                     "Active 1x 425 PCS band PN 180 Ec/Io -10.5 dB",
                                     "Active EV-DO 475 PN 36 Ec/Io -3 dB difference -1.75"));
    EXPECT_EQ(rows().front().path, "/1x/Active Set");
}

TEST_F(CellTableTest, HasNoPilotsWhereTheListSaysSo)
{
    use("c2k");
    show(PlistDictionary{{"1x", PlistDictionary{{"Active Set", "(none)"}}}});
    EXPECT_THAT(lines(), IsEmpty());
}

TEST_F(CellTableTest, HasTheCellsOfTheCellMonitor)
{
    use("ifx");
    show(PlistDictionary{
        {"Serving Cell",
         PlistDictionary{{"MCC", "262"}, {"ARFCN", "712"}, {"BSIC", "3-2"}, {"RxLev", "-72 dBm"}}},
        {"GSM Neighbor Cells",
         PlistArray{PlistDictionary{{"ARFCN", "57"}, {"BSIC", "2-6"}, {"RxLev", "-94 dBm"}}}},
        {"UMTS Neighbor Cells",
         PlistArray{PlistDictionary{
             {"UARFCN", "10787"}, {"Scrambling Code", "87"}, {"RSCP", "-86 dBm"}}}}});
    EXPECT_THAT(lines(), ElementsAre("Serving GSM 712 DCS 1800 1845.2 BSIC 3-2 RxLev -72 dBm",
                                     "Neighbor UMTS 10787 I 2157.4 PSC 87 RSCP -86 dBm",
                                     "Neighbor GSM 57 P-GSM 900 946.4 BSIC 2-6 RxLev -94 dBm "
                                     "difference -22"));
}

TEST_F(CellTableTest, EndsWithALengthThatStillComparesQuickly)
{
    use("ifx");
    PlistArray cells;
    for (int i = 0; i < 5000; ++i)
        cells.append(PlistDictionary{{"ARFCN", fmt::format("{}", i)}});
    show(PlistDictionary{{"GSM Neighbor Cells", cells}});
    EXPECT_EQ(rows().size(), 500U);
}

TEST_F(CellTableTest, TellsAgesAtTheTimeThatIsAskedFor)
{
    use("ifx");
    show(PlistDictionary{{"Serving Cell", PlistDictionary{{"ARFCN", "712"}}}});
    DisplayMoment now = store.at(store.present());
    EXPECT_EQ(cellsOf(now).front().age, 0s);
    EXPECT_EQ(cellsOf(now, start + 7s).front().age, 7s);
    EXPECT_EQ(cellsOf(now, start - 7s).front().age, 0s);
}

namespace
{

/// What a technology's scenario shows in the course of its records.
struct Course {
    std::string_view technology;
    std::set<std::string> kinds; ///< "Serving LTE"
};

class CellTableOfTechnologyTest : public testing::TestWithParam<Course>
{
  protected:
    CellTableOfTechnologyTest() { addTemplates(fake.resources, VENTRIK_RESOURCES); }

    /// The rows after every 20th of 4000 messages.
    template <typename Use>
    void run(RecordsMode records, const Use& use)
    {
        const Technology technology = *technologyNamed(GetParam().technology);
        const auto generator = LogGenerator::generatorsReading(records)(
            technology.identifier, {fake.log, fake.resources, fake.clock});
        ChangeStore store(records);
        store.useGenerator(generator.get(), technology.name);
        const auto scenario = makeScenario(technology, 5, records);
        PlistDictionary state;
        for (int i = 0; i < 4000; ++i) {
            const auto message = scenario->next();
            generator->updateState(state, message->data);
            store.messageTaken(start + message->due, message->data, state);
            if (i % 20 > 0)
                continue;
            DisplayMoment now = store.at(store.present());
            use(cellsOf(now));
        }
    }

    struct Fakes {
        CapturingSystemLog log;
        MemoryResources resources;
        FixedClock clock;
    } fake;
};

} // namespace

TEST_P(CellTableOfTechnologyTest, HasTheCellsOfAllLists)
{
    std::set<std::string> seen;
    for (const RecordsMode records : {RecordsMode::Base, RecordsMode::Extended})
        run(records, [&](const std::vector<CellRow>& rows) {
            for (const CellRow& row : rows)
                seen.insert(fmt::format("{} {}", nameOf(row.kind), nameOf(row.system)));
        });
    EXPECT_EQ(seen, GetParam().kinds);
}

TEST_P(CellTableOfTechnologyTest, HasEachCellOnceAndOneServingCellOfASystem)
{
    run(RecordsMode::Base, [&](const std::vector<CellRow>& rows) {
        std::set<std::string> cells;
        std::set<CellSystem> serving;
        for (const CellRow& row : rows) {
            EXPECT_TRUE(
                cells
                    .insert(fmt::format("{} {} {}", nameOf(row.system), *row.channel, row.identity))
                    .second)
                << lineOf(row);
            EXPECT_TRUE(row.kind != CellKind::Serving || serving.insert(row.system).second)
                << lineOf(row);
        }
    });
}

INSTANTIATE_TEST_SUITE_P(
    All, CellTableOfTechnologyTest,
    testing::Values(
        Course{"lte",
               {"Serving LTE", "Measured LTE", "Detected LTE", "Neighbor LTE", "Candidate LTE"}},
        Course{"gsm",
               {"Serving GSM", "Serving UMTS", "Active UMTS", "Neighbor GSM", "Neighbor UMTS",
                "Ranked GSM", "Ranked UMTS"}},
        Course{"utran", {"Serving TD-SCDMA", "Monitored TD-SCDMA", "Detected TD-SCDMA"}},
        Course{"c2k", {"Serving 1x", "Serving EV-DO", "Active 1x", "Active EV-DO"}},
        Course{"ifx", {"Serving GSM", "Neighbor GSM", "Neighbor UMTS"}}),
    [](const auto& course) { return std::string(course.param.technology); });

} // namespace ventrik

#include "Tools/MetricsFile.h"

#include "Tests/Model/ModelFixture.h"
#include "Tests/Support/IdleGenerator.h"

#include <filesystem>
#include <fstream>
#include <sstream>

namespace ventrik
{

namespace
{

using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

class MetricsFileTest : public ModelFixture
{
  protected:
    MetricsFileTest() { model.addObserver(metrics); }
    ~MetricsFileTest() override
    {
        model.removeObserver(metrics);
        std::filesystem::remove(path);
    }
    std::string text() { return metrics.text(model); }
    // Shows a display that is not the generator's own.
    void show(const PlistDictionary& display)
    {
        metrics.useGenerator(&idle, "lte");
        metrics.messageTaken({}, {}, PlistDictionary{{"Display", display}});
    }
    static std::string contentOf(const std::string& file)
    {
        std::stringstream content;
        content << std::ifstream(file).rdbuf();
        return content.str();
    }

    const std::string path = testing::TempDir() + "ventrik-metrics-" + std::to_string(getpid());
    IdleGenerator idle;
    MetricsFile metrics{path};
};

} // namespace

TEST_F(MetricsFileTest, HasTheNumbersOfFieldsWithTheirUnits)
{
    model.restartMonitor();
    // A serving cell measurement, its E-ARFCN at byte 17.
    arrive(PacketBuilder(0xB17F).size(33).u8(13, 3).u16(17, 1300).build());
    EXPECT_THAT(text(), HasSubstr("ventrik_e_arfcn{technology=\"lte\","
                                  "section=\"Serving Cell Measurements\",cell=\"0\","
                                  "path=\"/Serving Cell Measurements/E-ARFCN\"} 1300\n"));
    EXPECT_THAT(text(), HasSubstr("# TYPE ventrik_measured_rsrp_dbm gauge\n"
                                  "ventrik_measured_rsrp_dbm{"));
}

TEST_F(MetricsFileTest, TellsCellAndPlaceInAList)
{
    show(PlistDictionary{{"List", PlistArray{PlistDictionary{{"PCI", "7"}, {"Level", "1.5"}},
                                             PlistDictionary{{"PCI", "9"}, {"Level", "text"}}}}});
    EXPECT_THAT(text(), HasSubstr("# TYPE ventrik_level gauge\n"
                                  "ventrik_level{technology=\"lte\",cell=\"7\",index=\"0\","
                                  "path=\"/List/0/Level\"} 1.5\n"));
    EXPECT_THAT(text(), HasSubstr("ventrik_pci{technology=\"lte\",cell=\"9\",index=\"1\","
                                  "path=\"/List/1/PCI\"} 9\n"));
    EXPECT_THAT(text(), Not(HasSubstr("/List/1/Level")));
}

TEST_F(MetricsFileTest, HoldsNothingThatEndsALabelOrALine)
{
    show(PlistDictionary{{"a\"b\\c\nd", "5"}});
    EXPECT_THAT(text(), HasSubstr("ventrik_a_b_c_d{technology=\"lte\","
                                  "path=\"/a\\\"b\\\\c d\"} 5\n"));
}

TEST_F(MetricsFileTest, LeavesOutWhatOnlySortsAGroup)
{
    show(PlistDictionary{{"_sorted", "1"}, {"2;b", "5"}});
    EXPECT_THAT(text(), Not(HasSubstr("sorted")));
    EXPECT_THAT(text(), HasSubstr("path=\"/b\"} 5\n"));
}

// Prometheus refuses a whole file for two lines of one metric and labels.
TEST_F(MetricsFileTest, HasOneLineForTwoKeysWithOneLabel)
{
    show(PlistDictionary{{"_sorted", ""}, {"1;a", "1"}, {"2;a", "2"}});
    EXPECT_THAT(text(), HasSubstr("path=\"/a\"} 2\n"));
    EXPECT_THAT(text(), Not(HasSubstr("path=\"/a\"} 1\n")));
}

TEST_F(MetricsFileTest, CountsWhatTheChannelDid)
{
    EXPECT_THAT(text(), HasSubstr("ventrik_channel_open 0\n"));
    EXPECT_THAT(text(), Not(HasSubstr("last_message")));
    model.restartMonitor();
    arrive(cellInfo(7));
    arrive(cellInfo(8));
    EXPECT_THAT(text(), HasSubstr("# TYPE ventrik_channel_messages_total counter\n"
                                  "ventrik_channel_messages_total 2\n"));
    EXPECT_THAT(text(), HasSubstr("ventrik_channel_bytes_total 76\n")); // two of 38
    EXPECT_THAT(text(), HasSubstr("ventrik_channel_open 1\n"));
    EXPECT_THAT(text(), HasSubstr("ventrik_channel_opened_total 1\n"));
    EXPECT_THAT(text(), HasSubstr("ventrik_channel_last_message_seconds "));
}

TEST_F(MetricsFileTest, IsWrittenWholeAndReadableToOthers)
{
    std::string error;
    ASSERT_TRUE(metrics.write(model, error)) << error;
    EXPECT_EQ(contentOf(path), text());
    ASSERT_TRUE(metrics.write(model, error)) << error;
    EXPECT_EQ(contentOf(path), text());
    using std::filesystem::perms;
    EXPECT_EQ(std::filesystem::status(path).permissions(),
              perms::owner_read | perms::owner_write | perms::group_read | perms::others_read);
}

TEST_F(MetricsFileTest, TellsWhyItCannotBeWritten)
{
    const MetricsFile elsewhere("/missing/file.prom");
    std::string error;
    EXPECT_FALSE(elsewhere.write(model, error));
    EXPECT_THAT(error, StartsWith("/missing/file.prom: No such file"));
}

} // namespace ventrik

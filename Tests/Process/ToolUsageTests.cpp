#include "Tests/Process/ToolUsageFixture.h"

namespace ventrik
{

namespace
{

class ToolUsage : public ToolUsageFixture
{
};

} // namespace

TEST_F(ToolUsage, TelephonyRefusesWhatIsWrong)
{
    expectRefused("ventrik-telephony", {{},
                                        {"--technology"},
                                        {"--technology", "5g"},
                                        {"--serial", "/dev/null"},
                                        {"--serial", "/dev/null", "--technology", "ifx"},
                                        {"--serial", "/dev/null", "--replay", "x.pcap"},
                                        {"--technology", "lte", "--replay", "x", "--write", "y"},
                                        {"--technology", "lte", "--loop"},
                                        {"--replay", "x.pcap", "--speed", "0"},
                                        {"--replay", "x.pcap", "--speed", "fast"},
                                        {"--technology", "lte", "--seed", "-x"},
                                        {"--technology", "lte", "--rotate", "1h"},
                                        {"--technology", "lte", "--write", "x", "--record", "y"},
                                        {"--technology", "lte", "more"},
                                        {"--technology", "lte", "--records", ""},
                                        {"--technology", "lte", "--log-level", "loud"},
                                        {"--unheard-of"}});
}

TEST_F(ToolUsage, WatchRefusesWhatIsWrong)
{
    expectRefused("ventrik-watch", {{"--unheard-of"},
                                    {"more"},
                                    {"--once=1"},
                                    {"--records", "all"},
                                    {"--log-level", ""},
                                    {"--rotate", "1h"},
                                    {"--record", "x.pcap", "--rotate", "1"}});
}

TEST_F(ToolUsage, DecodeRefusesWhatIsWrong)
{
    expectRefused("ventrik-decode", {{},
                                     {"a.pcap", "b.pcap"},
                                     {"--format", "xml", "a.pcap"},
                                     {"--technology", "5g", "a.pcap"},
                                     {"--resources", path("missing"), "a.pcap"},
                                     {"--snapshot"},
                                     {"--records", "older", "a.pcap"},
                                     {"--with-bytes", "a.pcap"},
                                     {"--report-unknown", "b.txt"},
                                     {"--log-level", "3", "a.pcap"},
                                     {"--unheard-of", "a.pcap"}});
}

TEST_F(ToolUsage, TelephonyTellsItsUsageAndVersion)
{
    expectHelpAndVersion("ventrik-telephony", "--technology NAME [OPTION]...");
}

TEST_F(ToolUsage, WatchTellsItsUsageAndVersion)
{
    expectHelpAndVersion("ventrik-watch", "[OPTION]...");
}

TEST_F(ToolUsage, DecodeTellsItsUsageAndVersion)
{
    expectHelpAndVersion("ventrik-decode", "[OPTION]... CAPTURE");
}

} // namespace ventrik

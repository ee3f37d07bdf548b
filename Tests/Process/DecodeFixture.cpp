#include "Tests/Process/DecodeFixture.h"

namespace ventrik
{

DecodeFixture::DecodeFixture()
{
    writeFile("resources/LTE.plist",
              R"(<?xml version="1.0" encoding="UTF-8"?>
<plist version="1.0"><dict>
<key>Serving Cell Info</key>
<dict><key>Num Tx Antennas</key><string>-</string><key>Physical Cell ID</key><string>-</string></dict>
<key>Note</key><string>none</string>
</dict></plist>
)");
}

ProcessFixture::Arguments DecodeFixture::withResources(const Arguments& arguments) const
{
    Arguments all{"--resources", path("resources")};
    all.insert(all.end(), arguments.begin(), arguments.end());
    return all;
}

DecodeFixture::Result DecodeFixture::decode(const Arguments& arguments) const
{
    return finish(*start("ventrik-decode", withResources(arguments)));
}

DecodeFixture::Result DecodeFixture::decode(const PcapBytes& capture, Arguments arguments) const
{
    arguments.push_back(writeFile("capture.pcap", capture.bytes()));
    return decode(arguments);
}

DecodeFixture::Result DecodeFixture::decodeInput(const PcapBytes& capture,
                                                 Arguments arguments) const
{
    arguments.emplace_back("-");
    const auto program = start("ventrik-decode", withResources(arguments));
    program->write(capture.bytes());
    return finish(*program);
}

DecodeFixture::Result DecodeFixture::finish(Program& program) const
{
    program.closeInput();
    Result result{program.waitForEnd().value_or(-1), program.output(), program.errors(), {}};
    for (const std::string& line : linesOf(result.errors))
        if (line.starts_with("ventrik-decode: "))
            result.complaints.push_back(line);
    return result;
}

PcapBytes DecodeFixture::cellCapture()
{
    return lteCapture()
        .record(captureStart, 0, cellInfoMessage(301))
        .record(captureStart, 1, antennaMessage(2));
}

} // namespace ventrik

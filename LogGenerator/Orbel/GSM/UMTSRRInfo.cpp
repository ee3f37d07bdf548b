#include "LogGenerator/Orbel/GSM/UMTSRRInfo.h"

#include "Packets/GSMRecords.h"
#include "Packets/SharedRecords.h"
#include "Platform/TelephonyConstants.h"

namespace ventrik
{

namespace
{

constexpr std::array<std::string_view, 1> technologies{kQXCellMonitorRadioAccessTechnologyUMTS};
constexpr std::array<CellField, 3> cellFields{{
    {kQXCellMonitorCellId, {"Cell ID", cellNumberPlace}, "Cell ID"},
    {kQXCellMonitorUARFCN, {"UARFCN", cellNumberPlace}, "UARFCN"},
    {kQXCellMonitorSCN, {"Scrambling Code", cellNumberPlace}, "Scrambling Code"},
}};
constexpr MonitoredCells cells{MonitoredCells::Kind::Serving, technologies, cellFields,
                               "UMTSRRInfo"};

constexpr SectionTable table{
    .name = "UMTS RR Info",
    .trace = "UMTSRRInfo",
    .records = {{
        {&GSMRecords::rrcState, GSMRecords::rrcStateFields},
        {.record = &GSMRecords::transmitPower},
        // Only the cell monitor tells the UARFCN; the two frequencies supersede it.
        {.record = &GSMRecords::umtsCell,
         .fields = GSMRecords::umtsCellFields,
         .superseded = "UARFCN"},
        {&GSMRecords::security, GSMRecords::securityFields},
        {.record = &SharedRecords::cellMonitor, .cells = &cells},
    }},
};

} // namespace

UMTSRRInfo::UMTSRRInfo(SystemLog& log) : Base(log, table) {}

void UMTSRRInfo::decode(const ShownRecord& shown, const LogPacket& packet)
{
    if (shown.record == &GSMRecords::transmitPower)
        updateFromTransmitPower(packet);
    else
        Base::decode(shown, packet);
}

// Each sample counts in whole dB, truncated. Without one the mean is no number, which is shown.
void UMTSRRInfo::updateFromTransmitPower(const LogPacket& packet)
{
    constexpr std::int64_t noSample = 0;
    const RecordElements samples = GSMRecords::powerSamples.elementsOf(packet);
    double sum = 0;
    int count = 0;
    for (std::size_t i = 0; i < samples.completeIn(packet); ++i) {
        const LogPacket sample = samples.element(packet, i);
        const auto raw = numberOf(sample, GSMRecords::powerSampleFields.front());
        if (raw == noSample)
            continue;
        sum += static_cast<double>((raw + 512) / 10 - 70);
        ++count;
    }
    showNumber(GSMRecords::transmitPowerMean, sum / count);
}

} // namespace ventrik

#include "Packets/AllRecords.h"

#include "Packets/C2KRecords.h"
#include "Packets/GSMRecords.h"
#include "Packets/LTESignalRecords.h"
#include "Packets/LTEStateRecords.h"
#include "Packets/SharedRecords.h"
#include "Packets/UTRANRecords.h"

#include <algorithm>

namespace ventrik
{

namespace
{

constexpr std::array records{
    &C2KRecords::fingerC2I,
    &C2KRecords::evdoStatus,
    &C2KRecords::forwardPackets,
    &C2KRecords::oneXStatus,
    &C2KRecords::oneXTraffic,
    &C2KRecords::reversePackets,
    &C2KRecords::activeSetPilots,
    &C2KRecords::servingSystem,
    &SharedRecords::versionReport,
    &GSMRecords::rankedCells,
    &GSMRecords::transmitPower,
    &GSMRecords::blockErrors,
    &GSMRecords::rrcState,
    &GSMRecords::umtsCell,
    &GSMRecords::security,
    &GSMRecords::cellList,
    &GSMRecords::hsdpa,
    &GSMRecords::dtx,
    &GSMRecords::dedicatedChannel,
    &GSMRecords::rrState,
    &GSMRecords::cellIdentity,
    &GSMRecords::idleMeasurements,
    &GSMRecords::si13,
    &GSMRecords::packetOptions,
    &GSMRecords::cellOptions,
    &GSMRecords::mobileAllocation,
    &GSMRecords::broadcastChannel,
    &GSMRecords::measurementOrder,
    &GSMRecords::bsicList,
    &GSMRecords::gmmState,
    &GSMRecords::mmState,
    &GSMRecords::registration,
    &GSMRecords::servingPLMN,
    &GSMRecords::equivalentPLMNs,
    &LTEStateRecords::message2,
    &LTERecords::antennaCount,
    &LTERecords::cellInfo,
    &LTEStateRecords::emm,
    &LTERecords::connectedMode,
    &LTERecords::servingCellMeasurement,
    &LTERecords::idleNeighbors,
    &LTERecords::reselection,
    &LTESignalRecords::idleNeighbors,
    &LTESignalRecords::servingCellSignal,
    &LTESignalRecords::connectedNeighbors,
    &UTRANRecords::neighborMeasurements,
    &UTRANRecords::transportChannelMeasurement,
    &UTRANRecords::gsmNeighborMeasurements,
    &UTRANRecords::rrcState,
    &UTRANRecords::cellInfo,
    &SharedRecords::simFiles,
    &SharedRecords::cellMonitor,
    &SharedRecords::pdpContexts,
};

static_assert(std::ranges::is_sorted(records, {}, &Record::logCode));

} // namespace

std::span<const Record* const> allRecords()
{
    return records;
}

const Record* recordOf(std::uint32_t logCode)
{
    const auto found = std::ranges::lower_bound(records, logCode, {}, &Record::logCode);
    return found != records.end() && (*found)->logCode == logCode ? *found : nullptr;
}

} // namespace ventrik

#include "LogGenerator/Orbel/LTE/ReselectionCandidatesList.h"

#include "LogGenerator/Orbel/LTE/ReselectionRecord.h"
#include "LogGenerator/Orbel/ValueText.h"

#include <array>

namespace ventrik
{

namespace
{

enum Technology : std::uint16_t { LTE, UTRAN, GERAN, CDMA1XRTT, CDMAHRPD, unknownTechnology };

constexpr std::array<std::string_view, 6> technologyLabels{"LTE",       "UTRAN",    "GERAN",
                                                           "CDMA1XRTT", "CDMAHRPD", "??"};

Technology technologyOf(const LogPacket& candidate)
{
    const std::uint16_t value = candidate.u16(2);
    return value < unknownTechnology ? static_cast<Technology>(value) : unknownTechnology;
}

// The bytes of a candidate up to the last one that is read.
std::size_t neededBytes(Technology technology)
{
    switch (technology) {
    case LTE:
    case UTRAN:
    case GERAN:
        return 8;
    case CDMA1XRTT:
    case CDMAHRPD:
        return 12;
    case unknownTechnology:
        break;
    }
    return 4;
}

// Candidate
//   0 u16 priority | 2 u16 radio access technology | 4 technology part:
//   LTE    4 u16 EARFCN | 6.7 9 bits cell identity
//   UTRAN  4 u16 UARFCN | 6 u16 primary scrambling code
//   GERAN  4 u16 ARFCN | 6 u8 band | 7 u8 BSIC
//   CDMA   4 u8 band class | 8 u16 channel | 10 u16 pilot PN
PlistDictionary row(const LogPacket& candidate, Technology technology)
{
    PlistDictionary row{{"Candidate Priority", decimal(candidate.u16(0))},
                        {"Candidate RAT Type", technologyLabels.at(technology)}};
    switch (technology) {
    case LTE:
        row.set("E ARFCN", decimal(candidate.u16(4)));
        row.set("Cell ID", decimal(candidate.u16(6) >> 7));
        break;
    case UTRAN:
        row.set("U ARFCN", decimal(candidate.u16(4)));
        row.set("PSC", decimal(candidate.u16(6)));
        break;
    case GERAN:
        row.set("ARFCN", decimal(candidate.u16(4)));
        row.set("Band", decimal(candidate.u8(6)));
        row.set("BSIC ID", decimal(candidate.u8(7)));
        break;
    case CDMA1XRTT:
    case CDMAHRPD:
        row.set("Band", decimal(candidate.u8(4)));
        row.set("Channel", decimal(candidate.u16(8)));
        row.set("Pilot", decimal(candidate.u16(10)));
        break;
    case unknownTechnology:
        break;
    }
    return row;
}

} // namespace

std::string_view ReselectionCandidatesList::getSectionName() const
{
    return "Reselection Candidates List";
}

std::vector<std::uint32_t> ReselectionCandidatesList::getLogCodeArray() const
{
    return {ReselectionRecord::logCode};
}

void ReselectionCandidatesList::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("Reselection Candidates List");
    if (logCode != ReselectionRecord::logCode)
        return logUnknownMessage(logCode);
    if (packet.size() < ReselectionRecord::minimumSize)
        return;
    clearRows();

    const RecordElements candidates = ReselectionRecord::candidates(packet);
    PlistArray rows;
    for (std::size_t i = 0; i < candidates.completeIn(packet); ++i) {
        const LogPacket candidate = candidates.element(packet, i);
        const Technology technology = technologyOf(candidate);
        if (candidate.size() < neededBytes(technology))
            break; // its technology part is cut
        rows.append(row(candidate, technology));
    }
    showRows(rows);
}

} // namespace ventrik

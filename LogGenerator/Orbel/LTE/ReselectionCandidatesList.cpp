#include "LogGenerator/Orbel/LTE/ReselectionCandidatesList.h"

#include "Packets/LTERecords.h"

#include <algorithm>

namespace ventrik
{

namespace
{

constexpr SectionTable table{
    .name = "Reselection Candidates List",
    .records = {{{.record = &LTERecords::reselection}}},
};

const LTERecords::CandidatePart& partOf(const LogPacket& candidate)
{
    constexpr const Field& technology = LTERecords::candidateFields[1];
    const auto& parts = LTERecords::candidateParts;
    const auto number = static_cast<std::size_t>(numberOf(candidate, technology));
    return parts.at(std::min(number, parts.size() - 1));
}

} // namespace

ReselectionCandidatesList::ReselectionCandidatesList(SystemLog& log) : Base(log, table) {}

void ReselectionCandidatesList::decode(const ShownRecord& shown, const LogPacket& packet)
{
    RowList::Rewrite rows = rewriteRows(*shown.record);
    const RecordElements candidates = LTERecords::candidates.elementsOf(packet);
    for (std::size_t i = 0; i < candidates.completeIn(packet); ++i) {
        const LogPacket candidate = candidates.element(packet, i);
        const LTERecords::CandidatePart& part = partOf(candidate);
        if (candidate.size() < part.needed)
            break; // its technology part is cut
        rows.nextRow(candidates.offset + candidates.stride * i);
        rows.show(LTERecords::candidateFields, candidate);
        rows.show(part.fields, candidate);
    }
}

} // namespace ventrik

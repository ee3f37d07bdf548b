#include "Packets/AllRecords.h"
#include "Packets/RecordCensus.h"

#include <cstdlib>

namespace ventrik
{

namespace
{

// What a layout promises of the packets that it is chosen for.
void check(const LogPacket& packet, const Record& base)
{
    const ChosenLayout chosen = chooseLayout(base, layoutsOf(base.logCode), packet);
    if (!chosen.record || chosen.record->logCode != base.logCode)
        std::abort();
    if (chosen.kind != LayoutKind::Newer)
        return;
    if (packet.size() < chosen.record->minimumSize)
        std::abort();
    for (const List* list : chosen.record->lists) {
        if (!list)
            continue;
        const RecordElements elements = list->elementsOf(packet);
        if (elements.completeIn(packet) != elements.count)
            std::abort();
    }
}

/// The input is a packet, taken for one of every code in turn.
void choose(ByteView input)
{
    Bytes packet(input.begin(), input.end());
    if (packet.size() < logPacketHeaderSize)
        return;
    RecordCensus census(RecordsMode::Extended);
    for (const Record* record : allRecords()) {
        packet[0] = record->logCode >= extraCodeBase ? extraCodePacketType : ordinaryPacketType;
        packet[3] = static_cast<std::uint8_t>(record->logCode);
        packet[4] = static_cast<std::uint8_t>(record->logCode >> 8);
        check(LogPacket(packet), *record);
        census.take(packet);
    }
}

} // namespace

} // namespace ventrik

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    ventrik::choose({data, size});
    return 0;
}

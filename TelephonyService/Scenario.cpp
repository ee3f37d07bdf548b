#include "TelephonyService/Scenario.h"

#include "Packets/PacketBuilder.h"
#include "Packets/RecordWriter.h"
#include "Packets/SharedRecords.h"
#include "Platform/TelephonyConstants.h"
#include "PropertyList/PropertyListWriter.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

namespace ventrik
{

std::optional<TimedMessage> Scenario::next()
{
    while (_messages.empty()) {
        reportStep();
        ++_step;
    }
    TimedMessage message = std::move(_messages.front());
    _messages.pop_front();
    return message;
}

void Scenario::report(PacketBuilder packet)
{
    constexpr std::uint64_t prefixedMessageGap = 7;
    const auto due = _step * stepDuration;
    packet.timestamp(static_cast<std::uint64_t>(due.count()));
    if (++_messageCount % prefixedMessageGap == 0)
        packet.withPrefix();
    _messages.push_back({due, packet.build()});
}

void Scenario::report(const RecordWriter& record)
{
    report(record.packet());
}

void Scenario::reportSimFiles(std::string_view accessTechnology)
{
    reportPropertyList(
        SharedRecords::simFiles.logCode,
        PlistDictionary{{"kSimFile_ICCID", "89490200001234567890"},
                        {"kSimFile_MSISDN", "+491701234567"},
                        {"kSimFile_MBDN", "+491703311"},
                        {"kSimFile_HPPLMN", "30 min"},
                        {"kSimFile_LOCI", "262 07 LAC 4711 updated"},
                        {"kSimFile_PSLOCI", "262 07 RAC 17 updated"},
                        {"kSimFile_ACC", "0x0008"},
                        {"kSimFile_AD", "normal operation, MNC of 2 digits"},
                        {"kSimFile_FPLMN", "262 01, 262 02"},
                        {"kSimFile_AHPLMN", "262 07"},
                        {"kSimFile_RATMODE", "automatic"},
                        {"kSimFile_PNN", "Ventrik Mobile"},
                        {"kSimFile_OPL", "262 07 0000-FFFE"},
                        {"kSimFile_OPLMNAcT", fmt::format("262 07 {}", accessTechnology)}});
}

void Scenario::reportPdpContexts(bool isConnected)
{
    PlistArray contexts{PlistDictionary{{"APN", "ims"},
                                        {"Bearer", "5"},
                                        {"Type", "IPv6"},
                                        {"Address", "2001:db8:2:1::17"},
                                        {"QCI", "5"}}};
    if (isConnected)
        contexts.append(PlistDictionary{{"APN", "internet"},
                                        {"Bearer", "6"},
                                        {"Type", "IPv4v6"},
                                        {"Address", "192.0.2.17"},
                                        {"QCI", "9"}});
    reportPropertyList(SharedRecords::pdpContexts.logCode, contexts);
}

void Scenario::reportPropertyList(std::uint32_t logCode, const PlistValue& root)
{
    _messages.push_back({_step * stepDuration, propertyListPacket(logCode, root)});
}

void Scenario::reportBarePropertyList(const PlistValue& root)
{
    _messages.push_back({_step * stepDuration, propertyListBytes(root).value_or(Bytes())});
}

std::uint16_t rawOf(double value, unsigned bits)
{
    const double top = static_cast<double>((1U << bits) - 1);
    return static_cast<std::uint16_t>(std::clamp(std::round(value), 0.0, top));
}

std::uint8_t byteOf(double value)
{
    return static_cast<std::uint8_t>(rawOf(value, 8));
}

std::uint8_t signedByteOf(double value)
{
    return static_cast<std::uint8_t>(std::clamp(std::lround(value), -128L, 127L));
}

PlistDictionary cellEntry(std::string_view technology, bool isServing)
{
    return {{kQXCellMonitorCellRadioAccessTechnology, technology},
            {kQXCellMonitorCellType,
             isServing ? kQXCellMonitorCellTypeServing : kQXCellMonitorCellTypeNeighbor},
            {kQXCellMonitorMCC, 262},
            {kQXCellMonitorMNC, 7}};
}

} // namespace ventrik

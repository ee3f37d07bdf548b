#include "Tools/RecordReports.h"

#include "Packets/AllRecords.h"

#include <algorithm>
#include <array>
#include <vector>

#include <fmt/format.h>
#include <fmt/ranges.h>

namespace ventrik
{

namespace
{

// Measurements: levels and cells, nothing that tells who somebody is or where he calls.
constexpr std::array<std::uint32_t, 10> measurementCodes{0x4005, 0x4157, 0xB179, 0xB17F, 0xB180,
                                                         0xB181, 0xB186, 0xB192, 0xB193, 0xB195};
constexpr std::uint32_t firstMeasurementOfRange = 0x5100;
constexpr std::uint32_t lastMeasurementOfRange = 0x51FF;

bool holdsNoIdentities(std::uint32_t code)
{
    return std::ranges::find(measurementCodes, code) != measurementCodes.end() ||
           (code >= firstMeasurementOfRange && code <= lastMeasurementOfRange);
}

std::string versionText(const RecordCensus::Kind& kind)
{
    return kind.version ? std::to_string(*kind.version) : "-";
}

bool isUnknown(const RecordCensus::Kind& kind)
{
    return !kind.layout || *kind.layout == LayoutKind::NotKnown;
}

std::string hexadecimal(const Bytes& bytes)
{
    std::string text;
    for (const std::uint8_t byte : bytes)
        fmt::format_to(std::back_inserter(text), "{:02x}", byte);
    return text;
}

std::string times(std::size_t count)
{
    return fmt::format("{} record{}", count, count == 1 ? "" : "s");
}

std::string listText(const std::vector<std::string>& items)
{
    return items.empty() ? "none" : fmt::format("{}", fmt::join(items, ", "));
}

} // namespace

std::string recordTable(const RecordCensus& census)
{
    std::string text = fmt::format("{:<8} {:>7} {:>7} {:<9} {:>10}  {}\n", "code", "version",
                                   "bytes", "layout", "records", "name");
    const auto out = std::back_inserter(text);
    for (const auto& [kind, counted] : census.kinds()) {
        const Record* record = recordOf(kind.logCode);
        fmt::format_to(out, "{:<8} {:>7} {:>7} {:<9} {:>10}  {}\n",
                       fmt::format("0x{:04X}", kind.logCode), versionText(kind), kind.size,
                       kind.layout ? nameOf(*kind.layout) : "-", counted.count,
                       record ? record->name : "not decoded");
    }
    if (census.otherCount() > 0)
        fmt::format_to(out, "and {} of more kinds\n", times(census.otherCount()));
    if (census.brokenCount() > 0)
        fmt::format_to(out, "and {} messages that are no records\n", census.brokenCount());
    return text;
}

std::string codeTable(const CodeReport& report)
{
    std::string text = fmt::format("{:<8} {:>10} {:>10}  {:<12}  {}\n", "code", "records",
                                   "too short", "versions", "sections");
    const auto out = std::back_inserter(text);
    std::vector<std::string> undecoded;
    for (const CodeReport::Code& code : report.came) {
        if (!code.isAskedFor) {
            undecoded.push_back(fmt::format("{} ({})", codeText(code.logCode), code.records));
            continue;
        }
        fmt::format_to(
            out, "{:<8} {:>10} {:>10}  {:<12}  {}\n", codeText(code.logCode), code.records,
            code.tooShort, code.versions.empty() ? "-" : versionsText(code),
            code.sections.empty() ? "-" : fmt::format("{}", fmt::join(code.sections, ", ")));
    }
    std::vector<std::string> missing;
    for (const std::uint32_t code : report.missing)
        missing.push_back(codeText(code));
    fmt::format_to(out, "asked for, never came: {}\n", listText(missing));
    fmt::format_to(out, "came, nobody decodes: {}\n", listText(undecoded));
    return text;
}

std::string unknownRecordReport(const RecordCensus& census, bool withBytes)
{
    std::string text = "Records that cannot be read, by log code, version and size.\n";
    const auto out = std::back_inserter(text);
    const bool isAllKnown =
        census.otherCount() == 0 && std::ranges::none_of(census.kinds(), [](const auto& counted) {
            return isUnknown(counted.first);
        });
    if (isAllKnown)
        text += "none\n";
    for (const auto& [kind, counted] : census.kinds()) {
        if (!isUnknown(kind))
            continue;
        fmt::format_to(out, "0x{:04X} version {} size {}: {}, first payload of {} bytes\n",
                       kind.logCode, versionText(kind), kind.size, times(counted.count),
                       kind.size - logPacketHeaderSize);
        if (withBytes && holdsNoIdentities(kind.logCode))
            fmt::format_to(out, "  {}\n", hexadecimal(counted.firstPayload));
    }
    if (census.otherCount() > 0)
        fmt::format_to(out, "and {} of more kinds\n", times(census.otherCount()));
    return text;
}

std::string reportNotice(const std::string& file, bool withBytes)
{
    if (!withBytes)
        return fmt::format("{} holds log codes, versions, sizes and counts, and no bytes of any "
                           "payload",
                           file);
    return fmt::format("{} holds log codes, versions, sizes and counts, and the first payload of "
                       "each kind of measurement that holds no identities (0xB179, 0xB17F, 0xB180, "
                       "0xB181, 0xB186, 0xB192, 0xB193, 0xB195, 0x4005, 0x4157, 0x51xx)",
                       file);
}

} // namespace ventrik

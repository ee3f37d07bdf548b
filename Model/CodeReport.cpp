#include "Model/CodeReport.h"

#include "Packets/AllRecords.h"
#include "Packets/WantedCodes.h"

#include <algorithm>

#include <fmt/format.h>
#include <fmt/ranges.h>

namespace ventrik
{

CodeReport CodeReport::of(const RecordCensus& census, const LogGenerator* generator)
{
    CodeReport report;
    const WantedCodes wanted =
        generator ? WantedCodes(generator->getStartCommand()) : WantedCodes();
    std::set<std::uint64_t> missing(wanted.codes().begin(), wanted.codes().end());
    for (const auto& [kind, counted] : census.kinds()) {
        if (report.came.empty() || report.came.back().logCode != kind.logCode) {
            missing.erase(kind.logCode);
            report.came.push_back({.logCode = kind.logCode});
            if (generator)
                report.came.back().sections = generator->sectionsOfCode(kind.logCode);
            report.came.back().isAskedFor =
                wanted.wantsAll() || wanted.codes().contains(kind.logCode);
        }
        Code& code = report.came.back();
        code.records += counted.count;
        code.tooShort += counted.isTooShort ? counted.count : 0;
        if (kind.version)
            code.versions.insert(*kind.version);
        code.kinds.emplace_back(kind, counted.count);
    }
    report.missing.assign(missing.begin(), missing.end());
    return report;
}

std::string codeText(std::uint32_t logCode)
{
    return fmt::format("0x{:04X}", logCode);
}

std::string_view nameOfCode(std::uint32_t logCode)
{
    const Record* record = recordOf(logCode);
    return record ? record->name : std::string_view();
}

std::string versionsText(const CodeReport::Code& code)
{
    return fmt::format("{}", fmt::join(code.versions, ", "));
}

std::string kindText(const RecordKind& kind)
{
    std::string text;
    if (kind.version)
        text = fmt::format("version {}, ", *kind.version);
    text += fmt::format("{} bytes", kind.size);
    if (kind.layout)
        text += fmt::format(", {}", nameOf(*kind.layout));
    return text;
}

} // namespace ventrik

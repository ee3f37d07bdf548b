#include "Tools/RecordsPage.h"

#include "LogGenerator/Orbel/GSM/Orbel_GSMClassIndex.h"
#include "LogGenerator/Orbel/LTE/LTEClassIndex.h"
#include "LogGenerator/Orbel/UTRAN/UTRANClassIndex.h"
#include "Packets/AllRecords.h"
#include "Packets/LTESignalRecords.h"

#include <algorithm>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

class NoLog : public SystemLog
{
  public:
    NoLog() : SystemLog(-1) {}

  private:
    void write(int, std::string_view) override {}
};

/// The sections of all technologies, by log code.
class Sections
{
  public:
    std::string of(std::uint32_t code) const
    {
        std::string text;
        add(text, _gsm, "gsm", code);
        add(text, _lte, "lte", code);
        add(text, _utran, "utran", code);
        return text;
    }

  private:
    static void add(std::string& text, const ClassIndex& index, std::string_view technology,
                    std::uint32_t code)
    {
        const auto* subscribers = index.getSubscribers(code);
        if (!subscribers)
            return;
        for (const Base* section : *subscribers)
            text += fmt::format("{}\"{}\" ({})", text.empty() ? "" : ", ",
                                section->getSectionName(), technology);
    }

    NoLog _log;
    Orbel_GSMClassIndex _gsm{_log, RecordsMode::Extended};
    LTEClassIndex _lte{_log, RecordsMode::Extended};
    UTRANClassIndex _utran{_log, RecordsMode::Extended};
};

std::string placeText(const Place& place)
{
    if (place.bit == 0 && place.width % 8 == 0)
        return fmt::format("{} {}{}{}", place.offset, place.isSigned ? 'i' : 'u', place.width,
                           place.isBigEndian ? " big-endian" : "");
    return fmt::format("{}.{} {} bit{}", place.offset, place.bit, place.width,
                       place.width == 1 ? "" : "s");
}

std::string scaleText(const Shown& shown)
{
    std::string text = "raw";
    if (shown.factor != 1)
        text = fmt::format("raw × {}", shown.factor);
    if (shown.offset != 0)
        text += fmt::format(" {} {}", shown.offset < 0 ? "−" : "+", std::abs(shown.offset));
    if (shown.scale)
        text = "by a scale of its own";
    return shown.unit.empty() ? text : fmt::format("{} {}", text, shown.unit);
}

std::string marksText(const Shown& shown)
{
    constexpr std::size_t mostThatAreListed = 8;
    std::string text;
    if (shown.marks.size() > mostThatAreListed)
        return fmt::format("; {} to {}: {}", shown.marks.front().raw, shown.marks.back().raw,
                           shown.marks.front().text);
    for (const Mark& mark : shown.marks)
        text += fmt::format("; {}: {}", mark.raw, mark.text.empty() ? "an empty text" : mark.text);
    if (shown.none)
        text += fmt::format("; {}: nothing", *shown.none);
    return text;
}

std::string shownText(const Shown& shown)
{
    if (shown.text)
        return "digits";
    std::string labels;
    for (std::size_t i = 0; i < shown.labels.size(); ++i)
        if (!shown.labels[i].empty())
            labels += fmt::format("{}{}: {}", labels.empty() ? "" : "; ", i, shown.labels[i]);
    if (shown.labels.empty() && shown.otherwise.empty())
        return scaleText(shown) + marksText(shown);
    std::string text = labels + marksText(shown);
    if (text.starts_with("; "))
        text.erase(0, 2);
    if (!shown.otherwise.empty())
        text += fmt::format("; else {}", shown.otherwise);
    return text;
}

bool isShown(const Field& field)
{
    // Names of fields that do not show are in lower case; C2K's keys begin with a k.
    return field.key.empty() || (std::isupper(static_cast<unsigned char>(field.key.front())) ||
                                 (field.key.size() > 1 && field.key.front() == 'k' &&
                                  !std::islower(static_cast<unsigned char>(field.key[1]))));
}

std::string fieldRows(std::span<const Field> fields)
{
    std::string rows;
    for (const Field& field : fields)
        rows += fmt::format("| {} | {} | {} |\n", field.key.empty() ? "(text)" : field.key,
                            placeText(field.place),
                            isShown(field) ? shownText(field.shown) : "not by itself");
    return rows;
}

std::string table(const std::string& rows)
{
    return rows.empty() ? rows : "| key | where | shows |\n|---|---|---|\n" + rows + "\n";
}

std::string listText(const List& list)
{
    const std::string rows = fieldRows(list.fields) + fieldRows(list.unshown);
    if (rows.empty())
        return rows;
    std::string text = fmt::format("Elements of {} bytes from {} on", list.stride, list.offset);
    if (list.before.bytesEach > 0)
        text += fmt::format(" and {} for each that {} counts", list.before.bytesEach,
                            placeText(list.before.count));
    text += fmt::format(", counted by {}{}", placeText(list.count.place),
                        list.count.more > 0 ? fmt::format(" and {} more", list.count.more) : "");
    if (!list.key.empty())
        text += fmt::format(", under \"{}\"", list.key);
    return text + ":\n\n" + table(rows);
}

std::string recordText(const Record& record)
{
    std::string rows;
    std::vector<const Field*> told; // groups share some
    for (const std::span<const Field> group : record.groups)
        if (group.empty() || std::ranges::find(told, &group.front()) == told.end()) {
            rows += fieldRows(group);
            for (const Field& field : group)
                told.push_back(&field);
        }
    std::string text = table(rows);
    for (const List* list : record.lists)
        if (list)
            text += listText(*list);
    return text;
}

std::string versionsText(const Layout& layout)
{
    if (layout.firstVersion == 0 && layout.lastVersion == 255)
        return {};
    if (layout.firstVersion == layout.lastVersion)
        return fmt::format("version {}", layout.firstVersion);
    return fmt::format("versions {} to {}", layout.firstVersion, layout.lastVersion);
}

std::string sizeText(const Layout& layout)
{
    if (layout.minimumSize == layout.maximumSize)
        return fmt::format("{} bytes", layout.minimumSize);
    if (layout.maximumSize != std::numeric_limits<std::size_t>::max())
        return fmt::format("{} to {} bytes", layout.minimumSize, layout.maximumSize);
    return layout.minimumSize > 0 ? fmt::format("{} bytes or more", layout.minimumSize)
                                  : std::string();
}

std::string conditionText(const Layout& layout)
{
    std::string text;
    for (const std::string& part :
         {versionsText(layout), sizeText(layout), std::string(layout.condition)})
        if (!part.empty())
            text += (text.empty() ? "" : ", ") + part;
    text.front() = static_cast<char>(std::toupper(static_cast<unsigned char>(text.front())));
    return text;
}

// ---- Records of subpackets

std::string neighborText(std::span<const LTESignalRecords::NeighborLayout> layouts)
{
    std::string text;
    for (const auto& layout : layouts)
        text +=
            fmt::format("### Subpacket of version {}\n\nOffsets from the subpacket's first "
                        "byte.\n\n{}{}",
                        layout.version, table(fieldRows(layout.header)), listText(*layout.cells));
    return text;
}

std::string signalText()
{
    using namespace LTESignalRecords;
    std::string text;
    for (const SignalVersion& version : signalVersions) {
        const SignalFields& fields = signalFieldsOf(version);
        std::string rows = fieldRows(fields.cell());
        for (std::size_t i = 0; i < version.order->antennaCount; ++i)
            rows += fieldRows(fields.antenna(i));
        text +=
            fmt::format("### Subpacket of version {}\n\nCells from {} on; offsets from a cell's "
                        "first byte.\n\n{}",
                        version.version, Subpackets::headSize + version.headerSize, table(rows));
    }
    return text;
}

std::string layoutsText(const Record& record)
{
    if (record.logCode == LTESignalRecords::idleNeighbors.logCode)
        return neighborText(LTESignalRecords::idleLayouts);
    if (record.logCode == LTESignalRecords::connectedNeighbors.logCode)
        return neighborText(LTESignalRecords::connectedLayouts);
    if (record.logCode == LTESignalRecords::servingCellSignal.logCode)
        return signalText();
    const auto layouts = layoutsOf(record.logCode);
    std::string text;
    if (!record.isExtension)
        text = fmt::format("### Base layout, {} bytes or more\n\n{}", record.minimumSize,
                           recordText(record));
    for (const Layout& layout : layouts)
        if (layout.record != &record || record.isExtension)
            text += fmt::format("### {}\n\n{}", conditionText(layout), recordText(*layout.record));
    return text;
}

} // namespace

std::string recordsPage()
{
    // Class indices say farewell on standard output when they go.
    static const Sections sections;
    std::string text =
        "# Records\n\n"
        "What is read of each record, by log code. This page is made of the tables in `Packets/` "
        "(`cmake --build build/dev --target update-records-page`).\n\n"
        "Where a field stands is said by its first byte, counted from the packet's type byte (in "
        "elements: from the element's first byte), and its type; `o.b w` are w bits from bit b of "
        "the little-endian word at o on. A record whose version and size fit none of its layouts "
        "is read by the base layout, and marked. Records without a base layout are read with "
        "`--records extended` only.\n\n";
    for (const Record* record : allRecords()) {
        text += fmt::format("## 0x{:04X} {}\n\n", record->logCode, record->name);
        if (const std::string shown = sections.of(record->logCode); !shown.empty())
            text += fmt::format("Shown in {}.\n\n", shown);
        text += layoutsText(*record);
    }
    while (text.ends_with("\n\n"))
        text.pop_back();
    return text;
}

} // namespace ventrik

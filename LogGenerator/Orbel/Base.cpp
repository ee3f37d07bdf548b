#include "LogGenerator/Orbel/Base.h"

#include "LogGenerator/Orbel/ArrayLock.h"
#include "LogGenerator/Orbel/ValueText.h"
#include "Platform/TelephonyConstants.h"

#include <algorithm>
#include <array>

namespace ventrik
{

namespace
{

struct EcnoStep {
    std::uint32_t from;
    std::int16_t value;
};

// From the top; the first step that the raw value reaches counts. The last two rungs are both -31.
constexpr std::array<EcnoStep, 33> ecnoSteps{{
    {524288, 0},  {417648, -1}, {331809, -2}, {263625, -3}, {209464, -4}, {166442, -5},
    {132269, -6}, {105124, -7}, {83563, -8},  {66436, -9},  {52831, -10}, {42024, -11},
    {33441, -12}, {26622, -13}, {21206, -14}, {16904, -15}, {13487, -16}, {10772, -17},
    {8616, -18},  {6903, -19},  {5543, -20},  {4462, -21},  {3604, -22},  {2922, -23},
    {2241, -24},  {1950, -25},  {1608, -26},  {1337, -27},  {1121, -28},  {950, -29},
    {814, -30},   {757, -31},   {706, -31},
}};

} // namespace

void Base::initWithDict(ClassDictionary& classDictionary, CodeDictionary& codeDictionary)
{
    classDictionary[getSectionName()] = this;
    updateLogCodeDict(codeDictionary);
}

void Base::updateSectionRef(const PlistValue& container)
{
    sectionRef = WeakContainer(container);
    log().warning("{}", getSectionName());
}

void Base::updateLogCodeDict(CodeDictionary& codeDictionary)
{
    const auto codes = getLogCodeArray();
    log().warning("Array Count: {}", codes.size());
    for (const std::uint32_t code : codes)
        codeDictionary.append(code, *this);
}

void Base::clearElementsInArray(PlistArray& array)
{
    const ArrayLock::Scope locked;
    array.clear();
}

void Base::replaceArray(PlistArray& array, const PlistArray& newElements)
{
    const ArrayLock::Scope locked;
    array.clear();
    array.reserve(newElements.size());
    for (const PlistValue& element : newElements)
        array.append(element);
}

std::int16_t Base::lookUpECNO(std::uint32_t rawValue)
{
    const auto* step = std::ranges::find_if(
        ecnoSteps, [&](std::uint32_t from) { return rawValue >= from; }, &EcnoStep::from);
    return step == ecnoSteps.end() ? std::int16_t{0} : step->value;
}

void Base::show(std::string_view key, PlistValue value) const
{
    if (auto dictionary = sectionRef.dictionary())
        dictionary->set(key, std::move(value));
}

void Base::withdraw(std::string_view key) const
{
    if (auto dictionary = sectionRef.dictionary())
        dictionary->remove(key);
}

std::optional<PlistArray> Base::getCellArray(const LogPacket& packet) const
{
    auto cells = parseCellMonitorArray(packet, log());
    if (!cells)
        log().error("Failed to get Cell Array\n");
    return cells;
}

void Base::showCellFields(const PlistDictionary& cell, std::span<const CellField> fields,
                          std::string_view nameInLog) const
{
    for (const CellField& field : fields) {
        if (const auto number = cellNumber(cell, field.cellKey))
            show(field.displayKey, decimal(*number));
        else
            log().error("{}: Failed to retrieve {}\n", nameInLog, field.nameInLog);
    }
}

void Base::showNeighborCells(const LogPacket& packet, std::string_view technology,
                             std::span<const CellRowField> fields, std::string_view nameInLog) const
{
    clearRows();
    const auto cells = getCellArray(packet);
    if (!cells)
        return;
    PlistArray rows;
    for (const PlistValue& element : *cells) {
        const PlistDictionary* cell = element.dictionary();
        if (!cell || !isCell(*cell, technology, kQXCellMonitorCellTypeNeighbor))
            continue;
        PlistDictionary row;
        for (const CellRowField& field : fields) {
            if (const auto number = cellNumber(*cell, field.cellKey))
                row.set(field.rowKey, field.text(*number));
            else
                log().error("{}: Failed to retrieve {}\n", nameInLog, field.rowKey);
        }
        rows.append(row);
    }
    showRows(rows);
}

void Base::clearRows() const
{
    if (auto list = sectionRef.array())
        clearElementsInArray(*list);
}

void Base::showRows(const PlistArray& rows) const
{
    if (auto list = sectionRef.array())
        replaceArray(*list, rows);
}

void Base::logUnknownMessage(std::uint32_t logCode) const
{
    log().error("Received an unknown log message: {}", static_cast<std::int32_t>(logCode));
}

} // namespace ventrik

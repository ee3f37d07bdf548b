#include "LogGenerator/Orbel/OrbelLogGenerator.h"

#include "LogGenerator/Core/StateKeys.h"
#include "LogGenerator/Orbel/BuildDate.h"
#include "LogGenerator/Orbel/ETLDLF.h"
#include "PropertyList/PropertyListReader.h"

#include <fmt/format.h>

namespace ventrik
{

namespace
{

// Facility 2 at emergency level: the DLF writer's failures stand apart from all others.
constexpr int dlfPriority = 16;

} // namespace

void OrbelLogGenerator::init()
{
    LogGenerator::init();
    if (rawPackets() == RawPackets::Kept)
        _binData.emplace();
}

void OrbelLogGenerator::keepPacket(ByteView packet)
{
    if (_binData)
        _binData->append(packet);
}

void OrbelLogGenerator::storePacketsInState(PlistDictionary& state)
{
    if (!_binData)
        return;
    if (_binData->droppedCount() > 0)
        log().error("The period's raw packets are above {} MiB: the oldest {} are dropped",
                    PeriodPackets::maximumSize >> 20, _binData->droppedCount());
    state.set(StateKey::displayState, _binData->take());
}

std::optional<PlistValue> OrbelLogGenerator::loadTemplate(PlistDictionary& state,
                                                          const std::string& name,
                                                          std::string_view failureLine)
{
    if (const PlistValue* loaded = state.find(StateKey::displayTemplate))
        return *loaded;
    auto loaded = _isTemplateBad ? std::nullopt : readWholeTemplate(name);
    if (loaded)
        state.set(StateKey::displayTemplate, *loaded);
    else
        log().error("{}", failureLine);
    return loaded;
}

std::optional<PlistValue> OrbelLogGenerator::readWholeTemplate(const std::string& name)
{
    auto whole = readTemplate(name);
    if (!whole || _templateExtension.empty())
        return whole;
    const auto extension = readTemplate(_templateExtension);
    if (!extension)
        return std::nullopt;
    for (const auto& [key, entry] : *extension->dictionary())
        whole->dictionary()->set(key, entry);
    return whole;
}

// One that is missing may come; looking for it costs little.
std::optional<PlistValue> OrbelLogGenerator::readTemplate(const std::string& name)
{
    const auto path = resources().path(name, "plist");
    if (!path) {
        _templateFault = name.empty() ? "there is no display template for this technology"
                                      : fmt::format("display template {}.plist is missing", name);
        return std::nullopt;
    }
    _templatePath = *path;
    _templateFault.clear();
    const auto contents = resources().contents(*path);
    const auto reading = contents ? readPropertyList(*contents) : PropertyListReading{};
    if (!contents)
        rejectTemplate("it cannot be read");
    else if (!reading)
        rejectTemplate(reading.error);
    else if (!reading.value->dictionary())
        rejectTemplate(
            fmt::format("it is no dictionary but of type {}", reading.value->kindName()));
    return _isTemplateBad ? std::nullopt : reading.value;
}

void OrbelLogGenerator::rejectTemplate(std::string_view reason)
{
    _isTemplateBad = true;
    _templateFault = fmt::format("display template {}: {}", _templatePath, reason);
}

std::optional<Bytes> OrbelLogGenerator::makeVersionReport() const
{
    const auto version = resources().applicationVersion();
    const auto versionText = version ? fmt::format("Ventrik {}", *version) : "(none)";
    const auto now = clock().now();
    const auto zone = clock().timeZone(now);
    const auto seconds = std::chrono::floor<std::chrono::seconds>(now).time_since_epoch().count();
    const ETLDLFTimeRecord time{static_cast<std::uint32_t>(seconds),
                                static_cast<std::int16_t>(zone.secondsFromUtc / 60),
                                static_cast<std::uint8_t>(zone.isDaylightSaving)};

    Bytes report(etlDLFVersionReportSize);
    std::size_t written = 0;
    const int result =
        ETLDLFAddVersionReport(report.data(), report.size(), &written, 1, 1, versionText.c_str(),
                               "EXECUTABLE_NAME", buildDate(), &time);
    if (result != etlDLFSuccess) {
        log().log(dlfPriority, "Could not write DLF header (result={})", result);
        return std::nullopt;
    }
    return report;
}

std::optional<Bytes> OrbelLogGenerator::generateDlfFromState(const PlistDictionary& state) const
{
    auto dlf = makeVersionReport();
    const PlistValue* history = state.find(StateKey::history);
    if (!dlf || !history || !history->array())
        return dlf;

    for (const PlistValue& entry : *history->array()) {
        const PlistDictionary* period = entry.dictionary();
        const PlistValue* displayState = period ? period->find(StateKey::displayState) : nullptr;
        if (!displayState)
            continue;
        const Bytes* packets = displayState->data();
        if (!packets) {
            log().log(dlfPriority,
                      "Got wrong class writing history to DLF; aborting writing the DLF file");
            return std::nullopt;
        }
        // Without its leading type byte a packet has the layout of a DLF record. Only the first
        // packet of a period is cut this way.
        if (packets->size() >= 2)
            dlf->insert(dlf->end(), packets->begin() + 1, packets->end());
    }
    return dlf;
}

PlistValue OrbelLogGenerator::getSaveContentsFromState(const PlistDictionary& state) const
{
    const PlistValue* history = state.find(StateKey::history);
    PlistArray contents = history && history->array() ? history->array()->copy() : PlistArray();
    if (auto dlf = generateDlfFromState(state)) {
        PlistDictionary entry;
        entry.set("Description", fmt::format("DLF binary ({} bytes)", dlf->size()));
        entry.set("DLF", std::move(*dlf));
        contents.append(std::move(entry));
    }
    return contents;
}

} // namespace ventrik

#include "LogGenerator/Orbel/OrbelLogGenerator2.h"

#include "LogGenerator/Core/StateKeys.h"
#include "LogGenerator/Orbel/UnparsableDataException.h"

#include <algorithm>
#include <charconv>
#include <map>
#include <utility>

namespace ventrik
{

namespace
{

std::optional<std::size_t> rowNumber(std::string_view text)
{
    std::size_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    return error == std::errc() && end == text.data() + text.size() ? std::optional(number)
                                                                    : std::nullopt;
}

} // namespace

OrbelLogGenerator2::~OrbelLogGenerator2()
{
    log().warning("Orbel_GSMLogGenerator is destructed {}", fmt::ptr(this));
}

void OrbelLogGenerator2::initWithPListName(std::string templateName,
                                           std::shared_ptr<ClassIndex> classIndex)
{
    log().error("Creating OrbelLogGenerator2 object with {}", fmt::ptr(classIndex.get()));
    OrbelLogGenerator::init();
    pListName = std::move(templateName);
    cIndex = std::move(classIndex);
    log().error("Class Index: {}", cIndex.use_count());
}

void OrbelLogGenerator2::updateState(PlistDictionary& state, ByteView data)
{
    // The display comes first, so that the sections are bound before the packet is decoded.
    ensureDisplay(state);
    updateWithData(data);
    keepPacket(data);
}

void OrbelLogGenerator2::updateWithData(ByteView data)
{
    _lastRead = nullptr;
    if (data.size() < logPacketHeaderSize)
        return;
    const LogPacket packet(stripPrefix(data), _propertyLists);
    const std::uint8_t type = packet.u8(0);
    if (type != ordinaryPacketType && type != extraCodePacketType) {
        log().error("Invalid log type: {:x}. Dropping.", type);
        return;
    }
    const std::uint32_t logCode = effectiveLogCode(packet);
    const auto* subscribers = cIndex ? cIndex->getSubscribers(logCode) : nullptr;
    if (!subscribers)
        return;
    for (Base* section : *subscribers) {
        deliver(packet, logCode, *section);
        if (const ReadLayout* read = section->lastRead())
            _lastRead = read;
    }
}

void OrbelLogGenerator2::deliver(const LogPacket& packet, std::uint32_t logCode, Base& section)
{
    try {
        section.updateWithData(packet, logCode);
    } catch (const UnparsableDataException&) {
        // The section has said so in the log; the display stays, later sections and packets go on.
    }
}

std::optional<PlistValue> OrbelLogGenerator2::generateLogUsingState(PlistDictionary& state)
{
    auto display = getDisplayFromState(state);
    storePacketsInState(state);
    recordDisplay(state);
    return display;
}

std::optional<PlistValue> OrbelLogGenerator2::getDisplayFromState(PlistDictionary& state)
{
    const PlistValue* display = ensureDisplay(state);
    return display ? std::optional(*display) : std::nullopt;
}

const PlistValue* OrbelLogGenerator2::ensureDisplay(PlistDictionary& state)
{
    const PlistDictionary::Entry* entry = std::as_const(state).entryAt(_displayPlace);
    if (entry && _boundDisplay.refersTo(entry->value) && entry->isUnder(StateKey::display))
        return &entry->value;
    claimDisplay(state, displayOwner());
    const PlistValue* display = state.find(StateKey::display);
    _displayPlace = state.placeOf(StateKey::display).value_or(0);
    if (display) {
        // After a restart the display of the generator before us is still in the state: values go
        // on where they stood, so our sections take over its containers.
        const PlistValue* displayTemplate = state.find(StateKey::displayTemplate);
        if (displayTemplate && display->dictionary() && !_boundDisplay.refersTo(*display)) {
            bindSections(*displayTemplate, *display);
            _boundDisplay = WeakContainer(*display);
        }
        return display;
    }
    if (const auto built = buildDisplay(state)) {
        printDict(*built);
        _boundDisplay = WeakContainer(*built);
        state.set(StateKey::display, *built);
        state.set(StateKey::extraInfo, PlistDictionary());
    }
    return nullptr;
}

std::optional<CellPlace>
OrbelLogGenerator2::cellPlaceAt(const PlistDictionary&,
                                std::span<const std::string_view> path) const
{
    for (std::size_t i = 0; cIndex && i + 1 < path.size(); ++i) {
        const Base* section = cIndex->getClass(path[i]);
        if (!section)
            continue;
        const auto rest = path.subspan(i + 1);
        // A value; a value of one of the section's rows; one of a row under a key.
        if (rest.size() == 1)
            return CellPlace{.section = section, .key = rest[0]};
        const auto row = rowNumber(rest[rest.size() - 2]);
        if (rest.size() > 3 || !row)
            break;
        return CellPlace{section, rest.size() == 3 ? rest[0] : std::string_view(), row,
                         rest.back()};
    }
    return CellPlace{};
}

std::optional<ShownCell> OrbelLogGenerator2::cellAt(CellPlace& place) const
{
    const auto* section = static_cast<const Base*>(place.section);
    return section ? section->cellAt(place) : std::nullopt;
}

std::optional<ValueOrigin>
OrbelLogGenerator2::originOf(const PlistDictionary& state,
                             std::span<const std::string_view> path) const
{
    const auto place = cellPlaceAt(state, path);
    if (!place || !place->section)
        return std::nullopt;
    const Base& section = *static_cast<const Base*>(place->section);
    return place->row ? section.originOf(place->list, *place->row, place->key)
                      : section.originOf(place->key);
}

std::string_view OrbelLogGenerator2::sectionAt(const PlistDictionary&,
                                               std::span<const std::string_view> path) const
{
    for (const std::string_view name : path)
        if (const Base* section = cIndex ? cIndex->getClass(name) : nullptr)
            return section->getSectionName();
    return {};
}

std::vector<std::string_view> OrbelLogGenerator2::sectionsOfCode(std::uint32_t logCode) const
{
    std::vector<std::string_view> names;
    if (const auto* sections = cIndex ? cIndex->getSubscribers(logCode) : nullptr)
        for (const Base* section : *sections)
            names.push_back(section->getSectionName());
    return names;
}

std::vector<ReadLayout> OrbelLogGenerator2::layoutsAt(const PlistDictionary&,
                                                      std::span<const std::string_view> path) const
{
    for (const std::string_view name : path)
        if (const Base* section = cIndex ? cIndex->getClass(name) : nullptr)
            return section->layouts();
    return {};
}

std::vector<ReadLayout> OrbelLogGenerator2::layouts() const
{
    std::map<std::uint32_t, ReadLayout> byCode;
    if (cIndex)
        for (const auto& [name, section] : cIndex->sections())
            for (const ReadLayout& layout : section->layouts())
                byCode.emplace(layout.logCode, layout);
    std::vector<ReadLayout> result;
    for (const auto& [code, layout] : byCode)
        result.push_back(layout);
    return result;
}

// An extended display has places that the plain one has not.
std::string OrbelLogGenerator2::displayOwner() const
{
    return templateExtension().empty() ? pListName
                                       : fmt::format("{}+{}", pListName, templateExtension());
}

std::optional<PlistValue> OrbelLogGenerator2::buildDisplay(PlistDictionary& state)
{
    const auto displayTemplate = loadTemplate(state, pListName, "Cannot load template for display");
    if (!displayTemplate || _cannotBuild)
        return std::nullopt;
    log().warning("Initialized class index: {}, Self: {}", fmt::ptr(cIndex.get()), fmt::ptr(this));
    if (cIndex)
        cIndex->status();
    auto display = processTemplate(*displayTemplate);
    if (!display) {
        _cannotBuild = true;
        rejectTemplate("it holds a value that is neither text nor array nor dictionary");
    }
    return display;
}

std::optional<PlistValue> OrbelLogGenerator2::processTemplate(const PlistValue& value)
{
    if (value.string())
        return value;
    if (const PlistArray* elements = value.array()) {
        PlistArray result;
        for (const PlistValue& element : *elements) {
            auto processed = processTemplate(element);
            if (!processed)
                return std::nullopt;
            result.append(std::move(*processed));
        }
        return result;
    }
    if (const PlistDictionary* entries = value.dictionary()) {
        PlistDictionary result;
        for (const auto& [key, entry] : *entries) {
            auto processed = processTemplate(entry);
            if (!processed)
                return std::nullopt;
            bindSection(key, *processed);
            result.set(key, std::move(*processed));
        }
        return result;
    }
    log().error("Received an object of unknown type");
    log().warning("Processing the template");
    return std::nullopt;
}

void OrbelLogGenerator2::bindSection(std::string_view name, const PlistValue& container)
{
    if (Base* section = cIndex ? cIndex->getClass(name) : nullptr)
        section->updateSectionRef(container);
}

void OrbelLogGenerator2::bindSections(const PlistValue& displayTemplate, const PlistValue& display)
{
    if (displayTemplate.array() && display.array()) {
        const PlistArray& elements = *display.array();
        const std::size_t count = std::min(elements.size(), displayTemplate.array()->size());
        for (std::size_t i = 0; i < count; ++i)
            bindSections((*displayTemplate.array())[i], elements[i]);
    }
    if (!displayTemplate.dictionary() || !display.dictionary())
        return;
    for (const auto& [key, entry] : *displayTemplate.dictionary())
        if (const PlistValue* displayed = display.dictionary()->find(key)) {
            bindSections(entry, *displayed);
            bindSection(key, *displayed);
        }
}

void OrbelLogGenerator2::printDict(const PlistValue& value) const
{
    if (value.string())
        return;
    if (const PlistDictionary* entries = value.dictionary())
        for (const auto& [key, entry] : *entries)
            printDict(entry);
    else if (const PlistArray* elements = value.array())
        for (const PlistValue& element : *elements)
            printDict(element);
    else
        log().error("Received an object of unknown type");
}

PlistDictionary OrbelLogGenerator2::getStartCommand() const
{
    PlistArray logCodes;
    PlistArray extraCodes;
    if (cIndex) {
        for (const std::string& text : cIndex->getAllLogCodes()) {
            std::uint32_t code = 0;
            std::from_chars(text.data(), text.data() + text.size(), code);
            if (code >= extraCodeBase)
                extraCodes.append(code - extraCodeBase);
            else
                logCodes.append(code);
        }
    }
    return {
        {"SetState", "Streaming"}, {"SetOrbelLogCodes", logCodes}, {"SetQxExtraCodes", extraCodes}};
}

} // namespace ventrik

#include "LogGenerator/GSM/GSMLogGenerator.h"

#include "LogGenerator/Core/AssertionFailure.h"
#include "LogGenerator/Core/StateKeys.h"
#include "PropertyList/PropertyListReader.h"

#include <cstdio>
#include <cstdlib>

namespace ventrik
{

namespace
{

constexpr std::string_view displayOwner = "GSMLogGenerator";

// The places that support knows the two failures by.
constexpr std::string_view sourceName = "LogGenerator/GSM/GSMLogGenerator";
constexpr int unknownObjectLine = 78;
constexpr int notDeserializedLine = 90;

[[noreturn]] void failAssertion(const std::string& description, int line, SystemLog& log)
{
    const auto text =
        fmt::format("Assertion failure: {} ({}, line {})", description, sourceName, line);
    log.error("{}", text);
    throw AssertionFailure(text);
}

// Whatever was printed or logged so far must not be lost with the process.
[[noreturn]] void endProcess(const AssertionFailure& failure, SystemLog& log)
{
    log.showOnConsole(fmt::format("{}\n", failure.what()));
    log.flush();
    std::fflush(nullptr);
    std::abort();
}

std::optional<PlistValue> singleValue(const PlistValue& value)
{
    const PlistDictionary* entries = value.dictionary();
    if (!entries || entries->size() != 1)
        return std::nullopt;
    return entries->begin()->value;
}

// A value inside another one.
PlistValue processInner(const PlistValue& value, SystemLog& log)
{
    const PlistValue processed = GSMLogGenerator::processObject(value, log);
    return singleValue(processed).value_or(processed);
}

} // namespace

std::unique_ptr<GSMLogGenerator> GSMLogGenerator::generator(const GeneratorServices& services)
{
    auto result = std::unique_ptr<GSMLogGenerator>(new GSMLogGenerator(services));
    result->init();
    return result;
}

void GSMLogGenerator::updateState(PlistDictionary& state, ByteView data)
{
    try {
        takeMessage(state, data);
    } catch (const AssertionFailure& failure) {
        if (assertions() == AssertionPolicy::Throw)
            throw;
        endProcess(failure, log());
    }
}

void GSMLogGenerator::takeMessage(PlistDictionary& state, ByteView data)
{
    const PropertyListReading reading = readPropertyList(data);
    if (!reading)
        failAssertion("Could not deserialize the object", notDeserializedLine, log());
    const PlistValue display = processObject(*reading.value, log());
    claimDisplay(state, displayOwner);
    state.set(StateKey::displayState, *reading.value);
    state.set(StateKey::display, display);
    state.set(StateKey::extraInfo, PlistDictionary());
}

std::optional<PlistValue> GSMLogGenerator::generateLogUsingState(PlistDictionary& state)
{
    claimDisplay(state, displayOwner);
    recordDisplay(state);
    const PlistValue* display = state.find(StateKey::display);
    return display ? std::optional(*display) : std::nullopt;
}

PlistDictionary GSMLogGenerator::getStartCommand() const
{
    return {{"SetState", "Streaming"}};
}

PlistValue GSMLogGenerator::getSaveContentsFromState(const PlistDictionary& state) const
{
    const PlistValue* history = state.find(StateKey::history);
    return history && history->array() ? history->array()->copy() : PlistArray();
}

PlistValue GSMLogGenerator::processObject(const PlistValue& value, SystemLog& log)
{
    if (value.string())
        return value;
    if (const PlistDictionary* entries = value.dictionary()) {
        PlistDictionary result;
        for (const auto& [key, entry] : *entries)
            result.set(key, processInner(entry, log));
        return result;
    }
    if (const PlistArray* elements = value.array()) {
        // The first element of every array is the service's own business.
        PlistArray result;
        for (std::size_t i = 1; i < elements->size(); ++i)
            result.append(processInner((*elements)[i], log));
        return result;
    }
    failAssertion(fmt::format("Unknown object of type {} encountered", value.kindName()),
                  unknownObjectLine, log);
}

std::optional<PlistValue> GSMLogGenerator::canCollapse(const PlistValue& value) const
{
    return singleValue(value);
}

} // namespace ventrik

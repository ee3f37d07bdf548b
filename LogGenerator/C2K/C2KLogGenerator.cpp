#include "LogGenerator/C2K/C2KLogGenerator.h"

#include "LogGenerator/C2K/ActiveSetPilots.h"
#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/C2K/DataRates.h"
#include "LogGenerator/C2K/EVDOStatus.h"
#include "LogGenerator/C2K/FingerC2I.h"
#include "LogGenerator/C2K/OneXServingSystem.h"
#include "LogGenerator/C2K/OneXStatus.h"
#include "LogGenerator/C2K/OneXTrafficFER.h"
#include "Packets/LogPacket.h"

#include <algorithm>
#include <array>

namespace ventrik
{

namespace
{

constexpr const char* templateName = "C2KTemplate";

struct Decoder {
    std::uint32_t logCode;
    void (*decode)(const LogPacket& packet, const C2KOutput& output);
};

// In the order of the start command.
constexpr std::array<Decoder, 8> decoders{{{0x108A, decodeFingerC2I},
                                           {0x1183, decodeEVDOStatus},
                                           {0x1192, decodeForwardDataRate},
                                           {0x12B6, decodeActiveSetPilots},
                                           {0x119C, decodeOneXStatus},
                                           {0x119D, decodeOneXTrafficFER},
                                           {0x127E, decodeReverseDataRate},
                                           {0x134F, decodeOneXServingSystem}}};

} // namespace

std::unique_ptr<C2KLogGenerator> C2KLogGenerator::generator(const GeneratorServices& services)
{
    auto result = std::unique_ptr<C2KLogGenerator>(new C2KLogGenerator(services));
    result->init();
    return result;
}

PlistDictionary C2KLogGenerator::getStartCommand() const
{
    PlistArray logCodes;
    for (const Decoder& decoder : decoders)
        logCodes.append(decoder.logCode);
    return {{"SetState", "Streaming"}, {"SetOrbelLogCodes", logCodes}};
}

void C2KLogGenerator::updateState(PlistDictionary& state, ByteView data)
{
    getDisplayFromState(state);
    const PlistValue* found = state.find("Lookup");
    if (!found || !found->dictionary())
        return updateFromLog(data, nullptr, state);
    // Held here, because the decoders change the state.
    const PlistDictionary lookup = *found->dictionary();
    updateFromLog(data, &lookup, state);
}

void C2KLogGenerator::updateFromLog(ByteView data, const PlistDictionary* lookup,
                                    PlistDictionary& state)
{
    if (data.size() < logPacketHeaderSize)
        return;
    const LogPacket packet(stripPrefix(data));
    // Another type is reported, and decoded all the same.
    if (packet.u8(0) != ordinaryPacketType)
        log().error("Invalid log type: {:x}. Dropping.", packet.u8(0));
    const auto* decoder = std::ranges::find(decoders, effectiveLogCode(packet), &Decoder::logCode);
    if (decoder == decoders.end())
        return;
    decoder->decode(packet, C2KOutput(lookup, state, log()));
    keepPacket(packet.bytes());
}

std::optional<PlistValue> C2KLogGenerator::generateLogUsingState(PlistDictionary& state)
{
    auto display = getDisplayFromState(state);
    storePacketsInState(state);
    recordDisplay(state);
    return display;
}

std::optional<PlistValue> C2KLogGenerator::getDisplayFromState(PlistDictionary& state)
{
    claimDisplay(state, templateName);
    if (const PlistValue* display = state.find("Display"))
        return *display;
    const auto displayTemplate =
        loadTemplate(state, templateName, "Cannot load C2K template for display");
    if (!displayTemplate)
        return std::nullopt;
    PlistDictionary display;
    PlistDictionary lookup;
    processTemplate(*displayTemplate->dictionary(), display, lookup, log());
    state.set("Display", display);
    state.set("Lookup", lookup);
    state.set("ExtraInfo", PlistDictionary());
    return display;
}

void C2KLogGenerator::processTemplate(const PlistDictionary& displayTemplate,
                                      PlistDictionary& display, PlistDictionary& lookup,
                                      SystemLog& log)
{
    for (const auto& [label, value] : displayTemplate) {
        if (const PlistDictionary* group = value.dictionary()) {
            PlistDictionary displayed;
            processTemplate(*group, displayed, lookup, log);
            display.set(label, displayed);
        } else if (value == "_sorted") {
            display.set(label, value);
        } else if (const std::string* lookupKey = value.string()) {
            display.set(label, "");
            if (!lookup.contains(*lookupKey))
                lookup.set(*lookupKey, PlistArray());
            lookup.find(*lookupKey)
                ->array()
                ->append(PlistDictionary{{"key", label}, {"dict", display}});
        }
    }
    log.warning("Processing the template");
}

} // namespace ventrik

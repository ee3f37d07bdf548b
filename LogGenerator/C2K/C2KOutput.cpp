#include "LogGenerator/C2K/C2KOutput.h"

#include "LogGenerator/Core/StateKeys.h"

#include <utility>

namespace ventrik
{

void C2KOutput::publish(const Field& field, const LogPacket& part) const
{
    _labels.publish(field, _record, numberOf(part, field));
}

void C2KOutput::publish(std::span<const Field> fields, const LogPacket& part) const
{
    _labels.publish(fields, _record, part);
}

void C2KOutput::publish(const Field& field, std::string_view text) const
{
    _labels.publish(field, text);
}

void C2KOutput::publish(std::span<const Field> fields, std::string_view text) const
{
    _labels.publish(fields, text);
}

void C2KOutput::publish(const Field& field, std::vector<ShownPilot> pilots,
                        std::string_view textOfNone) const
{
    _labels.publish(field, std::move(pilots), textOfNone);
}

PlistDictionary* C2KOutput::extraInfo() const
{
    PlistValue* extraInfo = _state.find(StateKey::extraInfo, _totals.extraInfo);
    return extraInfo ? extraInfo->dictionary() : nullptr;
}

} // namespace ventrik

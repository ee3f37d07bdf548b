#include "LogGenerator/C2K/C2KOutput.h"

namespace ventrik
{

void C2KOutput::publish(std::string_view lookupKey, const PlistValue& value) const
{
    const PlistValue* found = _lookup ? _lookup->find(lookupKey) : nullptr;
    const PlistArray* entries = found ? found->array() : nullptr;
    if (!entries)
        return;
    for (const PlistValue& element : *entries) {
        const PlistDictionary* entry = element.dictionary();
        const PlistValue* label = entry ? entry->find("key") : nullptr;
        const PlistValue* group = entry ? entry->find("dict") : nullptr;
        if (!label || !label->string() || !group || !group->dictionary())
            return;
        PlistDictionary(*group->dictionary()).set(*label->string(), value);
    }
}

void C2KOutput::keepExtra(std::string_view key, const PlistValue& value) const
{
    PlistValue* extraInfo = _state.find("ExtraInfo");
    if (extraInfo && extraInfo->dictionary())
        extraInfo->dictionary()->set(key, value);
}

} // namespace ventrik

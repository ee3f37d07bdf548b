#include "Packets/WantedCodes.h"

#include "Packets/LogPacket.h"

#include <optional>
#include <string_view>

namespace ventrik
{

namespace
{

constexpr std::string_view logCodesKey = "SetOrbelLogCodes";
constexpr std::string_view extraCodesKey = "SetQxExtraCodes";

// The effective log code of a packet that is long enough to have one.
std::optional<std::uint64_t> codeOf(ByteView message)
{
    const ByteView packet = stripPrefix(message);
    return hasLogCode(packet) ? std::optional<std::uint64_t>(effectiveLogCode(LogPacket(packet)))
                              : std::nullopt;
}

void collectCodes(const PlistDictionary& command, std::string_view key, std::uint64_t base,
                  std::unordered_set<std::uint64_t>& codes)
{
    const PlistValue* list = command.find(key);
    if (!list || !list->array())
        return;
    for (const PlistValue& code : *list->array())
        if (code.integer())
            codes.insert(code.integer()->bits() + base);
}

} // namespace

WantedCodes::WantedCodes(const PlistDictionary& startCommand)
    : _wantsAll(!startCommand.contains(logCodesKey) && !startCommand.contains(extraCodesKey))
{
    collectCodes(startCommand, logCodesKey, 0, _codes);
    collectCodes(startCommand, extraCodesKey, extraCodeBase, _codes);
}

bool WantedCodes::wants(ByteView message) const
{
    if (_wantsAll)
        return true;
    const auto code = codeOf(message);
    return code && _codes.contains(*code);
}

} // namespace ventrik

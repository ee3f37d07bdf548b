#include "Tests/TelephonyService/ScenarioFixture.h"

#include "Packets/LogPacket.h"
#include "Tests/Support/ResourceFiles.h"

#include <algorithm>

#include <fmt/format.h>

namespace ventrik
{

std::vector<TimedMessage> messagesUpTo(MessageSource& source, std::chrono::seconds end)
{
    std::vector<TimedMessage> messages;
    for (auto message = source.next(); message && message->due < end; message = source.next())
        messages.push_back(std::move(*message));
    return messages;
}

std::uint32_t codeOf(const TimedMessage& message)
{
    return effectiveLogCode(LogPacket(stripPrefix(message.data)));
}

std::set<std::uint32_t> codesOf(const std::vector<TimedMessage>& messages)
{
    std::set<std::uint32_t> codes;
    for (const TimedMessage& message : messages)
        codes.insert(codeOf(message));
    return codes;
}

bool areSame(const std::vector<TimedMessage>& a, const std::vector<TimedMessage>& b)
{
    return std::ranges::equal(a, b, [](const TimedMessage& x, const TimedMessage& y) {
        return x.due == y.due && x.data == y.data;
    });
}

int largestBurst(const std::vector<TimedMessage>& messages)
{
    std::map<std::chrono::nanoseconds, int> perMoment;
    int largest = 0;
    for (const TimedMessage& message : messages)
        largest = std::max(largest, ++perMoment[message.due]);
    return largest;
}

std::size_t prefixedCount(const std::vector<TimedMessage>& messages)
{
    return static_cast<std::size_t>(std::ranges::count_if(
        messages, [](const TimedMessage& message) { return message.data[0] == 0x81; }));
}

void ScenarioFixture::decode(const std::vector<TimedMessage>& messages, std::string_view technology,
                             const std::string& templateName)
{
    addFile(fake.resources, fmt::format("{}/{}.plist", VENTRIK_RESOURCES, templateName));
    const auto generator =
        LogGenerator::generatorFromTechnology(technology, {fake.log, fake.resources, fake.clock});
    PlistDictionary state;
    for (const TimedMessage& message : messages) {
        generator->updateState(state, message.data);
        collect(*state.find("Display"), "", "");
    }
}

// The elements of an array stand under the array's name.
void ScenarioFixture::collect(const PlistValue& value, const std::string& parent,
                              const std::string& name)
{
    if (value.string())
        shown[parent + "/" + name].insert(*value.string());
    else if (value.dictionary())
        for (const auto& [key, entry] : *value.dictionary())
            collect(entry, name, key);
    else if (value.array())
        for (const PlistValue& element : *value.array())
            collect(element, parent, name);
}

std::pair<double, double> ScenarioFixture::rangeOf(const std::string& key)
{
    double low = 1e9;
    double high = -1e9;
    for (const std::string& text : shown[key])
        if (text != "-") {
            low = std::min(low, std::stod(text));
            high = std::max(high, std::stod(text));
        }
    return {low, high};
}

} // namespace ventrik

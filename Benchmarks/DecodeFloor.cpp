// The least time in which a capture could be decoded: what every decoder has to do, whatever it
// remembers. It reads the capture; it keeps the raw packets of the last periods, which the history
// holds; it reads the property lists that differ from the last one of their code; and it forms the
// texts of the values that changed. Which these are is found out before the clock runs, and nothing
// is put anywhere.

#include "Packets/AllRecords.h"
#include "Packets/C2KRecords.h"
#include "Packets/Subpackets.h"
#include "PropertyList/PropertyListReader.h"

#include <algorithm>
#include <array>
#include <cstdio>
#include <ctime>
#include <limits>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include <fmt/format.h>
#include <pcap/pcap.h>

namespace ventrik
{

namespace
{

struct CloseCapture {
    void operator()(pcap* handle) const { pcap_close(handle); }
};

/// Hands each message of a capture to `use`, as bytes that live for the call. Returns why the
/// capture could not be read to its end, in one line; empty when it could.
template <typename Use>
std::string readMessages(const char* path, const Use& use)
{
    std::array<char, PCAP_ERRBUF_SIZE> reason{};
    const std::unique_ptr<pcap, CloseCapture> capture(pcap_open_offline(path, reason.data()));
    if (!capture) {
        // The library puts the name in front of some of its reasons and not of others.
        const std::string_view text(reason.data());
        return text.starts_with(path) ? std::string(text) : fmt::format("{}: {}", path, text);
    }
    pcap_pkthdr* header = nullptr;
    const u_char* data = nullptr;
    int result = 0;
    std::size_t count = 0;
    while ((result = pcap_next_ex(capture.get(), &header, &data)) == 1) {
        use(ByteView(data, header->caplen));
        ++count;
    }
    return result == PCAP_ERROR
               ? fmt::format("{}: message {}: {}", path, count, pcap_geterr(capture.get()))
               : std::string();
}

struct ChangedValue {
    const Shown* shown;
    std::int64_t raw;
};

// What the decoders work out from these records, a text each time: the share of frames in error,
// and the data rates.
constexpr std::array workedOut{&C2KRecords::oneXTraffic, &C2KRecords::forwardPackets,
                               &C2KRecords::reversePackets};
constexpr Shown workedOutNumber{.digits = Digits::TwoDecimals, .unit = "kbps"};

struct SubpacketOf {
    const Record* record;
    const Subpacket* subpacket;
};
constexpr std::array<SubpacketOf, 2> subpackets{
    {{&C2KRecords::oneXStatus, &C2KRecords::statePart},
     {&C2KRecords::oneXStatus, &C2KRecords::radioPart}}};

// Fields that do not show have names in lower case, and stand in a group of their own.
bool isShown(const Field& field)
{
    const std::string_view key = field.key;
    const bool isLookupKey = key.size() > 1 && key[0] == 'k' && (key[1] < 'a' || key[1] > 'z');
    return key.empty() || key[0] < 'a' || key[0] > 'z' || isLookupKey;
}

std::optional<LogPacket> findSubpacket(const LogPacket& packet, const Subpacket& kind)
{
    std::size_t start = Subpackets::first;
    for (std::int64_t i = numberAt(packet, Subpackets::count); i > 0 && start < packet.size();
         --i) {
        const LogPacket subpacket = packet.from(start);
        if (numberAt(subpacket, Subpackets::identifier) == kind.identifier)
            return subpacket;
        start += static_cast<std::size_t>(numberAt(subpacket, Subpackets::size));
    }
    return std::nullopt;
}

/// The values of a capture that differ from those in the same place of the record of the same code
/// before, and the property lists that do. It keeps 16 bytes for each value, and 9 for each
/// message.
class Changes
{
  public:
    void add(ByteView message)
    {
        _hasNewList.push_back(false);
        if (message.size() >= transportPrefixSize)
            addPacket(LogPacket(stripPrefix(message)));
        _ends.push_back(_values.size());
    }

    std::size_t messages() const { return _ends.size(); }
    std::size_t values() const { return _values.size(); }
    std::size_t lists() const
    {
        return static_cast<std::size_t>(std::ranges::count(_hasNewList, true));
    }
    bool hasNewList(std::size_t message) const
    {
        return message < _hasNewList.size() && _hasNewList[message];
    }
    std::span<const ChangedValue> of(std::size_t message) const
    {
        if (message >= _ends.size()) // the file has grown meanwhile
            return {};
        const std::size_t begin = message == 0 ? 0 : _ends[message - 1];
        return std::span(_values).subspan(begin, _ends[message] - begin);
    }

  private:
    void addPacket(const LogPacket& packet)
    {
        if (!hasLogCode(packet.bytes()))
            return;
        if (packet.u8(0) == extraCodePacketType)
            addList(packet);
        const Record* record = recordOf(effectiveLogCode(packet));
        if (!record || packet.size() < record->minimumSize)
            return;
        const auto [last, isFirst] = _lastPackets.try_emplace(record);
        const LogPacket before(last->second);
        for (const std::span<const Field> group : record->groups)
            if (!group.empty() && isShown(group.front()))
                addFields(group, packet, isFirst ? nullptr : &before);
        for (const List* list : record->lists)
            if (list)
                addElements(*list, packet, before);
        for (const auto& [holder, subpacket] : subpackets)
            if (holder == record)
                addSubpacket(*subpacket, packet, before);
        if (record == &C2KRecords::oneXStatus)
            addPilots(packet, before);
        if (std::ranges::find(workedOut, record) != workedOut.end())
            _values.push_back({&workedOutNumber, static_cast<std::int64_t>(messages())});
        last->second.assign(packet.bytes().begin(), packet.bytes().end());
    }

    void addElements(const List& list, const LogPacket& packet, const LogPacket& before)
    {
        const RecordElements elements = list.elementsOf(packet);
        const RecordElements elementsBefore = list.elementsOf(before);
        const std::size_t count = elements.completeIn(packet);
        const std::size_t countBefore = elementsBefore.completeIn(before);
        for (std::size_t i = 0; i < count; ++i) {
            const std::optional<LogPacket> same =
                i < countBefore ? std::optional(elementsBefore.element(before, i)) : std::nullopt;
            addFields(list.fields, elements.element(packet, i), same ? &*same : nullptr);
        }
    }

    void addSubpacket(const Subpacket& kind, const LogPacket& packet, const LogPacket& before)
    {
        const auto part = findSubpacket(packet, kind);
        const auto partBefore = findSubpacket(before, kind);
        if (part)
            addFields(kind.fields, *part, partBefore ? &*partBefore : nullptr);
    }

    // A level is worked out from each pilot's energy.
    void addPilots(const LogPacket& packet, const LogPacket& before)
    {
        const auto part = findSubpacket(packet, C2KRecords::activeSetPart);
        const auto partBefore = findSubpacket(before, C2KRecords::activeSetPart);
        if (!part)
            return;
        const auto further = static_cast<std::size_t>(numberOf(*part, C2KRecords::furtherFields));
        const std::size_t size = C2KRecords::pilotSize(further);
        const Field energy = C2KRecords::pilotFields(further)[1];
        for (std::int64_t i = 0; i < numberOf(*part, C2KRecords::pilotCount); ++i) {
            const std::size_t start = C2KRecords::firstPilot + size * static_cast<std::size_t>(i);
            const std::int64_t raw = numberOf(part->from(start), energy);
            if (!partBefore || raw != numberOf(partBefore->from(start), energy))
                _values.push_back({&C2KRecords::pilotStrength, raw});
        }
    }

    void addList(const LogPacket& packet)
    {
        const ByteView payload = packet.payload();
        Bytes& last = _lastLists[effectiveLogCode(packet)];
        if (std::ranges::equal(last, payload))
            return;
        last.assign(payload.begin(), payload.end());
        _hasNewList.back() = true;
    }

    void addFields(std::span<const Field> fields, const LogPacket& part, const LogPacket* before)
    {
        for (const Field& field : fields) {
            const std::int64_t raw = numberOf(part, field);
            if (isShown(field) && (!before || raw != numberOf(*before, field)))
                _values.push_back({&field.shown, raw});
        }
    }

    std::unordered_map<const Record*, Bytes> _lastPackets;
    std::unordered_map<std::uint32_t, Bytes> _lastLists;
    std::vector<ChangedValue> _values;
    std::vector<std::size_t> _ends; // of each message's values
    std::vector<bool> _hasNewList;  // of each message
};

/// The shortest of a few runs, in nanoseconds a message: of the processor's time, which other
/// programs lengthen less than the clock's.
template <typename Run>
double leastTime(std::size_t messages, const Run& run)
{
    constexpr int runs = 5;
    std::clock_t least = std::numeric_limits<std::clock_t>::max();
    for (int i = 0; i < runs; ++i) {
        const std::clock_t start = std::clock();
        run();
        least = std::min(least, std::clock() - start);
    }
    constexpr double nanosecondsEach = 1e9 / CLOCKS_PER_SEC;
    return static_cast<double>(least) * nanosecondsEach / static_cast<double>(messages);
}

std::size_t byteCount = 0; // what the runs make, so that they have to make it
std::size_t textSize = 0;
std::size_t listCount = 0;

void readAlone(const char* path)
{
    byteCount = 0;
    readMessages(path, [](ByteView message) { byteCount += message.size(); });
}

/// The raw packets of the last periods, as the history holds them.
class Periods
{
  public:
    void add(ByteView message)
    {
        // About what comes in two seconds.
        constexpr std::size_t messagesInPeriod = 40;
        Bytes& period = _periods[_count++ / messagesInPeriod % _periods.size()];
        if (_count % messagesInPeriod == 1)
            period.clear();
        period.insert(period.end(), message.begin(), message.end());
    }

  private:
    std::array<Bytes, 5> _periods;
    std::size_t _count = 0;
};

void readAndFormat(const char* path, const Changes& changes)
{
    textSize = 0;
    std::size_t message = 0;
    readMessages(path, [&](ByteView) {
        for (const ChangedValue& value : changes.of(message))
            if (const auto text = value.shown->textOf(value.raw))
                textSize += text->size();
        ++message;
    });
}

void doAll(const char* path, const Changes& changes)
{
    textSize = 0;
    listCount = 0;
    std::size_t message = 0;
    Periods periods;
    readMessages(path, [&](ByteView bytes) {
        periods.add(bytes);
        if (changes.hasNewList(message))
            listCount += readPropertyList(LogPacket(stripPrefix(bytes)).payload()) ? 1U : 0U;
        for (const ChangedValue& value : changes.of(message))
            if (const auto text = value.shown->textOf(value.raw))
                textSize += text->size();
        ++message;
    });
}

void printFloor(const char* path, const Changes& changes)
{
    const std::size_t messages = changes.messages();
    const double reading = leastTime(messages, [&] { readAlone(path); });
    const double withTexts = leastTime(messages, [&] { readAndFormat(path, changes); });
    const double all = leastTime(messages, [&] { doAll(path, changes); });
    const auto perMessage = [&](std::size_t count) {
        return static_cast<double>(count) / static_cast<double>(messages);
    };
    fmt::print("messages           {:10} of {:.1f} bytes\n", messages, perMessage(byteCount));
    fmt::print("changed values     {:10.2f} a message, {:.1f} bytes of text\n",
               perMessage(changes.values()), perMessage(textSize));
    fmt::print("new property lists {:10.4f} a message\n", perMessage(changes.lists()));
    fmt::print("reading            {:10.1f} ns a message\n", reading);
    fmt::print("reading and texts  {:10.1f} ns a message\n", withTexts);
    fmt::print("the floor          {:10.1f} ns a message\n", all);
}

// Returns what is wrong with the capture, in one line; empty when its floor was printed.
std::string measure(const char* path)
{
    Changes changes;
    const std::string error = readMessages(path, [&](ByteView message) { changes.add(message); });
    if (!error.empty())
        return error;
    if (changes.messages() == 0)
        return fmt::format("{}: no messages", path);
    printFloor(path, changes);
    return {};
}

} // namespace

} // namespace ventrik

int main(int argumentCount, char** arguments)
{
    if (argumentCount != 2) {
        fmt::print(stderr, "usage: decode-floor CAPTURE\n");
        return 2;
    }
    const std::string error = ventrik::measure(arguments[1]);
    if (!error.empty())
        fmt::print(stderr, "decode-floor: {}\n", error);
    return error.empty() ? 0 : 1;
}

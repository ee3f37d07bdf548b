// The least time in which a capture could be decoded: reading it, and forming the texts of the
// values that changed, without finding out which they are or putting them anywhere.

#include "Packets/AllRecords.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdio>
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

/// The values of a capture that differ from those in the same place of the record of the same code
/// before. It keeps 16 bytes for each, and 8 for each message.
class Changes
{
  public:
    void add(ByteView message)
    {
        if (message.size() >= transportPrefixSize)
            addPacket(LogPacket(stripPrefix(message)));
        _ends.push_back(_values.size());
    }

    std::size_t messages() const { return _ends.size(); }
    std::size_t values() const { return _values.size(); }
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
        const Record* record =
            hasLogCode(packet.bytes()) ? recordOf(effectiveLogCode(packet)) : nullptr;
        if (!record || packet.size() < record->minimumSize)
            return;
        const auto [last, isFirst] = _lastPackets.try_emplace(record);
        const LogPacket before(last->second);
        for (const std::span<const Field> group : record->groups)
            addFields(group, packet, isFirst ? nullptr : &before);
        for (const List* list : record->lists)
            if (list)
                addElements(*list, packet, before);
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

    void addFields(std::span<const Field> fields, const LogPacket& part, const LogPacket* before)
    {
        for (const Field& field : fields) {
            const std::int64_t raw = numberOf(part, field);
            if (!before || raw != numberOf(*before, field))
                _values.push_back({&field.shown, raw});
        }
    }

    std::unordered_map<const Record*, Bytes> _lastPackets;
    std::vector<ChangedValue> _values;
    std::vector<std::size_t> _ends; // of each message's values
};

/// The shortest of a few runs, in nanoseconds a message.
template <typename Run>
double leastTime(std::size_t messages, const Run& run)
{
    constexpr int runs = 5;
    auto least = std::chrono::nanoseconds::max();
    for (int i = 0; i < runs; ++i) {
        const auto start = std::chrono::steady_clock::now();
        run();
        least = std::min<std::chrono::nanoseconds>(least, std::chrono::steady_clock::now() - start);
    }
    return static_cast<double>(least.count()) / static_cast<double>(messages);
}

std::size_t byteCount = 0; // what the runs make, so that they have to make it
std::size_t textSize = 0;

void readAlone(const char* path)
{
    byteCount = 0;
    readMessages(path, [](ByteView message) { byteCount += message.size(); });
}

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

void printFloor(const char* path, const Changes& changes)
{
    const std::size_t messages = changes.messages();
    const double reading = leastTime(messages, [&] { readAlone(path); });
    const double withTexts = leastTime(messages, [&] { readAndFormat(path, changes); });
    const auto perMessage = [&](std::size_t count) {
        return static_cast<double>(count) / static_cast<double>(messages);
    };
    fmt::print("messages           {:10} of {:.1f} bytes\n", messages, perMessage(byteCount));
    fmt::print("changed values     {:10.2f} a message, {:.1f} bytes of text\n",
               perMessage(changes.values()), perMessage(textSize));
    fmt::print("reading            {:10.1f} ns a message\n", reading);
    fmt::print("reading and texts  {:10.1f} ns a message\n", withTexts);
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

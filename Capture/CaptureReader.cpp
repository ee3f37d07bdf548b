#include "Capture/CaptureReader.h"

#include <array>

#include <fmt/format.h>
#include <pcap/pcap.h>

namespace ventrik
{

namespace
{

// In the year 2255. What is later cannot be counted in nanoseconds for long.
constexpr std::int64_t latestSecond = 9'000'000'000;

} // namespace

void CaptureReader::Closer::operator()(pcap* handle) const
{
    pcap_close(handle);
}

std::optional<CaptureReader> CaptureReader::open(const std::string& path, std::string& error)
{
    std::array<char, PCAP_ERRBUF_SIZE> reason{};
    pcap* handle = pcap_open_offline_with_tstamp_precision(path.c_str(), PCAP_TSTAMP_PRECISION_NANO,
                                                           reason.data());
    const std::string name = path == "-" ? "standard input" : path;
    if (!handle) {
        // The library puts the name in front of some of its reasons and not of others.
        const std::string_view text(reason.data());
        error = text.starts_with(path) ? std::string(text) : fmt::format("{}: {}", name, text);
        return std::nullopt;
    }
    return CaptureReader(handle, name);
}

std::optional<Technology> CaptureReader::technology() const
{
    return technologyOfLinkType(linkType());
}

int CaptureReader::linkType() const
{
    return pcap_datalink(_handle.get());
}

std::optional<CapturedMessage> CaptureReader::next()
{
    pcap_pkthdr* header = nullptr;
    const u_char* data = nullptr;
    const int result = pcap_next_ex(_handle.get(), &header, &data);
    if (result != 1) {
        if (result == PCAP_ERROR)
            _error = fmt::format("{}: message {}: {}", _path, _count, pcap_geterr(_handle.get()));
        return std::nullopt;
    }
    if (header->caplen < header->len) {
        _error = fmt::format("{}: message {}: cut short when it was captured ({} of {} bytes)",
                             _path, _count, header->caplen, header->len);
        return std::nullopt;
    }
    if (header->ts.tv_sec < 0 || header->ts.tv_sec > latestSecond) {
        _error = fmt::format("{}: message {}: its time, {} s, is out of range", _path, _count,
                             header->ts.tv_sec);
        return std::nullopt;
    }
    ++_count;
    // At nanosecond precision the library gives nanoseconds in the field for microseconds.
    const auto time =
        std::chrono::seconds(header->ts.tv_sec) + std::chrono::nanoseconds(header->ts.tv_usec);
    return CapturedMessage{Clock::TimePoint(time), {data, header->caplen}};
}

} // namespace ventrik

#include "Capture/PcapFile.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstring>

#include <fmt/format.h>
#include <pcap/pcap.h>

namespace ventrik
{

namespace
{

// In the year 2255. What is later cannot be counted in nanoseconds for long.
constexpr std::int64_t latestSecond = 9'000'000'000;

// Of the plain form.
constexpr std::uint64_t headSize = 24;
constexpr std::uint64_t messageHeadSize = 16;

// The newer form's first block.
constexpr std::array<std::uint8_t, 4> newerMagic{0x0A, 0x0D, 0x0D, 0x0A};
// In either byte order: with microseconds, with nanoseconds.
constexpr std::array<std::array<std::uint8_t, 4>, 5> magics{{
    {0xD4, 0xC3, 0xB2, 0xA1},
    {0xA1, 0xB2, 0xC3, 0xD4},
    {0x4D, 0x3C, 0xB2, 0xA1},
    {0xA1, 0xB2, 0x3C, 0x4D},
    newerMagic,
}};

} // namespace

bool PcapFile::isIn(ByteView firstBytes)
{
    return std::ranges::any_of(magics, [&](const auto& magic) {
        return firstBytes.size() >= magic.size() &&
               std::ranges::equal(magic, firstBytes.first(magic.size()));
    });
}

void PcapFile::Closer::operator()(pcap* handle) const
{
    pcap_close(handle);
}

std::unique_ptr<PcapFile> PcapFile::open(std::unique_ptr<ByteSource> source, std::string name,
                                         std::string& error)
{
    std::unique_ptr<PcapFile> file(new PcapFile(std::move(source), std::move(name)));
    if (!std::ranges::equal(newerMagic, file->_source->peek(newerMagic.size())))
        file->_offset = headSize;
    std::FILE* stream = file->_source->stream();
    if (!stream) {
        error = fmt::format("{}: {}", file->_name, std::strerror(errno));
        return nullptr;
    }
    std::array<char, PCAP_ERRBUF_SIZE> reason{};
    file->_handle.reset(pcap_fopen_offline_with_tstamp_precision(stream, PCAP_TSTAMP_PRECISION_NANO,
                                                                 reason.data()));
    if (file->_handle)
        return file; // and the handle owns the stream
    std::fclose(stream);
    error = file->_source->error().empty() ? fmt::format("{}: {}", file->_name, reason.data())
                                           : file->_source->error();
    return nullptr;
}

std::optional<int> PcapFile::linkType() const
{
    return pcap_datalink(_handle.get());
}

void PcapFile::fail(std::string_view reason)
{
    _error = _source->error().empty() ? fmt::format("{}: message {}: {}", _name, _count, reason)
                                      : _source->error();
}

std::optional<CapturedMessage> PcapFile::next()
{
    pcap_pkthdr* header = nullptr;
    const u_char* data = nullptr;
    const int result = pcap_next_ex(_handle.get(), &header, &data);
    if (result != 1) {
        if (result == PCAP_ERROR)
            fail(pcap_geterr(_handle.get()));
        return std::nullopt;
    }
    if (header->caplen < header->len) {
        fail(fmt::format("cut short when it was captured ({} of {} bytes)", header->caplen,
                         header->len));
        return std::nullopt;
    }
    if (header->ts.tv_sec < 0 || header->ts.tv_sec > latestSecond) {
        fail(fmt::format("its time, {} s, is out of range", header->ts.tv_sec));
        return std::nullopt;
    }
    ++_count;
    if (_offset)
        *_offset += messageHeadSize + header->caplen;
    // At nanosecond precision the library gives nanoseconds in the field for microseconds.
    const auto time =
        std::chrono::seconds(header->ts.tv_sec) + std::chrono::nanoseconds(header->ts.tv_usec);
    return CapturedMessage{Clock::TimePoint(time), {data, header->caplen}};
}

} // namespace ventrik

#include "Capture/PcapOutput.h"

#include <cerrno>
#include <utility>

#include <pcap/pcap.h>

namespace ventrik
{

void PcapOutput::Closer::operator()(pcap* handle) const
{
    pcap_close(handle);
}

void PcapOutput::Closer::operator()(pcap_dumper* dumper) const
{
    pcap_dump_close(dumper);
}

PcapOutput::PcapOutput(std::unique_ptr<pcap, Closer> handle,
                       std::unique_ptr<pcap_dumper, Closer> dumper)
    : _handle(std::move(handle)), _dumper(std::move(dumper))
{
}

std::optional<PcapOutput> PcapOutput::create(std::FILE* stream, const Technology& technology,
                                             std::string& reason)
{
    std::unique_ptr<pcap, Closer> handle(
        pcap_open_dead(technology.linkType, static_cast<int>(maximumMessageSize)));
    std::unique_ptr<pcap_dumper, Closer> dumper(pcap_dump_fopen(handle.get(), stream));
    if (!dumper) {
        reason = pcap_geterr(handle.get());
        return std::nullopt; // and the library has closed the stream
    }
    return PcapOutput(std::move(handle), std::move(dumper));
}

std::FILE* PcapOutput::stream() const
{
    return pcap_dump_file(_dumper.get());
}

bool PcapOutput::write(Clock::TimePoint time, ByteView message)
{
    if (message.size() > maximumMessageSize)
        return false;
    const auto seconds = std::chrono::floor<std::chrono::seconds>(time);
    const auto rest = std::chrono::floor<std::chrono::microseconds>(time - seconds);
    pcap_pkthdr header{};
    header.ts.tv_sec = seconds.time_since_epoch().count();
    header.ts.tv_usec = rest.count();
    header.caplen = header.len = static_cast<bpf_u_int32>(message.size());
    // The library's dump function takes its dumper as a byte pointer, so that it can serve as a
    // packet callback.
    pcap_dump(static_cast<u_char*>(static_cast<void*>(_dumper.get())), &header, message.data());
    // It tells of a failed write only by the stream's mark.
    if (_error == 0 && std::ferror(stream()))
        _error = errno;
    return _error == 0;
}

bool PcapOutput::flush()
{
    if (pcap_dump_flush(_dumper.get()) != 0 && _error == 0)
        _error = errno;
    return _error == 0;
}

} // namespace ventrik

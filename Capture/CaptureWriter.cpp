#include "Capture/CaptureWriter.h"

#include <cstdio>

#include <fmt/format.h>
#include <pcap/pcap.h>

namespace ventrik
{

void CaptureWriter::Closer::operator()(pcap* handle) const
{
    pcap_close(handle);
}

void CaptureWriter::Closer::operator()(pcap_dumper* dumper) const
{
    pcap_dump_close(dumper);
}

CaptureWriter::CaptureWriter(std::unique_ptr<pcap, Closer> handle,
                             std::unique_ptr<pcap_dumper, Closer> dumper)
    : _handle(std::move(handle)), _dumper(std::move(dumper))
{
}

std::optional<CaptureWriter> CaptureWriter::create(const std::string& path,
                                                   const CaptureTechnology& technology,
                                                   std::string& error)
{
    std::unique_ptr<pcap, Closer> handle(
        pcap_open_dead(technology.linkType, static_cast<int>(maximumMessageSize)));
    std::unique_ptr<pcap_dumper, Closer> dumper(pcap_dump_open(handle.get(), path.c_str()));
    if (!dumper) {
        error = pcap_geterr(handle.get());
        return std::nullopt;
    }
    return CaptureWriter(std::move(handle), std::move(dumper));
}

bool CaptureWriter::write(Clock::TimePoint time, ByteView message)
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
    return true;
}

bool CaptureWriter::flush()
{
    return pcap_dump_flush(_dumper.get()) == 0 && std::ferror(pcap_dump_file(_dumper.get())) == 0;
}

} // namespace ventrik

#include "Capture/CaptureWriter.h"

#include <cerrno>
#include <cstdio>
#include <cstring>

#include <fmt/format.h>
#include <pcap/pcap.h>
#include <unistd.h>

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

CaptureWriter::CaptureWriter(PrivateFile file, std::unique_ptr<pcap, Closer> handle,
                             std::unique_ptr<pcap_dumper, Closer> dumper)
    : _file(std::move(file)), _handle(std::move(handle)), _dumper(std::move(dumper))
{
}

std::optional<CaptureWriter> CaptureWriter::create(const std::string& path,
                                                   const Technology& technology, std::string& error)
{
    auto file = PrivateFile::create(path, error);
    if (!file)
        return std::nullopt;
    std::unique_ptr<pcap, Closer> handle(
        pcap_open_dead(technology.linkType, static_cast<int>(maximumMessageSize)));
    // The library closes the stream that it writes to, hence one of its own.
    const int descriptor = ::dup(::fileno(file->stream()));
    std::FILE* stream = descriptor < 0 ? nullptr : ::fdopen(descriptor, "w");
    std::unique_ptr<pcap_dumper, Closer> dumper(stream ? pcap_dump_fopen(handle.get(), stream)
                                                       : nullptr);
    if (!dumper) {
        error =
            fmt::format("{}: {}", path, stream ? pcap_geterr(handle.get()) : std::strerror(errno));
        return std::nullopt;
    }
    return CaptureWriter(std::move(*file), std::move(handle), std::move(dumper));
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
    noteError();
    return _error == 0;
}

// The library tells of a failed write only by the stream's mark.
void CaptureWriter::noteError()
{
    if (_error == 0 && std::ferror(pcap_dump_file(_dumper.get())))
        _error = errno;
}

bool CaptureWriter::commit(std::string& error)
{
    if (pcap_dump_flush(_dumper.get()) != 0 && _error == 0)
        _error = errno;
    if (_error == 0)
        return _file.commit(error);
    error = fmt::format("{}: {}", _file.path(), std::strerror(_error));
    return false;
}

} // namespace ventrik

#include "Capture/CaptureWriter.h"

#include <cerrno>
#include <cstdio>
#include <cstring>

#include <fmt/format.h>
#include <unistd.h>

namespace ventrik
{

std::optional<CaptureWriter> CaptureWriter::create(const std::string& path,
                                                   const Technology& technology, std::string& error)
{
    auto file = PrivateFile::create(path, error);
    if (!file)
        return std::nullopt;
    // The output closes the stream that it writes to, hence one of its own.
    const int descriptor = ::dup(::fileno(file->stream()));
    std::FILE* stream = descriptor < 0 ? nullptr : ::fdopen(descriptor, "w");
    std::string reason = stream ? "" : std::strerror(errno);
    auto output = stream ? PcapOutput::create(stream, technology, reason) : std::nullopt;
    if (!output) {
        error = fmt::format("{}: {}", path, reason);
        return std::nullopt;
    }
    return CaptureWriter(std::move(*file), std::move(*output));
}

bool CaptureWriter::write(Clock::TimePoint time, ByteView message)
{
    return _output.write(time, message);
}

bool CaptureWriter::commit(std::string& error)
{
    if (_output.flush())
        return _file.commit(error);
    error = fmt::format("{}: {}", _file.path(), std::strerror(_output.error()));
    return false;
}

} // namespace ventrik

#include "TelephonyService/ScenarioCapture.h"

#include "Capture/CaptureWriter.h"

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

constexpr Clock::TimePoint captureStart =
    std::chrono::sys_days{std::chrono::year{2026} / 11 / 16} + 6h + 10min + 28s;

} // namespace

bool writeScenarioCapture(MessageSource& source, std::uint64_t messageCount,
                          const Technology& technology, const std::string& path, std::string& error)
{
    auto writer = CaptureWriter::create(path, technology, error);
    if (!writer)
        return false;
    bool isWritten = true;
    for (std::uint64_t i = 0; i < messageCount && isWritten; ++i) {
        const auto message = source.next();
        if (!message)
            break;
        if (message->data.size() > CaptureWriter::maximumMessageSize) {
            error = fmt::format("{}: a message is too large for a capture", path);
            return false;
        }
        isWritten = writer->write(captureStart + message->due, message->data);
    }
    return writer->commit(error);
}

} // namespace ventrik

#pragma once

#include "Packets/Layouts.h"
#include "Platform/SystemLog.h"
#include "Platform/Technology.h"
#include "Tools/CaptureRows.h"

#include <cstdio>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

enum class DecodeFormat { Text, Json, JsonLines, Rows, Html };

struct DecodeOptions {
    std::string capture; ///< a file, or "-" for standard input
    std::optional<Technology> technology;
    DecodeFormat format = DecodeFormat::Text;
    RowOptions rows; ///< where they are the format
    RecordsMode records = RecordsMode::Newer;
    /// Of captures that tell the subscriptions of their messages: those of another one are left
    /// out.
    std::optional<std::uint32_t> subscription;
    std::optional<std::string> systemLogFile;
    std::optional<std::string> snapshotFile;
    std::string description;
    std::vector<std::string> resourceDirectories; ///< empty: the default ones
    std::string version;
    bool verbose = false;              ///< shows the log and the decoders' console
    int logLevel = LogPriority::debug; ///< the least urgent lines that are shown
    bool statistics = false;           ///< a table of the records, on standard error
    /// Where what was read is written as a capture of ours; in the newer form where its name ends
    /// with .pcapng.
    std::optional<std::string> captureToWrite;
    bool showsProgress = true; ///< on a terminal
};

struct UnknownReportOptions {
    std::string file;
    std::vector<std::string> captures; ///< as in DecodeOptions
    bool withBytes = false;
};

/// Exit statuses of the offline decoder.
namespace DecodeStatus
{
inline constexpr int done = 0;
inline constexpr int badInput = 1;
inline constexpr int badUsage = 2;
inline constexpr int interrupted = 130;
} // namespace DecodeStatus

/// Decodes a capture and writes the result to `output`, and one line for each failure to standard
/// error. What was decoded before damage is still written. Rows come without their heading, and
/// with the one that closes the capture unless the decoding was interrupted.
int decodeCapture(const DecodeOptions& options, std::FILE* output);

/// Writes what is in captures that cannot be read to a file. One line for each failure to standard
/// error; what is in front of damage counts, and the other captures do.
int reportUnknownRecords(const UnknownReportOptions& options);

/// Makes a running `decodeCapture` end after its present message. Safe in a signal handler.
void interruptDecoding();
bool isDecodingInterrupted();

} // namespace ventrik

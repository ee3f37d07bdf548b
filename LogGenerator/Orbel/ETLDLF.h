#pragma once

#include <cstddef>
#include <cstdint>

/// When and where a DLF file was made.
struct ETLDLFTimeRecord {
    std::uint32_t secondsSince1970;
    std::int16_t zoneOffsetMinutes; ///< east of UTC positive
    std::uint8_t daylightSaving;    ///< 1 while daylight-saving time is in force, else 0
};

inline constexpr std::size_t etlDLFVersionReportSize = 161;
inline constexpr int etlDLFSuccess = 0;
inline constexpr int etlDLFBufferTooSmall = 3;

/// Writes the version report record that begins a DLF file at the start of the buffer. Texts are
/// cut to their fields (6, 15 and 17 characters). `written` is set to 161, or to 0 when the
/// capacity is below that; the result is then `etlDLFBufferTooSmall`. A null buffer has no
/// capacity; what else is null is left out: the count, a text, the time.
extern "C" [[gnu::visibility("default"), gnu::used]] int
ETLDLFAddVersionReport(std::uint8_t* buffer, std::size_t capacity, std::size_t* written,
                       std::uint16_t firstVersion, std::uint16_t secondVersion,
                       const char* versionText, const char* executableName, const char* buildDate,
                       const ETLDLFTimeRecord* time);

#include "LogGenerator/Orbel/ETLDLF.h"

#include "Packets/SharedRecords.h"

#include <algorithm>
#include <cstring>
#include <span>

// Version report record, little-endian, 161 bytes
//    0 u16 record length | 2 u16 log code 0x1FFD | 4 8 bytes timestamp, zero | 12 u32 reserved,
//    zero
//   16 u16 first version | 18 u16 second version | 20 7 bytes version text
//   27 16 bytes executable name | 43 24 bytes zero | 67 18 bytes build date
//   85 u32 creation time | 89 i16 zone offset, minutes | 91 u8 daylight saving | 92 69 bytes zero

namespace
{

class RecordWriter
{
  public:
    explicit RecordWriter(std::span<std::uint8_t> record) : _record(record)
    {
        std::ranges::fill(_record, std::uint8_t{0});
    }

    void number(std::size_t offset, std::size_t width, std::uint32_t value)
    {
        for (std::size_t i = 0; i < width; ++i)
            _record[offset + i] = static_cast<std::uint8_t>(value >> (8 * i));
    }

    // Cut to the field's width less one, so that a NUL always ends it.
    void text(std::size_t offset, std::size_t width, const char* text)
    {
        const std::size_t length = text ? strnlen(text, width - 1) : 0;
        std::copy_n(text, length, _record.subspan(offset).begin());
    }

  private:
    std::span<std::uint8_t> _record;
};

} // namespace

int ETLDLFAddVersionReport(std::uint8_t* buffer, std::size_t capacity, std::size_t* written,
                           std::uint16_t firstVersion, std::uint16_t secondVersion,
                           const char* versionText, const char* executableName,
                           const char* buildDate, const ETLDLFTimeRecord* time)
{
    std::size_t unwanted = 0;
    std::size_t& count = written ? *written : unwanted;
    count = 0;
    if (!buffer || capacity < etlDLFVersionReportSize)
        return etlDLFBufferTooSmall;

    RecordWriter record({buffer, etlDLFVersionReportSize});
    record.number(0, 2, etlDLFVersionReportSize);
    record.number(2, 2, ventrik::SharedRecords::versionReport.logCode);
    record.number(16, 2, firstVersion);
    record.number(18, 2, secondVersion);
    record.text(20, 7, versionText);
    record.text(27, 16, executableName);
    record.text(67, 18, buildDate);
    if (time) {
        record.number(85, 4, time->secondsSince1970);
        record.number(89, 2, static_cast<std::uint16_t>(time->zoneOffsetMinutes));
        record.number(91, 1, time->daylightSaving);
    }
    count = etlDLFVersionReportSize;
    return etlDLFSuccess;
}

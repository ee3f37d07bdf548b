#include "LogGenerator/Orbel/SimInfo.h"

#include "LogGenerator/Orbel/UnparsableDataException.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr std::uint32_t simFilesLogCode = 0xFF0000;

struct SimFile {
    std::string_view file;
    std::string_view displayKey;
};

constexpr std::array<SimFile, 14> simFiles{{
    {"kSimFile_ICCID", "EF-ICCID"},
    {"kSimFile_MSISDN", "EF-MSISDN"},
    {"kSimFile_MBDN", "EF-3GPP MAIL BOX DIALING NUMBER"},
    {"kSimFile_HPPLMN", "EF-HPPLMN SEARCH PERIOD"},
    {"kSimFile_LOCI", "EF-LOCI"},
    {"kSimFile_PSLOCI", "EF-GPRS/PS-LOCI"},
    {"kSimFile_ACC", "EF-ACCESS CONTROL CLASS"},
    {"kSimFile_AD", "EF-ADMINISTRATIVE DATA"},
    {"kSimFile_FPLMN", "EF-FPLMN"},
    {"kSimFile_AHPLMN", "EF-ACTING HPLMN"},
    {"kSimFile_RATMODE", "EF-RAT MODE"},
    {"kSimFile_PNN", "EF-PLMN NETWORK NAME"},
    {"kSimFile_OPL", "EF-OPERATOR PLMN LIST"},
    {"kSimFile_OPLMNAcT", "EF-OPLMNAcT"},
}};

} // namespace

std::string_view SimInfo::getSectionName() const
{
    return "SIM Info";
}

std::vector<std::uint32_t> SimInfo::getLogCodeArray() const
{
    return {simFilesLogCode};
}

// SIM files, extra code 0
//   13 a serialised property list: a dictionary of kSimFile_... keys
void SimInfo::updateWithData(const LogPacket& packet, std::uint32_t logCode)
{
    log().warning("SimInfo");
    if (logCode != simFilesLogCode)
        return;
    const PropertyListReading& reading = packet.propertyList();
    const PlistDictionary* files = reading ? reading.value->dictionary() : nullptr;
    if (!files) {
        log().error("SIM File dictionary data could not be constructed");
        throw UnparsableDataException();
    }
    for (const auto& [file, displayKey] : simFiles)
        if (const PlistValue* contents = files->find(file))
            show(displayKey, *contents);
}

} // namespace ventrik

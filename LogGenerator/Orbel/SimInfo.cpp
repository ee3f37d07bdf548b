#include "LogGenerator/Orbel/SimInfo.h"

#include "LogGenerator/Orbel/UnparsableDataException.h"
#include "Packets/SharedRecords.h"

#include <array>

namespace ventrik
{

namespace
{

constexpr SectionTable table{
    .name = "SIM Info",
    .trace = "SimInfo",
    .records = {{{.record = &SharedRecords::simFiles}}},
    .unknownCode = UnknownCode::Ignored,
};

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

SimInfo::SimInfo(SystemLog& log) : Base(log, table) {}

void SimInfo::decode(const ShownRecord&, const LogPacket& packet)
{
    const PropertyListReading& reading = packet.propertyList();
    const PlistDictionary* files = reading ? reading.value->dictionary() : nullptr;
    if (!files) {
        log().error("SIM File dictionary data could not be constructed");
        throw UnparsableDataException();
    }
    for (const auto& [file, displayKey] : simFiles)
        if (const PlistValue* contents = files->find(file))
            showValue(displayKey, *contents);
}

} // namespace ventrik

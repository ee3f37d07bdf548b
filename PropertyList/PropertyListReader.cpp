#include "PropertyList/PropertyListReader.h"

#include <algorithm>
#include <string_view>

namespace ventrik
{

PropertyListReading readPropertyList(ByteView data)
{
    constexpr std::string_view binaryMark = "bplist";
    const bool isBinary = data.size() >= binaryMark.size() &&
                          std::equal(binaryMark.begin(), binaryMark.end(), data.begin());
    return isBinary ? readBinaryPropertyList(data) : readXmlPropertyList(data);
}

} // namespace ventrik

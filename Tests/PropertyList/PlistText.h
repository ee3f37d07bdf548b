#pragma once

#include "PropertyList/PropertyListReader.h"

#include <string>
#include <string_view>

namespace ventrik
{

inline Bytes bytesOf(std::string_view text)
{
    return {text.begin(), text.end()};
}

inline PropertyListReading readXml(std::string_view text)
{
    return readXmlPropertyList(bytesOf(text));
}

/// The reading of one element inside <plist>.
inline PropertyListReading readXmlElement(std::string_view element)
{
    return readXml("<plist version=\"1.0\">" + std::string(element) + "</plist>");
}

inline std::string repeated(std::string_view text, std::size_t count)
{
    std::string result;
    result.reserve(text.size() * count);
    for (std::size_t i = 0; i < count; ++i)
        result += text;
    return result;
}

} // namespace ventrik

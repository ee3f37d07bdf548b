#include "Fuzz/PropertyList/RoundTrip.h"

#include "PropertyList/PropertyListWriter.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <iostream>

namespace ventrik
{

namespace
{

void require(bool holds, std::string_view what)
{
    if (holds)
        return;
    std::cerr << what << '\n';
    std::abort();
}

bool readsBackAs(const PlistValue& written, const PlistValue& read);

bool arrayReadsBackAs(const PlistArray& written, const PlistArray& read)
{
    return std::equal(written.begin(), written.end(), read.begin(), read.end(), readsBackAs);
}

bool dictionaryReadsBackAs(const PlistDictionary& written, const PlistDictionary& read)
{
    const auto isEqual = [](const auto& one, const auto& other) {
        return one.key == other.key && readsBackAs(one.value, other.value);
    };
    return std::equal(written.begin(), written.end(), read.begin(), read.end(), isEqual);
}

bool readsBackAs(const PlistValue& written, const PlistValue& read)
{
    if (written.kind() != read.kind())
        return false;
    if (const PlistArray* array = written.array())
        return arrayReadsBackAs(*array, *read.array());
    if (const PlistDictionary* dictionary = written.dictionary())
        return dictionaryReadsBackAs(*dictionary, *read.dictionary());
    if (const PlistDate* date = written.date())
        return std::floor(date->secondsSince1970) == read.date()->secondsSince1970;
    return written == read;
}

void checkRoundTrip(const PlistValue& value)
{
    const PropertyListWriting writing = writeXmlPropertyList(value);
    if (!writing) {
        require(writing.error.find('\n') == std::string::npos, "the writer's error has lines");
        return;
    }
    // Shared containers are written out each time, so a small message can make a text too long.
    if (writing.text->size() > propertyListMaximumSize)
        return;
    const Bytes bytes(writing.text->begin(), writing.text->end());
    const PropertyListReading back = readXmlPropertyList(bytes);
    require(back.value.has_value(), back.error);
    require(readsBackAs(value, *back.value), "the value read back differs");
}

} // namespace

void checkReading(const PropertyListReading& reading)
{
    require(reading.value.has_value() == reading.error.empty(), "neither a value nor an error");
    require(reading.error.find('\n') == std::string::npos, "the reader's error has lines");
    if (reading)
        checkRoundTrip(*reading.value);
}

} // namespace ventrik

#include "Fuzz/PropertyList/RoundTrip.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    ventrik::checkReading(ventrik::readXmlPropertyList({data, size}));
    return 0;
}

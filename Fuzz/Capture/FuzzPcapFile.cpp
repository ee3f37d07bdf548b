#include "Capture/PcapFile.h"
#include "Fuzz/Capture/ReadContainer.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    using namespace ventrik;
    const ByteView input{data, size};
    if (input.empty() || !PcapFile::isIn(input.subspan(1)))
        return 0;
    std::string error;
    if (const auto container = PcapFile::open(sourceOf(input), "x", error))
        drain(*container);
    return 0;
}

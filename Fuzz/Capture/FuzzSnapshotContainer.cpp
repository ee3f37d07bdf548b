#include "Capture/SnapshotContainer.h"
#include "Fuzz/Capture/ReadContainer.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    ventrik::readContainer<ventrik::SnapshotContainer>({data, size});
    return 0;
}

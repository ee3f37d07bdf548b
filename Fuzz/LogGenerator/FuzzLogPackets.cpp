#include "LogGenerator/Core/LogGenerator.h"
#include "Platform/Technology.h"
#include "Tests/Support/FixedClock.h"
#include "Tests/Support/MemoryResources.h"
#include "Tests/Support/ResourceFiles.h"

#include <algorithm>
#include <array>
#include <cstdio>

namespace ventrik
{

namespace
{

// A log that formats every line and keeps none.
class DiscardingLog : public SystemLog
{
  public:
    DiscardingLog() : SystemLog(LogPriority::debug) {}

  protected:
    void write(int, std::string_view) override {}
};

// The cell monitor is left out: it ends the process at what it does not expect.
constexpr std::array technologies{"lte", "gsm", "utran", "c2k"};

MemoryResources shippedTemplates()
{
    MemoryResources resources;
    addTemplates(resources, VENTRIK_RESOURCES);
    return resources;
}

/// The first byte picks the technology and the layouts that records are read by; then come
/// messages, each behind its size in two bytes.
void decode(ByteView input)
{
    static const MemoryResources resources = shippedTemplates();
    static const FixedClock clock;
    static DiscardingLog log;
    if (input.empty())
        return;
    const char* name = technologies.at(input[0] % technologies.size());
    constexpr std::size_t modes = 3;
    const auto records = static_cast<RecordsMode>(input[0] / technologies.size() % modes);
    const auto generator = LogGenerator::generatorsReading(records)(
        technologyNamed(name)->identifier, {log, resources, clock});
    PlistDictionary state;
    input = input.subspan(1);
    while (input.size() >= 2) {
        const std::size_t wanted = input[0] | std::size_t{input[1]} << 8;
        const std::size_t size = std::min(wanted, input.size() - 2);
        // A copy of its own, so that the sanitizer sees each read beyond its end.
        const Bytes message(input.begin() + 2,
                            input.begin() + 2 + static_cast<std::ptrdiff_t>(size));
        generator->updateState(state, message);
        input = input.subspan(2 + size);
    }
    generator->generateLogUsingState(state);
}

} // namespace

} // namespace ventrik

extern "C" int LLVMFuzzerInitialize(int*, char***)
{
    // The class index's farewell, once for every input.
    return std::freopen("/dev/null", "w", stdout) == nullptr;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    ventrik::decode({data, size});
    return 0;
}

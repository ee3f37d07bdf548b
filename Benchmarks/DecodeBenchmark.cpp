#include "LogGenerator/Core/LogGenerator.h"
#include "Platform/Linux/LinuxClock.h"
#include "Platform/Linux/LinuxResources.h"
#include "Platform/Linux/LinuxSystemLog.h"
#include "TelephonyService/Scenarios.h"

#include <benchmark/benchmark.h>

namespace ventrik
{

namespace
{

// A log that is filtered out whole, as the offline decoder's is.
class FilteredLog : public SystemLog
{
  public:
    FilteredLog() : SystemLog(-1) {}

  protected:
    void write(int, std::string_view) override {}
};

std::vector<Bytes> scenarioMessages(const Technology& technology, std::size_t count)
{
    const auto scenario = makeScenario(technology, 1);
    std::vector<Bytes> messages;
    for (std::size_t i = 0; i < count; ++i)
        messages.push_back(scenario->next()->data);
    return messages;
}

void decodeScenario(benchmark::State& benchmarkState, const char* technologyName)
{
    const Technology technology = *technologyNamed(technologyName);
    const std::vector<Bytes> messages = scenarioMessages(technology, 2000);
    FilteredLog log;
    const LinuxResources resources(LinuxResources::defaultDirectories(), "1.0");
    const LinuxClock clock;
    const auto generator =
        LogGenerator::generatorFromTechnology(technology.identifier, {log, resources, clock});
    PlistDictionary state;
    std::size_t bytes = 0;
    for (auto _ : benchmarkState) {
        for (const Bytes& message : messages) {
            generator->updateState(state, message);
            bytes += message.size();
        }
        generator->generateLogUsingState(state);
    }
    benchmarkState.SetItemsProcessed(benchmarkState.iterations() *
                                     static_cast<std::int64_t>(messages.size()));
    benchmarkState.SetBytesProcessed(static_cast<std::int64_t>(bytes));
}
BENCHMARK_CAPTURE(decodeScenario, lte, "lte")->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(decodeScenario, gsm, "gsm")->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(decodeScenario, utran, "utran")->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(decodeScenario, c2k, "c2k")->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(decodeScenario, ifx, "ifx")->Unit(benchmark::kMillisecond);

} // namespace

} // namespace ventrik

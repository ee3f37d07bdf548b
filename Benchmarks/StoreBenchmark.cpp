#include "LogGenerator/Core/StateKeys.h"
#include "Model/ChangeStore.h"
#include "Model/DisplayMoment.h"
#include "Platform/Linux/LinuxClock.h"
#include "Platform/Linux/LinuxResources.h"
#include "TelephonyService/Scenarios.h"
#include "Tools/CaptureRows.h"

#include <benchmark/benchmark.h>

#include <chrono>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

class FilteredLog : public SystemLog
{
  public:
    FilteredLog() : SystemLog(-1) {}
    void showOnConsole(std::string_view) override {}

  protected:
    void write(int, std::string_view) override {}
};

/// A generator whose display is a thousand numbers, changed from outside.
class Numbers : public LogGenerator
{
  public:
    explicit Numbers(const GeneratorServices& services) : LogGenerator(services)
    {
        for (int i = 0; i < 1000; ++i)
            group.set("value " + std::to_string(i), "0");
        state.set(StateKey::display, PlistDictionary{{"Group", group}});
    }
    void change(std::size_t number)
    {
        group.entryAt(number % 1000)->value.setText(std::to_string(number % 7919));
    }

    void updateState(PlistDictionary&, ByteView) override {}
    std::optional<PlistValue> generateLogUsingState(PlistDictionary&) override { return {}; }
    PlistDictionary getStartCommand() const override { return {}; }
    PlistValue getSaveContentsFromState(const PlistDictionary&) const override
    {
        return PlistArray();
    }

    PlistDictionary group;
    PlistDictionary state;
};

/// What ten seconds of so many changes a second takes, ten a message of 100 bytes, and how far back
/// a store of the usual size then reaches.
void keepChanges(benchmark::State& benchmarkState)
{
    const auto changesOfSecond = static_cast<std::size_t>(benchmarkState.range(0));
    FilteredLog log;
    const LinuxResources resources(LinuxResources::defaultDirectories(), "1.0");
    const LinuxClock clock;
    const Bytes message(100);
    for (auto _ : benchmarkState) {
        Numbers numbers({log, resources, clock});
        ChangeStore store(RecordsMode::Newer);
        store.useGenerator(&numbers, "lte");
        const std::size_t changes = 10 * changesOfSecond;
        Clock::TimePoint time{};
        for (std::size_t i = 0; i < changes; ++i) {
            numbers.change(i);
            if (i % 10 != 9)
                continue;
            time += std::chrono::nanoseconds(1s) * 10 / static_cast<int>(changesOfSecond);
            store.messageTaken(time, message, numbers.state);
        }
        benchmarkState.counters["bytes"] = static_cast<double>(store.bytes());
        benchmarkState.counters["bytes/change"] =
            static_cast<double>(store.bytes()) / static_cast<double>(store.changeCount());
        benchmarkState.counters["seconds kept"] =
            std::chrono::duration<double>(store.lastTime() - store.firstTime()).count();
    }
    benchmarkState.SetItemsProcessed(benchmarkState.iterations() * 10 * benchmarkState.range(0));
}
BENCHMARK(keepChanges)->Arg(10)->Arg(1000)->Arg(100000)->Unit(benchmark::kMillisecond);

/// Any moment of a full store.
void showMoment(benchmark::State& benchmarkState)
{
    FilteredLog log;
    const LinuxResources resources(LinuxResources::defaultDirectories(), "1.0");
    const LinuxClock clock;
    Numbers numbers({log, resources, clock});
    ChangeStore store(RecordsMode::Newer);
    store.useGenerator(&numbers, "lte");
    Clock::TimePoint time{};
    for (std::size_t i = 0; i < 600000; ++i) {
        numbers.change(i);
        time += 1ms;
        if (i % 10 == 9)
            store.messageTaken(time, {}, numbers.state);
    }
    const std::uint64_t first = store.firstMoment();
    const std::uint64_t length = store.present() - first;
    std::uint64_t moment = 0;
    for (auto _ : benchmarkState) {
        moment = (moment + 7919 * 31) % length;
        DisplayMoment shown = store.at(first + moment);
        benchmark::DoNotOptimize(shown.topLevelNodes());
    }
}
BENCHMARK(showMoment)->Unit(benchmark::kMillisecond);

enum class Kept { Rows, Store };

/// Reading a capture into a store beside writing its rows.
void decodeInto(benchmark::State& benchmarkState, const char* technologyName, Kept kept)
{
    const Technology technology = *technologyNamed(technologyName);
    const auto scenario = makeScenario(technology, 1);
    std::vector<TimedMessage> messages;
    for (int i = 0; i < 20000; ++i)
        messages.push_back(*scenario->next());
    FilteredLog log;
    const LinuxResources resources(LinuxResources::defaultDirectories(), "1.0");
    const LinuxClock clock;
    for (auto _ : benchmarkState) {
        const auto generator = LogGenerator::generatorFromTechnology(
            technology.identifier, {log, resources, clock, AssertionPolicy::Throw,
                                    RecordsMode::Newer, RawPackets::Dropped});
        PlistDictionary state;
        ChangeStore store(RecordsMode::Newer);
        store.useGenerator(generator.get(), technology.name);
        CaptureRows rows({}, "capture", technology, *generator, RecordsMode::Newer);
        for (const TimedMessage& message : messages) {
            generator->updateState(state, message.data);
            const Clock::TimePoint time{message.due};
            if (kept == Kept::Store) {
                store.messageTaken(time, message.data, state);
            } else {
                rows.take({time, message.data}, state);
                rows.clearText();
            }
        }
    }
    benchmarkState.SetItemsProcessed(benchmarkState.iterations() *
                                     static_cast<std::int64_t>(messages.size()));
}
BENCHMARK_CAPTURE(decodeInto, lte_rows, "lte", Kept::Rows)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(decodeInto, lte_store, "lte", Kept::Store)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(decodeInto, gsm_rows, "gsm", Kept::Rows)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(decodeInto, gsm_store, "gsm", Kept::Store)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(decodeInto, utran_rows, "utran", Kept::Rows)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(decodeInto, utran_store, "utran", Kept::Store)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(decodeInto, c2k_rows, "c2k", Kept::Rows)->Unit(benchmark::kMillisecond);
BENCHMARK_CAPTURE(decodeInto, c2k_store, "c2k", Kept::Store)->Unit(benchmark::kMillisecond);

} // namespace

} // namespace ventrik

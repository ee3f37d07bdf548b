#include "PropertyList/PropertyListReader.h"
#include "PropertyList/PropertyListWriter.h"

#include <benchmark/benchmark.h>
#include <fmt/format.h>

namespace ventrik
{

namespace
{

PlistValue cells(std::int64_t count)
{
    PlistArray array;
    for (std::int64_t i = 0; i < count; ++i)
        array.append(PlistDictionary{{"kQXCellMonitorCellType", "kQXCellMonitorCellTypeNeighbor"},
                                     {"kQXCellMonitorPID", i},
                                     {"kQXCellMonitorRSRP", -100.5}});
    return array;
}

void writeXml(benchmark::State& state)
{
    const PlistValue value = cells(state.range(0));
    for (auto _ : state)
        benchmark::DoNotOptimize(writeXmlPropertyList(value));
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(writeXml)->Arg(8)->Arg(1000);

void readXml(benchmark::State& state)
{
    const Bytes bytes = propertyListBytes(cells(state.range(0))).value();
    for (auto _ : state)
        benchmark::DoNotOptimize(readPropertyList(bytes));
    state.SetBytesProcessed(state.iterations() * static_cast<std::int64_t>(bytes.size()));
}
BENCHMARK(readXml)->Arg(8)->Arg(1000);

} // namespace

} // namespace ventrik

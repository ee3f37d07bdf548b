#include "Model/VentrikModelNode.h"

#include <benchmark/benchmark.h>
#include <fmt/format.h>

namespace ventrik
{

namespace
{

void buildTree(benchmark::State& state)
{
    PlistArray rows;
    for (std::int64_t i = 0; i < state.range(0); ++i)
        rows.append(PlistDictionary{{"Physical Cell ID", fmt::format("{}", i)}, {"RSRP", "-100"}});
    const PlistValue display = PlistDictionary{{"Cells", rows}};
    for (auto _ : state) {
        PathIndex index;
        benchmark::DoNotOptimize(VentrikModelNode::makeTreeFromObject(&display, index));
    }
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(buildTree)->Arg(10)->Arg(10000);

} // namespace

} // namespace ventrik

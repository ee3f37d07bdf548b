#include "Charts/LineThinning.h"
#include "Charts/SignalChart.h"
#include "Charts/SvgCanvas.h"

#include <benchmark/benchmark.h>

#include <cmath>

namespace ventrik
{

namespace
{

// Two points a second, with a gap now and then.
std::vector<SeriesPoint> points(std::int64_t count)
{
    using namespace std::chrono_literals;
    std::vector<SeriesPoint> made;
    Clock::TimePoint time{std::chrono::seconds(1'795'341'600)};
    for (std::int64_t i = 0; i < count; ++i) {
        time += i % 5000 == 4999 ? 60s : 500ms;
        const double value = -95 + 15 * std::sin(static_cast<double>(i) / 300) +
                             static_cast<double>(i * 7919 % 17) / 4;
        made.push_back({time, time + 400ms, value});
    }
    return made;
}

void thinLine(benchmark::State& state)
{
    const auto line = points(state.range(0));
    const TimeScale times(line.front().from, line.back().until, 0, 1500);
    const ValueScale values(-120, -70, 0, 400);
    for (auto _ : state)
        benchmark::DoNotOptimize(thinnedLine(line, times, values));
    state.SetItemsProcessed(state.iterations() * state.range(0));
}
BENCHMARK(thinLine)->Arg(1000)->Arg(100000)->Unit(benchmark::kMicrosecond);

void drawChart(benchmark::State& state)
{
    const auto series = points(state.range(0));
    const std::vector<ChartLine> lines{{"Measured RSRP", "dBm", series},
                                       {"Measured RSRQ", "dB", series}};
    const ChartContent content{lines, {}, series.front().from, series.back().until};
    for (auto _ : state) {
        SvgCanvas canvas(1500, 500);
        SignalChart(content, ChartLooks(), 1500, 500, canvas).draw(canvas);
        benchmark::DoNotOptimize(canvas.document());
    }
}
BENCHMARK(drawChart)->Arg(1000)->Arg(100000)->Unit(benchmark::kMicrosecond);

} // namespace

} // namespace ventrik

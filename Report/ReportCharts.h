#pragma once

#include "Charts/ChartLine.h"
#include "Model/EventLog.h"
#include "Report/HtmlWriter.h"
#include "Report/NumberSeries.h"
#include "Report/ReportTimes.h"

#include <cstddef>
#include <span>
#include <string>
#include <vector>

namespace ventrik
{

/// The lines of one group that share a unit. A number without a unit stands alone.
struct LineGroup {
    PlaceId holder;
    std::string unit;
    std::vector<const NumberLine*> lines;
    std::size_t changeCount = 0;
    int part = 1; ///< of those with the same holder and unit
};

/// Groups of the values that changed: those with units, then those without, each in the order of
/// the tree. Large ones are parted.
std::vector<LineGroup> lineGroups(std::span<const NumberLine> lines, const PlaceTable& places);

/// The numbers that changed as charts over time, with changes of the serving cell as marks. Where
/// there are too many, those that changed most often are drawn, and the others are counted.
class ReportCharts
{
  public:
    static constexpr std::size_t mostCharts = 80;
    static constexpr std::size_t mostBytes = 2'600'000; ///< of all pictures

    /// The store and the times outlive it.
    ReportCharts(const ChangeStore& store, const ReportTimes& times, std::span<const Event> events);

    void write(HtmlWriter& html) const;

  private:
    struct Chart {
        std::size_t group;
        std::string picture;
    };

    void takeMarks(std::span<const Event> events);
    void draw();
    std::string pictureOf(const LineGroup& group) const;
    std::string titleOf(const LineGroup& group) const;
    std::string nameOf(const NumberLine& line) const;
    std::string sectionOf(const LineGroup& group) const;
    void writeChart(HtmlWriter& html, const Chart& chart) const;
    void writeNotes(HtmlWriter& html) const;

    const ChangeStore& _store;
    const ReportTimes& _times;
    NumberSeries _series;
    std::vector<LineGroup> _groups;
    std::vector<ChartMark> _marks;
    std::size_t _cellChangeCount = 0;
    std::vector<Chart> _charts; // in the order of the groups
};

} // namespace ventrik

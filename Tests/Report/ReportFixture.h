#pragma once

#include "LogGenerator/Core/StateKeys.h"
#include "Model/ChangeStore.h"
#include "Report/HtmlWriter.h"
#include "Tests/Support/IdleGenerator.h"

#include <chrono>
#include <string>

#include <fmt/format.h>
#include <gmock/gmock.h>

namespace ventrik
{

/// Says that all was told by the record of a code.
class TellingGenerator : public IdleGenerator
{
  public:
    const ReadLayout* lastRead() const override { return &read; }

    ReadLayout read{};
};

/// Displays made by hand, one a second, of LTE.
class ReportFixture : public testing::Test
{
  protected:
    ReportFixture()
    {
        generator.read.logCode = 1;
        store.useGenerator(&generator, "lte");
    }

    /// After the last display by a second, or by as much as given.
    void show(const PlistValue& display, std::chrono::nanoseconds after = std::chrono::seconds(1))
    {
        if (!store.isEmpty())
            time += after;
        state.set(StateKey::display, display);
        store.messageTaken(time, {}, state);
    }

    static PlistDictionary servingCell(std::string_view identity, std::string_view level)
    {
        return {{"E-ARFCN", "1300"}, {"Physical Cell ID", identity}, {"Measured RSRP", level}};
    }
    static PlistDictionary serving(std::string_view identity, std::string_view level)
    {
        return {{"Serving Cell Measurements", servingCell(identity, level)}};
    }
    static PlistDictionary withNeighbor(std::string_view identity, std::string_view level)
    {
        PlistDictionary display = serving("301", "-90 dBm");
        const PlistDictionary cell{{"Physical Cell ID", identity}, {"Measured RSRP", level}};
        display.set("Neighbors", PlistDictionary{{"Neighbor Cells List", PlistArray{cell}},
                                                 {"Neighbor Measurements",
                                                  PlistDictionary{{"E-ARFCN", "6300"}}}});
        return display;
    }

    const Clock::TimePoint start = FixedClock().now();
    Clock::TimePoint time = start;
    TellingGenerator generator;
    PlistDictionary state;
    ChangeStore store{RecordsMode::Base};
};

} // namespace ventrik

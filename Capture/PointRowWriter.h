#pragma once

#include "Capture/RowWriter.h"

#include <string>

namespace ventrik
{

/// Rows as points of InfluxDB's line protocol. A path is a series; what tells records apart would
/// make series without end, so that a point has its time only.
class PointRowWriter : public RowWriter
{
  public:
    PointRowWriter(std::string_view capture, std::string_view technology);

    RecordPart recordPart(const RowRecord& record) override;
    std::string placePart(const RowPlace& place) const override;
    void addValue(std::string& row, const RowValue& value) const override;
    /// Without a time: that is when it comes to the engine.
    void appendClosing(std::string& rows, const RowClosing& closing) const override;

  private:
    std::string _tags; // of the capture and its technology
    std::string _time; // of the last record
};

} // namespace ventrik

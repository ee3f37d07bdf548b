#pragma once

#include "Capture/ColumnRowWriter.h"

namespace ventrik
{

/// Rows as CSV. Nothing is null; an empty text is "". A row of values has nothing in the columns of
/// the closing one, and the other way round.
class CsvRowWriter : public ColumnRowWriter
{
  public:
    CsvRowWriter(std::string_view capture, std::string_view technology);

    /// The line with the columns' names.
    static std::string heading();

  protected:
    void addText(std::string& row, std::string_view text) const override;
};

} // namespace ventrik

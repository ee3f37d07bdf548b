#pragma once

#include "Capture/ColumnRowWriter.h"

namespace ventrik
{

/// Rows as JSON Lines: an object a line, its members named as the columns are.
class JsonRowWriter : public ColumnRowWriter
{
  public:
    JsonRowWriter(std::string_view capture, std::string_view technology);

  protected:
    void addText(std::string& row, std::string_view text) const override;
};

} // namespace ventrik

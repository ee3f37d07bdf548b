#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The serving cell's signal on the first carrier, by antenna.
class ServingCellSignal : public Base
{
  public:
    explicit ServingCellSignal(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

/// The signal of each cell of the last record, one row each: added carriers and neighbours as well.
class SignalByCell : public Base
{
  public:
    explicit SignalByCell(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
};

} // namespace ventrik

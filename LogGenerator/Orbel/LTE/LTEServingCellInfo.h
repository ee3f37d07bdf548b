#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The serving cell's identity, frequencies, bandwidths and band.
class LTEServingCellInfo : public Base
{
  public:
    explicit LTEServingCellInfo(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
    bool isOfOtherCell(const Record& record, const LogPacket& packet) const;

    /// Which the last cell info was of.
    struct Cell {
        std::int64_t physicalCellIdentity;
        std::int64_t earfcn;
        bool operator==(const Cell&) const = default;
    };
    std::optional<Cell> _servingCell;
};

} // namespace ventrik

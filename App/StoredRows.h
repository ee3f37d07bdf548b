#pragma once

#include "Model/ChangeStore.h"

#include <functional>
#include <string>
#include <string_view>

namespace ventrik
{

/// Of which part of a store rows are wanted.
struct StoredRowsRange {
    Clock::TimePoint first;
    Clock::TimePoint last; ///< itself included
};

/// Writes what a store keeps of a range as CSV rows, behind their heading: the rows that decoding
/// the same messages gives, but for the one that closes a capture. What a store does not keep is
/// empty: the subscription, and the version and the layout where the message itself is gone.
class StoredRows
{
  public:
    /// The store outlives it.
    StoredRows(const ChangeStore& store, std::string_view capture)
        : _store(store), _capture(capture)
    {
    }

    /// Gives the text to `take` in blocks.
    void write(const StoredRowsRange& range,
               const std::function<void(std::string_view block)>& take) const;

  private:
    const ChangeStore& _store;
    std::string _capture;
};

} // namespace ventrik

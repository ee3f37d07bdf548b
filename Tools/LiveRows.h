#pragma once

#include "Model/MessageObserver.h"
#include "Tools/CaptureRows.h"

#include <optional>
#include <string>

namespace ventrik
{

/// The rows of what comes over the log channel. After each restart of the channel all values are
/// told once more; records are counted on.
class LiveRows : public MessageObserver
{
  public:
    LiveRows(RowOptions options, RecordsMode records);

    void useGenerator(const LogGenerator* generator, std::string_view technology) override;
    void messageTaken(Clock::TimePoint time, ByteView message,
                      const PlistDictionary& state) override;

    /// What there is to print by now.
    std::string takeText();
    /// The row that closes all others.
    void close();

  private:
    void endRows();

    RowOptions _options;
    RecordsMode _records;
    std::string _text;
    RowClosing _closing{.status = "empty"};
    std::optional<CaptureRows> _rows; // of the present generator
};

} // namespace ventrik

#pragma once

#include "Capture/CaptureContainer.h"
#include "Capture/RowWriter.h"
#include "LogGenerator/Core/LogGenerator.h"
#include "Model/DisplayChanges.h"
#include "Model/PathSelection.h"
#include "Packets/WantedCodes.h"
#include "Platform/Technology.h"

#include <chrono>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

struct RowOptions {
    RowFormat format = RowFormat::JsonLines;
    PathSelection selection = {};
    /// The state at each such step in the place of the changes.
    std::optional<std::chrono::nanoseconds> every = {};
};

/// The rows of one capture: what each message changed in the display, or at each step all values as
/// they stand. They are appended to a text that the caller takes away.
class CaptureRows
{
  public:
    /// The generator outlives it.
    CaptureRows(const RowOptions& options, std::string_view capture, const Technology& technology,
                const LogGenerator& generator, RecordsMode records);

    /// Before a message is decoded: the steps that end before it.
    void runStepsBefore(Clock::TimePoint time, const PlistDictionary& state);
    /// After it was decoded.
    void take(const CapturedMessage& message, const PlistDictionary& state);
    /// After the last one: the rows that are left.
    void finish(const PlistDictionary& state);

    std::string_view text() const { return std::string_view(_text).substr(0, _used); }
    /// The text was taken away.
    void clearText() { _used = 0; }
    /// Counts on from what was before, of the same capture.
    void continueFrom(const RowClosing& closing) { _closing = closing; }
    /// What the closing row counts.
    RowClosing closing() const { return _closing; }
    void close(const RowClosing& closing);

  private:
    /// What the rows of a place begin with, as long as it is the same place.
    struct KnownPlace {
        std::uint64_t serial = 0;
        std::string part;
        bool isSelected = false;
    };

    /// The part of a row that tells a value.
    struct KnownValue {
        const Field* field = nullptr;
        std::int64_t raw = 0; ///< of a text that no field shows something of its own
        bool isWorkedOut = false;
        std::string text;
        std::string part; ///< empty while there is none

        bool isOf(const ShownCell& shown, std::string_view itsText) const
        {
            return field == shown.field && raw == shown.raw &&
                   isWorkedOut == shown.workedOut.has_value() && text == itsText && !part.empty();
        }
    };

    std::optional<RecordKind> kindOf(const CapturedMessage& message) const;
    void append(const RecordPart& recordPart, std::string_view placePart,
                std::string_view valuePart);
    void writeChanges(const CapturedMessage& message, const PlistDictionary& state);
    void writeFirst(const RowRecord& record, std::span<const DisplayChange> changes,
                    const PlistDictionary& state);
    void writeState(Clock::TimePoint time, const PlistDictionary& state);
    void writeRow(const RecordPart& recordPart, const DisplayChange& change,
                  const PlistDictionary& state);
    void writeHolder(const RecordPart& recordPart, const DisplayChange& change,
                     const PlistDictionary& state);
    std::string_view valuePart(const std::optional<ShownCell>& cell, std::string_view text);
    std::string_view keepValue(KnownValue& known, const ShownCell& shown,
                               std::string_view text) const;
    const KnownPlace& knownPlace(const DisplayPlace& place, const PlistDictionary& state);
    void describe(KnownPlace& known, const DisplayPlace& place, const PlistDictionary& state) const;

    RowOptions _options;
    RecordsMode _records;
    const LogGenerator& _generator;
    DisplayChanges _changes;
    std::unique_ptr<RowWriter> _writer;
    std::string _text; // with room behind what is used, so that rows need not make some
    std::size_t _used = 0;
    RowClosing _closing;
    WantedCodes _wanted; ///< what the decoders ask for; all where messages are property lists
    std::vector<KnownPlace> _places; // by number, as far as they are kept
    KnownPlace _otherPlace;
    std::vector<KnownValue> _values; // each where its field and its number lead, or beside it
    bool _hasDisplay = false;        // there were changes already
    // Where values are told at steps.
    std::optional<Clock::TimePoint> _nextStep;
    Clock::TimePoint _lastTime;
    bool _isUpdated = false; // since the last step
};

} // namespace ventrik

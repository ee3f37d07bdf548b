#pragma once

#include "LogGenerator/Core/LogGenerator.h"
#include "Model/DisplayMoment.h"
#include "Platform/Platform.h"

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

/// Where a shown value comes from, as far as that is known.
struct ValueSource {
    std::string path;
    std::string text; ///< what shows
    Clock::TimePoint changed;
    Clock::TimePoint written;              ///< to about a second
    std::optional<RecordKind> record = {}; ///< none where no record told it
    std::string recordName = {};           ///< empty where nobody knows it
    std::optional<std::int64_t> raw = {};  ///< none where no field shows
    std::string unit = {};
    /// Where the raw number stands in the packet; only where that is known.
    struct Bits {
        std::size_t firstByte; ///< of the packet, without its transport prefix
        Place place;
    };
    std::optional<Bits> bits = {};
    Bytes packet = {}; ///< that told the value first; empty where it is not kept

    /// As lines of a name and a value.
    std::vector<std::pair<std::string, std::string>> lines(const Clock& clock) const;
    /// The whole packet, so many bytes a line, each behind its offset; those that hold the value
    /// stand in brackets.
    std::string packetText(std::size_t bytesOfLine) const;
    /// In one line: log code, version, layout, raw number and place; empty where nothing is known.
    std::string brief() const;
    /// All of it: the lines, an empty one, and the packet.
    std::string allText(const Clock& clock, std::size_t bytesOfLine) const;
    /// Whether a byte of the packet holds some of the value.
    bool isMarked(std::size_t byte) const;
};

/// Finds where values come from: decodes the packet that told a value once more.
class ValueSources
{
  public:
    ValueSources(const Resources& resources, const Clock& clock, RecordsMode records);
    ~ValueSources();

    /// None where no value stands at the path.
    std::optional<ValueSource> find(const DisplayMoment& display, const ChangeStore& store,
                                    const std::string& path) const;

  private:
    class Silence;

    void locate(ValueSource& source, const StoredValue& value,
                const std::vector<std::string_view>& keys, const std::string& technology) const;
    std::unique_ptr<LogGenerator> generatorOf(const std::string& technology) const;

    const Resources& _resources;
    const Clock& _clock;
    RecordsMode _records;
    std::unique_ptr<Silence> _log;
};

} // namespace ventrik

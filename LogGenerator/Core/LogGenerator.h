#pragma once

#include "LogGenerator/Core/GeneratorServices.h"
#include "LogGenerator/Core/ValueOrigin.h"
#include "Packets/Layouts.h"
#include "PropertyList/PlistValue.h"

#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// Turns the log messages of one radio technology into a display object.
///
/// A generator keeps what it knows in the state dictionary, which the monitor model owns and hands
/// to every operation; only generators write it. Its keys stand in StateKeys.h.
///
/// Construction is silent; each concrete class's `generator` runs its `init`, a member because its
/// log lines belong in the middle of the subclass's own.
class LogGenerator
{
  public:
    virtual ~LogGenerator() = default;
    LogGenerator(const LogGenerator&) = delete;
    LogGenerator& operator=(const LogGenerator&) = delete;

    /// Folds one log message, opaque bytes as they arrived, into the state.
    virtual void updateState(PlistDictionary& state, ByteView data) = 0;
    /// The display object, after it was recorded in the history; none while there is nothing.
    virtual std::optional<PlistValue> generateLogUsingState(PlistDictionary& state) = 0;
    /// The command that makes the telephony service stream.
    virtual PlistDictionary getStartCommand() const = 0;
    /// The "Data" of a snapshot file.
    virtual PlistValue getSaveContentsFromState(const PlistDictionary& state) const = 0;
    /// One line that says why there is no display; empty when nothing is in the way of one.
    virtual std::string displayFault() const { return {}; }

    /// Where the value at a path of the display's keys and row numbers comes from; none where no
    /// field of a record shows there.
    virtual std::optional<ValueOrigin> originOf(const PlistDictionary& state,
                                                std::span<const std::string_view> path) const;

    /// Where to look for what the value at such a path shows; none where that is not known yet, and
    /// a place of no section where it will never be a field's.
    virtual std::optional<CellPlace> cellPlaceAt(const PlistDictionary& state,
                                                 std::span<const std::string_view> path) const;
    /// What shows there; none where no field does.
    virtual std::optional<ShownCell> cellAt(CellPlace& place) const;

    /// The name of the section that shows what stands at that path; empty outside of sections.
    virtual std::string_view sectionAt(const PlistDictionary& state,
                                       std::span<const std::string_view> path) const;

    /// The names of the sections that are given the records of an effective log code, in order.
    virtual std::vector<std::string_view> sectionsOfCode(std::uint32_t /*logCode*/) const
    {
        return {};
    }

    /// How the records were read, the last one of each log code, that the section shows which
    /// stands at that path or holds it; empty outside of sections.
    virtual std::vector<ReadLayout> layoutsAt(const PlistDictionary& state,
                                              std::span<const std::string_view> path) const;

    /// How the record of the last message was read, until the next one; null where none was.
    virtual const ReadLayout* lastRead() const { return nullptr; }

    /// The same of all sections.
    virtual std::vector<ReadLayout> layouts() const { return {}; }

    /// A new generator for the service's technology identifier, or none if it is unknown.
    static std::unique_ptr<LogGenerator> generatorFromTechnology(const PlistValue& technology,
                                                                 const GeneratorServices& services);

    /// The same for services that say nothing of the records: they are read so.
    static std::function<std::unique_ptr<LogGenerator>(const PlistValue& technology,
                                                       const GeneratorServices& services)>
    generatorsReading(RecordsMode records);

    /// Records the state's display in its history, which never holds more than 5 entries.
    static void updateHistoryInState(PlistDictionary& state, const Clock& clock);

  protected:
    explicit LogGenerator(const GeneratorServices& services) : _services(services) {}

    void init();

    /// Records the display in the history, as `updateHistoryInState` does; where there is none, for
    /// another technology's has made way, there is nothing to record.
    void recordDisplay(PlistDictionary& state) const;

    /// Drops the display of another technology's generator from the state, so that its values are
    /// not taken for ours after the baseband changed its technology. The history stays.
    static void claimDisplay(PlistDictionary& state, std::string_view owner);

    SystemLog& log() const { return _services.log; }
    const Resources& resources() const { return _services.resources; }
    const Clock& clock() const { return _services.clock; }
    AssertionPolicy assertions() const { return _services.assertions; }
    RecordsMode records() const { return _services.records; }
    RawPackets rawPackets() const { return _services.rawPackets; }

  private:
    GeneratorServices _services;
};

} // namespace ventrik

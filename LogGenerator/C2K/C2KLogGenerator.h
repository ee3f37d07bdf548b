#pragma once

#include "LogGenerator/C2K/C2KLabels.h"
#include "LogGenerator/C2K/C2KOutput.h"
#include "LogGenerator/Orbel/OrbelLogGenerator.h"

namespace ventrik
{

/// The generator of CDMA2000 basebands, 1x and EV-DO.
///
/// A template gives each label of the display the key of the value to show there; from it come the
/// empty display and a lookup from each key to its labels. One decoder for each log code publishes
/// its values through the lookup. Display and lookup live in the state dictionary and are updated
/// in place.
class C2KLogGenerator : public OrbelLogGenerator
{
  public:
    static std::unique_ptr<C2KLogGenerator> generator(const GeneratorServices& services);

    void updateState(PlistDictionary& state, ByteView data) override;
    std::optional<PlistValue> generateLogUsingState(PlistDictionary& state) override;
    PlistDictionary getStartCommand() const override;

    std::optional<ValueOrigin> originOf(const PlistDictionary& state,
                                        std::span<const std::string_view> path) const override;
    std::optional<CellPlace> cellPlaceAt(const PlistDictionary& state,
                                         std::span<const std::string_view> path) const override;
    std::optional<ShownCell> cellAt(CellPlace& place) const override;
    const ReadLayout* lastRead() const override { return _lastRead ? &*_lastRead : nullptr; }

    /// Fills the display with the template's groups and empty values, and the lookup with an array
    /// of entries for each lookup key: the label, and the group of the display that holds it.
    static void processTemplate(const PlistDictionary& displayTemplate, PlistDictionary& display,
                                PlistDictionary& lookup, SystemLog& log);
    /// The display, built on first use; none when the template cannot be loaded.
    std::optional<PlistValue> getDisplayFromState(PlistDictionary& state);
    /// Decodes one packet as it arrived; without a lookup its values go nowhere.
    void updateFromLog(ByteView data, const PlistDictionary* lookup, PlistDictionary& state);

  private:
    using OrbelLogGenerator::OrbelLogGenerator;

    /// The display in the state, built on first use; null when the template cannot be loaded.
    const PlistValue* ensureDisplay(PlistDictionary& state);
    /// The display in the state is ours from now on.
    void useDisplay(const PlistDictionary& state);

    C2KLabels _labels;
    TotalPlaces _totals;
    std::optional<ReadLayout> _lastRead;
    // The display that was made of our template; and where it and its lookup are in the state.
    WeakContainer _display;
    std::size_t _displayPlace = 0;
    std::size_t _lookupPlace = 0;
};

} // namespace ventrik

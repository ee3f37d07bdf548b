#pragma once

#include "LogGenerator/Orbel/ClassIndex.h"
#include "LogGenerator/Orbel/OrbelLogGenerator.h"

#include <memory>
#include <string>

namespace ventrik
{

/// The generator of the technologies whose display is described by a template: it copies the
/// template into the live display, binds each section to its part of it, and routes every packet to
/// the sections that want its log code.
///
/// The display lives in the state dictionary and is updated in place; it is built on the first
/// packet or the first generation, whichever comes first.
class OrbelLogGenerator2 : public OrbelLogGenerator
{
  public:
    ~OrbelLogGenerator2() override;

    void updateState(PlistDictionary& state, ByteView data) override;
    std::optional<PlistValue> generateLogUsingState(PlistDictionary& state) override;
    PlistDictionary getStartCommand() const override;

    std::optional<ValueOrigin> originOf(const PlistDictionary& state,
                                        std::span<const std::string_view> path) const override;
    std::optional<CellPlace> cellPlaceAt(const PlistDictionary& state,
                                         std::span<const std::string_view> path) const override;
    std::optional<ShownCell> cellAt(CellPlace& place) const override;
    std::string_view sectionAt(const PlistDictionary& state,
                               std::span<const std::string_view> path) const override;

    std::vector<std::string_view> sectionsOfCode(std::uint32_t logCode) const override;
    std::vector<ReadLayout> layoutsAt(const PlistDictionary& state,
                                      std::span<const std::string_view> path) const override;
    std::vector<ReadLayout> layouts() const override;
    const ReadLayout* lastRead() const override { return _lastRead; }

    /// Routes one packet, as it arrived, to the subscribed sections.
    void updateWithData(ByteView data);
    /// The copy of a template value, its sections bound to their containers; none when it holds a
    /// value of a kind that no template may hold.
    std::optional<PlistValue> processTemplate(const PlistValue& value);
    /// Reports values of unknown kinds in a display; prints nothing else.
    void printDict(const PlistValue& value) const;
    /// The display. The call that builds it returns none; only later calls return it.
    std::optional<PlistValue> getDisplayFromState(PlistDictionary& state);

  protected:
    using OrbelLogGenerator::OrbelLogGenerator;

    void initWithPListName(std::string templateName, std::shared_ptr<ClassIndex> classIndex);

  private:
    static void deliver(const LogPacket& packet, std::uint32_t logCode, Base& section);
    /// The display in the state; null in the call that builds it, and when there is none.
    const PlistValue* ensureDisplay(PlistDictionary& state);
    std::optional<PlistValue> buildDisplay(PlistDictionary& state);
    /// Of which displays this one may go on with.
    std::string displayOwner() const;
    void bindSection(std::string_view name, const PlistValue& container);
    /// Binds the sections that the template names, and nothing that a record brought into the
    /// display under such a name.
    void bindSections(const PlistValue& displayTemplate, const PlistValue& display);

    std::string pListName;
    std::shared_ptr<ClassIndex> cIndex;
    PropertyListMemory _propertyLists;
    // The display that our sections are bound to.
    WeakContainer _boundDisplay;
    std::size_t _displayPlace = 0;         // in the state, as far as is known
    const ReadLayout* _lastRead = nullptr; // a section's
    bool _cannotBuild = false;             // the template holds what no template may hold
};

} // namespace ventrik

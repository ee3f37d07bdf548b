#pragma once

#include "LogGenerator/Core/LogGenerator.h"
#include "LogGenerator/Orbel/PeriodPackets.h"

namespace ventrik
{

/// The base of every packet-based technology's generator: keeps the raw packets of each display
/// period and turns the periods of the history into a DLF log for the snapshot.
class OrbelLogGenerator : public LogGenerator
{
  public:
    /// A DLF file: the version report, then each period's bytes without their first byte. None,
    /// with a log line, when the history holds something else than bytes.
    std::optional<Bytes> generateDlfFromState(const PlistDictionary& state) const;

    /// The history's entries and, when it could be made, one more with the DLF log.
    PlistValue getSaveContentsFromState(const PlistDictionary& state) const override;
    std::string displayFault() const override { return _templateFault; }

  protected:
    using LogGenerator::LogGenerator;

    void init();

    /// Appends one packet exactly as it arrived.
    void keepPacket(ByteView packet);
    /// Moves the packets since the last call into the state as "DisplayState".
    void storePacketsInState(PlistDictionary& state);

    /// The state's display template, from the resource of that name at first. None, with the line
    /// at error level, when it cannot be used: one that is there and broken is read only once.
    std::optional<PlistValue> loadTemplate(PlistDictionary& state, const std::string& name,
                                           std::string_view failureLine);
    /// The template ends with the entries of another one, the resource of that name.
    void extendTemplate(std::string name) { _templateExtension = std::move(name); }
    const std::string& templateExtension() const { return _templateExtension; }
    /// From now on there is no display of this template.
    void rejectTemplate(std::string_view reason);

  private:
    std::optional<Bytes> makeVersionReport() const;
    std::optional<PlistValue> readTemplate(const std::string& name);
    std::optional<PlistValue> readWholeTemplate(const std::string& name);

    // The packets since the last display; none where they are not kept.
    std::optional<PeriodPackets> _binData;
    std::string _templateExtension;
    std::string _templatePath;   // where the template was read
    std::string _templateFault;  // why it cannot be used, in one line; empty when it can
    bool _isTemplateBad = false; // it was read; reading it again would give the same
};

} // namespace ventrik

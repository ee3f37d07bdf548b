#pragma once

#include "LogGenerator/LogGenerator.h"

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

  protected:
    using LogGenerator::LogGenerator;

    void init();

    /// Appends one packet exactly as it arrived.
    void keepPacket(ByteView packet);
    /// Moves the packets since the last call into the state as "DisplayState".
    void storePacketsInState(PlistDictionary& state);

  private:
    std::optional<Bytes> makeVersionReport() const;

    // The packets since the last display; none in a generator that was never initialised.
    std::optional<Bytes> _binData;
};

} // namespace ventrik

#pragma once

#include "LogGenerator/Core/LogGenerator.h"

namespace ventrik
{

/// The generator of the older basebands whose service sends ready-made cell descriptions: each
/// message is a property list of dictionaries, arrays and strings, and replaces the one before.
///
/// The service is trusted to send nothing else. Any other message is an assertion failure: it is
/// reported in the system log and on standard error and ends the process, or is thrown where the
/// services ask for that.
class GSMLogGenerator : public LogGenerator
{
  public:
    static std::unique_ptr<GSMLogGenerator> generator(const GeneratorServices& services);

    void updateState(PlistDictionary& state, ByteView data) override;
    std::optional<PlistValue> generateLogUsingState(PlistDictionary& state) override;
    PlistDictionary getStartCommand() const override;
    PlistValue getSaveContentsFromState(const PlistDictionary& state) const override;

    /// The value as it is displayed: without the first element of every array, and with the value
    /// of each one-entry dictionary in that dictionary's place. The top level is never replaced.
    /// Throws AssertionFailure for a value that is not shown.
    static PlistValue processObject(const PlistValue& value, SystemLog& log);
    /// The single value of a one-entry dictionary, or none.
    std::optional<PlistValue> canCollapse(const PlistValue& value) const;

  private:
    using LogGenerator::LogGenerator;

    void takeMessage(PlistDictionary& state, ByteView data);
};

} // namespace ventrik

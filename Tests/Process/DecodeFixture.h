#pragma once

#include "Tests/Process/LTECaptures.h"
#include "Tests/Process/ProcessFixture.h"

namespace ventrik
{

/// Runs ventrik-decode with a small display template of its own.
class DecodeFixture : public ProcessFixture
{
  protected:
    struct Result {
        int status = -1;
        std::string output;
        std::string errors;
        /// The decoder's own complaints on standard error.
        std::vector<std::string> complaints;
    };

    /// What the template shows after an antenna count of 2, as JSON.
    static constexpr const char* twoAntennas =
        R"({"Serving Cell Info": {"Num Tx Antennas": "2", "Physical Cell ID": "-"}, )"
        R"("Note": "none"})";

    DecodeFixture();

    /// The options come behind the one for the template.
    Arguments withResources(const Arguments& arguments) const;
    Result decode(const Arguments& arguments) const;
    Result decode(const PcapBytes& capture, Arguments arguments = {}) const;
    /// The capture comes on standard input, which then ends.
    Result decodeInput(const PcapBytes& capture, Arguments arguments = {}) const;

    /// An empty LTE capture.
    static PcapBytes lteCapture() { return PcapBytes(lteLinkType); }
    /// A cell info and, a microsecond later, an antenna count.
    static PcapBytes cellCapture();

    /// What came of a program when it has ended.
    Result finish(Program& program) const;
};

} // namespace ventrik

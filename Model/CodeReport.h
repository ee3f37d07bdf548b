#pragma once

#include "LogGenerator/Core/LogGenerator.h"
#include "Packets/RecordCensus.h"

#include <cstdint>
#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace ventrik
{

/// What became of the log codes of a technology: which came, which did not, which nobody decodes.
struct CodeReport {
    struct Code {
        std::uint32_t logCode; ///< effective
        std::size_t records = 0;
        std::size_t tooShort = 0;             ///< records that do not hold what theirs holds
        std::set<std::uint8_t> versions = {}; ///< that were seen
        std::vector<std::string_view> sections = {};
        std::vector<std::pair<RecordKind, std::size_t>> kinds = {}; ///< and how often each came
        bool isAskedFor = false;                                    ///< and so somebody decodes it
    };
    std::vector<Code> came;             ///< in order
    std::vector<std::uint32_t> missing; ///< asked for, and never came; in order

    /// The generator may be null: then nothing is asked for.
    static CodeReport of(const RecordCensus& census, const LogGenerator* generator);
};

/// As "0xB17F".
std::string codeText(std::uint32_t logCode);
/// What the records of a code are called; "" where nobody knows it.
std::string_view nameOfCode(std::uint32_t logCode);
/// The versions, as "1, 2, 4"; "" where there are none.
std::string versionsText(const CodeReport::Code& code);
/// As "version 3, 42 bytes, newer".
std::string kindText(const RecordKind& kind);

} // namespace ventrik

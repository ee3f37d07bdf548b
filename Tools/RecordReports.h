#pragma once

#include "Model/CodeReport.h"
#include "Packets/RecordCensus.h"

#include <string>

namespace ventrik
{

// What is told of the records of captures, for people to read.

/// A line for each code, version, size and layout.
std::string recordTable(const RecordCensus& census);

/// A line for each log code that came, with its sections; then the codes that were asked for and
/// never came, and those that nobody decodes.
std::string codeTable(const CodeReport& report);

/// The records that nobody can read, as a text that can be sent to us: a line for each code,
/// version and size. No bytes of payloads are in it but, where that is asked for, the first payload
/// of each line of a measurement that holds no identities.
std::string unknownRecordReport(const RecordCensus& census, bool withBytes);

/// One line that says what such a report holds.
std::string reportNotice(const std::string& file, bool withBytes);

} // namespace ventrik

#pragma once

#include "Tools/DecodeCommand.h"

#include <cstdio>
#include <string>
#include <vector>

namespace ventrik
{

struct ManyCapturesOptions {
    DecodeOptions decode;              ///< but for the capture
    std::vector<std::string> captures; ///< files, directories, "-"
    std::vector<std::string> lists;    ///< files with names, one a line; "-"
    unsigned jobs = 1;                 ///< processes that decode at a time
    bool isStrict = false;             ///< several captures give a status as one does
};

/// Decodes captures to rows, in their order, with one heading. A bad one ends nothing: its closing
/// row and a line on standard error tell, and the status only where it is the only one or they are
/// strict.
int decodeCaptures(const ManyCapturesOptions& options, std::FILE* output);

} // namespace ventrik

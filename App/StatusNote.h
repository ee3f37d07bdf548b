#pragma once

#include "App/Toolkit/StatusLabel.h"

#include <string>

namespace ventrik
{

/// What is said beside the status; empty when all is well.
struct StatusNote {
    std::string text;
    StatusLabel::NoteKind kind = StatusLabel::NoteKind::Lasting;
};

} // namespace ventrik

#pragma once

#include "Model/MessageObserver.h"

#include <string>

namespace ventrik
{

/// What is shown in the place of a log channel: a capture that is read bit by bit, so that the
/// window lives meanwhile.
class OpenedSource
{
  public:
    virtual ~OpenedSource() = default;

    /// Is told what is read, as by a log channel; before anything is. The observer is used in
    /// `readOn` alone.
    virtual void setObserver(MessageObserver& observer) = 0;
    /// For people: that of the file.
    virtual std::string name() const = 0;
    /// Reads on for a few hundredths of a second; false when there is no more.
    virtual bool readOn() = 0;
    /// How far it has come, in a few words.
    virtual std::string progress() const = 0;
    /// What is wrong with it, in one line; empty when nothing is.
    virtual std::string fault() const = 0;
};

} // namespace ventrik

#pragma once

#include <stdexcept>

namespace ventrik
{

/// A message breaks what the telephony service promises, and its generator can go on no more. It
/// was reported in the system log. Thrown only where the services ask for it; else such a message
/// ends the process.
class AssertionFailure : public std::runtime_error
{
  public:
    using std::runtime_error::runtime_error;
};

} // namespace ventrik

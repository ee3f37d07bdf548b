#pragma once

#include "PropertyList/Bytes.h"

#include <string>
#include <vector>

namespace ventrik
{

/// A phone's diagnostic port: the far end of a pseudo-terminal, which a link of a lasting name
/// leads to. Nothing is answered but what the test says.
class EmulatedPhone
{
  public:
    /// Makes the link lead to this phone.
    explicit EmulatedPhone(const std::string& link);
    /// Unplugs the phone; the link then leads nowhere.
    ~EmulatedPhone();
    EmulatedPhone(const EmulatedPhone&) = delete;
    EmulatedPhone& operator=(const EmulatedPhone&) = delete;

    /// Sends as much as is taken within some seconds; false when that is not all.
    bool send(ByteView bytes);
    /// The content of each whole frame that has come so far.
    const std::vector<Bytes>& commands();

  private:
    void receive();

    int _master = -1;
    Bytes _received;
    std::vector<Bytes> _commands;
};

} // namespace ventrik

#pragma once

#include "TelephonyService/MessageSource.h"

#include <cstdint>
#include <deque>
#include <string_view>

namespace ventrik
{

class PacketBuilder;
class RecordWriter;

/// What the scenarios of all technologies have in common: steps of equal length, each of which
/// reports some packets; and the SIM's files and packet data contexts, which are the phone's own.
class Scenario : public MessageSource
{
  public:
    static constexpr std::chrono::milliseconds stepDuration{50};

    /// Endless.
    std::optional<TimedMessage> next() final;

  protected:
    /// The number of the step that is being reported, from 0.
    std::uint64_t step() const { return _step; }

    using MessageSource::report; // which tells of the source

    /// Sends a packet at the time of this step; now and then one with the transport prefix.
    void report(PacketBuilder packet);
    void report(const RecordWriter& record);
    /// Sends a packet that carries a property list.
    void reportPropertyList(std::uint32_t logCode, const PlistValue& root);
    /// Sends a property list as it is, without a packet around it.
    void reportBarePropertyList(const PlistValue& root);
    /// The access technology is the one that the SIM prefers.
    void reportSimFiles(std::string_view accessTechnology);
    /// One context that always stands, and one for data while the phone is connected.
    void reportPdpContexts(bool isConnected);

  private:
    /// Moves the world on by one step and reports it.
    virtual void reportStep() = 0;

    std::uint64_t _step = 0;
    std::uint64_t _messageCount = 0;
    std::deque<TimedMessage> _messages;
};

/// A number as so many bits carry it, rounded and cut to what they hold.
std::uint16_t rawOf(double value, unsigned bits);

/// A whole number as a byte carries it, cut to what that holds.
std::uint8_t byteOf(double value);
/// The same for a signed one.
std::uint8_t signedByteOf(double value);

/// A cell of the phone's own network as the cell monitor tells it, still without numbers.
PlistDictionary cellEntry(std::string_view technology, bool isServing);

} // namespace ventrik

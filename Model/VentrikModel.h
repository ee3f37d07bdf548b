#pragma once

#include "LogGenerator/Core/LogGenerator.h"
#include "Model/DisplayTree.h"
#include "Model/MessageObserver.h"
#include "Platform/Platform.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// Why the last attempt to open the log channel failed; None while the channel stands.
enum class ChannelFault {
    None,
    NoPort,       ///< our own port cannot be made
    PortTaken,    ///< another process has a port of our name
    NoService,    ///< nobody serves
    NoAnswer,     ///< the service does not answer in time, or goes in the middle
    BadAnswer,    ///< its answer is not understood
    Refused,      ///< it refuses a channel
    NoTechnology, ///< it speaks no technology that we know
};
/// The fault in a few words, for the screens; empty for None.
std::string_view channelFaultText(ChannelFault fault);

/// The one object that talks to the telephony service: owns the log channel, chooses the log
/// generator, feeds it every message and, every 2 seconds when something new arrived, asks for a
/// redraw. Any failure tears the channel down and tries again after 5 seconds, without limit.
///
/// Everything runs on the main queue, which blocks only in the sends to the service. Failures are
/// told to the system log; the screens learn of them through `isConnected`.
class VentrikModel : public DisplayTree
{
  public:
    using UpdateCallback = std::function<void()>;
    /// The generator for a technology identifier, or none if it is unknown.
    using GeneratorFactory = std::function<std::unique_ptr<LogGenerator>(
        const PlistValue& technology, const GeneratorServices& services)>;

    /// `updateScreens` is called on the main queue after a refresh that found something new.
    VentrikModel(const Platform& platform, UpdateCallback updateScreens,
                 GeneratorFactory makeGenerator = LogGenerator::generatorFromTechnology);
    ~VentrikModel() override;
    VentrikModel(const VentrikModel&) = delete;
    VentrikModel& operator=(const VentrikModel&) = delete;

    /// Both ports are there; whether they are still valid is not asked.
    bool isConnected() const;
    ChannelFault channelFault() const { return _channelFault; }
    /// Since when the channel has been open; none while it is not.
    std::optional<Clock::TimePoint> connectedSince() const { return _connectedSince; }
    /// When the last log message came; none before the first.
    std::optional<Clock::TimePoint> lastMessageTime() const { return _lastMessageTime; }
    /// How often the channel was opened.
    std::size_t timesOpened() const { return _timesOpened; }
    /// What went wrong with the channel last, also when it stands again.
    struct Trouble {
        Clock::TimePoint time;
        std::string text; ///< in a few words
    };
    const std::optional<Trouble>& lastTrouble() const { return _lastTrouble; }
    /// What the service tells of the channel, as rows of a display; none where it tells nothing.
    /// Waits a tenth of a second at most, and a service that has not answered is not asked again
    /// before the channel is opened anew. Other services than ours do not know the question.
    std::optional<PlistDictionary> askServiceReport();
    /// The technology in a word or two, as people call it; empty before it is known.
    std::string_view technologyName() const { return _technologyName; }
    /// One line that says why there is no display: which template cannot be used, and why. Empty
    /// when all is well.
    std::string displayFault() const;
    /// Called on the main queue after the channel was opened or lost, or failed for another reason
    /// than before; also while nothing new has arrived.
    void setChannelCallback(std::function<void()> callback);

    /// Null while there is none.
    const LogGenerator* generator() const { return _logGenerator.get(); }

    /// Before the first message. An observer outlives the model, or leaves before.
    void addObserver(MessageObserver& observer) { _observers.push_back(&observer); }
    void removeObserver(MessageObserver& observer) { std::erase(_observers, &observer); }

    bool createPorts();
    void destroyPorts();
    void configureGenerator();
    void startMonitor();
    void restartMonitor();
    void refresh();

    /// The root of the display tree, built on demand and kept until the next refresh with news;
    /// none while there is no generator.
    ModelNodePointer topLevelNodes() override;
    ModelNodePointer nodeAtPath(const std::string& path) override;

    /// Nothing is said of a tree that is not built.
    std::string_view doubtAt(const std::string& path) const override;
    std::vector<std::string> layoutWarningsAt(const std::string& path) const override;

    /// Takes one message of the log channel.
    void updateWithData(ByteView data);
    /// What a snapshot holds; none while there is no generator.
    std::optional<PlistValue> getSaveContents() const;

  private:
    bool createLocalPort();
    bool createRemotePort();
    bool sendStartCommand();
    /// Without a port the result is `PortError::invalidPort`.
    RemotePort::SendResult sendCommand(const Bytes& command, RemotePort::Seconds replyTimeout,
                                       RemotePort::Reply reply);
    void tellObservers(const LogGenerator* generator, std::string_view technology);
    void retryLater();
    void setFault(ChannelFault fault) { _attemptFault = fault; }
    /// Tells the screens where the channel's state is not what they were told last.
    void publishChannelState();
    void localPortInvalidated();
    /// A task that does nothing once the model is gone.
    MainQueue::Task guarded(void (VentrikModel::*operation)());

    Platform _platform;
    UpdateCallback _updateScreens;
    GeneratorFactory _makeGenerator;

    std::shared_ptr<LocalPort> _recvPort;
    std::shared_ptr<RemotePort> _sendPort;
    std::unique_ptr<RepeatingTimer> _displayUpdateTimer;
    bool _updated = false;
    std::unique_ptr<LogGenerator> _logGenerator;
    std::string_view _technologyName;
    PlistDictionary _state;
    ModelNodePointer _nodes;
    std::optional<PathIndex> _nodesByPath;

    std::vector<MessageObserver*> _observers;
    std::function<void()> _channelCallback;
    ChannelFault _attemptFault = ChannelFault::None; // of the attempt that is being made
    ChannelFault _channelFault = ChannelFault::None;
    bool _wasConnected = false;
    std::optional<Clock::TimePoint> _connectedSince;
    std::optional<Clock::TimePoint> _lastMessageTime;
    std::size_t _timesOpened = 0;
    std::optional<Trouble> _lastTrouble;
    bool _answersReports = true; // as far as is known

    std::shared_ptr<bool> _alive = std::make_shared<bool>(true);
};

} // namespace ventrik

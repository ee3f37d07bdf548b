#pragma once

#include "LogGenerator/LogGenerator.h"
#include "Model/VentrikModelNode.h"
#include "Platform/Platform.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace ventrik
{

/// The one object that talks to the telephony service: owns the log channel, chooses the log
/// generator, feeds it every message and, every 2 seconds when something new arrived, asks for a
/// redraw. Any failure tears the channel down and tries again after 5 seconds, without limit.
///
/// Everything runs on the main queue, which blocks only in the sends to the service. Failures are
/// told to the system log; the screens learn of them through `isConnected`.
class VentrikModel
{
  public:
    using UpdateCallback = std::function<void()>;

    /// `updateScreens` is called on the main queue after a refresh that found something new.
    VentrikModel(const Platform& platform, UpdateCallback updateScreens);
    ~VentrikModel();
    VentrikModel(const VentrikModel&) = delete;
    VentrikModel& operator=(const VentrikModel&) = delete;

    /// Both ports are there; whether they are still valid is not asked.
    bool isConnected() const;

    bool createPorts();
    void destroyPorts();
    void configureGenerator();
    void startMonitor();
    void restartMonitor();
    void refresh();

    /// The root of the display tree, built on demand and kept until the next refresh with news;
    /// none while there is no generator.
    ModelNodePointer topLevelNodes();
    ModelNodePointer nodeAtPath(const std::string& path);

    /// Takes one message of the log channel.
    void updateWithData(ByteView data);
    /// What a snapshot holds; none while there is no generator.
    std::optional<PlistValue> getSaveContents() const;

  private:
    bool createLocalPort();
    bool createRemotePort();
    bool sendStartCommand();
    void retryLater();
    void localPortInvalidated();
    /// A task that does nothing once the model is gone.
    MainQueue::Task guarded(void (VentrikModel::*operation)());

    Platform _platform;
    UpdateCallback _updateScreens;

    std::shared_ptr<LocalPort> _recvPort;
    std::shared_ptr<RemotePort> _sendPort;
    std::unique_ptr<RepeatingTimer> _displayUpdateTimer;
    bool _updated = false;
    std::unique_ptr<LogGenerator> _logGenerator;
    PlistDictionary _state;
    ModelNodePointer _nodes;
    std::optional<PathIndex> _nodesByPath;

    std::shared_ptr<bool> _alive = std::make_shared<bool>(true);
};

} // namespace ventrik

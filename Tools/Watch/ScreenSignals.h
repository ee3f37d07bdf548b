#pragma once

#include <functional>
#include <memory>

class QSocketNotifier;

namespace ventrik
{

/// The signals about a terminal's screen as calls on the main queue: its size has changed, the user
/// wants the program to stop for now (Ctrl+Z), it goes on. They are blocked meanwhile, so that no
/// library's handler draws. A stop that the process was started to ignore stays ignored.
class ScreenSignals
{
  public:
    struct Handlers {
        std::function<void()> resized;
        std::function<void()> stopping; ///< before the process stops
        std::function<void()> goingOn;  ///< after that; may come when there was no stop
    };

    explicit ScreenSignals(Handlers handlers);
    ~ScreenSignals();
    ScreenSignals(const ScreenSignals&) = delete;
    ScreenSignals& operator=(const ScreenSignals&) = delete;

  private:
    void receive();
    void stop();

    Handlers _handlers;
    int _descriptor;
    std::unique_ptr<QSocketNotifier> _notifier;
};

} // namespace ventrik

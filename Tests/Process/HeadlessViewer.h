#pragma once

#include "Model/VentrikModel.h"
#include "Platform/Linux/LinuxClock.h"
#include "Platform/Linux/LinuxMainQueue.h"
#include "Platform/Linux/LinuxMessagePorts.h"
#include "Platform/Linux/LinuxResources.h"
#include "Platform/Linux/LinuxTelephonyClient.h"
#include "Tests/Support/CapturingSystemLog.h"
#include "Tests/Support/MemoryPreferences.h"

#include <chrono>
#include <string>
#include <vector>

namespace ventrik
{

/// A system log that also knows when its entries came.
class TimedSystemLog : public CapturingSystemLog
{
  public:
    using Time = std::chrono::steady_clock::time_point;

    /// When the entries that start with this text came.
    std::vector<Time> timesOf(std::string_view start) const;

  protected:
    void write(int priority, std::string_view text) override;

  private:
    std::vector<Time> _times;
};

/// The viewer without its window: the real model on the real platform in the test process, which
/// builds the tree whenever the model asks for a redraw.
class HeadlessViewer
{
  public:
    explicit HeadlessViewer(const std::string& runtimeDirectory,
                            RecordsMode records = RecordsMode::Newer);

    /// Starts as the application does at its launch.
    void start();
    /// What the retry timer and the refresh timer do, without the wait for them.
    void retryNow() { _model.startMonitor(); }
    void refreshNow() { _model.refresh(); }

    bool isConnected() const { return _model.isConnected(); }
    int redraws() const { return _redraws; }
    /// The value at a path of the tree that was shown last; empty when there is none.
    std::string shown(const std::string& path);
    /// The whole tree as text, as it is at the next refresh; empty while there is none.
    std::string tree();
    /// Has that value by the next refresh.
    bool comesToShow(const std::string& path, const std::string& value);
    /// Has a value that came from the service by the next refresh.
    bool comesToShow(const std::string& path);
    PlistArray saveContents() const;

    const VentrikModel& model() const { return _model; }
    TimedSystemLog& log() { return _log; }
    /// Error lines with their addresses replaced by %p.
    std::vector<std::string> errors() const;

  private:
    TimedSystemLog _log;
    LinuxMainQueue _mainQueue;
    LinuxMessagePorts _ports;
    LinuxTelephonyClient _telephony{_ports, _mainQueue};
    LinuxResources _resources{{VENTRIK_RESOURCES}, "1.0"};
    MemoryPreferences _preferences;
    LinuxClock _clock;
    int _redraws = 0;
    VentrikModel _model;
};

} // namespace ventrik

#pragma once

#include "Capture/HdlcFrames.h"
#include "Capture/LogFrames.h"
#include "Platform/MainQueue.h"
#include "Platform/SerialPort.h"
#include "Platform/SystemLog.h"
#include "TelephonyService/LogMasks.h"
#include "TelephonyService/MessageSource.h"

#include <chrono>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

/// A phone's diagnostic port. It is one device for all log channels: it is asked for the codes that
/// any of them wants, each record goes to all of them, and when none is left it is asked for
/// nothing.
///
/// A port that goes away, or is not there yet, is tried again every 5 s without limit. What it
/// sends besides log records is counted, and the counts are logged when it goes.
class DiagnosticPort
{
  public:
    static constexpr std::chrono::seconds retryDelay{5};
    static constexpr std::chrono::seconds answerTime{5};

    /// The queue, the ports and the log outlive this.
    DiagnosticPort(MainQueue& queue, SerialPorts& ports, SystemLog& log, std::string device);
    /// Has the port send nothing any more; waits for that, but not for long.
    ~DiagnosticPort();
    DiagnosticPort(const DiagnosticPort&) = delete;
    DiagnosticPort& operator=(const DiagnosticPort&) = delete;

    void open();
    bool isOpen() const { return _port != nullptr; }

    /// What a log channel streams of it; this must outlive it.
    std::unique_ptr<MessageSource> makeSource();

  private:
    class Source;
    struct Connection { ///< what is known of the port while it is open
        FrameAssembler frames;
        LogFrames records;
        LogMasks masks; ///< that it was asked for
        std::uint64_t byteCount = 0;
        bool hasAnswered = false;
        bool hasSetMasks = false; ///< it has said so
        std::string refusal = {}; ///< what it has answered instead; empty: it has not
    };

    void add(Source& source);
    void remove(Source& source);
    void updateMasksSoon();
    void updateMasks();
    void take(ByteView bytes);
    void takeFrame(const HdlcFrame& frame);
    bool takeAnswer(ByteView content);
    void refuse(std::string_view reason);
    void lose(const std::string& reason);
    void retryLater();
    void reportCounts();
    PlistDictionary report() const;
    std::string maskState() const;
    void expectAnswer();
    /// A task that does nothing once this is gone.
    MainQueue::Task guarded(void (DiagnosticPort::*operation)());

    MainQueue& _queue;
    SerialPorts& _ports;
    SystemLog& _log;
    std::string _device;
    std::string _lastFault; // why it could not be opened, as it was logged
    std::unique_ptr<SerialPort> _port;
    std::optional<Connection> _connection;
    std::vector<Source*> _sources;
    bool _willUpdateMasks = false;
    std::shared_ptr<bool> _alive = std::make_shared<bool>(true);
};

} // namespace ventrik

#pragma once

#include "Capture/CaptureContainer.h"
#include "Platform/Technology.h"

#include <deque>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace ventrik
{

/// Reads a capture, a file of log-channel messages of any known kind, compressed or not, one
/// message after the other in constant memory. The kind is told by content.
class CaptureReader
{
  public:
    /// Opens a file, or standard input for "-". On failure `error` says why in one line.
    static std::optional<CaptureReader> open(const std::string& path, std::string& error);

    /// None when the capture does not tell it, or its link type names none.
    std::optional<Technology> technology() const;
    /// The technology that decodes most of the first 1,000 records; none where no technology
    /// decodes any. They are read ahead.
    std::optional<Technology> guessTechnology();
    /// None for containers that have no such thing.
    std::optional<int> linkType() const { return _container->linkType(); }

    /// The next message; none at the end of the capture and at damage.
    std::optional<CapturedMessage> next();
    /// What is wrong with the capture, in one line; empty when it ended as it should.
    std::string error() const { return _container->error(); }
    /// Where that is, of the uncompressed file's bytes; none where it is not known.
    std::optional<std::uint64_t> errorOffset() const { return _container->errorOffset(); }
    /// What was skipped, a line for each kind of damage.
    std::vector<std::string> notes() const { return _container->notes(); }

  private:
    explicit CaptureReader(std::unique_ptr<CaptureContainer> container)
        : _container(std::move(container))
    {
    }

    struct ReadAhead {
        CapturedMessage message; ///< but for its data
        Bytes data;
    };

    std::unique_ptr<CaptureContainer> _container;
    std::deque<ReadAhead> _ahead;
    Bytes _current; // the data of the last message that had been read ahead
};

} // namespace ventrik

#pragma once

#include "PropertyList/Bytes.h"

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <functional>
#include <memory>
#include <span>
#include <string>
#include <vector>

namespace ventrik
{

/// The bytes of a capture, one after the other, in constant memory: of a file, of standard input,
/// or of memory; those of a compressed one (gzip, bzip2, xz, zstd) as they were before.
class ByteSource
{
  public:
    /// Fills the room and gives how many bytes it got; 0 at the end, or with an error.
    using Read = std::function<std::size_t(std::span<std::uint8_t> room, std::string& error)>;

    /// A file, or standard input for "-". On failure `error` is "PATH: reason".
    static std::unique_ptr<ByteSource> open(const std::string& path, std::string& error);
    explicit ByteSource(Read read) : _read(std::move(read)) {}
    /// For tests: bytes that come in blocks of that size.
    ByteSource(Bytes bytes, std::size_t blockSize);

    /// The next bytes, without taking them: so many as are asked for, fewer only at the end. They
    /// live until the next call. At most `maximumPeek`.
    ByteView peek(std::size_t size);
    /// Likewise, but what is there without waiting for more: one byte at least, but at the end.
    ByteView peekSome(std::size_t size);
    /// Takes bytes into the room: what is there without waiting for more, one byte at least, but at
    /// the end. Gives how many.
    std::size_t read(std::span<std::uint8_t> room);
    /// Takes bytes that were peeked.
    void skip(std::size_t size);
    /// What is not taken yet, as a stream for the caller, who closes it while this source lives and
    /// takes no more here. Of a file that is not compressed it is that file itself, so that nothing
    /// is copied on its way; `error` and `offset` then tell nothing of it. Null, with errno, where
    /// there can be none.
    std::FILE* stream();
    /// Of the next byte, in the uncompressed capture.
    std::uint64_t offset() const { return _offset; }
    /// Why the bytes end before their time; empty when they do not.
    const std::string& error() const { return _error; }

    static constexpr std::size_t maximumPeek = std::size_t{80} << 20;

  private:
    void fill(std::size_t size);
    std::FILE* fileItself() const;

    Read _read;
    int _plainFile = -1; // the reader's; none where it is compressed or no file
    Bytes _buffer;
    std::vector<char> _streamBuffer;
    std::size_t _start = 0; // of what is not taken, in the buffer
    std::size_t _end = 0;
    std::uint64_t _offset = 0;
    bool _isAtEnd = false;
    std::string _error;
};

} // namespace ventrik

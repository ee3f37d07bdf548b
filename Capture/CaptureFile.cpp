#include "Capture/CaptureFile.h"

#include "Capture/CaptureWriter.h"
#include "Capture/PcapngWriter.h"

#include <optional>
#include <utility>

namespace ventrik
{

namespace
{

static_assert(CaptureFile::maximumMessageSize == CaptureWriter::maximumMessageSize);

template <typename Writer>
class FileOf : public CaptureFile
{
  public:
    explicit FileOf(Writer writer) : _writer(std::move(writer)) {}

    bool write(Clock::TimePoint time, ByteView message) override
    {
        return _writer.write(time, message);
    }
    bool commit(std::string& error) override { return _writer.commit(error); }

  private:
    Writer _writer;
};

template <typename Writer>
std::unique_ptr<CaptureFile> fileOf(std::optional<Writer> writer)
{
    return writer ? std::make_unique<FileOf<Writer>>(std::move(*writer)) : nullptr;
}

} // namespace

std::unique_ptr<CaptureFile> CaptureFile::create(const std::string& path,
                                                 const Technology& technology,
                                                 std::string_view version, std::string& error)
{
    return path.ends_with(".pcapng")
               ? fileOf(PcapngWriter::create(path, technology, version, error))
               : fileOf(CaptureWriter::create(path, technology, error));
}

} // namespace ventrik

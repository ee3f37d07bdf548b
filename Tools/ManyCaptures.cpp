#include "Tools/ManyCaptures.h"

#include "Platform/Linux/StandardStreams.h"
#include "Tools/CaptureList.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <deque>
#include <memory>
#include <optional>

#include <fmt/format.h>
#include <sys/wait.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

void complain(std::string_view text)
{
    ventrik::complain("ventrik-decode", text, Patience::Endless);
}

struct StreamCloser {
    void operator()(std::FILE* stream) const { std::fclose(stream); }
};
using Stream = std::unique_ptr<std::FILE, StreamCloser>;

/// A capture that a process of its own decodes, so that whatever becomes of that ends only this
/// capture. Its rows gather in a file without a name until it is their turn.
struct Job {
    std::string capture;
    pid_t process = -1; ///< -1: it has ended
    int status = 0;     ///< of the process then, as of waitpid
    Stream rows = nullptr;
};

class Jobs
{
  public:
    Jobs(const ManyCapturesOptions& options, std::FILE* output)
        : _options(options),
          _output(output),
          _list(options.captures, options.lists),
          // Those that wait for an earlier one keep no process busy.
          _maximumPending(std::size_t{4} * options.jobs)
    {
    }

    int run()
    {
        if (const std::string heading = rowHeading(_options.decode.rows.format);
            std::fwrite(heading.data(), 1, heading.size(), _output) != heading.size())
            return failOutput();
        const bool isAlone = _options.jobs == 1 || _list.isSingle();
        const int status = isAlone ? decodeHere() : decodeInJobs();
        if (status == DecodeStatus::done && std::fflush(_output) != 0)
            return failOutput();
        return status;
    }

  private:
    int decodeHere()
    {
        const bool isSingle = _list.isSingle();
        while (const auto capture = nextCapture()) {
            DecodeOptions decode = _options.decode;
            decode.capture = *capture;
            take(decodeCapture(decode, _output));
            if (isSingle || isDecodingInterrupted())
                return isDecodingInterrupted() ? DecodeStatus::interrupted : _worst;
            if (std::ferror(_output))
                return _worst;
        }
        return status();
    }

    int decodeInJobs()
    {
        while (startJobs() || !_jobs.empty()) {
            waitForOne();
            while (!_jobs.empty() && _jobs.front().process < 0) {
                if (!finish(_jobs.front()))
                    return endJobs();
                _jobs.pop_front();
            }
            if (isDecodingInterrupted())
                return endJobs();
        }
        return status();
    }

    // False when there are no more.
    bool startJobs()
    {
        const auto running = [&] {
            return std::ranges::count_if(_jobs, [](const Job& job) { return job.process >= 0; });
        };
        while (_jobs.size() < _maximumPending &&
               running() < static_cast<std::ptrdiff_t>(_options.jobs)) {
            const auto capture = nextCapture();
            if (!capture)
                return false;
            start(*capture);
        }
        return true;
    }

    void start(const std::string& capture)
    {
        Job& job = _jobs.emplace_back();
        job.capture = capture;
        job.rows.reset(std::tmpfile());
        if (!job.rows) {
            _spoolError = errno;
            return;
        }
        // What is in the buffers must not be written twice.
        std::fflush(nullptr);
        job.process = fork();
        if (job.process < 0)
            _spoolError = errno;
        if (job.process != 0)
            return;
        DecodeOptions decode = _options.decode;
        decode.capture = capture;
        decode.showsProgress = false;
        const int status = decodeCapture(decode, job.rows.get());
        std::fflush(nullptr);
        _exit(status);
    }

    void waitForOne()
    {
        int status = 0;
        const pid_t process = waitpid(-1, &status, 0);
        for (Job& job : _jobs)
            if (process > 0 && job.process == process) {
                job.process = -1;
                job.status = status;
            }
    }

    // False when its rows cannot be handed on.
    bool finish(Job& job)
    {
        if (!job.rows || _spoolError != 0) {
            complain(fmt::format("{}: cannot be decoded beside others: {}", job.capture,
                                 std::strerror(_spoolError)));
            _worst = DecodeStatus::badInput;
            return false;
        }
        RowClosing closing;
        if (!copyRows(job, closing))
            return false;
        if (WIFEXITED(job.status)) {
            take(WEXITSTATUS(job.status));
            return true;
        }
        // What has no end yet gets one.
        const std::string reason =
            fmt::format("{}: the decoder ended by signal {} ({})", job.capture,
                        WTERMSIG(job.status), strsignal(WTERMSIG(job.status)));
        complain(reason);
        closing.status = "damaged";
        closing.reason = reason;
        std::string row;
        RowWriter::create(_options.decode.rows.format, job.capture, {})
            ->appendClosing(row, closing);
        take(DecodeStatus::badInput);
        return std::fwrite(row.data(), 1, row.size(), _output) == row.size() || !failOutput();
    }

    // Whole rows only, should the process have ended within one.
    bool copyRows(Job& job, RowClosing& closing)
    {
        std::rewind(job.rows.get());
        std::array<char, 65536> block{};
        std::string rest;
        for (std::size_t size = 0;
             (size = std::fread(block.data(), 1, block.size(), job.rows.get())) > 0;) {
            rest.append(block.data(), size);
            const std::size_t end = rest.rfind('\n') + 1;
            closing.rows += static_cast<std::size_t>(
                std::count(rest.begin(), rest.begin() + static_cast<std::ptrdiff_t>(end), '\n'));
            if (std::fwrite(rest.data(), 1, end, _output) != end) {
                failOutput();
                return false;
            }
            rest.erase(0, end);
        }
        job.rows.reset();
        return true;
    }

    int endJobs()
    {
        for (const Job& job : _jobs)
            if (job.process >= 0)
                kill(job.process, SIGINT);
        for (const Job& job : _jobs)
            if (job.process >= 0)
                waitpid(job.process, nullptr, 0);
        return isDecodingInterrupted() ? DecodeStatus::interrupted : _worst;
    }

    std::optional<std::string> nextCapture()
    {
        auto capture = _list.next();
        for (const std::string& error : _list.takeErrors()) {
            complain(error);
            take(DecodeStatus::badInput);
        }
        return capture;
    }

    void take(int status)
    {
        if (status != DecodeStatus::done)
            _worst = status;
    }

    int status() const
    {
        return _options.isStrict || std::ferror(_output) ? _worst : DecodeStatus::done;
    }

    int failOutput()
    {
        _worst = tellOutputFailure("ventrik-decode", "writing the result", errno);
        return _worst;
    }

    const ManyCapturesOptions& _options;
    std::FILE* _output;
    CaptureList _list;
    std::size_t _maximumPending;
    std::deque<Job> _jobs;
    int _spoolError = 0;
    int _worst = DecodeStatus::done;
};

} // namespace

int decodeCaptures(const ManyCapturesOptions& options, std::FILE* output)
{
    return Jobs(options, output).run();
}

} // namespace ventrik

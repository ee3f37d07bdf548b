#pragma once

#include "Platform/Linux/Socket.h"
#include "Tests/Process/Program.h"

#include <memory>
#include <set>

#include <QTemporaryDir>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

/// Real processes with a runtime directory, a home and files of their own.
class ProcessFixture : public testing::Test
{
  protected:
    using ProgramPointer = std::unique_ptr<Program>;
    using Arguments = std::vector<std::string>;

    ProcessFixture();

    std::string runtimeDirectory() const { return path("run"); }
    /// A path in the test's own directory.
    std::string path(const std::string& name) const;
    std::string writeFile(const std::string& name, ByteView contents) const;
    std::string writeFile(const std::string& name, std::string_view contents) const;
    static std::string readFile(const std::string& path);
    static std::set<std::string> namesIn(const std::string& directory);
    /// The sockets that are in the runtime directory.
    std::set<std::string> sockets() const;

    /// One of our programs.
    ProgramPointer start(const std::string& name, const Arguments& arguments,
                         Program::Output output = Program::Output::Kept) const;
    /// One of our programs, in whose place a shell was before: it has run `setup`, and the program
    /// has the redirections.
    ProgramPointer startInShell(const std::string& name, const Arguments& arguments,
                                const std::string& setup,
                                const std::string& redirections = "") const;
    /// A pipe that has a reader and takes not one byte more; it lasts as long as the test.
    std::string fullPipe();
    /// Has the log daemon be one that takes no lines; or one that writes each to this file, behind
    /// its priority.
    void useStuckSystemLog();
    void useSystemLogFile(const std::string& file);
    /// A telephony service, once it listens.
    ProgramPointer startService(const Arguments& arguments) const;
    ProgramPointer startScenario() const { return startService({"--technology", "lte"}); }
    ProgramPointer startReplay(const std::string& name, ByteView capture,
                               const Arguments& arguments = {}) const;
    /// A service that misbehaves in that way, once it listens.
    ProgramPointer startFaulty(const std::string& mode) const;

    QProcessEnvironment environment;

  private:
    void useSystemLog(const std::string& behavior);
    ProgramPointer startListening(const std::string& name, const Arguments& arguments) const;

    QTemporaryDir _directory{"/tmp/ventrik-process-XXXXXX"};
    FileDescriptor _fullPipe;
};

} // namespace ventrik

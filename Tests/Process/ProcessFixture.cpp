#include "Tests/Process/ProcessFixture.h"

#include "Platform/Linux/LinuxMessagePorts.h"
#include "Platform/TelephonyConstants.h"
#include "Tests/Support/CapturingSystemLog.h"

#include <filesystem>
#include <fstream>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace ventrik
{

ProcessFixture::ProcessFixture() : environment(QProcessEnvironment::systemEnvironment())
{
    EXPECT_TRUE(_directory.isValid());
    for (const char* name : {"DBUS_SESSION_BUS_ADDRESS", "XDG_RUNTIME_DIR", "DISPLAY"})
        environment.remove(name);
    const auto set = [this](const char* name, const std::string& value) {
        environment.insert(name, QString::fromStdString(value));
    };
    set("VENTRIK_RUNTIME_DIR", runtimeDirectory());
    set("VENTRIK_RESOURCE_DIRECTORY", VENTRIK_RESOURCES);
    set("HOME", path("home"));
    set("XDG_CONFIG_HOME", path("home/config"));
    set("XDG_STATE_HOME", path("home/state"));
    set("QT_QPA_PLATFORM", "offscreen");
}

std::string ProcessFixture::path(const std::string& name) const
{
    return _directory.filePath(QString::fromStdString(name)).toStdString();
}

std::string ProcessFixture::writeFile(const std::string& name, ByteView contents) const
{
    return writeFile(name, std::string(contents.begin(), contents.end()));
}

std::string ProcessFixture::writeFile(const std::string& name, std::string_view contents) const
{
    const std::filesystem::path file = path(name);
    std::filesystem::create_directories(file.parent_path());
    std::ofstream(file, std::ios::binary) << contents;
    return file;
}

std::string ProcessFixture::readFile(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

std::set<std::string> ProcessFixture::namesIn(const std::string& directory)
{
    std::set<std::string> names;
    std::error_code error;
    for (const auto& entry : std::filesystem::directory_iterator(directory, error))
        names.insert(entry.path().filename());
    return names;
}

std::set<std::string> ProcessFixture::sockets() const
{
    std::set<std::string> names = namesIn(runtimeDirectory());
    std::erase_if(names, [this](const std::string& name) {
        return !std::filesystem::is_socket(runtimeDirectory() + "/" + name);
    });
    return names;
}

ProcessFixture::ProgramPointer ProcessFixture::start(const std::string& name,
                                                     const Arguments& arguments,
                                                     Program::Output output) const
{
    return std::make_unique<Program>(VENTRIK_PROGRAMS "/" + name, arguments, environment, output);
}

ProcessFixture::ProgramPointer ProcessFixture::startInShell(const std::string& name,
                                                            const Arguments& arguments,
                                                            const std::string& setup,
                                                            const std::string& redirections) const
{
    Arguments all{"-c", setup + "\nexec \"$0\" \"$@\" " + redirections,
                  VENTRIK_PROGRAMS "/" + name};
    all.insert(all.end(), arguments.begin(), arguments.end());
    return std::make_unique<Program>("/bin/sh", all, environment);
}

std::string ProcessFixture::fullPipe()
{
    std::string pipe = path("full-pipe");
    EXPECT_EQ(mkfifo(pipe.c_str(), 0600), 0);
    _fullPipe = FileDescriptor(open(pipe.c_str(), O_RDWR | O_NONBLOCK | O_CLOEXEC));
    const Bytes bytes(4096, '.');
    while (::write(_fullPipe.get(), bytes.data(), bytes.size()) > 0) {
    }
    return pipe;
}

void ProcessFixture::useStuckSystemLog()
{
    useSystemLog("stuck");
}

void ProcessFixture::useSystemLogFile(const std::string& file)
{
    useSystemLog(file);
}

void ProcessFixture::useSystemLog(const std::string& behavior)
{
    environment.insert("LD_PRELOAD", VENTRIK_TEST_SYSTEM_LOG);
    environment.insert("VENTRIK_TEST_SYSTEM_LOG", QString::fromStdString(behavior));
    environment.insert("ASAN_OPTIONS", "verify_asan_link_order=0");
}

ProcessFixture::ProgramPointer ProcessFixture::startService(const Arguments& arguments) const
{
    return startListening("ventrik-telephony", arguments);
}

ProcessFixture::ProgramPointer ProcessFixture::startReplay(const std::string& name,
                                                           ByteView capture,
                                                           const Arguments& arguments) const
{
    Arguments all{"--replay", writeFile(name, capture)};
    all.insert(all.end(), arguments.begin(), arguments.end());
    return startService(all);
}

ProcessFixture::ProgramPointer ProcessFixture::startFaulty(const std::string& mode) const
{
    return startListening("faulty-telephony", {mode});
}

// The file alone tells nothing: it may be a stale one, or not be listened on yet.
ProcessFixture::ProgramPointer ProcessFixture::startListening(const std::string& name,
                                                              const Arguments& arguments) const
{
    auto program = start(name, arguments);
    CapturingSystemLog log;
    LinuxMessagePorts ports(runtimeDirectory(), log);
    EXPECT_TRUE(waitUntil(
        [&] { return !program->isRunning() || ports.createRemotePort(telephonyServicePortName); }));
    EXPECT_TRUE(program->isRunning()) << program->errors();
    return program;
}

} // namespace ventrik

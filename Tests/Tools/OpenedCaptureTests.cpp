#include "Capture/CaptureFile.h"
#include "LogGenerator/Core/StateKeys.h"
#include "TelephonyService/Scenarios.h"
#include "Tests/Support/FakePlatform.h"
#include "Tests/Support/ResourceFiles.h"
#include "Tests/Support/TemporaryFile.h"
#include "Tools/OpenedCapture.h"

#include <fstream>

#include <gmock/gmock.h>

#include <sys/stat.h>

namespace ventrik
{

namespace
{

using testing::EndsWith;
using testing::HasSubstr;

/// Counts what it is told.
class CountingObserver : public MessageObserver
{
  public:
    void useGenerator(const LogGenerator* generator, std::string_view name) override
    {
        hasGenerator = generator != nullptr;
        technology = name;
    }
    void messageTaken(Clock::TimePoint time, ByteView, const PlistDictionary& state) override
    {
        ++messages;
        lastTime = time;
        hasDisplay = state.contains(StateKey::display);
    }

    bool hasGenerator = false;
    bool hasDisplay = false;
    std::string technology;
    int messages = 0;
    Clock::TimePoint lastTime;
};

class OpenedCaptureTest : public testing::Test
{
  protected:
    OpenedCaptureTest() { addTemplates(fake.resources, VENTRIK_RESOURCES); }

    /// A capture of so many messages, one a second from the clock's time on.
    void write(const Technology& technology, const std::vector<Bytes>& messages)
    {
        auto capture = CaptureFile::create(file.path(), technology, "1.0", error);
        Clock::TimePoint time = fake.clock.now();
        for (const Bytes& message : messages) {
            capture->write(time, message);
            time += std::chrono::seconds(1);
        }
        EXPECT_TRUE(capture->commit(error)) << error;
    }
    void writeScenario(int count)
    {
        const auto scenario = makeScenario(Technologies::lte, 1);
        std::vector<Bytes> messages;
        for (int i = 0; i < count; ++i)
            messages.push_back(scenario->next()->data);
        write(Technologies::lte, messages);
    }
    std::unique_ptr<OpenedCapture> open()
    {
        auto opened = OpenedCapture::open({.capture = file.path()}, fake.platform(), error);
        if (opened)
            opened->setObserver(observer);
        return opened;
    }
    static void readAll(OpenedCapture& opened)
    {
        while (opened.readOn()) {
        }
    }

    FakePlatform fake;
    TemporaryFile file{"drive.pcap"};
    CountingObserver observer;
    std::string error;
};

} // namespace

TEST_F(OpenedCaptureTest, TellsEachMessageWithItsTime)
{
    writeScenario(500);
    const auto opened = open();
    ASSERT_TRUE(opened) << error;
    EXPECT_TRUE(observer.hasGenerator);
    EXPECT_EQ(observer.technology, "lte");
    readAll(*opened);
    EXPECT_EQ(observer.messages, 500);
    EXPECT_EQ(observer.lastTime, fake.clock.now() + std::chrono::seconds(499));
    EXPECT_TRUE(observer.hasDisplay);
    EXPECT_EQ(opened->progress(), "500 messages");
    EXPECT_EQ(opened->fault(), "");
}

TEST_F(OpenedCaptureTest, IsNamedAsItsFile)
{
    writeScenario(1);
    EXPECT_THAT(open()->name(), EndsWith("drive.pcap"));
    EXPECT_THAT(open()->name(), testing::Not(HasSubstr("/")));
}

TEST_F(OpenedCaptureTest, ReadsALargeOneInSeveralTurns)
{
    writeScenario(30000);
    const auto opened = open();
    EXPECT_TRUE(opened->readOn());
    EXPECT_LT(observer.messages, 30000);
    readAll(*opened);
    EXPECT_EQ(observer.messages, 30000);
}

TEST_F(OpenedCaptureTest, SaysWhatIsMissing)
{
    EXPECT_EQ(open(), nullptr);
    EXPECT_THAT(error, HasSubstr(file.path()));
}

TEST_F(OpenedCaptureTest, SaysWhatDamageEndedIt)
{
    writeScenario(100);
    std::filesystem::resize_file(file.path(), std::filesystem::file_size(file.path()) - 5);
    const auto opened = open();
    readAll(*opened);
    EXPECT_EQ(observer.messages, 99);
    EXPECT_THAT(opened->fault(), HasSubstr(file.path()));
}

TEST_F(OpenedCaptureTest, EndsAtAMessageThatCannotBe)
{
    write(Technologies::cellMonitor, {Bytes(20, 0xFF)});
    const auto opened = open();
    readAll(*opened);
    EXPECT_EQ(observer.messages, 0);
    EXPECT_THAT(opened->fault(), HasSubstr("message 0: "));
}

TEST_F(OpenedCaptureTest, ReadsNothingThatItWouldHaveToWaitFor)
{
    ASSERT_EQ(::mkfifo(file.path().c_str(), 0600), 0);
    EXPECT_EQ(OpenedCapture::open({file.path()}, fake.platform(), error), nullptr);
    EXPECT_EQ(error, file.path() + ": it is no file");
}

} // namespace ventrik

#include "Tests/Process/ProcessFixture.h"

#include <filesystem>

namespace ventrik
{

namespace
{

/// By which layouts the viewer reads records, as its log tells: a section that only extended
/// records have is named there.
class WindowRecords : public ProcessFixture
{
  protected:
    std::string preferenceFile() const { return path("home/config/org.ventrik.Ventrik.conf"); }
    void prefer(std::string_view records)
    {
        std::filesystem::create_directories(path("home/config"));
        writeFile("home/config/org.ventrik.Ventrik.conf",
                  "[General]\nRecords=" + std::string(records) + "\n");
    }
    /// Starts it, waits until it decodes a record, when all sections have been named, and ends it.
    bool readsExtendedRecords(Arguments options = {})
    {
        const auto service = startService({"--technology", "lte"});
        options.emplace_back("--verbose");
        const auto window = start("ventrik", options);
        EXPECT_TRUE(waitUntil([&] { return window->says("LTE Serving Cell Info\n"); }))
            << window->errors();
        const bool isExtended = window->says("Last RRC Message\n");
        window->send(SIGTERM);
        EXPECT_EQ(window->waitForEnd(), 0) << window->errors();
        errors = window->errors();
        return isExtended;
    }

    std::string errors;
};

} // namespace

TEST_F(WindowRecords, AreNotExtendedWhereNobodyAsksForIt)
{
    EXPECT_FALSE(readsExtendedRecords());
    EXPECT_FALSE(std::filesystem::exists(preferenceFile()));
}

TEST_F(WindowRecords, AreWhatTheOptionSays)
{
    EXPECT_TRUE(readsExtendedRecords({"--records", "extended"}));
    EXPECT_FALSE(std::filesystem::exists(preferenceFile()));
}

TEST_F(WindowRecords, AreWhatThePreferenceSays)
{
    prefer("extended");
    EXPECT_TRUE(readsExtendedRecords());
}

TEST_F(WindowRecords, TheOptionCountsMoreThanThePreference)
{
    prefer("extended");
    EXPECT_FALSE(readsExtendedRecords({"--records", "base"}));
}

TEST_F(WindowRecords, TheOptionCanBeRemembered)
{
    EXPECT_TRUE(readsExtendedRecords({"--records", "extended", "--remember-records"}));
    EXPECT_EQ(readFile(preferenceFile()), "[General]\nRecords=extended\n");
    EXPECT_TRUE(readsExtendedRecords());
}

TEST_F(WindowRecords, APreferenceThatIsNoneIsLogged)
{
    prefer("all");
    EXPECT_FALSE(readsExtendedRecords());
    EXPECT_NE(
        errors.find("The preference Records of org.ventrik.Ventrik is none of base, newer and "
                    "extended: all"),
        std::string::npos)
        << errors;
}

} // namespace ventrik

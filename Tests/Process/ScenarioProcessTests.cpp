#include "Tests/Process/HeadlessViewer.h"
#include "Tests/Process/ProcessFixture.h"

#include <algorithm>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

struct Journey {
    const char* technology;
    int messages; // a whole round of the scenario and more
    RecordsMode records = RecordsMode::Base;

    /// The name of its tree.
    std::string name() const
    {
        return records == RecordsMode::Base ? technology
                                            : fmt::format("{}-{}", technology, nameOf(records));
    }
};

void PrintTo(const Journey& journey, std::ostream* stream)
{
    std::string name = journey.name();
    std::ranges::replace(name, '-', '_');
    *stream << name;
}

// A technology's scenario on its way from the service through the sockets into the viewer's tree.
class ScenarioProcess : public ProcessFixture, public testing::WithParamInterface<Journey>
{
  protected:
    /// A scenario's messages, to be sent without their pauses.
    std::string makeCapture() const
    {
        std::string file = path("scenario.pcap");
        const auto writing =
            start("ventrik-telephony", {"--technology", GetParam().technology, "--records",
                                        std::string(nameOf(GetParam().records)), "--write", file,
                                        "--count", std::to_string(GetParam().messages)});
        EXPECT_EQ(writing->waitForEnd(), 0) << writing->errors();
        return file;
    }
    static std::string goldenTree()
    {
        return readFile(fmt::format("{}/{}-scenario.txt", VENTRIK_GOLDEN, GetParam().name()));
    }
};

} // namespace

TEST_P(ScenarioProcess, EndsInTheTreeThatItsLastRecordsTell)
{
    const std::string golden = goldenTree();
    ASSERT_FALSE(golden.empty());
    const auto service = startService({"--replay", makeCapture(), "--speed", "max"});
    // Base records show alike by newer layouts.
    HeadlessViewer viewer(runtimeDirectory(), GetParam().records == RecordsMode::Base
                                                  ? RecordsMode::Newer
                                                  : GetParam().records);
    viewer.start();
    EXPECT_TRUE(waitUntil([&] { return viewer.tree() == golden; }));
    EXPECT_EQ(viewer.tree(), golden);
}

INSTANTIATE_TEST_SUITE_P(Technologies, ScenarioProcess,
                         testing::Values(Journey{"lte", 1000}, Journey{"gsm", 1300},
                                         Journey{"utran", 1700}, Journey{"c2k", 1500},
                                         Journey{"ifx", 60},
                                         Journey{"lte", 1000, RecordsMode::Newer},
                                         Journey{"lte", 2000, RecordsMode::Extended},
                                         Journey{"gsm", 1300, RecordsMode::Newer}),
                         testing::PrintToStringParamName());

} // namespace ventrik

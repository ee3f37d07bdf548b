#include "Tests/Model/ModelFixture.h"
#include "Tools/LiveRows.h"

namespace ventrik
{

namespace
{

using testing::HasSubstr;
using testing::IsEmpty;

/// A model whose messages become rows.
class LiveRowsTest : public ModelFixture
{
  protected:
    LiveRowsTest() { model.addObserver(rows); }
    ~LiveRowsTest() override { model.removeObserver(rows); }

    LiveRows rows{{.selection = PathSelection({"/a/x"})}, RecordsMode::Newer};
};

} // namespace

TEST_F(LiveRowsTest, AreNoneBeforeAMessageComes)
{
    model.restartMonitor();
    EXPECT_THAT(rows.takeText(), IsEmpty());
}

TEST_F(LiveRowsTest, CloseWithWhatCame)
{
    rows.close();
    EXPECT_EQ(rows.takeText(), "{\"capture\":\"live\",\"status\":\"empty\",\"offset\":null,"
                               "\"reason\":null,\"records\":0,\"decoded\":0,\"rows\":0,"
                               "\"bytes\":0}\n");
}

TEST_F(LiveRowsTest, CountOnAfterARestart)
{
    model.restartMonitor();
    arrive(cellInfo(301));
    model.restartMonitor();
    arrive(cellInfo(302));
    arrive(cellInfo(303));
    rows.close();
    EXPECT_THAT(rows.takeText(), HasSubstr("\"status\":\"ok\",\"offset\":null,\"reason\":null,"
                                           "\"records\":3,\"decoded\":3,"));
}

} // namespace ventrik

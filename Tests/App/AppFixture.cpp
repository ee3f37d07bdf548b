#include "Tests/App/AppFixture.h"

#include "PropertyList/PropertyListWriter.h"

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

constexpr std::string_view lteTemplate =
    "<plist><dict><key>Cell</key><dict>"
    "<key>Details</key><dict><key>More</key><dict><key>Deep</key><string>1</string></dict></dict>"
    "<key>Name</key><string>lte</string>"
    "</dict></dict></plist>";
constexpr std::string_view utranTemplate = "<plist><dict><key>Cell</key><dict>"
                                           "<key>Name</key><string>utran</string>"
                                           "</dict></dict></plist>";

} // namespace

AppFixture::AppFixture()
{
    fake.resources.add("/res/LTE.plist", lteTemplate);
    fake.resources.add("/res/UTRAN.plist", utranTemplate);
    changeTechnology(kQXLogChannelTechnology_Orbel_LTE);
}

VentrikAppOptions AppFixture::options(const std::string& snapshotDirectory)
{
    VentrikAppOptions options;
    options.snapshotDirectory = snapshotDirectory;
    options.animation = false;
    options.windowSize = QSize(480, 640);
    return options;
}

void AppFixture::changeTechnology(std::string_view technology)
{
    loseService();
    fake.ports.setDefaultResult(
        {PortError::success, propertyListBytes(PlistDictionary{{"GetTechnology", technology}})});
    fake.ports.listen(remoteName);
    fake.telephony.setServiceAvailable(true);
}

void AppFixture::loseService()
{
    fake.telephony.setServiceAvailable(false);
    fake.ports.killRemote(remoteName);
}

void AppFixture::launchAndConnect()
{
    app.applicationDidFinishLaunching();
    fake.mainQueue.run();
}

void AppFixture::refreshWithData()
{
    EXPECT_TRUE(fake.ports.deliver(logChannelLocalPortName, 0, Bytes(13)));
    fake.mainQueue.advance(2s);
}

VentrikPaneController& AppFixture::pane(std::size_t index)
{
    return static_cast<VentrikPaneController&>(*app.navController()->screens().at(index));
}

VentrikPaneController& AppFixture::topPane()
{
    return pane(app.navController()->screens().size() - 1);
}

std::vector<std::string> AppFixture::titles()
{
    std::vector<std::string> result;
    for (const Screen* screen : app.navController()->screens())
        result.push_back(screen->title().toStdString());
    return result;
}

void AppFixture::openRow(int row)
{
    VentrikPaneController& top = topPane();
    top.rowSelected(top.table(), IndexPath{0, row});
}

std::string AppFixture::statusText(const VentrikPaneController& pane)
{
    return statusLabel(pane).text().toStdString();
}

StatusLabel& AppFixture::statusLabel(const VentrikPaneController& pane)
{
    return dynamic_cast<StatusLabel&>(*pane.toolbar().items().at(1));
}

std::string AppFixture::note(const VentrikPaneController& pane)
{
    return statusLabel(pane).note().toStdString();
}

bool AppFixture::isSpinning(const VentrikPaneController& pane)
{
    return dynamic_cast<ActivityIndicator&>(*pane.toolbar().items().at(0)).isAnimating();
}

} // namespace ventrik

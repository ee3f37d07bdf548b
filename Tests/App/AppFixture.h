#pragma once

#include "App/Toolkit/ActivityIndicator.h"
#include "App/VentrikApp.h"
#include "Platform/TelephonyConstants.h"
#include "Tests/Support/FakePlatform.h"

#include <QLabel>
#include <QTemporaryDir>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

/// The application on a fake platform. Its service speaks LTE, whose display has the panes
/// "Cell" / "Details" / "More" with leaves in each, or UTRAN, where "Details" is missing.
class AppFixture : public testing::Test
{
  protected:
    static constexpr std::string_view remoteName = FakeTelephonyClient::defaultRemotePortName;

    AppFixture();

    /// Launches and runs the turn in which the model starts.
    void launchAndConnect();
    /// A message arrives and the next tick shows it.
    void refreshWithData();
    /// The service comes back with another technology; the model finds out at its next tick.
    void changeTechnology(std::string_view technology);
    void loseService();

    VentrikPaneController& pane(std::size_t index);
    VentrikPaneController& topPane();
    /// The name of each pane on the stack, bottom first.
    std::vector<std::string> titles();
    void openRow(int row);
    static std::string statusText(const VentrikPaneController& pane);
    static StatusLabel& statusLabel(const VentrikPaneController& pane);
    /// What is said beside the status.
    static std::string note(const VentrikPaneController& pane);
    std::string windowTitle() { return app.window()->windowTitle().toStdString(); }
    static bool isSpinning(const VentrikPaneController& pane);

    FakePlatform fake;
    QTemporaryDir temporary;
    VentrikApp app{fake.platform(), options(temporary.path().toStdString())};

  private:
    static VentrikAppOptions options(const std::string& snapshotDirectory);
};

} // namespace ventrik

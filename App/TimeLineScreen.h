#pragma once

#include "App/Toolkit/Screen.h"
#include "App/VentrikPaneController.h"
#include "App/ViewerWindow.h"

namespace ventrik
{

/// The time line as a screen of the stack, where the window is too narrow for both: it borrows the
/// window's while it is in view.
class TimeLineScreen : public Screen
{
  public:
    /// All outlive it.
    TimeLineScreen(VentrikPaneHost& host, ViewerWindow& window, QWidget& timeLine);

    void viewWillAppear(bool animated) override;
    void viewWillDisappear(bool animated) override;
    void setStatus(const std::string& status, bool isLoading) override;
    void updateNotes() override;

  private:
    VentrikPaneHost& _host;
    ViewerWindow& _window;
    QWidget& _timeLine;
};

} // namespace ventrik

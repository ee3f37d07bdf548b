#pragma once

#include "App/Toolkit/Screen.h"
#include "App/VentrikPaneController.h"
#include "Model/ValueSource.h"

#include <functional>
#include <optional>

class QPlainTextEdit;

namespace ventrik
{

/// Where a value comes from: the record that told it, its raw number, and the packet's bytes with
/// those of the value marked. What is selected, or all of it, can be copied.
class OriginScreen : public Screen
{
  public:
    using Finder = std::function<std::optional<ValueSource>()>;

    /// All outlive it. The finder tells how it stands at the moment that is shown.
    OriginScreen(VentrikPaneHost& host, const Clock& clock, Finder find);

    /// What it says, the packet with as many bytes a line as there is room for.
    QString text() const;

    bool reload() override;
    void setStatus(const std::string& status, bool isLoading) override;
    void updateNotes() override;
    void viewWillAppear(bool animated) override;

  protected:
    void resizeEvent(QResizeEvent* event) override;

  private:
    std::size_t bytesOfLine() const;
    void showText();
    void markBytes();

    VentrikPaneHost& _host;
    const Clock& _clock;
    Finder _find;
    std::optional<ValueSource> _source;
    QPlainTextEdit* _text;
};

} // namespace ventrik

#pragma once

#include "App/DateFormatter.h"
#include "App/TimeLine.h"

#include <QMenu>
#include <QString>

#include <functional>
#include <string>

class QAction;

namespace ventrik
{

class SignalStrip;

/// What can be done with the time line: its picture, its drawing and its values as files of one's
/// own, the whole range at once, what is pinned, and the keys.
class TimeLineMenu : public QMenu
{
  public:
    /// All outlive it but its parent, to whose window dialogs belong.
    TimeLineMenu(TimeLine& timeLine, const Clock& clock, SignalStrip& strip, QWidget* parent);

    /// Called with the name of a file that was written.
    void setOnSaved(std::function<void(const std::string& fileName)> onSaved);
    /// Called when other values are pinned.
    void setOnPins(std::function<void()> onPins) { _onPins = std::move(onPins); }
    /// What the rows of values name as their capture; "live" as long as nothing else is said.
    void setCaptureName(std::string name) { _captureName = std::move(name); }
    /// Opens below the widget, with the first entry chosen.
    void openBelow(const QWidget& widget);

  private:
    /// Writes the file; where it cannot be, `error` says why in one line.
    using Writer = bool (TimeLineMenu::*)(const std::string& path, std::string& error) const;

    void addFile(const QString& text, const char* suffix, const QString& kind, Writer writer);
    void askForFile(const QString& suffix, const QString& kind, Writer writer);
    void save(const std::string& path, Writer writer);
    bool savePicture(const std::string& path, std::string& error) const;
    bool saveDrawing(const std::string& path, std::string& error) const;
    bool saveValues(const std::string& path, std::string& error) const;
    void showKeys();
    void listPins();
    void tellOfPins() const;
    std::string proposedName() const;

    TimeLine& _timeLine;
    const Clock& _clock;
    SignalStrip& _strip;
    DateFormatter _names;
    std::string _captureName = "live";
    std::function<void(const std::string&)> _onSaved;
    QMenu* _pins;
    std::function<void()> _onPins;
};

} // namespace ventrik

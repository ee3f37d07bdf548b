#pragma once

#include "App/Toolkit/Screen.h"
#include "App/Toolkit/TableView.h"
#include "Platform/Platform.h"
#include "PropertyList/PlistValue.h"

#include <memory>
#include <optional>
#include <string>

class QLineEdit;
class QPushButton;

namespace Ui
{
class VentrikSaveViewController;
} // namespace Ui

namespace ventrik
{

/// What the save screen asks of the application.
class VentrikSaveHost
{
  public:
    virtual ~VentrikSaveHost() = default;
    virtual void closeSaveView() = 0;
    /// A snapshot has been written to that file.
    virtual void snapshotSaved(const std::string& fileName) = 0;
};

/// The screen that lists what a snapshot will hold, takes a description and writes the snapshot
/// file. What is saved is fixed when the screen is made. Both ways out close it through the main
/// queue, also when the file could not be written, which is told in the log and in an alert.
class VentrikSaveViewController : public Screen, public TableViewDataSource
{
  public:
    /// The host and the platform's parts outlive the screen. The directory is made at the first
    /// save. Without save contents the file holds the time alone.
    static std::unique_ptr<VentrikSaveViewController>
    initWithSaveHistory(VentrikSaveHost& host, const Platform& platform, std::string directory,
                        const std::optional<PlistValue>& saveContents);
    ~VentrikSaveViewController() override;

    void viewDidLoad();
    void viewWillAppear(bool animated) override;

    void savePressed();
    void cancelPressed();
    /// The answer is always yes: the key's usual effect is wanted.
    bool textFieldShouldReturn(QLineEdit& field);
    void backgroundTouched();

    /// The description, so that it can be typed at once.
    QWidget& firstFocus() override;

    int rowsInSection(int section) override;
    std::unique_ptr<TableRow> rowForIndexPath(TableView& table, IndexPath indexPath) override;
    void rowSelected(TableView& table, std::optional<IndexPath> indexPath) override;
    QString textForCopying(IndexPath indexPath) override;

    TableView& saveContentTable() const;
    QLineEdit& saveDescription() const;
    QPushButton& saveButton() const;
    QPushButton& cancelButton() const;

  protected:
    void mousePressEvent(QMouseEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;

  private:
    VentrikSaveViewController(VentrikSaveHost& host, const Platform& platform,
                              std::string directory, const std::optional<PlistValue>& saveContents);

    bool writeFile(const std::string& fileName) const;
    void showFileError();
    void addShortcuts();
    void hideKeyboard();
    void queueClose();
    QString descriptionAt(IndexPath indexPath) const;

    VentrikSaveHost& _host;
    Platform _platform;
    std::string _directory;
    Clock::TimePoint _timeStamp;
    std::optional<PlistValue> _saveHistory;
    std::unique_ptr<Ui::VentrikSaveViewController> _layout;
    std::shared_ptr<bool> _alive = std::make_shared<bool>(true);
};

} // namespace ventrik

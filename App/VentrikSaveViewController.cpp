#include "App/VentrikSaveViewController.h"

#include "App/Toolkit/Alert.h"
#include "App/Toolkit/Fonts.h"
#include "App/Toolkit/NavigationStack.h"
#include "Capture/SnapshotFile.h"
#include "Files/PrivateFile.h"
#include "LogGenerator/Core/DateText.h"

#include <ui_VentrikSaveViewController.h>

#include <QKeyEvent>
#include <QShortcut>
#include <QValidator>

#include <algorithm>

namespace ventrik
{

namespace
{

constexpr int titlePoints = 17;
constexpr int labelPoints = 13;
constexpr int fieldPoints = 15;
constexpr int rowPoints = 13;
constexpr int fieldMargin = 4;

QString identifier()
{
    return QStringLiteral("SaveHistoryContentCell");
}

QFont rowFont()
{
    QFont font(QStringLiteral("Helvetica"));
    font.setPixelSize(rowPoints);
    return font;
}

/// Turns what is pasted and cannot stand in a file of text into spaces.
class TextOnly : public QValidator
{
  public:
    using QValidator::QValidator;

    State validate(QString& input, int&) const override
    {
        for (QChar& character : input)
            if (character.category() == QChar::Other_Control ||
                character.category() == QChar::Other_NotAssigned)
                character = u' ';
        return Acceptable;
    }
};

PlistValue deepCopy(const PlistValue& value)
{
    if (const PlistArray* array = value.array()) {
        PlistArray copy;
        for (const PlistValue& element : *array)
            copy.append(deepCopy(element));
        return copy;
    }
    if (const PlistDictionary* dictionary = value.dictionary()) {
        PlistDictionary copy;
        for (const auto& entry : *dictionary)
            copy.set(entry.key, deepCopy(entry.value));
        return copy;
    }
    return value;
}

} // namespace

// The sections go on writing into the containers of the history, hence the deep copy.
VentrikSaveViewController::VentrikSaveViewController(VentrikSaveHost& host,
                                                     const Platform& platform,
                                                     std::string directory,
                                                     const std::optional<PlistValue>& saveContents)
    : _host(host),
      _platform(platform),
      _directory(std::move(directory)),
      _timeStamp(platform.clock.now()),
      _saveHistory(saveContents ? std::optional(deepCopy(*saveContents)) : std::nullopt),
      _layout(std::make_unique<Ui::VentrikSaveViewController>())
{
    _layout->setupUi(this);
}

VentrikSaveViewController::~VentrikSaveViewController() = default;

std::unique_ptr<VentrikSaveViewController>
VentrikSaveViewController::initWithSaveHistory(VentrikSaveHost& host, const Platform& platform,
                                               std::string directory,
                                               const std::optional<PlistValue>& saveContents)
{
    std::unique_ptr<VentrikSaveViewController> screen(
        new VentrikSaveViewController(host, platform, std::move(directory), saveContents));
    screen->viewDidLoad();
    return screen;
}

void VentrikSaveViewController::viewDidLoad()
{
    setAutoFillBackground(true);
    // The screen has the keyboard after a touch on it, but the Tab key passes it by.
    setFocusPolicy(Qt::ClickFocus);
    _layout->titleLabel->setFont(systemFont(titlePoints, FontWeight::Bold));
    _layout->titleLabel->setElideMode(Qt::ElideRight);
    for (QLabel* label : {_layout->descriptionLabel, _layout->contentLabel})
        label->setFont(systemFont(labelPoints, FontWeight::Regular));
    saveDescription().setFont(systemFont(fieldPoints, FontWeight::Regular));
    saveDescription().setTextMargins(fieldMargin, 0, fieldMargin, 0);
    saveDescription().setValidator(new TextOnly(this));
    connect(&saveDescription(), &QLineEdit::returnPressed, this, [this] {
        if (textFieldShouldReturn(saveDescription()))
            savePressed();
    });
    addShortcuts();
    connect(&saveButton(), &QPushButton::clicked, this, [this] { savePressed(); });
    connect(&cancelButton(), &QPushButton::clicked, this, [this] { cancelPressed(); });

    TableView& table = saveContentTable();
    table.setDataSource(*this);
    table.setPlaceholder(QStringLiteral("Nothing has come yet"));
    table.reloadData();
    table.setMaximumHeight(std::max(table.contentHeight(), TableView::rowHeight));
}

void VentrikSaveViewController::addShortcuts()
{
    for (const Qt::Key key : {Qt::Key_Return, Qt::Key_Enter}) {
        auto* shortcut = new QShortcut(QKeySequence(Qt::CTRL | key), this);
        shortcut->setContext(Qt::WidgetWithChildrenShortcut);
        shortcut->setAutoRepeat(false);
        connect(shortcut, &QShortcut::activated, this, [this] { savePressed(); });
    }
}

QWidget& VentrikSaveViewController::firstFocus()
{
    return saveDescription();
}

// The whole of the window is what the application has of the main screen.
void VentrikSaveViewController::viewWillAppear(bool animated)
{
    Screen::viewWillAppear(animated);
    if (navigationStack())
        setGeometry(navigationStack()->rect());
}

void VentrikSaveViewController::savePressed()
{
    const std::string fileName = snapshotFileName(_directory, _platform.clock.now());
    if (writeFile(fileName)) {
        _host.snapshotSaved(fileName);
    } else {
        _platform.log.error("Unable to write snapshot to {}", fileName);
        showFileError();
    }
    queueClose();
}

bool VentrikSaveViewController::writeFile(const std::string& fileName) const
{
    const PlistDictionary snapshot =
        makeSnapshot(dateText(_timeStamp), _saveHistory, saveDescription().text().toStdString());
    makePrivateDirectories(_directory); // where there is none, the file cannot be written either
    const auto writing = writeSnapshot(snapshot, fileName);
    if (!writing)
        _platform.log.error("Snapshot not written: {}", writing.error);
    else if (writing.replaced > 0)
        _platform.log.error("Snapshot {}: {} characters that XML cannot carry are U+FFFD", fileName,
                            writing.replaced);
    return static_cast<bool>(writing);
}

// The window's, since the screen closes below it.
void VentrikSaveViewController::showFileError()
{
    auto* alert =
        new Alert(QStringLiteral("File Error"), QStringLiteral("Unable to write file to disk"),
                  QStringLiteral("Close"), window());
    alert->openNow();
}

void VentrikSaveViewController::cancelPressed()
{
    queueClose();
}

// Of a screen that is gone by then nothing is left to close.
void VentrikSaveViewController::queueClose()
{
    _platform.mainQueue.async([this, alive = std::weak_ptr(_alive)] {
        if (!alive.expired())
            _host.closeSaveView();
    });
}

bool VentrikSaveViewController::textFieldShouldReturn(QLineEdit&)
{
    hideKeyboard();
    return true;
}

void VentrikSaveViewController::backgroundTouched()
{
    hideKeyboard();
}

void VentrikSaveViewController::hideKeyboard()
{
    if (saveDescription().hasFocus())
        setFocus();
}

int VentrikSaveViewController::rowsInSection(int)
{
    const PlistArray* entries = _saveHistory ? _saveHistory->array() : nullptr;
    return entries ? static_cast<int>(entries->size()) : 0;
}

QString VentrikSaveViewController::descriptionAt(IndexPath indexPath) const
{
    const PlistValue& entry = (*_saveHistory->array())[static_cast<std::size_t>(indexPath.row)];
    const PlistValue* description =
        entry.dictionary() ? entry.dictionary()->find("Description") : nullptr;
    const std::string* text = description ? description->string() : nullptr;
    return text ? QString::fromStdString(*text) : QString();
}

std::unique_ptr<TableRow> VentrikSaveViewController::rowForIndexPath(TableView& table,
                                                                     IndexPath indexPath)
{
    auto row = table.dequeueReusableRow(identifier());
    if (!row)
        row = std::make_unique<TableRow>(TableRow::Style::Default, identifier());
    row->setText(descriptionAt(indexPath));
    row->textLabel().setFont(rowFont());
    row->setAccessory(TableRowAccessory::CheckMark);
    return row;
}

void VentrikSaveViewController::rowSelected(TableView&, std::optional<IndexPath>)
{
    hideKeyboard();
}

QString VentrikSaveViewController::textForCopying(IndexPath indexPath)
{
    return descriptionAt(indexPath);
}

TableView& VentrikSaveViewController::saveContentTable() const
{
    return *_layout->saveContentTable;
}

QLineEdit& VentrikSaveViewController::saveDescription() const
{
    return *_layout->saveDescription;
}

QPushButton& VentrikSaveViewController::saveButton() const
{
    return *_layout->saveButton;
}

QPushButton& VentrikSaveViewController::cancelButton() const
{
    return *_layout->cancelButton;
}

void VentrikSaveViewController::mousePressEvent(QMouseEvent*)
{
    backgroundTouched();
}

// The second click on what has opened the screen is not meant for its background.
void VentrikSaveViewController::mouseDoubleClickEvent(QMouseEvent*) {}

void VentrikSaveViewController::keyPressEvent(QKeyEvent* event)
{
    if (event->key() == Qt::Key_Escape || event->key() == Qt::Key_Back)
        cancelPressed();
    else
        Screen::keyPressEvent(event);
}

} // namespace ventrik

#include "App/TimeLineMenu.h"

#include "App/StoredRows.h"
#include "App/Strip/SignalStrip.h"
#include "App/Toolkit/Alert.h"
#include "App/Toolkit/PlainText.h"
#include "Files/PrivateFile.h"

#include <QFileDialog>
#include <QStandardPaths>

#include <array>
#include <utility>

namespace ventrik
{

namespace
{

struct KeyMeaning {
    const char* key;
    const char* meaning;
};

constexpr std::array<KeyMeaning, 12> keys{{
    {"Space", "pauses, and returns to the present"},
    {"Home", "returns to the present"},
    {"Ctrl+T", "shows the time line, or hides it"},
    {"P", "pins the number of a row to the time line, or unpins it"},
    {"Ctrl+I", "tells where the value of a row comes from"},
    {"Left, Right", "in the strip: the moment before, the one after"},
    {"Shift+Left, Right", "in the strip: the same of the second cursor"},
    {"Ctrl+Left, Right", "in the strip: earlier times, later ones"},
    {"+, -", "in the strip: a shorter time, a longer one"},
    {"F", "in the strip: all that there is"},
    {"X", "in the strip: sets the second cursor"},
    {"Escape", "in the strip: takes the second cursor away"},
}};

QString textOfKeys()
{
    QString text = QStringLiteral("<table>");
    for (const KeyMeaning& key : keys)
        text += QStringLiteral("<tr><td><b>%1</b>&nbsp;&nbsp;&nbsp;</td><td>%2</td></tr>")
                    .arg(QString::fromUtf8(key.key), QString::fromUtf8(key.meaning));
    return text + QStringLiteral("</table>");
}

bool writeFile(const std::string& path, std::string_view content, std::string& error)
{
    auto file = PrivateFile::create(path, error);
    if (!file)
        return false;
    file->write(content);
    return file->commit(error);
}

} // namespace

TimeLineMenu::TimeLineMenu(TimeLine& timeLine, const Clock& clock, SignalStrip& strip,
                           QWidget* parent)
    : QMenu(parent),
      _timeLine(timeLine),
      _clock(clock),
      _strip(strip),
      _names(clock),
      _pins(new QMenu(QStringLiteral("Pinned"), this))
{
    setAccessibleName(QStringLiteral("More"));
    _names.setDateFormat(QStringLiteral("'ventrik-'yyyy-MM-dd-HHmmss"));
    addFile(QStringLiteral("Save Picture…"), "png", QStringLiteral("Pictures"),
            &TimeLineMenu::savePicture);
    addFile(QStringLiteral("Save Drawing…"), "svg", QStringLiteral("Drawings"),
            &TimeLineMenu::saveDrawing);
    addFile(QStringLiteral("Save Values…"), "csv", QStringLiteral("Tables"),
            &TimeLineMenu::saveValues);
    addSeparator();
    connect(addAction(QStringLiteral("Show All")), &QAction::triggered, this,
            [this] { _strip.fit(); });
    connect(_pins, &QMenu::aboutToShow, this, [this] { listPins(); });
    addMenu(_pins);
    connect(addAction(QStringLiteral("Keys")), &QAction::triggered, this, [this] { showKeys(); });
}

void TimeLineMenu::setOnSaved(std::function<void(const std::string& fileName)> onSaved)
{
    _onSaved = std::move(onSaved);
}

void TimeLineMenu::addFile(const QString& text, const char* suffix, const QString& kind,
                           Writer writer)
{
    connect(addAction(text), &QAction::triggered, this,
            [this, suffix = QString::fromUtf8(suffix), kind, writer] {
                askForFile(suffix, kind, writer);
            });
}

void TimeLineMenu::openBelow(const QWidget& widget)
{
    popup(widget.mapToGlobal(QPoint(0, widget.height())));
    setActiveAction(actions().front());
}

// Local time, of the moment that shows.
std::string TimeLineMenu::proposedName() const
{
    return _names.stringFromDate(_timeLine.pausedAt().value_or(_clock.now()));
}

// The toolkit's own dialog: that of a desktop may wait for a program that is not there.
void TimeLineMenu::askForFile(const QString& suffix, const QString& kind, Writer writer)
{
    auto* dialog = new QFileDialog(parentWidget()->window(), QStringLiteral("Save"));
    dialog->setAttribute(Qt::WA_DeleteOnClose);
    dialog->setOption(QFileDialog::DontUseNativeDialog);
    dialog->setAcceptMode(QFileDialog::AcceptSave);
    dialog->setNameFilter(QStringLiteral("%1 (*.%2)").arg(kind, suffix));
    dialog->setDefaultSuffix(suffix);
    dialog->setDirectory(QStandardPaths::writableLocation(QStandardPaths::DocumentsLocation));
    dialog->selectFile(QString::fromStdString(proposedName()) + QLatin1Char('.') + suffix);
    connect(dialog, &QFileDialog::fileSelected, this, [this, writer](const QString& file) {
        save(QFile::encodeName(file).toStdString(), writer);
    });
    dialog->open();
}

void TimeLineMenu::save(const std::string& path, Writer writer)
{
    std::string error;
    if ((this->*writer)(path, error)) {
        if (_onSaved)
            _onSaved(path);
        return;
    }
    auto* alert = new Alert(QStringLiteral("File Error"), QString::fromStdString(error),
                            QStringLiteral("Close"), parentWidget()->window());
    alert->openNow();
}

bool TimeLineMenu::savePicture(const std::string& path, std::string& error) const
{
    const QByteArray png = _strip.png();
    return writeFile(path, {png.constData(), static_cast<std::size_t>(png.size())}, error);
}

bool TimeLineMenu::saveDrawing(const std::string& path, std::string& error) const
{
    return writeFile(path, _strip.svg(), error);
}

bool TimeLineMenu::saveValues(const std::string& path, std::string& error) const
{
    auto file = PrivateFile::create(path, error);
    if (!file)
        return false;
    const auto [first, last] = _strip.shownRange();
    StoredRows(_timeLine.store(), _captureName).write({first, last}, [&](std::string_view block) {
        file->write(block);
    });
    return file->commit(error);
}

// Also what no row shows now, such as the best of a list.
void TimeLineMenu::listPins()
{
    _pins->clear();
    for (const Pin& pin : _timeLine.pins()) {
        QString text = oneLine(QString::fromStdString(pin.name + "  " + pin.path));
        QAction* action = _pins->addAction(text.replace(QLatin1Char('&'), QLatin1String("&&")));
        action->setCheckable(true);
        action->setChecked(true);
        connect(action, &QAction::triggered, this, [this, path = pin.path] {
            _timeLine.togglePin(path);
            tellOfPins();
        });
    }
    _pins->addSeparator();
    connect(_pins->addAction(QStringLiteral("As at First")), &QAction::triggered, this, [this] {
        _timeLine.resetPins();
        tellOfPins();
    });
}

void TimeLineMenu::tellOfPins() const
{
    if (_onPins)
        _onPins();
}

void TimeLineMenu::showKeys()
{
    auto* sheet = new Alert(QStringLiteral("Keys"), textOfKeys(), QStringLiteral("Close"),
                            parentWidget()->window());
    sheet->setIcon(QMessageBox::NoIcon);
    sheet->setTextFormat(Qt::RichText);
    sheet->openNow();
}

} // namespace ventrik

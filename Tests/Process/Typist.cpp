#include <QApplication>
#include <QGenericPlugin>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTest>
#include <QTimer>

#include <array>
#include <cstdio>
#include <cstdlib>
#include <utility>

namespace ventrik
{

namespace
{

/// Somebody who waits until values are shown and then saves a snapshot, by mouse and keys; or a
/// display that goes away then, upon which the toolkit ends the process.
class Typist : public QObject
{
  public:
    explicit Typist(bool losesDisplay) : _losesDisplay(losesDisplay)
    {
        connect(&_timer, &QTimer::timeout, this, [this] { goOn(); });
        _timer.start(50);
    }

  private:
    // The visible widget of that kind whose text begins so.
    template <typename Widget>
    static Widget* find(const QString& text)
    {
        for (QWidget* widget : QApplication::allWidgets())
            if (auto* found = qobject_cast<Widget*>(widget))
                if (found->isVisible() && found->text().startsWith(text))
                    return found;
        return nullptr;
    }

    void goOn()
    {
        if (_losesDisplay && find<QLabel>("Updated "))
            std::exit(EXIT_FAILURE);
        if (_losesDisplay)
            return;
        const std::array steps{&Typist::openSaveScreen, &Typist::describeAndSave};
        if (_step < steps.size() && (this->*steps[_step])())
            ++_step;
    }
    bool openSaveScreen() { return find<QLabel>("Updated ") && clickSave(); }
    // Types at once; the description has the keyboard.
    bool describeAndSave()
    {
        if (!find<QLineEdit>("") || !QApplication::focusWidget())
            return false;
        QTest::keyClicks(QApplication::focusWidget(), "On the road");
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Return);
        return true;
    }
    static bool clickSave()
    {
        auto* button = find<QPushButton>("Save");
        if (button)
            QTest::mouseClick(button, Qt::LeftButton);
        return button != nullptr;
    }

    bool _losesDisplay;
    QTimer _timer;
    std::size_t _step = 0;
};

/// Somebody who reads: writes on standard error what the window says, each time it says something
/// else, as "WIDTHxHEIGHT TITLE | STATUS | WHAT STANDS BESIDE IT".
class WindowReader : public QObject
{
  public:
    WindowReader()
    {
        connect(&_timer, &QTimer::timeout, this, [this] { read(); });
        _timer.start(50);
    }

  private:
    static QLabel* statusLabel(const QWidget& window)
    {
        for (QLabel* label : window.findChildren<QLabel*>())
            if (label->isVisible() &&
                (label->text().startsWith("Connecting") || label->text().startsWith("Updated ") ||
                 label->text().contains(" at 20")))
                return label;
        return nullptr;
    }

    void read()
    {
        for (const QWidget* window : QApplication::topLevelWidgets()) {
            const QLabel* status = window->isVisible() ? statusLabel(*window) : nullptr;
            if (!status)
                continue;
            const QString line =
                QStringLiteral("%1x%2 %3 | %4 | %5\n")
                    .arg(window->width())
                    .arg(window->height())
                    .arg(window->windowTitle(), status->text(), status->accessibleDescription());
            if (line != std::exchange(_last, line))
                std::fputs(line.toUtf8().constData(), stderr);
        }
    }

    QTimer _timer;
    QString _last;
};

} // namespace

/// The typist or the reader as an input device of the toolkit's, for a program that knows nothing
/// of it.
class TypistPlugin : public QGenericPlugin
{
    Q_OBJECT
    Q_PLUGIN_METADATA(IID QGenericPluginFactoryInterface_iid FILE "typist.json")

  public:
    QObject* create(const QString&, const QString& argument) override
    {
        if (argument == "reads")
            return new WindowReader;
        return new Typist(argument == "loses-display");
    }
};

} // namespace ventrik

#include "Typist.moc"

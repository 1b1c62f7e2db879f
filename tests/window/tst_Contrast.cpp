// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The contrast of texts and of parts without a text, measured on pictures of the window.

#include "AllDialogs.h"
#include "Palettes.h"
#include "ShownTexts.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/ReachableStyle.h"
#include "app/window/log/ActivityStrip.h"
#include "app/window/log/HighlightColors.h"
#include "app/window/log/HighlightRules.h"
#include "app/window/log/LineNumberMargin.h"
#include "app/window/log/LogOverview.h"
#include "app/window/settings/NumberedText.h"

#include <QCheckBox>
#include <QHash>
#include <QMenu>
#include <QMenuBar>
#include <QPushButton>
#include <QStyleOptionButton>
#include <QStyleOptionViewItem>
#include <QTabBar>
#include <QToolBar>

#include <cmath>

using namespace Velocor;
using namespace WindowParts;

namespace {

constexpr double LeastForText = 4.5;
constexpr double LeastForPart = 3;

// As WCAG 2 defines it.
double luminance(QRgb color)
{
    const auto linear = [](int value) {
        const double part = value / 255.0;
        return part <= 0.04045 ? part / 12.92 : std::pow((part + 0.055) / 1.055, 2.4);
    };
    return 0.2126 * linear(qRed(color)) + 0.7152 * linear(qGreen(color)) +
           0.0722 * linear(qBlue(color));
}

double contrast(QRgb one, QRgb other)
{
    const double first = luminance(one);
    const double second = luminance(other);
    return (std::max(first, second) + 0.05) / (std::min(first, second) + 0.05);
}

// Of the most frequent color of a place, the background, and the one that is farthest from it. The
// edges of letters are between the two.
class Picture
{
public:
    explicit Picture(QWidget* widget)
        : m_image(widget->grab().toImage().convertToFormat(QImage::Format_RGB32)),
          m_scale(m_image.width() / std::max(1, widget->width()))
    {}

    double contrastIn(QRect const& place) const
    {
        const QRect pixels =
            QRect(place.topLeft() * m_scale, place.size() * m_scale) & m_image.rect();
        QHash<QRgb, int> counts;
        for (int y = pixels.top(); y <= pixels.bottom(); ++y) {
            for (int x = pixels.left(); x <= pixels.right(); ++x)
                ++counts[m_image.pixel(x, y)];
        }
        QRgb ground = 0;
        int most = 0;
        for (auto color = counts.constBegin(); color != counts.constEnd(); ++color) {
            if (color.value() > most) {
                most = color.value();
                ground = color.key();
            }
        }
        double best = 1;
        for (auto color = counts.constBegin(); color != counts.constEnd(); ++color)
            best = std::max(best, contrast(color.key(), ground));
        return best;
    }

    // Of the pixels that differ from another picture of the same thing, to what was there.
    double contrastTo(Picture const& other) const
    {
        double best = 1;
        for (int y = 0; y < m_image.height(); ++y) {
            for (int x = 0; x < m_image.width(); ++x)
                best = std::max(best, contrast(m_image.pixel(x, y), other.m_image.pixel(x, y)));
        }
        return best;
    }

private:
    QImage m_image;
    int m_scale;
};

// What is too pale in a window.
class Pale
{
public:
    explicit Pale(QWidget* window) : m_window(window), m_picture(window) {}

    void text(QRect const& place, QString const& what) { check(place, what, LeastForText); }
    void part(QRect const& place, QString const& what) { check(place, what, LeastForPart); }

    QRect placeOf(QWidget const* widget, QRect const& inside) const
    {
        return QRect(widget->mapTo(m_window, inside.topLeft()), inside.size());
    }

    QStringList const& found() const { return m_found; }

private:
    void check(QRect const& place, QString const& what, double least)
    {
        if (place.isEmpty() || !m_window->rect().intersects(place))
            return;
        const double measured = m_picture.contrastIn(place);
        if (measured < least)
            m_found.append(QString("%1: %2").arg(what).arg(measured, 0, 'f', 2));
    }

    QWidget* m_window;
    Picture m_picture;
    QStringList m_found;
};

// Without the frame of a control.
QRect insideOf(QWidget const* widget)
{
    return widget->rect().adjusted(3, 3, -3, -3);
}

void checkButton(Pale& pale, QAbstractButton const* button)
{
    const QString text = ShownTexts::textOf(button);
    QRect inside = insideOf(button);
    if (qobject_cast<QCheckBox const*>(button)) {
        QStyleOptionButton option;
        option.initFrom(button);
        inside = button->style()->subElementRect(QStyle::SE_CheckBoxContents, &option, button);
    } else if (!button->icon().isNull()) {
        const int icon = button->iconSize().width() + 4;
        const bool isAlone = text.isEmpty() || button->width() < 2 * icon;
        const QRect place =
            isAlone ? inside : QRect(inside.topLeft(), QSize(icon, inside.height()));
        pale.part(pale.placeOf(button, place), "icon of " + button->accessibleName());
        if (isAlone)
            return;
        inside.setLeft(place.right() + 1);
    }
    if (!text.isEmpty())
        pale.text(pale.placeOf(button, inside), text);
}

void checkCells(Pale& pale, QAbstractItemView const* view)
{
    const QRect shown = view->viewport()->rect();
    for (QModelIndex row = view->indexAt(QPoint(2, 2));
         row.isValid() && shown.contains(view->visualRect(row).center());
         row = view->indexAt(QPoint(2, view->visualRect(row).bottom() + 3))) {
        for (int column = 0; column < row.model()->columnCount(row.parent()); ++column) {
            const QModelIndex cell = row.sibling(row.row(), column);
            const QRect place = view->visualRect(cell) & shown;
            if (cell.data().toString().trimmed().isEmpty() || place.width() < 16)
                continue;
            if (column == LogModel::MessageColumn &&
                !cell.data(LogModel::GapRole).toString().isEmpty() && place.width() > 400) {
                const QRect gap(place.right() - 60, place.top() + 2, 60, place.height() - 4);
                pale.text(pale.placeOf(view->viewport(), gap),
                          "gap before " + row.data().toString());
                const QRect line(place.left(), place.top(), 60, 3);
                pale.part(pale.placeOf(view->viewport(), line), "line of a gap");
            }
            const bool hasIcon = cell.data(Qt::DecorationRole).isValid();
            const QRect text = place.adjusted(hasIcon ? 24 : 5, 2, -2, -2);
            pale.text(pale.placeOf(view->viewport(), text), "cell " + cell.data().toString());
            if (hasIcon && cell.data(LogModel::SeverityRole).toInt() != LogEntry::Trace)
                pale.part(pale.placeOf(view->viewport(),
                                       QRect(place.topLeft() + QPoint(3, 2), QSize(18, 18))),
                          "icon of " + cell.data().toString());
        }
    }
}

void checkHeaders(Pale& pale, QAbstractItemView const* view)
{
    const QList<QHeaderView*> headers = view->findChildren<QHeaderView*>();
    for (QHeaderView const* header : headers) {
        for (int i = 0;
             header->orientation() == Qt::Horizontal && header->isVisible() && i < header->count();
             ++i) {
            if (header->isSectionHidden(i))
                continue;
            const QRect place(header->sectionViewportPosition(i) + 2, 3, header->sectionSize(i) - 4,
                              header->height() - 6);
            pale.text(pale.placeOf(header->viewport(), place & header->viewport()->rect()),
                      "column " + header->model()->headerData(i, Qt::Horizontal).toString());
        }
    }
}

// Frames without which one would not see where to click.
void checkBoundary(Pale& pale, QWidget const* widget)
{
    if (qobject_cast<QLineEdit const*>(widget))
        pale.part(pale.placeOf(widget, QRect(-3, widget->height() / 2, 5, 2)),
                  "frame of " + widget->accessibleName());
    auto const* box = qobject_cast<QCheckBox const*>(widget);
    if (!box)
        return;
    QStyleOptionButton option;
    option.initFrom(box);
    const QRect check = box->style()->subElementRect(QStyle::SE_CheckBoxIndicator, &option, box);
    pale.part(pale.placeOf(box, check.adjusted(-1, 4, 1 - check.width() / 2, -4)),
              "frame of " + box->accessibleName());
}

// All that is enabled: what cannot be used may be pale.
QString tooPale(QWidget* window)
{
    Pale pale(window);
    const QList<QWidget*> parts = ShownTexts::parts(window);
    for (QWidget const* widget : parts) {
        if (!widget->isEnabled())
            continue;
        checkBoundary(pale, widget);
        if (auto const* button = qobject_cast<QAbstractButton const*>(widget)) {
            checkButton(pale, button);
        } else if (auto const* view = qobject_cast<QAbstractItemView const*>(widget)) {
            checkCells(pale, view);
            checkHeaders(pale, view);
        } else if (!ShownTexts::textOf(widget).isEmpty() &&
                   !qobject_cast<QPlainTextEdit const*>(widget)) {
            pale.text(pale.placeOf(widget, insideOf(widget)), ShownTexts::textOf(widget));
        }
    }
    const QList<QTabBar*> bars = window->findChildren<QTabBar*>();
    for (QTabBar const* bar : bars) {
        for (int i = 0; bar->isVisible() && i < bar->count(); ++i)
            pale.text(pale.placeOf(bar, bar->tabRect(i).adjusted(6, 6, -24, -6)), bar->tabText(i));
    }
    return pale.found().join('\n');
}

// The style polishes the colors of the desktop, but not those that a program sets.
void usePalette(QString const& name)
{
    QPalette palette = name == "dark"            ? Palettes::dark()
                       : name == "high contrast" ? Palettes::highContrast()
                                                 : Palettes::light();
    QApplication::style()->polish(palette);
    QApplication::setPalette(palette);
}

void addPalettes()
{
    QTest::addColumn<QString>("palette");
    for (char const* name : {"light", "dark", "high contrast"})
        QTest::newRow(name) << name;
}

void addPalettesFor(QStringList const& names)
{
    QTest::addColumn<QString>("palette");
    QTest::addColumn<QString>("shown");
    for (char const* palette : {"light", "dark", "high contrast"}) {
        for (QString const& name : names)
            QTest::newRow((QString(name).remove('&') + ", " + palette).toUtf8()) << palette << name;
    }
}

// One of each severity and of each thing that is drawn over a line.
QByteArray log()
{
    using DemoLog::entry;
    return entry("09:00:00.000", "Trace", "plain") + entry("09:00:01.000", "Notification", "some") +
           entry("09:00:02.000", "Warning", "found") + entry("09:05:03.000", "Error", "matching") +
           entry("09:05:04.000", "Fatal", "ruled") + entry("09:05:05.000", "Trace", "last");
}

} // namespace

class tst_Contrast : public WindowTestCase
{
    Q_OBJECT

private slots:
    void files_data();
    void files();
    void lines_data();
    void lines();
    void rules_data();
    void rules();
    void besideTheLines_data();
    void besideTheLines();
    void switches_data();
    void switches();
    void menus_data();
    void menus();
    void focus_data();
    void focus();
    void dialogs_data();
    void dialogs();

protected slots:
    void initTestCase() override;
    void cleanup() override;
};

// The program's own style sees to some of the colors.
void tst_Contrast::initTestCase()
{
    WindowTestCase::initTestCase();
    QApplication::setStyle(new ReachableStyle);
}

void tst_Contrast::cleanup()
{
    WindowTestCase::cleanup();
    QApplication::setPalette(Palettes::light());
}

void tst_Contrast::files_data()
{
    addPalettesFor({"log", "places", "settings", "broken settings"});
}

void tst_Contrast::files()
{
    QFETCH(QString, palette);
    QFETCH(QString, shown);
    usePalette(palette);
    const WindowTest test(log());
    QStringList files;
    if (shown.contains("settings")) {
        files.append(test.folder() + "a.cfg");
        QVERIFY(TestFiles::write(files.first(), shown == "settings" ? Settings : "<a>\n<b></c>"));
    }
    const auto window = WindowTest::show(files);
    if (shown == "places")
        QTest::keyClick(window.get(), Qt::Key_F9);
    QTRY_COMPARE_WITH_TIMEOUT(window->findChild<LogView*>()->model()->rowCount(), 6, Patience);
    QTest::qWait(0);
    QCOMPARE(tooPale(window.get()), QString());
}

void tst_Contrast::lines_data()
{
    addPalettes();
}

// Selected, found, matching, before and after a match, of an earlier run, marked.
void tst_Contrast::lines()
{
    QFETCH(QString, palette);
    usePalette(palette);
    const WindowTest test(DemoLog::writtenOver(log() + log(), DemoLog::run(6, QTime(10, 0), "of")));
    const auto window = WindowTest::show();
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) >= 12, Patience);
    Panel(*window)->SetLeastGap(1000);
    Panel(*window)->SetSince(true);
    QCOMPARE(tooPale(window.get()), QString());
    View(*window)->selectAll();
    QCOMPARE(tooPale(window.get()), QString());
    View(*window)->clearSelection();
    View(*window)->GoToRow(3);
    Panel(*window)->ToggleMark();
    Child<QLineEdit>(window.get(), "Filter by text")->setText("matching");
    Child<QComboBox>(window.get(), "Lines of context")->setCurrentIndex(2);
    Panel(*window)->OpenFind();
    Child<QLineEdit>(window.get(), "Find text")->setText("found");
    QTRY_VERIFY_WITH_TIMEOUT(Rows(*window) < 12, Patience);
    QTest::qWait(300);
    QCOMPARE(tooPale(window.get()), QString());
}

void tst_Contrast::rules_data()
{
    addPalettes();
}

void tst_Contrast::rules()
{
    QFETCH(QString, palette);
    usePalette(palette);
    QByteArray text;
    for (int i = 0; i < HighlightColors::Count; ++i)
        text += DemoLog::entry(QString("09:00:0%1.000").arg(i), "Trace", QString("rule%1").arg(i));
    const WindowTest test(text);
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), int(HighlightColors::Count), Patience);
    for (int i = 0; i < HighlightColors::Count; ++i)
        window->findChild<FileTabs*>()->highlightRules()->Add(QString("rule%1").arg(i));
    QTest::qWait(0);
    QCOMPARE(tooPale(window.get()), QString());
}

void tst_Contrast::besideTheLines_data()
{
    addPalettes();
}

// Numbers of lines, ticks beside the scroll bar, bars by time, marks.
void tst_Contrast::besideTheLines()
{
    QFETCH(QString, palette);
    usePalette(palette);
    const WindowTest test(log());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 6, Patience);
    Panel(*window)->SetLineNumbers(true);
    View(*window)->GoToRow(0);
    Panel(*window)->ToggleMark();
    View(*window)->clearSelection();
    View(*window)->setCurrentIndex(QModelIndex());
    Panel(*window)->OpenFind();
    Child<QLineEdit>(window.get(), "Find text")->setText("found");
    auto* strip = window->findChild<ActivityStrip*>();
    QSignalSpy counted(strip, &ActivityStrip::shown);
    strip->SetShown(true);
    QTRY_VERIFY_WITH_TIMEOUT(!counted.isEmpty(), Patience);
    QTest::qWait(1500); // ticks follow later

    Pale pale(window.get());
    auto const* numbers = window->findChild<LineNumberMargin*>();
    for (int row = 0; row < 6; ++row)
        pale.text(pale.placeOf(numbers, QRect(0, row * View(*window)->rowHeight(0) + 2,
                                              numbers->width(), View(*window)->rowHeight(0) - 4)),
                  QString("number %1").arg(row + 1));
    auto const* overview = window->findChild<LogOverview*>();
    for (int lane = 0; lane < 3; ++lane)
        pale.part(pale.placeOf(overview, QRect(1 + lane * 4, 0, 4, overview->height())),
                  QString("ticks in lane %1").arg(lane));
    pale.part(pale.placeOf(strip, QRect(1, 1, 12, 40)), "first bar");
    pale.part(pale.placeOf(strip, QRect(strip->width() - 12, 1, 10, 40)), "last bar");
    pale.text(pale.placeOf(strip, QRect(0, 42, strip->width(), strip->height() - 42)), "times");
    const QRect marked = View(*window)->visualRect(View(*window)->model()->index(0, 0));
    pale.part(pale.placeOf(View(*window)->viewport(), QRect(marked.topLeft(), QSize(5, 20))),
              "mark");
    QCOMPARE(pale.found().join('\n'), QString());
}

void tst_Contrast::switches_data()
{
    addPalettes();
}

// Of severities that are not shown.
void tst_Contrast::switches()
{
    QFETCH(QString, palette);
    usePalette(palette);
    const WindowTest test(log());
    const auto window = WindowTest::show();
    for (char const* name : {"Trace", "Notification", "Warning", "Error", "Fatal", "Other"})
        Child<QAbstractButton>(window.get(), QString("Show ") + name)->setChecked(false);
    QTest::qWait(200);
    QCOMPARE(tooPale(window.get()), QString());
}

void tst_Contrast::menus_data()
{
    addPalettes();
}

void tst_Contrast::menus()
{
    QFETCH(QString, palette);
    usePalette(palette);
    const WindowTest test(log());
    const auto window = WindowTest::show();
    Pale ofBar(window.get());
    const QList<QAction*> titles = window->menuBar()->actions();
    for (QAction* title : titles) {
        const QRect place = window->menuBar()->actionGeometry(title);
        ofBar.text(ofBar.placeOf(window->menuBar(), place), title->text());
        QMenu* menu = title->menu();
        menu->popup(window->pos());
        QVERIFY(QTest::qWaitForWindowExposed(menu, Patience));
        Pale pale(menu);
        const QList<QAction*> items = menu->actions();
        for (QAction* item : items) {
            if (item->isEnabled() && !item->isSeparator())
                pale.text(menu->actionGeometry(item).adjusted(24, 2, -14, -2), item->text());
        }
        menu->close();
        QCOMPARE(pale.found().join('\n'), QString());
    }
    QCOMPARE(ofBar.found().join('\n'), QString());
}

void tst_Contrast::focus_data()
{
    addPalettes();
}

// Something changes enough to be seen where the keyboard goes. Fusion shows it only after Tab.
void tst_Contrast::focus()
{
    QFETCH(QString, palette);
    usePalette(palette);
    const WindowTest test(log());
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 6, Patience);
    window->findChild<ActivityStrip*>()->SetShown(true);
    QTest::keyClick(window.get(), Qt::Key_F9);
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
    QStringList pale;
    const QList<QWidget*> all = window->findChildren<QWidget*>();
    auto* elsewhere = Child<QComboBox>(window.get(), "Log file");
    for (QWidget* widget : all) {
        if (!widget->isVisible() || !widget->isEnabled() || widget == elsewhere ||
            !(widget->focusPolicy() & Qt::TabFocus) || widget->focusProxy())
            continue;
        elsewhere->setFocus(Qt::TabFocusReason);
        const Picture before(widget);
        widget->setFocus(Qt::TabFocusReason);
        const double measured = Picture(widget).contrastTo(before);
        if (measured < LeastForPart)
            pale.append(QString("%1 %2: %3")
                            .arg(widget->metaObject()->className(), widget->accessibleName())
                            .arg(measured, 0, 'f', 2));
    }
    QCOMPARE(pale.join('\n'), QString());
}

void tst_Contrast::dialogs_data()
{
    addPalettesFor(AllDialogs::names());
}

void tst_Contrast::dialogs()
{
    QFETCH(QString, palette);
    QFETCH(QString, shown);
    usePalette(palette);
    const WindowTest test(log());
    const QString settings = test.folder() + "a.cfg";
    QVERIFY(TestFiles::write(settings, Settings));
    const auto window = WindowTest::show({settings});
    window->findChild<FileTabs*>()->setCurrentIndex(0);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 6, Patience);
    AllDialogs dialogs(*window, [](QString const& text) { return text; });
    bool isShown = false;
    dialogs.with(shown, [&](QDialog* dialog) {
        isShown = true;
        QCOMPARE(tooPale(dialog), QString());
    });
    QVERIFY(isShown);
}

QTEST_MAIN(tst_Contrast)
#include "tst_Contrast.moc"

// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Window and dialogs in the text sizes that desktops offer.

#include "AllDialogs.h"
#include "ShownTexts.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/window/ReachableStyle.h"

using namespace Velocor;
using namespace WindowParts;

namespace {

constexpr int Sizes[] = {8, 10, 12, 16, 20, 24}; // points

void addSizes(QStringList const& names)
{
    QTest::addColumn<int>("points");
    QTest::addColumn<QString>("shown");
    for (int points : Sizes) {
        for (QString const& name : names)
            QTest::newRow((QString(name).remove('&') + QString(", %1").arg(points)).toUtf8())
                << points << name;
    }
}

void useSize(int points)
{
    QFont font = QApplication::font();
    font.setPointSize(points);
    QApplication::setFont(font);
}

QString problems(QWidget* window)
{
    QStringList found = ShownTexts::cutOff(window) + ShownTexts::overlapping(window);
    const QList<QAbstractItemView*> views = window->findChildren<QAbstractItemView*>();
    for (QAbstractItemView const* view : views) {
        const QModelIndex first = view->model() ? view->model()->index(0, 0) : QModelIndex();
        if (!qobject_cast<QHeaderView const*>(view) && view->isVisible() && first.isValid() &&
            view->visualRect(first).height() < view->fontMetrics().height())
            found.append("rows of " + view->accessibleName());
    }
    return found.join('\n');
}

} // namespace

class tst_TextSizes : public WindowTestCase
{
    Q_OBJECT

private slots:
    void window_data();
    void window();
    void icons_data();
    void icons();
    void cells_data();
    void cells();
    void dialogs_data();
    void dialogs();

protected slots:
    void initTestCase() override;
    void cleanup() override;

private:
    QFont m_font;
};

void tst_TextSizes::initTestCase()
{
    WindowTestCase::initTestCase();
    QApplication::setStyle(new ReachableStyle);
    m_font = QApplication::font();
}

void tst_TextSizes::cleanup()
{
    WindowTestCase::cleanup();
    QApplication::setFont(m_font);
}

void tst_TextSizes::window_data()
{
    addSizes({"log", "bars", "settings", "broken settings"});
}

void tst_TextSizes::window()
{
    QFETCH(int, points);
    QFETCH(QString, shown);
    useSize(points);
    const WindowTest test(DemoLog::run(30, QTime(12, 0), "entry"));
    QStringList files;
    if (shown.contains("settings")) {
        files.append(test.folder() + "a.cfg");
        QVERIFY(TestFiles::write(files.first(), shown == "settings" ? Settings : "<a"));
    }
    const auto window = WindowTest::show(files);
    if (shown == "bars") {
        for (char const* action :
             {"Find", "Places", "Activity", "Time Since", "Also Filter", "Line Numbers"})
            Action(*window, action)->trigger();
    }
    QTRY_COMPARE_WITH_TIMEOUT(problems(window.get()), QString(), Patience);
}

void tst_TextSizes::icons_data()
{
    cells_data();
}

// They are not much smaller than the letters beside them.
void tst_TextSizes::icons()
{
    QFETCH(int, points);
    useSize(points);
    const WindowTest test(DemoLog::entry("12:00:00.000", "Notification", "entry"));
    const auto window = WindowTest::show();
    const int least = window->fontMetrics().ascent() * 3 / 4;
    const QList<QToolButton*> tools = window->findChildren<QToolButton*>();
    for (QToolButton const* tool : tools)
        QVERIFY2(tool->iconSize().height() >= least, qPrintable(tool->accessibleName()));
    for (auto metric : {QStyle::PM_SmallIconSize, QStyle::PM_IndicatorHeight,
                        QStyle::PM_TabCloseIndicatorHeight, QStyle::PM_ListViewIconSize})
        QVERIFY(window->style()->pixelMetric(metric, nullptr, window.get()) >= least);
}

void tst_TextSizes::cells_data()
{
    QTest::addColumn<int>("points");
    for (int points : Sizes)
        QTest::addRow("%d", points) << points;
}

// Times and severities are not elided.
void tst_TextSizes::cells()
{
    QFETCH(int, points);
    useSize(points);
    const WindowTest test(DemoLog::entry("12:00:00.000", "Notification", "entry"));
    const auto window = WindowTest::show();
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 1, Patience);
    QStyleOptionViewItem option;
    option.font = View(*window)->font();
    option.fontMetrics = QFontMetrics(option.font);
    const int icon =
        View(*window)->style()->pixelMetric(QStyle::PM_SmallIconSize, nullptr, View(*window));
    option.decorationSize = QSize(icon, icon);
    for (int column : {LogModel::TimeColumn, LogModel::SeverityColumn}) {
        const QModelIndex cell = View(*window)->model()->index(0, column);
        QVERIFY(View(*window)->columnWidth(column) >=
                View(*window)->itemDelegate()->sizeHint(option, cell).width());
    }
}

void tst_TextSizes::dialogs_data()
{
    addSizes(AllDialogs::names());
}

void tst_TextSizes::dialogs()
{
    QFETCH(int, points);
    QFETCH(QString, shown);
    useSize(points);
    const WindowTest test(DemoLog::run(5, QTime(12, 0), "entry"));
    const QString settings = test.folder() + "a.cfg";
    QVERIFY(TestFiles::write(settings, Settings));
    const auto window = WindowTest::show({settings});
    window->findChild<FileTabs*>()->setCurrentIndex(0);
    QTRY_COMPARE_WITH_TIMEOUT(Rows(*window), 5, Patience);
    AllDialogs dialogs(*window, [](QString const& text) { return text; });
    bool isShown = false;
    dialogs.with(shown, [&](QDialog* dialog) {
        isShown = true;
        QTRY_COMPARE_WITH_TIMEOUT(problems(dialog), QString(), Patience);
    });
    QVERIFY(isShown);
}

QTEST_MAIN(tst_TextSizes)
#include "tst_TextSizes.moc"

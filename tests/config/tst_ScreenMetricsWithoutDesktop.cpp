// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include <QCoreApplication>
#include <QGuiApplication>
#include <QPoint>
#include <QSize>
#include <QtTest>

#include <memory>

// Programs without a desktop, because their application object is not a GUI one.
class tst_ScreenMetricsWithoutDesktop : public QObject
{
    Q_OBJECT

private slots:
    void read_data();
    void read();
    void write();
};

namespace {

enum Application { None, Core, Gui };

std::unique_ptr<QCoreApplication> MakeApplication(int kind)
{
    // Of the screen plug-ins, the one that cleans up after itself. The arguments must outlive the
    // application, which removes those that it recognized.
    static char name[] = "program";
    static char option[] = "-platform";
    static char plugin[] = "minimal";
    static char* argv[4];
    static int argc;
    argv[0] = name;
    argv[1] = option;
    argv[2] = plugin;
    argc = 3;
    switch (kind) {
    case Core:
        return std::make_unique<QCoreApplication>(argc, argv);
    case Gui:
        return std::make_unique<QGuiApplication>(argc, argv);
    default:
        return nullptr;
    }
}

} // namespace

void tst_ScreenMetricsWithoutDesktop::read_data()
{
    QTest::addColumn<int>("application");
    QTest::addColumn<QString>("stored"); // null: the key is missing
    QTest::addColumn<bool>("found");
    QTest::addColumn<QPoint>("position");
    QTest::addColumn<QSize>("size");

    const QPoint untouchedPosition(11, 12);
    const QSize untouchedSize(13, 14);
    const QPoint noPosition(0, 0);
    const QSize noSize(0, 0);
    const struct
    {
        char const* title;
        Application kind;
    } applications[] = {{"no application", None},
                        {"application without screen", Core},
                        {"application without widgets", Gui}};
    for (auto const& application : applications) {
        const auto row = [&](char const* what, QString const& stored, bool found,
                             QPoint const& position, QSize const& size) {
            QTest::addRow("%s: %s", application.title, what)
                << int(application.kind) << stored << found << position << size;
        };
        row("four numbers", "100,100,800,600", false, untouchedPosition, untouchedSize);
        row("four that are no numbers", "a,b,c,d", false, untouchedPosition, untouchedSize);
        row("three fields", "1,2,3", true, noPosition, noSize);
        row("empty", "", true, noPosition, noSize);
        row("missing", QString(), false, noPosition, noSize);
    }
}

void tst_ScreenMetricsWithoutDesktop::read()
{
    QFETCH(int, application);
    QFETCH(QString, stored);
    const std::unique_ptr<QCoreApplication> running = MakeApplication(application);
    QCOMPARE(QCoreApplication::instance(), running.get());
    TorkConfigFile file{QString()};
    file.WriteItem("ApplicationScreens", "Main", stored);

    QPoint position(11, 12);
    QSize size(13, 14);
    QTEST(file.ReadScreenMetrics("Main", position, size), "found");
    QTEST(position, "position");
    QTEST(size, "size");
}

void tst_ScreenMetricsWithoutDesktop::write()
{
    TorkConfigFile file{QString()};
    QPoint position(1, 2);
    QSize size(3, 4);
    QVERIFY(file.WriteScreenMetrics("Main", position, size));
    QString none;
    QString stored;
    QVERIFY(file.ReadItem("ApplicationScreens", "Main", none, stored));
    QCOMPARE(stored, QString("1,2,3,4"));
}

QTEST_APPLESS_MAIN(tst_ScreenMetricsWithoutDesktop)
#include "tst_ScreenMetricsWithoutDesktop.moc"

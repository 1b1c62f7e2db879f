// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// How long the settings editor makes its user wait, with a file of 100,000 values: opening it until
// it is painted, and each key that is typed into the find bar until its answer is. Needs a display.

#include "app/window/settings/SettingsEditor.h"
#include "support/Measurements.h"
#include "support/ScratchFolder.h"

#include <QApplication>
#include <QElapsedTimer>
#include <QFile>
#include <QKeyEvent>
#include <QLineEdit>
#include <QToolButton>
#include <QTreeView>

#include <functional>

#include <time.h>

using namespace Velocor;

namespace {

constexpr int Values = 100000;

// As many keys in each section.
void WriteSettings(QString const& fileName, int sections)
{
    QFile file(fileName);
    Require(file.open(QIODevice::WriteOnly), file.errorString());
    file.write("<VelocorSettings>\n");
    for (int i = 0; i < sections; ++i) {
        const QByteArray name = "Section" + QByteArray::number(i);
        file.write('<' + name + ">\n");
        for (int j = 0; j < Values / sections; ++j) {
            const QByteArray key = "setting" + QByteArray::number(j);
            file.write('<' + key + ">value " + QByteArray::number(i) + "</" + key + ">\n");
        }
        file.write("</" + name + ">\n");
    }
    file.write("</VelocorSettings>\n");
    Require(file.flush(), file.errorString());
}

double ProcessorTime()
{
    timespec time = {};
    ::clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &time);
    return double(time.tv_sec) * 1e9 + double(time.tv_nsec);
}

template <class Widget>
Widget* Child(QWidget const& parent, QString const& accessibleName)
{
    const QList<Widget*> all = parent.findChildren<Widget*>();
    for (Widget* widget : all) {
        if (widget->accessibleName() == accessibleName)
            return widget;
    }
    Require(false, accessibleName + QStringLiteral(" is missing"));
    return nullptr;
}

class SettingsBench
{
public:
    void measure(int sections)
    {
        m_group = QStringLiteral("settings file of %L1 values in %L2 section%3")
                      .arg(Values)
                      .arg(sections)
                      .arg(sections == 1 ? QString() : QStringLiteral("s"));
        const ScratchFolder folder;
        const QString file = folder.file(QStringLiteral("large.cfg"));
        WriteSettings(file, sections);
        SettingsEditor editor;
        editor.resize(1080, 680);
        editor.show();
        QCoreApplication::processEvents();
        time("open", [&] { editor.Open(file); });
        Require(editor.ShowsTree(), QStringLiteral("the file was not read"));

        auto* tree = Child<QTreeView>(editor, QStringLiteral("Settings"));
        auto* field = Child<QLineEdit>(editor, QStringLiteral("Find in names and values"));
        auto* onlyMatches = Child<QToolButton>(editor, QStringLiteral("Only Matches"));
        press(tree, Qt::Key_F, Qt::ControlModifier);
        type("a key to find", field, QStringLiteral("value 9"));
        field->clear();
        type("a key to find, no match", field, QStringLiteral("zzzz"));
        field->clear();
        onlyMatches->setChecked(true);
        type("a key to filter, all match", field, QStringLiteral("value"));
        time("all shown again", [&] { field->clear(); });
        type("a key to filter, some match", field, QStringLiteral("9999"));
        time("all shown again", [&] { field->clear(); });
        type("a key to filter, no match", field, QStringLiteral("zzzz"));
        time("all shown again", [&] { press(field, Qt::Key_Escape); });
        Require(tree->model()->rowCount() == sections, QStringLiteral("not all are shown"));
    }

    Measurements const& measurements() const { return m_measurements; }

private:
    static void press(QWidget* widget, int key, Qt::KeyboardModifiers modifiers = Qt::NoModifier,
                      QString const& text = QString())
    {
        QKeyEvent event(QEvent::KeyPress, key, modifiers, text);
        QCoreApplication::sendEvent(widget, &event);
    }

    void type(char const* what, QLineEdit* field, QString const& text)
    {
        for (QChar letter : text)
            time(what, [&] { press(field, 0, Qt::NoModifier, QString(letter)); });
        Require(field->text() == text,
                QStringLiteral("%1: the field has %2").arg(QLatin1String(what), field->text()));
    }

    // Until the event loop has nothing more to do, and everything is painted.
    void time(char const* what, std::function<void()> const& work)
    {
        QElapsedTimer timer;
        timer.start();
        const double before = ProcessorTime();
        work();
        QCoreApplication::processEvents();
        m_measurements.add(m_group, what, double(timer.nsecsElapsed()), "ns",
                           ProcessorTime() - before);
    }

    QString m_group;
    Measurements m_measurements;
};

} // namespace

// bench_settings RESULTS ROUNDS
int main(int argc, char** argv)
{
    Require(argc >= 3, QStringLiteral("usage: bench_settings RESULTS ROUNDS"));
    ::setenv("QT_QPA_PLATFORM", "xcb", 1);
    QApplication application(argc, argv);

    SettingsBench bench;
    const int rounds = std::atoi(argv[2]);
    for (int round = 0; round < rounds; ++round) {
        bench.measure(1);
        bench.measure(1000);
    }
    bench.measurements().save(QString::fromLocal8Bit(argv[1]));
    return 0;
}

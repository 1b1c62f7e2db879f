// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Drives the window, and in one test the whole program.

#include "NotesWindow.h"

#include "app/AppPaths.h"

#include <QApplication>
#include <QDir>
#include <QFile>
#include <QMenu>
#include <QMenuBar>
#include <QMessageBox>
#include <QPlainTextEdit>
#include <QProcess>
#include <QPushButton>
#include <QTemporaryDir>
#include <QTimer>
#include <QtTest>

#include <csignal>

class tst_Notes : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void init();
    void firstStart();
    void placeFontAndColor();
    void recentFiles();
    void recentFileOfAnyName_data();
    void recentFileOfAnyName();
    void settingsOfEarlierVersions_data();
    void settingsOfEarlierVersions();
    void recentFileFromMenu();
    void missingRecentFile();
    void savesText();
    void saveThatFails();
    void askedAboutChanges_data();
    void askedAboutChanges();
    void brokenSettings();
    void settingsThatCannotBeSaved();
    void program();

private:
    QString note(QString const& name, QByteArray const& content = "text") const;
    QByteArray read(QString const& path) const;
    static QPlainTextEdit* text(NotesWindow& window);
    static QStringList recent(NotesWindow& window);
    void answer(QMessageBox::StandardButton button);

    QScopedPointer<QTemporaryDir> m_folder;
    QString m_settings;
    QStringList m_boxes; // the texts of the boxes that were shown
};

void tst_Notes::initTestCase()
{
    qApp->setProperty("caption", "Notes");
}

void tst_Notes::init()
{
    m_folder.reset(new QTemporaryDir);
    QVERIFY2(m_folder->isValid(), qPrintable(m_folder->errorString()));
    m_settings = m_folder->filePath("notes.cfg");
    m_boxes.clear();
}

QString tst_Notes::note(QString const& name, QByteArray const& content) const
{
    const QString path = m_folder->filePath(name);
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly) || file.write(content) != content.size())
        qFatal("%s: %s", qPrintable(path), qPrintable(file.errorString()));
    return path;
}

QByteArray tst_Notes::read(QString const& path) const
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll()
                                          : "(" + file.errorString().toUtf8() + ")";
}

QPlainTextEdit* tst_Notes::text(NotesWindow& window)
{
    return window.findChild<QPlainTextEdit*>();
}

QStringList tst_Notes::recent(NotesWindow& window)
{
    QMenu* file = window.menuBar()->actions().first()->menu();
    emit file->aboutToShow();

    QStringList entries;
    QMenu* menu = file->actions()[1]->menu();
    const QList<QAction*> actions = menu->actions();
    for (QAction* action : actions) {
        if (action->isVisible())
            entries.append(action->text());
    }
    if (menu->isEnabled() == entries.isEmpty())
        entries.append("(wrongly enabled or disabled)");
    return entries;
}

// Answers the next box, which blocks until it is answered.
void tst_Notes::answer(QMessageBox::StandardButton button)
{
    auto* timer = new QTimer(this);
    connect(timer, &QTimer::timeout, this, [this, timer, button] {
        auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
        if (!box || !box->isVisible())
            return;
        timer->deleteLater();
        timer->stop();
        m_boxes.append(box->text());
        QTest::mouseClick(box->button(button), Qt::LeftButton);
    });
    timer->start(10);
}

void tst_Notes::firstStart()
{
    NotesWindow window(m_settings);
    QCOMPARE(window.size(), QSize(640, 480));
    QCOMPARE(window.windowTitle(), QString("New note[*]"));
    QCOMPARE(recent(window), QStringList());
    QVERIFY(!QFile::exists(m_settings));
    window.close();
    QVERIFY(QFile::exists(m_settings));
}

void tst_Notes::placeFontAndColor()
{
    QFont font("Monospace", 17);
    font.setBold(true);
    {
        NotesWindow window(m_settings);
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        window.move(120, 90);
        window.resize(500, 400);
        QTRY_COMPARE(window.pos(), QPoint(120, 90));
        text(window)->setFont(font);
        QPalette palette = text(window)->palette();
        palette.setColor(QPalette::Text, QColor(10, 20, 30));
        text(window)->setPalette(palette);
        window.close();
    }
    NotesWindow window(m_settings);
    QCOMPARE(window.pos(), QPoint(120, 90));
    QCOMPARE(window.size(), QSize(500, 400));
    QCOMPARE(text(window)->font().toString(), font.toString());
    QCOMPARE(text(window)->palette().color(QPalette::Text), QColor(10, 20, 30));
}

void tst_Notes::recentFiles()
{
    const QString first = note("first.txt");
    const QString second = note(QString::fromUtf8("größe ☃.txt"));
    {
        NotesWindow window(m_settings);
        QVERIFY(window.OpenNote(first));
        QVERIFY(window.OpenNote(second));
        QVERIFY(window.OpenNote(first));
        QCOMPARE(recent(window), QStringList({first, second}));
        window.close();
    }
    {
        NotesWindow window(m_settings);
        QCOMPARE(recent(window), QStringList({first, second}));
        for (int i = 0; i < 10; ++i)
            QVERIFY(window.OpenNote(note(QString::number(i))));
        QCOMPARE(recent(window).size(), 8);
        QCOMPARE(recent(window).first(), m_folder->filePath("9"));
        window.close();
    }
    NotesWindow window(m_settings);
    QCOMPARE(recent(window).size(), 8);
}

void tst_Notes::recentFileOfAnyName_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("placeholder") << "plan%2Ffinal.txt";
    QTest::newRow("more placeholders") << "%L1 90%1 %20";
    QTest::newRow("end of a CDATA section") << "a]]>b";
    QTest::newRow("markup") << "<R&D> \"'";
    QTest::newRow("beyond ASCII") << QString::fromUtf8("größe ☃");
    QTest::newRow("backslashes") << "\\u0041\\";
    QTest::newRow("spaces around and a line break") << " a\nb ";
}

void tst_Notes::recentFileOfAnyName()
{
    QFETCH(QString, name);
    const QString path = note(name);
    {
        NotesWindow window(m_settings);
        window.resize(500, 400);
        QVERIFY(window.OpenNote(path));
        window.close();
    }
    NotesWindow window(m_settings);
    QCOMPARE(m_boxes, QStringList());
    QCOMPARE(window.size(), QSize(500, 400));
    QCOMPARE(recent(window), QStringList(path));
}

void tst_Notes::settingsOfEarlierVersions_data()
{
    QTest::addColumn<QByteArray>("stored");
    QTest::addColumn<QString>("path");

    QTest::newRow("plain") << QByteArray("/a/b c.txt|") << "/a/b c.txt";
    QTest::newRow("markup") << QByteArray("<![CDATA[/a/R&D]]>") << "/a/R&D";
    QTest::newRow("beyond ASCII") << QByteArray("/a/gr\xc3\xb6\xc3\x9f")
                                  << QString::fromUtf8("/a/größ");
}

void tst_Notes::settingsOfEarlierVersions()
{
    QFETCH(QByteArray, stored);
    QFETCH(QString, path);
    note("notes.cfg", "<VelocorSettings>\n<Notes>\n<recent>" + stored +
                          "</recent>\n</Notes>\n</VelocorSettings>\n");
    NotesWindow window(m_settings);
    QCOMPARE(recent(window), QStringList(path));
}

void tst_Notes::recentFileFromMenu()
{
    NotesWindow window(m_settings);
    QVERIFY(window.OpenNote(note("first.txt", "one")));
    QVERIFY(window.OpenNote(note("second.txt", "two")));
    recent(window);
    QMenu* menu = window.menuBar()->actions().first()->menu()->actions()[1]->menu();
    menu->actions()[1]->trigger();
    QCOMPARE(text(window)->toPlainText(), QString("one"));
    QCOMPARE(window.windowTitle(), QString("first.txt[*]"));
}

void tst_Notes::missingRecentFile()
{
    const QString path = note("gone.txt");
    {
        NotesWindow window(m_settings);
        QVERIFY(window.OpenNote(path));
        window.close();
    }
    QVERIFY(QFile::remove(path));
    {
        NotesWindow window(m_settings);
        QCOMPARE(recent(window), QStringList(path));
        answer(QMessageBox::Ok);
        QVERIFY(!window.OpenNote(path));
        QCOMPARE(m_boxes, QStringList("Cannot open " + path + ":\nNo such file or directory"));
        QCOMPARE(recent(window), QStringList());
        window.close();
    }
    NotesWindow window(m_settings);
    QCOMPARE(recent(window), QStringList());
}

void tst_Notes::savesText()
{
    NotesWindow window(m_settings);
    const QString path = m_folder->filePath("new.txt");
    text(window)->insertPlainText(QString::fromUtf8("grün\nzwei"));
    QVERIFY(window.isWindowModified());
    QVERIFY(window.SaveNote(path));
    QVERIFY(!window.isWindowModified());
    QCOMPARE(read(path), QByteArray("gr\xc3\xbcn\nzwei"));
    QCOMPARE(recent(window), QStringList(path));
}

void tst_Notes::saveThatFails()
{
    NotesWindow window(m_settings);
    const QString path = m_folder->filePath("missing/new.txt");
    text(window)->insertPlainText("text");
    answer(QMessageBox::Ok);
    QVERIFY(!window.SaveNote(path));
    QCOMPARE(m_boxes, QStringList("Cannot save " + path + ":\nNo such file or directory"));
    QVERIFY(window.isWindowModified());
    QCOMPARE(recent(window), QStringList());
}

void tst_Notes::askedAboutChanges_data()
{
    QTest::addColumn<int>("button");
    QTest::addColumn<bool>("closed");
    QTest::addColumn<QByteArray>("content");

    QTest::newRow("save") << int(QMessageBox::Save) << true << QByteArray("new old");
    QTest::newRow("discard") << int(QMessageBox::Discard) << true << QByteArray("old");
    QTest::newRow("cancel") << int(QMessageBox::Cancel) << false << QByteArray("old");
}

void tst_Notes::askedAboutChanges()
{
    QFETCH(int, button);
    QFETCH(bool, closed);
    QFETCH(QByteArray, content);

    const QString path = note("note.txt", "old");
    NotesWindow window(m_settings);
    window.show();
    QVERIFY(window.OpenNote(path));
    text(window)->insertPlainText("new ");
    answer(QMessageBox::StandardButton(button));
    QCOMPARE(window.close(), closed);
    QCOMPARE(m_boxes, QStringList("Save the changes to this note?"));
    QCOMPARE(read(path), content);
}

void tst_Notes::brokenSettings()
{
    note("notes.cfg", "<VelocorSettings>\n<Notes>\n<color>1,2,3</color>\n");
    answer(QMessageBox::Ok);
    NotesWindow window(m_settings);
    QCOMPARE(m_boxes, QStringList("ConfigFile - Could not parse the input file."));
    QCOMPARE(text(window)->palette().color(QPalette::Text), QColor(1, 2, 3));
}

void tst_Notes::settingsThatCannotBeSaved()
{
    const QString path = m_folder->filePath("missing/notes.cfg");
    NotesWindow window(path);
    answer(QMessageBox::Ok);
    QVERIFY(window.close());
    QCOMPARE(m_boxes, QStringList("Unable to save " + path + ": No such file or directory"));
}

void tst_Notes::program()
{
    const QString path = note("note.txt");
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert("HOME", m_folder->path());
    environment.insert("XDG_DATA_HOME", m_folder->filePath("data"));
    QProcess process;
    process.setProcessEnvironment(environment);
    process.start(NOTES_PROGRAM, {path});

    QDir data(m_folder->filePath("data/Tork/Notes"));
    const QString log = data.filePath("logs/notes.log");
    QTRY_VERIFY_WITH_TIMEOUT(read(log).endsWith(" Notification ready\n"), 60000);
    QVERIFY2(read(log).contains(" Trace opened \"" + path.toUtf8() + "\"\n"), read(log));

    kill(pid_t(process.processId()), SIGTERM);
    QVERIFY(process.waitForFinished(60000));
    QCOMPARE(process.exitStatus(), QProcess::NormalExit);
    QCOMPARE(process.exitCode(), 0);
    const QByteArray settings = read(data.filePath("notes.cfg"));
    QVERIFY2(settings.contains("<recent>" + path.toUtf8() + "|</recent>\n"), settings);
}

QTEST_MAIN(tst_Notes)

#include "tst_Notes.moc"

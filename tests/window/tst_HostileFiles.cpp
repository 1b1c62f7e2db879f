// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Files that are not regular files, and files that are far too large, opened in the window.

#include "ShownSettings.h"
#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/logfile/LogIndex.h"
#include "app/report/ReportReader.h"
#include "app/runninglog/InstanceList.h"
#include "app/settingsfile/SettingsFileReader.h"
#include "app/settingsfile/SettingsFileWriter.h"
#include "app/window/FileTabs.h"
#include "app/window/RecentFiles.h"
#include "app/window/SystemReport.h"
#include "app/window/WindowSettings.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogPanel.h"
#include "app/window/log/LogView.h"
#include "app/window/settings/SettingsEditor.h"
#include "app/window/settings/SettingsTextPage.h"
#include "app/window/settings/ValueDialog.h"
#include "app/window/widgets/NoticeBar.h"

#include <QClipboard>
#include <QDropEvent>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QMessageBox>
#include <QMimeData>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QStatusBar>
#include <QTextBlock>
#include <QTreeView>

#include <atomic>
#include <cerrno>
#include <thread>
#include <utility>

#include <fcntl.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>

using namespace Velocor;
using namespace WindowParts;

namespace {

constexpr int TenMegabytes = 10000000;

// Before the application object, which would look for a session bus and start one: the child gets
// this process' files, and a pipe that it has open looks as if the window had opened it.
const bool NoSessionBus = qputenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent");

// A named pipe that records whether anybody has opened it, and releases whoever did.
class Pipe
{
public:
    explicit Pipe(QString const& path) : m_path(QFile::encodeName(path))
    {
        QFile::remove(path);
        if (mkfifo(m_path.constData(), 0600) != 0)
            qFatal("no pipe");
        m_writer = std::thread([this] { lookForOthers(); });
    }

    ~Pipe()
    {
        m_over = true;
        m_writer.join();
    }

    Pipe(Pipe const&) = delete;
    Pipe& operator=(Pipe const&) = delete;

    bool wasOpened() const { return m_opened; }

private:
    // Readers wait for a writer and writers for a reader: each gets one here, alternately.
    void lookForOthers()
    {
        while (!m_over) {
            const int out = open(m_path.constData(), O_WRONLY | O_NONBLOCK);
            if (out >= 0) {
                m_opened = true;
                close(out);
            }
            const int in = open(m_path.constData(), O_RDONLY | O_NONBLOCK);
            usleep(1000);
            char byte = 0;
            const ssize_t count = in >= 0 ? read(in, &byte, 1) : 0;
            if (count > 0 || (count < 0 && errno == EAGAIN))
                m_opened = true;
            if (in >= 0)
                close(in);
            usleep(1000);
        }
    }

    QByteArray m_path;
    std::atomic<bool> m_over{false};
    std::atomic<bool> m_opened{false};
    std::thread m_writer;
};

bool MakeSocket(QString const& path)
{
    sockaddr_un address = {};
    address.sun_family = AF_UNIX;
    qstrncpy(address.sun_path, QFile::encodeName(path).constData(), sizeof(address.sun_path));
    const int handle = socket(AF_UNIX, SOCK_STREAM, 0);
    const bool bound = bind(handle, reinterpret_cast<sockaddr*>(&address), sizeof(address)) == 0;
    close(handle);
    return bound;
}

void Drop(MainWindow& window, QString const& file)
{
    QMimeData files;
    files.setUrls({QUrl::fromLocalFile(file)});
    QDragEnterEvent enter(QPoint(50, 50), Qt::CopyAction, &files, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(&window, &enter);
    QDropEvent drop(QPoint(50, 50), Qt::CopyAction, &files, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(&window, &drop);
}

QByteArray WithValue(QByteArray const& value, QByteArray const& other = "no")
{
    return "<R>\n<S>\n<long>" + value + "</long>\n<other>" + other + "</other>\n</S>\n</R>\n";
}

// Ten megabytes in which no two pieces are alike.
QByteArray LongValue()
{
    QByteArray value;
    value.reserve(TenMegabytes + 20);
    for (int i = 0; value.size() < TenMegabytes; ++i)
        value += QByteArray::number(i) + ' ';
    value.truncate(TenMegabytes - 1);
    return value + '.';
}

// The longest text that the tree has to measure.
int MaximumCellLength(QTreeView const* tree)
{
    int longest = 0;
    for (int i = 0; i < tree->model()->rowCount(); ++i) {
        longest = qMax(longest, Cell(tree, i).data().toString().size());
        for (int j = 0; j < tree->model()->rowCount(Cell(tree, i)); ++j)
            longest =
                qMax(longest, qMax(CellText(tree, i, j, 0).size(), CellText(tree, i, j, 1).size()));
    }
    return longest;
}

} // namespace

class tst_HostileFiles : public WindowTestCase
{
    Q_OBJECT

private slots:
    void initTestCase() override;

    void isToldAndNotOpened_data();
    void isToldAndNotOpened();
    void becomesAPipe();
    void readersAndWriters();
    void windowSettings_data();
    void windowSettings();
    void windowSettingsAtTheEnd();
    void logIsAPipe();
    void lockIsAPipe();

    void recentFilesAreCapped_data();
    void recentFilesAreCapped();
    void longNamesInTheMenu();
    void recentFilesInTheWindow();

    void tooManyKeysAreShownAsText();
    void hugeFileIsShownAsText();
    void longValueIsShownShortened();
    void longValueSurvivesOtherEdits();
    void longValueIsEdited_data();
    void longValueIsEdited();
    void longValueIsTypedOver();
    void longValueIsPasted();
    void longName();
    void longLoss();
    void valueDialog_data();
    void valueDialog();
    void valueDialogMark_data();
    void valueDialogMark();
    void otherLineBreaks_data();
    void otherLineBreaks();
    void dialogOfOtherLineBreaks_data();
    void dialogOfOtherLineBreaks();
    void valueDialogPastes();
};

void tst_HostileFiles::initTestCase()
{
    QVERIFY(NoSessionBus);
    WindowTestCase::initTestCase();
}

void tst_HostileFiles::isToldAndNotOpened_data()
{
    QTest::addColumn<QString>("kind");
    for (char const* kind : {"pipe", "link to a pipe", "socket", "endless device", "empty device"})
        QTest::newRow(kind) << kind;
}

void tst_HostileFiles::isToldAndNotOpened()
{
    QFETCH(QString, kind);
    const WindowTest test;
    QString file = test.folder() + "file.cfg";
    const std::unique_ptr<Pipe> pipe(kind.contains("pipe") ? new Pipe(test.folder() + "pipe")
                                                           : nullptr);
    if (kind == "pipe")
        file = test.folder() + "pipe";
    else if (kind == "link to a pipe")
        QVERIFY(QFile::link(test.folder() + "pipe", file));
    else if (kind == "socket")
        QVERIFY(MakeSocket(file));
    else
        file = kind == "endless device" ? "/dev/zero" : "/dev/null";

    TestFiles::write(test.settingsFile(), "<VelocorSettings><MainWindow><recentFiles>" +
                                              QFile::encodeName(file) +
                                              "</recentFiles></MainWindow></VelocorSettings>");
    const auto window = WindowTest::show();
    const QString told = file + " is not a regular file";
    const std::function<void()> ways[] = {
        [&] { window->OpenFile(file); },
        [&] { Drop(*window, file); },
        [&] { Action(*window, "Open Recent")->menu()->actions().first()->trigger(); },
    };
    for (auto const& open : ways) {
        window->statusBar()->clearMessage();
        open();
        QCOMPARE(Status(*window), told);
        QCOMPARE(window->findChild<FileTabs*>()->count(), 1);
    }
    QVERIFY(!FileTabs::IsSettingsFile(file));
    if (pipe)
        QVERIFY(!pipe->wasOpened());
}

// The file of an open tab is replaced by a pipe.
void tst_HostileFiles::becomesAPipe()
{
    const WindowTest test;
    const QString log = test.folder() + "other.log";
    QVERIFY(TestFiles::write(log, DemoLog::run(5, QTime(9, 0), "x")));
    LogPanel panel;
    panel.resize(600, 400);
    panel.show();
    panel.Open(log, false);
    QTRY_COMPARE_WITH_TIMEOUT(panel.model()->rowCount(), 5, Patience);
    const Pipe pipe(log);
    QTRY_COMPARE_WITH_TIMEOUT(panel.model()->rowCount(), 0, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(panel.view()->accessibleDescription().endsWith("\nNot a regular file"),
                             Patience);
    QCOMPARE(panel.model()->LineText(0, 100), QString());
    QVERIFY(!pipe.wasOpened());
}

void tst_HostileFiles::readersAndWriters()
{
    const WindowTest test;
    const QString file = test.folder() + "pipe.cfg";
    const Pipe pipe(file);
    const SettingsDocument document = SettingsFileReader::Read(file);
    QVERIFY(!document.isReadable && !document.isParsed);
    QCOMPARE(document.error, QString("Not a regular file"));

    QString error;
    QVERIFY(!SettingsFileWriter::Save(file, SettingsDocument(), &error));
    QCOMPARE(error, QString("Not a regular file"));
    TestFiles::write(file + ".bak", "kept");
    QVERIFY(!SettingsFileWriter::KeepBackup(file, &error));
    QCOMPARE(error, QString("Not a regular file"));
    QCOMPARE(TestFiles::read(file + ".bak"), QByteArray("kept"));
    QVERIFY(!QFileInfo(file).isFile());
    QVERIFY(!pipe.wasOpened());
    QVERIFY(SystemReport::Facts(file).contains(file + " (not a regular file)"));
}

void tst_HostileFiles::windowSettings_data()
{
    QTest::addColumn<bool>("isLink");
    QTest::newRow("pipe") << false;
    QTest::newRow("link to a pipe") << true;
}

void tst_HostileFiles::windowSettings()
{
    QFETCH(bool, isLink);
    const WindowTest test;
    const QString file = isLink ? test.folder() + "pipe" : test.settingsFile();
    const Pipe pipe(file);
    if (isLink)
        QVERIFY(QFile::link(file, test.settingsFile()));
    {
        const auto window = WindowTest::show();
        const QString told = window->findChild<NoticeBar*>()->text();
        QVERIFY2(told.contains("Cannot read the settings file " + test.settingsFile() +
                               " (Not a regular file)"),
                 qPrintable(told));
        window->close();
    }
    QVERIFY(!pipe.wasOpened());
    QVERIFY(QFileInfo::exists(file) && !QFileInfo(file).isFile());

    // What could not be read is not replaced at the end, even by a program that could write it.
    WindowSettings settings(test.folder() + "data/");
    QVERIFY(!settings.Load().isEmpty());
    QCOMPARE(settings.Save(), QString());
}

void tst_HostileFiles::windowSettingsAtTheEnd()
{
    const WindowTest test;
    const auto window = WindowTest::show();
    const Pipe pipe(test.settingsFile());
    window->close();
    QVERIFY(!pipe.wasOpened());
    WindowSettings settings(test.folder() + "data/");
    QCOMPARE(settings.Save(),
             "The settings file " + test.settingsFile() + " is not a regular file");
}

void tst_HostileFiles::logIsAPipe()
{
    const WindowTest test;
    const Pipe pipe(test.logFile());
    QVERIFY(ReportReader::Log(test.logFile()).at(0).text.startsWith("The log is empty.\n"));
    LogPanel panel;
    panel.Open(test.logFile(), true);
    QTRY_VERIFY_WITH_TIMEOUT(panel.view()->accessibleDescription().endsWith("\nNot a regular file"),
                             Patience);
    QVERIFY(!pipe.wasOpened());
}

void tst_HostileFiles::lockIsAPipe()
{
    const WindowTest test;
    const InstanceList list(test.folder() + "running");
    const Pipe pipe(test.folder() + "pipe");
    QVERIFY(QFile::link(test.folder() + "pipe", test.folder() + "running/1.lock"));
    QCOMPARE(list.Others(), QList<qint64>());
    QVERIFY(!pipe.wasOpened());
}

void tst_HostileFiles::recentFilesAreCapped_data()
{
    QTest::addColumn<QString>("list");
    QTest::addColumn<QString>("kept");
    const QString most(RecentFiles::MaximumPathLength, 'x');
    QTest::newRow("nothing") << ""
                             << "";
    QTest::newRow("only separators") << QString(1700000, '|') << "";
    QTest::newRow("many") << QString("/a|").repeated(600000)
                          << "/a" + QString("|/a").repeated(RecentFiles::MaximumFiles - 1);
    QTest::newRow("one long") << QString(1700000, 'x') << "";
    QTest::newRow("as long as may be") << most << most;
    QTest::newRow("too long by one") << most + "x|/b"
                                     << "/b";
    QTest::newRow("after a long one") << "/a|" + QString(1700000, 'x') + "|/b"
                                      << "/a|/b";
}

void tst_HostileFiles::recentFilesAreCapped()
{
    QFETCH(QString, list);
    QMenu menu;
    RecentFiles recent(&menu);
    recent.SetList(list);
    QTEST(recent.list(), "kept");
    recent.SetList("/a");
    recent.Add('/' + QString(RecentFiles::MaximumPathLength, 'x'));
    QCOMPARE(recent.list(), QString("/a"));

    // One that is too long does not push the oldest out of a full list either.
    QStringList full;
    for (int i = 0; i < RecentFiles::MaximumFiles; ++i)
        full.append('/' + QString::number(i));
    recent.SetList(full.join('|'));
    recent.Add('/' + QString(RecentFiles::MaximumPathLength, 'x'));
    QCOMPARE(recent.list(), full.join('|'));
}

void tst_HostileFiles::longNamesInTheMenu()
{
    QMenu menu;
    RecentFiles recent(&menu);
    recent.SetList('/' + QString(3000, 'x') + "|/a\tb&c");
    QVERIFY2(menu.actions().at(0)->text().size() < 130, qPrintable(menu.actions().at(0)->text()));
    QCOMPARE(menu.actions().at(1)->text(), QString("&2 a b&&c"));
}

void tst_HostileFiles::recentFilesInTheWindow()
{
    const WindowTest test;
    TestFiles::write(test.settingsFile(), "<VelocorSettings><MainWindow><recentFiles>" +
                                              QByteArray("/some/file.log|").repeated(113000) +
                                              "</recentFiles></MainWindow></VelocorSettings>");
    {
        const auto window = WindowTest::show();
        QCOMPARE(Action(*window, "Open Recent")->menu()->actions().size(),
                 RecentFiles::MaximumFiles + 2);
        window->close();
    }
    QVERIFY(QFileInfo(test.settingsFile()).size() < 2000);
}

void tst_HostileFiles::tooManyKeysAreShownAsText()
{
    const QByteArray key("<k>1</k>\n");
    const QByteArray content =
        "<R><S>\n" + key.repeated(SettingsFileReader::ShownKeys + 1) + "</S></R>";
    const ShownSettings shown(content);
    SettingsEditor* editor = shown.editor;
    QVERIFY(!editor->ShowsTree());
    auto const* notice = editor->findChild<NoticeBar*>();
    QCOMPARE(notice->text(),
             "Cannot show " + shown.file + " as a tree: It has more than 1,000,000 keys");
    QCOMPARE(
        Child<QLabel>(editor, "State of the text")->text(),
        QString("This file is too large to be shown as settings. Only the start of the file is "
                "shown, and it cannot be edited as text."));
    auto* text = Child<QPlainTextEdit>(editor, "File text");
    QVERIFY(text->isReadOnly() && text->extraSelections().isEmpty());
    QVERIFY(text->toPlainText().startsWith("<R><S>\n<k>1</k>\n"));

    // A part of them as a tree could be saved in place of all.
    QTest::keyClick(text, Qt::Key_T, Qt::ControlModifier);
    editor->ShowAsTree();
    QVERIFY(!editor->ShowsTree());
    QCOMPARE(Status(*shown.window), QString("This file is too large to be shown as settings"));
    QCOMPARE(TestFiles::read(shown.file), content);
}

// With a hole, so it takes no space.
void tst_HostileFiles::hugeFileIsShownAsText()
{
    const QByteArray start = "<R><S>\n<k>1</k>\n" + QByteArray(2000000, ' ');
    const ShownSettings shown;
    SettingsEditor* editor = shown.editor;
    QFile file(shown.file);
    QVERIFY(TestFiles::writeOver(shown.file, start));
    const qint64 size = qint64(5) << 30;
    QVERIFY(file.resize(size));

    // Changed while it is open, then opened.
    Child<QTreeView>(editor, "Settings")->setFocus();
    QString told;
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        told = box->text();
        QTest::keyClick(box, Qt::Key_Escape);
    });
    editor->ShowWhatWillBeWritten();
    QVERIFY2(told.endsWith("It is larger than 128 MiB"), qPrintable(told));
    editor->Reload();
    QVERIFY(!editor->ShowsTree());
    QCOMPARE(editor->findChild<NoticeBar*>()->text(),
             "Cannot show " + shown.file + " as a tree: It is larger than 128 MiB");
    auto* text = Child<QPlainTextEdit>(editor, "File text");
    QVERIFY(text->isReadOnly());
    QCOMPARE(text->document()->characterCount(), SettingsTextPage::EditLimit + 1);
    QTest::keyClick(text, Qt::Key_T, Qt::ControlModifier);
    editor->ShowAsTree();
    QVERIFY(!editor->ShowsTree() && !editor->isModified());
    QCOMPARE(QFileInfo(shown.file).size(), size);
    QCOMPARE(Status(*shown.window), QString("This file is too large to be shown as settings"));
}

void tst_HostileFiles::longValueIsShownShortened()
{
    const WindowTest test;
    const QByteArray value = LongValue();
    const QString file = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(file, WithValue(value)));
    SettingsEditor editor;
    editor.Open(file);
    editor.resize(700, 500);
    editor.show();
    auto* tree = editor.findChild<QTreeView*>();
    const QString shown = CellText(tree, 0, 0, 1);
    QVERIFY2(shown.startsWith("0 1 2 3 ") && shown.endsWith(QChar(0x2026) + QString(" (10 MB)")),
             qPrintable(shown.left(300)));
    QVERIFY(MaximumCellLength(tree) <= 1000);
    QCOMPARE(editor.document().Value("S", "long", ""), QString::fromLatin1(value));
    QVERIFY(!editor.isModified());
}

void tst_HostileFiles::longValueSurvivesOtherEdits()
{
    const QByteArray value = LongValue();
    const ShownSettings shown(WithValue(value));
    QTreeView* tree = shown.tree;

    // The long value is opened.
    tree->setFocus();
    GoTo(tree, ItemCell(tree, 0, 0, 1));
    QString looked;
    WindowTest::whenShown<QDialog>([&](QDialog* dialog) {
        looked = dialog->findChild<QLabel*>()->text();
        QTest::keyClick(dialog, Qt::Key_Escape);
    });
    QTest::keyClick(tree, Qt::Key_F2);
    QTRY_VERIFY_WITH_TIMEOUT(!looked.isEmpty(), Patience);
    QVERIFY2(looked.startsWith("S / long (10 MB)\n"), qPrintable(looked));
    QTRY_VERIFY_WITH_TIMEOUT(!QApplication::activeModalWidget(), Patience);
    QVERIFY(!shown.editor->isModified());

    // Its key gets another name, and another value is changed.
    TypeInto(tree, ItemCell(tree, 0, 0, 0), "renamed");
    Enter(tree);
    TypeInto(tree, ItemCell(tree, 0, 1, 1), "yes");
    Enter(tree);
    QVERIFY(WindowTest::activate(shown.window.get()));
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QVERIFY(!shown.editor->isModified());
    const QByteArray expected = WithValue(value, "yes").replace("long>", "renamed>");
    QVERIFY(TestFiles::read(shown.file) == expected);
    QVERIFY(MaximumCellLength(tree) <= 1000);
}

void tst_HostileFiles::longValueIsEdited_data()
{
    QTest::addColumn<QString>("way");
    for (char const* way : {"F2", "Enter", "double click"})
        QTest::newRow(way) << way;
}

void tst_HostileFiles::longValueIsEdited()
{
    QFETCH(QString, way);
    const QByteArray value = LongValue();
    const ShownSettings shown(WithValue(value));
    QTreeView* tree = shown.tree;
    tree->setFocus();
    const QModelIndex item = ItemCell(tree, 0, 0, 1);
    GoTo(tree, item);

    int dialogs = 0;
    WindowTest::whenShown<QDialog>([&](QDialog* dialog) {
        ++dialogs;
        auto* text = dialog->findChild<QPlainTextEdit*>();
        text->setFocus();
        QTest::keyClick(text, Qt::Key_End, Qt::ControlModifier);
        QTest::keyClicks(text, "end");
        QTest::keyClick(dialog, Qt::Key_Tab); // leaves the text, for OK
        QTest::keyClick(dialog->focusWidget(), Qt::Key_Return);
    });
    if (way == "F2")
        QTest::keyClick(tree, Qt::Key_F2);
    else if (way == "Enter")
        QTest::keyClick(tree, Qt::Key_Return);
    else {
        const QPoint place = tree->visualRect(item).center();
        const QPoint cell(tree->columnViewportPosition(1) + 20, place.y());
        QTest::mouseClick(tree->viewport(), Qt::LeftButton, Qt::NoModifier, cell);
        QTest::mouseDClick(tree->viewport(), Qt::LeftButton, Qt::NoModifier, cell);
    }
    QTRY_COMPARE_WITH_TIMEOUT(dialogs, 1, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(shown.editor->isModified(), Patience);
    QTRY_VERIFY_WITH_TIMEOUT(!QApplication::activeModalWidget(), Patience);
    QVERIFY(MaximumCellLength(tree) <= 1000);
    QVERIFY(WindowTest::activate(shown.window.get()));
    QTest::keyClick(shown.window.get(), Qt::Key_S, Qt::ControlModifier);
    QVERIFY(TestFiles::read(shown.file) == WithValue(value + "end"));
}

// A long value can become short; its cell is then edited like any other.
void tst_HostileFiles::longValueIsTypedOver()
{
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(file, WithValue(LongValue())));
    SettingsEditor editor;
    editor.Open(file);
    editor.resize(700, 500);
    editor.show();
    auto* tree = editor.findChild<QTreeView*>();
    tree->setFocus();
    GoTo(tree, ItemCell(tree, 0, 0, 1));
    WindowTest::whenShown<QDialog>([&](QDialog* dialog) {
        auto* text = dialog->findChild<QPlainTextEdit*>();
        text->setFocus();
        QTest::keyClick(text, Qt::Key_A, Qt::ControlModifier);
        QTest::keyClicks(text, "short");
        QTest::keyClick(dialog, Qt::Key_Tab);
        QTest::keyClick(dialog->focusWidget(), Qt::Key_Return);
    });
    QTest::keyClick(tree, Qt::Key_F2);
    QTRY_COMPARE_WITH_TIMEOUT(CellText(tree, 0, 0, 1), QString("short"), Patience);
    QTest::keyClick(tree, Qt::Key_F2);
    QTRY_VERIFY_WITH_TIMEOUT(tree->findChild<QLineEdit*>(), Patience);
    QTest::keyClicks(tree->findChild<QLineEdit*>(), "shorter");
    QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Return);
    QTRY_COMPARE_WITH_TIMEOUT(editor.document().Value("S", "long", ""), QString("shorter"),
                              Patience);
    QVERIFY(editor.Save());
    QCOMPARE(TestFiles::read(file), WithValue("shorter"));
}

void tst_HostileFiles::longValueIsPasted()
{
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(file, WithValue("v")));
    SettingsEditor editor;
    editor.Open(file);
    editor.show();
    auto* tree = editor.findChild<QTreeView*>();
    const QString pasted = QString("p").repeated(5000);
    SetValue(tree, 0, pasted);
    QVERIFY(MaximumCellLength(tree) <= 1000);
    QCOMPARE(editor.document().Value("S", "long", ""), pasted);
    QVERIFY(editor.Save());
    QCOMPARE(TestFiles::read(file), WithValue(pasted.toLatin1()));
}

void tst_HostileFiles::longName()
{
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    const QByteArray name(1000000, 'n');
    const QByteArray content =
        "<R>\n<" + name + ">\n<" + name + ">v</" + name + ">\n</" + name + ">\n</R>\n";
    QVERIFY(TestFiles::write(file, content));
    SettingsEditor editor;
    editor.Open(file);
    editor.resize(700, 500);
    editor.show();
    auto* tree = editor.findChild<QTreeView*>();
    QVERIFY(MaximumCellLength(tree) <= 1000);
    GoTo(tree, ItemCell(tree, 0, 0, 0));
    tree->setFocus();
    QTest::keyClick(tree, Qt::Key_F2, Qt::ShiftModifier);
    QTest::qWait(50);
    QVERIFY(!tree->findChild<QLineEdit*>() && !QApplication::activeModalWidget());
    SetValue(tree, 0, "w");
    QVERIFY(editor.Save());
    QVERIFY(TestFiles::read(file) == QByteArray(content).replace(">v<", ">w<"));
}

void tst_HostileFiles::longLoss()
{
    const WindowTest test;
    const QString file = test.folder() + "some.cfg";
    QVERIFY(TestFiles::write(file, "<R><S " + QByteArray(1000000, 'a') + "='1'><k>v</k></S></R>"));
    SettingsEditor editor;
    editor.Open(file);
    editor.show();
    SetValue(editor.findChild<QTreeView*>(), 0, "w");
    int length = -1;
    WindowTest::whenShown<QMessageBox>([&](QMessageBox* box) {
        length = box->informativeText().size();
        QTest::keyClick(box, Qt::Key_Escape);
    });
    QVERIFY(!editor.Save());
    QVERIFY2(length > 0 && length < 400, qPrintable(QString::number(length)));
}

void tst_HostileFiles::valueDialog_data()
{
    QTest::addColumn<QString>("value");
    QTest::addColumn<bool>("inPieces");
    const QString longLine(Velocor::ValueDialog::MaximumLineLength + 1, 'x');
    QTest::newRow("empty") << "" << false;
    QTest::newRow("lines") << "a\nb\n\nc\n" << false;
    QTest::newRow("no-break space") << QString("a") + QChar(0xa0) + "b" << false;
    QTest::newRow("just short enough") << longLine.mid(1) + '\n' + longLine.mid(1) << false;
    QTest::newRow("long line") << longLine << true;
    QTest::newRow("long line among others") << "a\n\n" + longLine + "\nb\n" << true;
    QTest::newRow("the sign itself") << longLine + QChar(0x2424) + '\n' + QChar(0x21b5) << true;
    QTest::newRow("pairs of surrogates")
        << QString::fromUtf8("\xF0\x9F\x98\x80").repeated(6000) + "\nx" << true;
    QTest::newRow("pairs of surrogates at odd places")
        << 'a' + QString::fromUtf8("\xF0\x9F\x98\x80").repeated(6000) + "\nx" << true;
}

void tst_HostileFiles::valueDialog()
{
    QFETCH(QString, value);
    QFETCH(bool, inPieces);
    Velocor::ValueDialog dialog("name", value);
    dialog.show();
    QVERIFY(!dialog.isModified());
    QVERIFY(dialog.value() == value);
    QCOMPARE(dialog.findChild<QLabel*>()->text().contains('\n'), inPieces);
    auto* text = dialog.findChild<QPlainTextEdit*>();
    for (QTextBlock block = text->document()->begin(); block.isValid(); block = block.next())
        QVERIFY(block.text().isEmpty() || !block.text().at(0).isLowSurrogate());
    QTest::keyClick(text, Qt::Key_Home, Qt::ControlModifier);
    QTest::keyClicks(text, "a");
    QTest::keyClick(text, Qt::Key_Return);
    QVERIFY(dialog.isModified());
    QVERIFY(dialog.value() == "a\n" + value);
    for (QTextBlock block = text->document()->begin(); block.isValid(); block = block.next())
        QVERIFY(block.length() <= Velocor::ValueDialog::MaximumLineLength + 1);
}

void tst_HostileFiles::valueDialogMark_data()
{
    QTest::addColumn<QString>("start");
    QTest::addColumn<QString>("mark");

    const auto row = [](char const* name, char const* start, char const* mark) {
        QTest::newRow(name) << QString::fromUtf8(start) << QString::fromUtf8(mark);
    };
    row("usual", "", "\xE2\x86\xB5");
    row("value with the usual one", "\xE2\x86\xB5", "\xC2\xB6");
}

// Symbols that are in usual fonts, unlike the one called "symbol for newline".
void tst_HostileFiles::valueDialogMark()
{
    QFETCH(QString, start);
    QFETCH(QString, mark);
    const QString value =
        start + QString(Velocor::ValueDialog::MaximumLineLength + 1, 'x') + "\nend";
    Velocor::ValueDialog dialog("name", value);
    QVERIFY(dialog.findChild<QPlainTextEdit*>()->toPlainText().endsWith(mark + "\nend"));
    const QString heading = dialog.findChild<QLabel*>()->text();
    QVERIFY2(heading.contains("only " + mark + " marks"), qPrintable(heading));
}

void tst_HostileFiles::otherLineBreaks_data()
{
    QTest::addColumn<QString>("lineBreak");
    QTest::addColumn<int>("length");
    QTest::addColumn<bool>("inDialog");

    const std::pair<char const*, QString> breaks[] = {
        {"CR", "\r"},
        {"CRLF", "\r\n"},
        {"U+2028", QChar(QChar::LineSeparator)},
        {"U+2029", QChar(QChar::ParagraphSeparator)},
    };
    for (auto const& lineBreak : breaks) {
        const auto row = [&](char const* where, int length, bool inDialog) {
            QTest::addRow("%s in %s", lineBreak.first, where)
                << lineBreak.second << length << inDialog;
        };
        row("a short value", 1, false);
        row("a value of many lines", 1001, true);
        row("a long line", Velocor::ValueDialog::MaximumLineLength + 1, true);
    }
}

// Qt's text widget takes each of these for a line feed, so what it shows cannot be edited. A short
// value is edited in its cell, which keeps them.
void tst_HostileFiles::otherLineBreaks()
{
    QFETCH(QString, lineBreak);
    QFETCH(int, length);
    QFETCH(bool, inDialog);
    const WindowTest test;
    const QString value = QString(length, 'x') + lineBreak + 'b';
    const QString file = test.folder() + "some.cfg";
    const QByteArray content = WithValue(value.toUtf8());
    QVERIFY(TestFiles::write(file, content));
    SettingsEditor editor;
    editor.Open(file);
    editor.resize(700, 500);
    editor.show();
    const auto stored = [&] {
        return editor.document().Value("S", "long", "");
    };
    QVERIFY(stored() == value);

    auto* tree = editor.findChild<QTreeView*>();
    tree->setFocus();
    GoTo(tree, ItemCell(tree, 0, 0, 1));
    int shown = 0;
    if (inDialog) {
        WindowTest::whenShown<QDialog>([&](QDialog* dialog) {
            auto* text = dialog->findChild<QPlainTextEdit*>();
            const QString label = dialog->findChild<QLabel*>()->text();
            QVERIFY2(label.contains("it cannot be edited here"), qPrintable(label));
            QVERIFY(text->isReadOnly());
            QGuiApplication::clipboard()->setText("pasted");
            text->setFocus();
            QTest::keyClick(text, Qt::Key_A, Qt::ControlModifier);
            QTest::keyClicks(text, "z");
            for (Qt::Key key : {Qt::Key_Return, Qt::Key_Backspace, Qt::Key_Delete})
                QTest::keyClick(text, key);
            for (Qt::Key key : {Qt::Key_V, Qt::Key_X})
                QTest::keyClick(text, key, Qt::ControlModifier);
            if (dialog->isVisible()) { // unless Enter went on to OK
                QTest::keyClick(dialog, Qt::Key_Tab);
                QTest::keyClick(dialog->focusWidget(), Qt::Key_Return);
            }
            ++shown;
        });
        QTest::keyClick(tree, Qt::Key_F2);
        QTRY_COMPARE_WITH_TIMEOUT(shown, 1, Patience);
        QTRY_VERIFY_WITH_TIMEOUT(!QApplication::activeModalWidget(), Patience);
    } else {
        QTest::keyClick(tree, Qt::Key_F2);
        QTRY_VERIFY_WITH_TIMEOUT(tree->findChild<QLineEdit*>(), Patience);
        QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Return);
        QTRY_VERIFY_WITH_TIMEOUT(!tree->findChild<QLineEdit*>(), Patience);
    }
    QTest::qWait(50);
    QVERIFY(stored() == value);
    QVERIFY(!editor.isModified());
    QVERIFY(TestFiles::read(file) == content);

    if (!inDialog) {
        QTest::keyClick(tree, Qt::Key_F2);
        QTRY_VERIFY_WITH_TIMEOUT(tree->findChild<QLineEdit*>(), Patience);
        QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_End);
        QTest::keyClicks(tree->findChild<QLineEdit*>(), "!");
        QTest::keyClick(tree->findChild<QLineEdit*>(), Qt::Key_Return);
        QTRY_VERIFY_WITH_TIMEOUT(stored() == value + '!', Patience);
    }
}

void tst_HostileFiles::dialogOfOtherLineBreaks_data()
{
    QTest::addColumn<QString>("value");
    QTest::addColumn<bool>("isReadOnly");

    QTest::newRow("empty") << "" << false;
    QTest::newRow("line feed") << "a\nb" << false;
    QTest::newRow("CR alone") << "\r" << true;
    QTest::newRow("CR at the end") << "a\r" << true;
    QTest::newRow("CRLF") << "a\r\nb" << true;
    QTest::newRow("U+2028") << QString("a") + QChar(QChar::LineSeparator) << true;
    QTest::newRow("U+2029") << QChar(QChar::ParagraphSeparator) + QString("a") << true;
    QTest::newRow("next line") << QString("a") + QChar(0x85) + 'b' << false;
    QTest::newRow("form feed") << "a\fb" << false;
}

// What a widget turns into something else is never returned.
void tst_HostileFiles::dialogOfOtherLineBreaks()
{
    QFETCH(QString, value);
    QFETCH(bool, isReadOnly);
    for (QString const& start : {QString(), QString(ValueDialog::MaximumLineLength + 1, 'x')}) {
        Velocor::ValueDialog dialog("name", start + value);
        dialog.show();
        auto* text = dialog.findChild<QPlainTextEdit*>();
        QCOMPARE(text->isReadOnly(), isReadOnly);
        QVERIFY(!dialog.isModified());
        QVERIFY(dialog.value() == start + value);
        QTest::keyClick(text, Qt::Key_Home, Qt::ControlModifier);
        QTest::keyClicks(text, "z");
        QCOMPARE(dialog.isModified(), !isReadOnly);
        QVERIFY(dialog.value() == (isReadOnly ? QString() : QString("z")) + start + value);
    }
}

void tst_HostileFiles::valueDialogPastes()
{
    const QString value(Velocor::ValueDialog::MaximumLineLength + 1, 'x');
    const QString pasted = QString("p").repeated(20000) + "\nq";
    Velocor::ValueDialog dialog("name", value);
    dialog.show();
    QGuiApplication::clipboard()->setText(pasted);
    auto* text = dialog.findChild<QPlainTextEdit*>();
    QTest::keyClick(text, Qt::Key_End, Qt::ControlModifier);
    QTest::keyClick(text, Qt::Key_V, Qt::ControlModifier);
    QVERIFY(dialog.value() == value + pasted);
}

QTEST_MAIN(tst_HostileFiles)
#include "tst_HostileFiles.moc"

// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Nothing from a file, a path or a log line is interpreted as rich text: every part of the window
// is checked with names and contents that look like markup.

#include "WindowParts.h"
#include "WindowTestCase.h"

#include "app/runninglog/LogPreferences.h"
#include "app/window/FileTabs.h"
#include "app/window/PlacesPanel.h"
#include "app/window/ProblemReportDialog.h"
#include "app/window/ReportDialog.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogPanel.h"
#include "app/window/log/LogSettingsDialog.h"
#include "app/window/log/LogView.h"
#include "app/window/settings/SettingsEditor.h"
#include "app/window/settings/ValueDialog.h"
#include "app/window/widgets/NoticeBar.h"
#include "app/window/widgets/PlainText.h"

#include <QAbstractItemView>
#include <QComboBox>
#include <QDialogButtonBox>
#include <QFileDialog>
#include <QHelpEvent>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QMessageBox>
#include <QPushButton>
#include <QStatusBar>
#include <QTabBar>
#include <QTextBlock>
#include <QTextDocument>
#include <QToolTip>
#include <QTreeView>

#include <random>

using namespace Velocor;
using namespace WindowParts;

using Velocor::PlainToolTip;

namespace {

// What a widget that guesses the format shows for a text.
QString Displayed(QString const& text)
{
    if (!Qt::mightBeRichText(text))
        return text;
    QTextDocument document;
    document.setHtml(text);
    return document.toPlainText();
}

bool HasMarkup(QString const& text)
{
    if (!Qt::mightBeRichText(text))
        return false;
    QTextDocument document;
    document.setHtml(text);
    for (QTextBlock block = document.begin(); block.isValid(); block = block.next()) {
        for (auto part = block.begin(); !part.atEnd(); ++part) {
            const QTextCharFormat format = part.fragment().charFormat();
            if (format.isImageFormat() || format.isAnchor() ||
                format.fontWeight() > QFont::Normal || format.isTableFormat())
                return true;
        }
    }
    return false;
}

QString Where(QObject const* object)
{
    QStringList names;
    for (; object; object = object->parent())
        names.prepend(object->metaObject()->className());
    return names.join('/');
}

void CheckTip(QString const& tip, QString const& where, QStringList& breaches)
{
    if (HasMarkup(tip))
        breaches.append(where + " has the tool tip " + tip);
}

void CheckModel(QAbstractItemView const* view, QStringList& breaches)
{
    QAbstractItemModel const* model = view->model();
    if (!model || view->inherits("QSidebar"))
        return;
    const std::function<void(QModelIndex const&)> walk = [&](QModelIndex const& parent) {
        for (int row = 0; row < qMin(model->rowCount(parent), 100); ++row) {
            for (int column = 0; column < model->columnCount(parent); ++column) {
                const QModelIndex index = model->index(row, column, parent);
                for (int role : {Qt::ToolTipRole, Qt::WhatsThisRole})
                    CheckTip(index.data(role).toString(), Where(view), breaches);
            }
            walk(model->index(row, 0, parent));
        }
    };
    walk(QModelIndex());
}

// Everything below a window that could interpret a text as rich text.
QStringList Breaches(QWidget* top)
{
    QStringList breaches;
    const QList<QWidget*> widgets = top->findChildren<QWidget*>() << top;
    for (QWidget* widget : widgets) {
        auto const* label = qobject_cast<QLabel const*>(widget);
        if (label && !label->inherits("QTipLabel") && label->textFormat() != Qt::PlainText)
            breaches.append(Where(label) + " guesses the format of \"" + label->text() + "\"");
        CheckTip(widget->toolTip(), Where(widget), breaches);
        CheckTip(widget->whatsThis(), Where(widget), breaches);
        const QList<QAction*> actions = widget->actions();
        for (QAction const* action : actions)
            CheckTip(action->toolTip(), Where(action), breaches);
        if (auto const* view = qobject_cast<QAbstractItemView const*>(widget))
            CheckModel(view, breaches);
        if (auto* box = qobject_cast<QComboBox*>(widget))
            CheckModel(box->view(), breaches);
        if (auto const* bar = qobject_cast<QTabBar const*>(widget)) {
            for (int i = 0; i < bar->count(); ++i)
                CheckTip(bar->tabToolTip(i), Where(bar), breaches);
        }
    }
    return breaches;
}

void Hover(QWidget* widget, QPoint const& place)
{
    QToolTip::hideText();
    QHelpEvent help(QEvent::ToolTip, place, widget->mapToGlobal(place));
    QCoreApplication::sendEvent(widget, &help);
}

QString NameOf(QString const& markup, QString const& end)
{
    return markup + end;
}

void ClickNamed(QWidget* window, QString const& text)
{
    const QList<QPushButton*> buttons = window->findChildren<QPushButton*>();
    for (QPushButton* button : buttons) {
        if (button->text().remove('&') == text) {
            Click(button);
            return;
        }
    }
    QFAIL(qPrintable("no button " + text));
}

// A program whose names, folders, log and settings all contain markup.
class HostilePlace
{
public:
    explicit HostilePlace(QString const& markup)
        : folder(m_test.folder() + markup + "/"), settings(folder + NameOf(markup, ".cfg")),
          log(folder + NameOf(markup, ".log"))
    {
        for (char const* name : {"RootPath", "DataPath", "DocPath"})
            qApp->setProperty(name, folder);
        QCoreApplication::setOrganizationName(markup);
        QCoreApplication::setApplicationName(markup);
        QDir().mkpath(folder);
        TorkLog::shutdown();
        TorkLog::initialize(folder + "logs/", "app", QString(), true);
        const QByteArray lines = DemoLog::entry("09:00:00.000", "Warning", markup) +
                                 DemoLog::entry("09:00:01.000", "Error", markup + " again");
        TestFiles::write(folder + "logs/app.log", lines);
        TestFiles::write(log, lines);
        TestFiles::write(log + ".1", lines);
        TestFiles::write(settings, "<R><!-- " + markup.toLatin1() + " --><S><k a='&lt;img&gt;'>" +
                                       "<![CDATA[" + markup.toLatin1() + "]]></k></S></R>\n");
    }

private:
    WindowTest m_test;

public:
    const QString folder;
    const QString settings;
    const QString log;
};

// Inspects the next box and answers it with a key.
void LookAtNextBox(QStringList* seen, QString* text, Qt::Key answer = Qt::Key_Escape)
{
    WindowTest::whenShown<QMessageBox>([=](QMessageBox* box) {
        *seen = Breaches(box);
        *text = box->text() + "\n" + box->informativeText();
        QTest::keyClick(box, answer);
    });
}

} // namespace

class tst_PlainTextOnly : public WindowTestCase
{
    Q_OBJECT

private slots:
    void cleanup() override;

    void toolTips_data();
    void toolTips();
    void anyToolTip();
    void shortened_data();
    void shortened();

    void window_data() { markup(); }
    void window();
    void shownToolTips_data() { markup(); }
    void shownToolTips();
    void statusText_data() { markup(); }
    void statusText();
    void recentFiles_data() { markup(); }
    void recentFiles();
    void dialogs_data() { markup(); }
    void dialogs();
    void lossBox_data() { markup(); }
    void lossBox();
    void boxesOfTheEditor_data() { markup(); }
    void boxesOfTheEditor();
    void boxAboutAMissingFile_data() { markup(); }
    void boxAboutAMissingFile();
    void boxOfTheLogSettings_data() { markup(); }
    void boxOfTheLogSettings();
    void boxOfTheFileDialog_data() { markup(); }
    void boxOfTheFileDialog();
    void notices_data() { markup(); }
    void notices();

private:
    static void markup();
};

void tst_PlainTextOnly::cleanup()
{
    QToolTip::hideText();
    WindowTestCase::cleanup();
}

void tst_PlainTextOnly::markup()
{
    QTest::addColumn<QString>("markup");
    QTest::newRow("an image") << "<img src='no such file'>";
    QTest::newRow("a link") << "<a href='file:nowhere'>click";
    QTest::newRow("bold") << "<b>bold";
    QTest::newRow("an entity") << "x &lt;b&gt;";
    QTest::newRow("an entity twice over") << "x &amp;lt; &amp;";
}

void tst_PlainTextOnly::toolTips_data()
{
    QTest::addColumn<QString>("text");
    QTest::newRow("empty") << "";
    QTest::newRow("plain") << "/home/ada/notes.cfg";
    QTest::newRow("blanks") << "<b>a   b";
    QTest::newRow("lines") << "<b>a\nb\n  c";
    QTest::newRow("image") << "/home/<img src=file:/dev/zero>/x";
    QTest::newRow("entity") << "a &lt; b";
    QTest::newRow("ampersand") << "a & b &amp; c <b>";
    QTest::newRow("escaped twice") << "a &amp;lt; b";
    QTest::newRow("long") << QString("word ").repeated(100).trimmed();
    QTest::newRow("declaration") << "<?xml version='1.0'?><b>";
    QTest::newRow("document type") << "<!DOCTYPE html>x";
    QTest::newRow("quotes") << "<b a=\"1\" c='2'>";
}

void tst_PlainTextOnly::toolTips()
{
    QFETCH(QString, text);
    const QString tip = PlainToolTip(text);
    QCOMPARE(Displayed(tip), text);
    QVERIFY(!HasMarkup(tip));
    if (text.size() < 120 && !Qt::mightBeRichText(text))
        QCOMPARE(tip, text);
}

void tst_PlainTextOnly::anyToolTip()
{
    const QStringList pieces = {"<", ">",   "&",    "lt;", "amp;",    "b",     "img",   "a",
                                " ", "\n",  "/",    "\"",  "=",       "<?xml", "<!doc", "?>",
                                "x", "<b>", "</p>", "<p>", "<table>", "#60;",  "&quot;"};
    std::mt19937 random(11);
    for (int i = 0; i < 20000; ++i) {
        QString text = "x"; // leading and trailing white space is up to the layout
        const int count = static_cast<int>(random() % 12);
        for (int j = 0; j < count; ++j)
            text = pieces.at(static_cast<int>(random() % pieces.size())) + text;
        text = text.trimmed();
        QCOMPARE(Displayed(PlainToolTip(text)), text);
    }
}

void tst_PlainTextOnly::shortened_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("expected");
    const QString more = QString(QChar(0x2026));
    QTest::newRow("short") << "abcd"
                           << "abcd";
    QTest::newRow("long") << "abcdef"
                          << "abcd" + more + " (6 bytes)";
    QTest::newRow("bytes, not characters")
        << QString::fromUtf8("abcd\xE2\x82\xAC") << "abcd" + more + " (7 bytes)";
    QTest::newRow("megabytes") << QString(2500000, 'x') << "xxxx" + more + " (2.5 MB)";
    QTest::newRow("pair of surrogates is not cut")
        << QString::fromUtf8("abc\xF0\x9F\x98\x80") << "abc" + more + " (7 bytes)";
}

void tst_PlainTextOnly::shortened()
{
    QFETCH(QString, text);
    QTEST(Velocor::Shortened(text, 4), "expected");
}

void tst_PlainTextOnly::window()
{
    QFETCH(QString, markup);
    const HostilePlace place(markup);
    const auto window = WindowTest::show();
    window->OpenFile(place.log);
    auto* tabs = window->findChild<FileTabs*>();
    auto* files = tabs->currentLog()->findChild<QComboBox*>();
    files->showPopup(); // populated on demand
    files->hidePopup();
    QCOMPARE(files->count(), 4); // the last two are all of them and the whole family
    QTRY_COMPARE_WITH_TIMEOUT(tabs->currentLog()->model()->rowCount(), 2, Patience);
    window->OpenFile(place.settings);
    QCOMPARE(Breaches(window.get()).join('\n'), QString());

    // The names are shown, and unchanged.
    QStringList texts;
    const QList<QLabel*> labels = window->findChildren<QLabel*>();
    for (QLabel const* label : labels)
        texts.append(label->text());
    QVERIFY2(texts.contains(place.settings), qPrintable(texts.join('\n')));
    QCOMPARE(tabs->tabText(1).replace("&&", "&"), markup + ".log");
    QCOMPARE(tabs->widget(1)->accessibleName(), markup + ".log");
    QCOMPARE(tabs->widget(2)->accessibleName(), markup + ".cfg");
    auto const* tree = tabs->currentEditor()->findChild<QTreeView*>();
    QCOMPARE(CellText(tree, 0, 0, 1), markup);
}

// What Qt really shows when the mouse hovers.
void tst_PlainTextOnly::shownToolTips()
{
    QFETCH(QString, markup);
    const HostilePlace place(markup);
    const auto window = WindowTest::show();
    window->OpenFile(place.log);
    window->OpenFile(place.settings);
    auto* tabs = window->findChild<FileTabs*>();

    Hover(tabs->tabBar(), tabs->tabBar()->tabRect(1).center());
    QCOMPARE(Displayed(QToolTip::text()), place.log);
    Hover(tabs->tabBar(), tabs->tabBar()->tabRect(2).center());
    QCOMPARE(Displayed(QToolTip::text()), place.settings);
    QVERIFY(!HasMarkup(QToolTip::text()));

    tabs->setCurrentIndex(1);
    auto* files = tabs->currentLog()->findChild<QComboBox*>();
    Hover(files, files->rect().center());
    QCOMPARE(Displayed(QToolTip::text()), place.log);
    QCOMPARE(files->accessibleDescription(), place.log);
    auto* view = tabs->currentLog()->view();
    QTRY_COMPARE_WITH_TIMEOUT(view->model()->rowCount(), 2, Patience);
    QTRY_VERIFY_WITH_TIMEOUT(
        view->visualRect(view->model()->index(0, LogModel::MessageColumn)).isValid(), Patience);
    Hover(view->viewport(),
          view->visualRect(view->model()->index(0, LogModel::MessageColumn)).center());
    QCOMPARE(Displayed(QToolTip::text()), markup);
    QVERIFY(!HasMarkup(QToolTip::text()));

    QTest::keyClick(window.get(), Qt::Key_F9);
    const QList<QLabel*> fields = window->findChild<PlacesPanel*>()->findChildren<QLabel*>();
    int places = 0;
    for (QLabel* field : fields) {
        if (!field->text().startsWith(place.folder))
            continue;
        Hover(field, field->rect().center());
        QCOMPARE(Displayed(QToolTip::text()), field->text());
        QCOMPARE(field->accessibleDescription(), field->text());
        ++places;
    }
    QCOMPARE(places, 5);
}

void tst_PlainTextOnly::statusText()
{
    QFETCH(QString, markup);
    const HostilePlace place(markup);
    const auto window = WindowTest::show();
    window->OpenFile(place.folder);
    QCOMPARE(Status(*window), QFileInfo(place.folder).absoluteFilePath() + " is a folder");
    QCOMPARE(Breaches(window->statusBar()).join('\n'), QString());

    QFile::remove(place.folder + "logs/app.log");
    QDir().mkpath(place.folder + "logs/app.log");
    TorkLog::logger()->trace("lost");
    QTRY_VERIFY_WITH_TIMEOUT(
        [&] {
            const QList<QLabel*> labels = window->findChildren<QLabel*>();
            return std::any_of(labels.begin(), labels.end(), [](QLabel const* label) {
                return label->isVisible() && label->text().startsWith("Cannot write the log");
            });
        }(),
        Patience);
    QCOMPARE(Breaches(window.get()).join('\n'), QString());
}

void tst_PlainTextOnly::recentFiles()
{
    QFETCH(QString, markup);
    const HostilePlace place(markup);
    const auto window = WindowTest::show();
    window->OpenFile(place.log);
    QMenu* menu = Action(*window, "Open Recent")->menu();
    QAction const* action = menu->actions().first();
    QCOMPARE(Displayed(action->toolTip()), place.log);
    QVERIFY(!HasMarkup(action->toolTip()));
    QCOMPARE(action->statusTip(), place.log);
    QCOMPARE(QString(action->text()).replace("&&", "\x01").remove('&').replace('\x01', "&"),
             "1 " + markup + ".log");
}

void tst_PlainTextOnly::dialogs()
{
    QFETCH(QString, markup);
    const HostilePlace place(markup);
    LogSettingsDialog settings;
    QCOMPARE(Breaches(&settings).join('\n'), QString());
    ReportDialog text(markup, markup, markup);
    QCOMPARE(Breaches(&text).join('\n'), QString());
    Redactor redactor;
    redactor.SetWords({markup});
    ProblemReportDialog report({{markup, markup, {{markup, markup}}}}, redactor);
    QCOMPARE(Breaches(&report).join('\n'), QString());
    Velocor::ValueDialog value(markup, markup);
    QCOMPARE(Breaches(&value).join('\n'), QString());
}

void tst_PlainTextOnly::lossBox()
{
    QFETCH(QString, markup);
    const HostilePlace place(markup);
    const auto window = WindowTest::show();
    window->OpenFile(place.settings);
    auto* tree = window->findChild<FileTabs*>()->currentEditor()->findChild<QTreeView*>();
    SetValue(tree, 0, "changed");

    QStringList breaches("no box");
    QString text;
    LookAtNextBox(&breaches, &text);
    QTest::keyClick(window.get(), Qt::Key_S, Qt::ControlModifier);
    QCOMPARE(breaches.join('\n'), QString());
    QVERIFY2(text.contains("the comment \"" + markup.left(20)), qPrintable(text));
    QVERIFY2(text.contains(markup + ".cfg would lose:"), qPrintable(text));

    // The window asks before it closes.
    breaches = QStringList("no box");
    LookAtNextBox(&breaches, &text);
    QVERIFY(!window->close());
    QCOMPARE(breaches.join('\n'), QString());
    QCOMPARE(text, "Save changes to " + markup + ".cfg?\n");
    QVERIFY(window->findChild<FileTabs*>()->currentEditor());
}

void tst_PlainTextOnly::boxesOfTheEditor()
{
    QFETCH(QString, markup);
    const HostilePlace place(markup);
    const QString settings = place.folder + "going/" + markup + ".cfg";
    const QByteArray content = "<R><S><k>v</k></S></R>\n";
    QVERIFY(TestFiles::write(settings, content));
    SettingsEditor editor;
    editor.Open(settings);
    editor.show();
    auto* tree = editor.findChild<QTreeView*>();
    SetValue(tree, 0, "w");
    QStringList breaches("no box");
    QString text;

    // No copy can be kept.
    QVERIFY(QDir().mkpath(settings + ".bak/full"));
    LookAtNextBox(&breaches, &text);
    QVERIFY(!editor.Save());
    QCOMPARE(breaches.join('\n'), QString());
    QVERIFY2(text.contains(settings + ".bak"), qPrintable(text));
    QVERIFY(QDir(settings + ".bak").removeRecursively());

    // The file has been changed by another program.
    QFile file(settings);
    QVERIFY(file.open(QIODevice::ReadWrite));
    QVERIFY(file.setFileTime(QDateTime(QDate(2020, 1, 1), QTime(12, 0)),
                             QFileDevice::FileModificationTime));
    file.close();
    breaches = QStringList("no box");
    LookAtNextBox(&breaches, &text);
    QVERIFY(!editor.Save());
    QCOMPARE(breaches.join('\n'), QString());
    QVERIFY2(text.contains(markup + ".cfg was changed"), qPrintable(text));

    // The file cannot be saved.
    QVERIFY(QFile::remove(settings));
    QVERIFY(QDir(place.folder + "going").removeRecursively());
    breaches = QStringList("no box");
    LookAtNextBox(&breaches, &text);
    QVERIFY(!editor.Save());
    QCOMPARE(breaches.join('\n'), QString());
    QVERIFY2(text.contains("Could not save " + settings), qPrintable(text));
}

void tst_PlainTextOnly::boxAboutAMissingFile()
{
    QFETCH(QString, markup);
    const HostilePlace place(markup);
    const auto window = WindowTest::show();
    window->OpenFile(place.log);
    window->findChild<FileTabs*>()->CloseCurrent();
    QVERIFY(QFile::remove(place.log));
    QStringList breaches("no box");
    QString text;
    LookAtNextBox(&breaches, &text);
    Action(*window, "Open Recent")->menu()->actions().first()->trigger();
    QCOMPARE(breaches.join('\n'), QString());
    QVERIFY2(text.contains(place.log), qPrintable(text));
}

void tst_PlainTextOnly::boxOfTheLogSettings()
{
    QFETCH(QString, markup);
    const HostilePlace place(markup);
    LogSettingsDialog dialog;
    dialog.show();
    QFile::remove(LogPreferences::FileName());
    QVERIFY(QDir().mkpath(LogPreferences::FileName() + "/in the way"));
    QStringList breaches("no box");
    QString text;
    LookAtNextBox(&breaches, &text);
    Click(dialog.findChild<QDialogButtonBox*>()->button(QDialogButtonBox::Ok));
    QCOMPARE(breaches.join('\n'), QString());
    QVERIFY2(text.contains(place.folder), qPrintable(text));
}

// Qt's own box, which asks whether to replace an existing file.
void tst_PlainTextOnly::boxOfTheFileDialog()
{
    QFETCH(QString, markup);
    const HostilePlace place(markup);
    const auto window = WindowTest::show();
    QStringList breaches("no box");
    QString text;
    WindowTest::whenShown<ProblemReportDialog>([&](ProblemReportDialog* dialog) {
        WindowTest::whenShown<QFileDialog>([&](QFileDialog* chooser) {
            auto* name = chooser->findChild<QLineEdit*>("fileNameEdit");
            name->setText(place.log);
            LookAtNextBox(&breaches, &text);
            QTest::keyClick(name, Qt::Key_Return);
            QTest::keyClick(chooser, Qt::Key_Escape);
        });
        ClickNamed(dialog, "Save...");
        dialog->reject();
    });
    QTest::keyClick(window.get(), Qt::Key_R, Qt::ControlModifier | Qt::ShiftModifier);
    QTRY_VERIFY_WITH_TIMEOUT(breaches != QStringList("no box"), Patience);
    QCOMPARE(breaches.join('\n'), QString());
    QVERIFY2(text.contains(markup + ".log already exists"), qPrintable(text));
    QVERIFY(TestFiles::read(place.log).startsWith("2025"));
}

void tst_PlainTextOnly::notices()
{
    QFETCH(QString, markup);
    const HostilePlace place(markup);
    QVERIFY(TestFiles::write(place.folder + "velocor.cfg", "<VelocorSettings><x"));
    QVERIFY(TestFiles::write(place.settings, "<R><S>"));
    const auto window = WindowTest::show();
    window->OpenFile(place.settings);
    QCOMPARE(Breaches(window.get()).join('\n'), QString());
    QStringList notices;
    const QList<NoticeBar*> bars = window->findChildren<NoticeBar*>();
    for (NoticeBar const* bar : bars)
        notices.append(bar->text());
    QVERIFY2(notices.join('\n').contains("Cannot show " + place.settings + " as a tree"),
             qPrintable(notices.join('\n')));
    QVERIFY2(notices.join('\n').contains(place.folder + "velocor.cfg.damaged-1"),
             qPrintable(notices.join('\n')));
}

QTEST_MAIN(tst_PlainTextOnly)
#include "tst_PlainTextOnly.moc"

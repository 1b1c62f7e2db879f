// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The catalogs of all languages, and the window in each of them.

#include "app/language/Language.h"
#include "app/window/WindowSettings.h"
#include "window/WindowTest.h"
#include "window/WindowTestCase.h"

#include <QAction>
#include <QDir>
#include <QDomDocument>
#include <QMenu>
#include <QMenuBar>
#include <QRegularExpression>

#include <algorithm>

using namespace Velocor;

class tst_Languages : public WindowTestCase
{
    Q_OBJECT

private slots:
    void all();
    void catalogs_data();
    void catalogs();
    void plurals_data();
    void plurals();
    void menus_data();
    void menus();
    void severitiesOfLogs_data();
    void severitiesOfLogs();
    void unknownLanguage();
};

namespace {

void languages()
{
    QTest::addColumn<QString>("code");
    const QList<Language> all = Language::All();
    for (Language const& language : all)
        QTest::newRow(qPrintable(language.code)) << language.code;
}

QStringList found(QString const& pattern, QString const& text)
{
    QStringList all;
    QRegularExpressionMatchIterator matches = QRegularExpression(pattern).globalMatch(text);
    while (matches.hasNext())
        all.append(matches.next().captured());
    std::sort(all.begin(), all.end());
    return all;
}

// What is wrong with a translation, or nothing.
QString problem(QString const& source, QString const& text)
{
    if (text.isEmpty())
        return "empty";
    const QString places = "%L?(\\d|n)";
    if (found(places, source) != found(places, text))
        return "other placeholders";
    if (found("&(?!&)", source).size() != found("&(?!&)", text).size())
        return "mnemonic";
    if (source.endsWith("...") != text.endsWith("..."))
        return "dots";
    if (source.endsWith('\n') != text.endsWith('\n') ||
        source.startsWith('\n') != text.startsWith('\n'))
        return "line breaks";
    if (source.endsWith(' ') != text.endsWith(' '))
        return "blank at the end";
    if (found("\\*\\.\\w+", source) != found("\\*\\.\\w+", text))
        return "file types";
    return QString();
}

std::unique_ptr<MainWindow> showIn(QString const& code, WindowTest const& test)
{
    {
        WindowSettings settings(test.folder() + "data/");
        settings.Load();
        settings.SetText("language", code);
        settings.Save();
    }
    return WindowTest::show();
}

// All menus with their entries, the bar first.
QList<QList<QAction*>> levels(QMenuBar const* bar)
{
    QList<QList<QAction*>> all{bar->actions()};
    const QList<QMenu*> menus = bar->findChildren<QMenu*>();
    for (QMenu const* menu : menus)
        all.append(menu->actions());
    return all;
}

} // namespace

void tst_Languages::all()
{
    QStringList codes;
    const QList<Language> languages = Language::All();
    for (Language const& language : languages)
        codes.append(language.code + ' ' + language.name);
    QCOMPARE(codes.join(", "), QString::fromUtf8("de Deutsch, en American English, fr Fran\xC3\xA7"
                                                 "ais"));
}

void tst_Languages::catalogs_data()
{
    languages();
}

void tst_Languages::catalogs()
{
    QFETCH(QString, code);
    QDomDocument catalog;
    QVERIFY(catalog.setContent(
        TestFiles::read(QStringLiteral(PROJECT_FOLDER "/translations/velocor_%1.ts").arg(code))));
    const QDomNodeList messages = catalog.elementsByTagName("message");
    QVERIFY(messages.size() > (code == "en" ? 10 : 800));
    for (int i = 0; i < messages.size(); ++i) {
        const QDomElement message = messages.at(i).toElement();
        const QString source = message.firstChildElement("source").text();
        const QDomElement translation = message.firstChildElement("translation");
        QVERIFY2(!translation.hasAttribute("type"), qPrintable(source));
        const QDomNodeList forms = translation.elementsByTagName("numerusform");
        QCOMPARE(forms.size(), message.hasAttribute("numerus") ? 2 : 0);
        for (int form = 0; form < std::max(1, forms.size()); ++form) {
            const QString text =
                forms.isEmpty() ? translation.text() : forms.at(form).toElement().text();
            const QString wrong = problem(source, text);
            QVERIFY2(wrong.isEmpty(), qPrintable(wrong + ": " + source + " / " + text));
        }
    }
}

void tst_Languages::plurals_data()
{
    QTest::addColumn<QString>("code");
    QTest::addColumn<int>("number");
    QTest::addColumn<QString>("text");
    QTest::newRow("none, English") << "en" << 0 << "0 lines";
    QTest::newRow("one, English") << "en" << 1 << "1 line";
    QTest::newRow("none, German") << "de" << 0 << "0 Zeilen";
    QTest::newRow("one, German") << "de" << 1 << "1 Zeile";
    QTest::newRow("two, German") << "de" << 2 << "2 Zeilen";
    QTest::newRow("none, French") << "fr" << 0 << "0 ligne";
    QTest::newRow("one, French") << "fr" << 1 << "1 ligne";
    QTest::newRow("two, French") << "fr" << 2 << "2 lignes";
}

void tst_Languages::plurals()
{
    QFETCH(QString, code);
    QFETCH(int, number);
    Language::Use(code);
    QTEST(QCoreApplication::translate("LogStateText", "%Ln line(s)", "", number), "text");
}

void tst_Languages::menus_data()
{
    languages();
}

// In each menu, each entry has a letter of its own; none of them stayed English.
void tst_Languages::menus()
{
    QFETCH(QString, code);
    const WindowTest test;
    const auto window = showIn(code, test);
    QCOMPARE(window->menuBar()->actions().first()->text(), QString(code == "fr"   ? "&Fichier"
                                                                   : code == "de" ? "&Datei"
                                                                                  : "&File"));
    for (QList<QAction*> const& level : levels(window->menuBar())) {
        QString letters;
        for (QAction const* action : level) {
            const int mark = action->text().indexOf('&');
            if (action->isSeparator() || mark < 0) // a file, or a language
                continue;
            const QChar letter = action->text().at(mark + 1).toLower();
            QVERIFY2(!letters.contains(letter), qPrintable(action->text()));
            QVERIFY2(letter.unicode() < 128, qPrintable(action->text())); // on every keyboard
            letters.append(letter);
        }
    }
}

void tst_Languages::severitiesOfLogs_data()
{
    languages();
}

// Logs of all languages read alike.
void tst_Languages::severitiesOfLogs()
{
    QFETCH(QString, code);
    const WindowTest test;
    const auto window = showIn(code, test);
    TorkLog::logger()->warning("careful");
    const QByteArray log = TestFiles::read(test.logFile());
    QVERIFY2(log.contains("Warning"), log.constData());
}

void tst_Languages::unknownLanguage()
{
    const WindowTest test;
    const auto window = showIn("xx", test);
    QCOMPARE(window->menuBar()->actions().first()->text(), QString("&File"));
}

QTEST_MAIN(tst_Languages)
#include "tst_Languages.moc"

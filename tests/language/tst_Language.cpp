// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The language that the texts of the program are shown in.

#include "app/language/Language.h"

#include "common/TorkQt_p.h"

#include <QCoreApplication>
#include <QDir>
#include <QLocale>
#include <QtTest>

using namespace Velocor;

namespace {

QString Translated(char const* context, char const* text, int count = -1)
{
    return QCoreApplication::translate(context, text, nullptr, count);
}

} // namespace

class tst_Language : public QObject
{
    Q_OBJECT

private slots:
    void all();
    void texts_data();
    void texts();
    void textsOfQt();
    void languageThatIsMissing();
};

void tst_Language::all()
{
    QStringList languages;
    const QList<Language> all = Language::All();
    for (Language const& language : all)
        languages.append(language.code + "=" + language.name);
    QCOMPARE(languages, QStringList({"de=Deutsch", "en=English",
                                     QString::fromUtf8("fr=Fran\xC3\xA7"
                                                       "ais")}));
}

void tst_Language::texts_data()
{
    QTest::addColumn<QString>("code");
    QTest::addColumn<QString>("used");
    QTest::addColumn<QString>("green");
    QTest::addColumn<QString>("none");
    QTest::addColumn<QString>("one");
    QTest::addColumn<QString>("many");

    const auto row = [](char const* name, char const* code, char const* used, char const* green,
                        char const* none, char const* one, char const* many) {
        QTest::newRow(name) << code << used << QString::fromUtf8(green) << none << one << many;
    };
    row("English", "en", "en", "Green", "0 lines", "1 line", "2 lines");
    row("German", "de", "de", "Gr\xC3\xBCn", "0 Zeilen", "1 Zeile", "2 Zeilen");
    row("French has no plural of zero", "fr", "fr", "Vert", "0 ligne", "1 ligne", "2 lignes");
    // The tests run in the locales C, ar_TN, de_DE and fr_FR.
    const QLocale::Language system = QLocale::system().language();
    for (char const* code : {"", "xx", "tlh_KX", "de\n", "../de"}) {
        const QByteArray name = QByteArray("language of the system for \"") + code + "\"";
        if (system == QLocale::German)
            row(name, code, "de", "Gr\xC3\xBCn", "0 Zeilen", "1 Zeile", "2 Zeilen");
        else if (system == QLocale::French)
            row(name, code, "fr", "Vert", "0 ligne", "1 ligne", "2 lignes");
        else
            row(name, code, "en", "Green", "0 lines", "1 line", "2 lines");
    }
}

// Each language replaces the one before, and the last row's stays until the next test.
void tst_Language::texts()
{
    QFETCH(QString, code);
    Language::Use("fr");
    Language::Use("de");
    Language::Use(code);
    QTEST(Language::Used(), "used");
    QTEST(Translated("HighlightColors", "Green"), "green");
    QTEST(Translated("LogStateText", "%Ln line(s)", 0), "none");
    QTEST(Translated("LogStateText", "%Ln line(s)", 1), "one");
    QTEST(Translated("LogStateText", "%Ln line(s)", 2), "many");
}

void tst_Language::textsOfQt()
{
    QVERIFY(QDir(TorkQt::TranslationsFolder()).exists("qtbase_de.qm"));
    Language::Use("de");
    QCOMPARE(Translated("QPlatformTheme", "Cancel"), QString("Abbrechen"));
    Language::Use("fr");
    QCOMPARE(Translated("QPlatformTheme", "Cancel"), QString("Annuler"));
    Language::Use("en");
    QCOMPARE(Translated("QPlatformTheme", "Cancel"), QString("Cancel"));
}

// Of it, Qt has texts, and a direction.
void tst_Language::languageThatIsMissing()
{
    if (QLocale::system().language() != QLocale::Arabic)
        QSKIP("for the run in Arabic");
    QVERIFY(QDir(TorkQt::TranslationsFolder()).exists("qtbase_ar.qm"));
    Language::Use("de");
    Language::Use(QString());
    QCOMPARE(Translated("QPlatformTheme", "Cancel"), QString("Cancel"));
    QCOMPARE(Translated("QGuiApplication", "QT_LAYOUT_DIRECTION"), QString("QT_LAYOUT_DIRECTION"));
}

QTEST_GUILESS_MAIN(tst_Language)

#include "tst_Language.moc"

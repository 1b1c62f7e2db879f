// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Every text of every catalog: translated, and with all that the program fills in.

#include <QDir>
#include <QFile>
#include <QLocale>
#include <QRegularExpression>
#include <QXmlStreamReader>
#include <QtTest>

namespace {

struct Text
{
    QString context;
    QString source;
    bool isCounted = false;
    bool isFinished = true;
    QStringList translations; ///< one for each plural form
};

void ReadTranslation(QXmlStreamReader& xml, Text& text)
{
    text.isFinished = xml.attributes().value("type").isEmpty();
    if (!text.isCounted) {
        text.translations.append(xml.readElementText());
        return;
    }
    while (xml.readNextStartElement())
        text.translations.append(xml.readElementText());
}

Text ReadMessage(QXmlStreamReader& xml, QString const& context)
{
    Text text;
    text.context = context;
    text.isCounted = xml.attributes().value("numerus") == QLatin1String("yes");
    while (xml.readNextStartElement()) {
        if (xml.name() == QLatin1String("source"))
            text.source = xml.readElementText();
        else if (xml.name() == QLatin1String("translation"))
            ReadTranslation(xml, text);
        else
            xml.skipCurrentElement();
    }
    return text;
}

QList<Text> ReadCatalog(QString const& code)
{
    QFile file(CATALOGS "velocor_" + code + ".ts");
    if (!file.open(QIODevice::ReadOnly))
        return {};
    QList<Text> texts;
    QXmlStreamReader xml(&file);
    QString context;
    xml.readNextStartElement();
    while (xml.readNextStartElement()) {
        while (xml.readNextStartElement()) {
            if (xml.name() == QLatin1String("name"))
                context = xml.readElementText();
            else
                texts.append(ReadMessage(xml, context));
        }
    }
    return xml.hasError() ? QList<Text>() : texts;
}

QStringList Placeholders(QString const& text)
{
    QStringList all;
    auto matches = QRegularExpression("%L?(\\d|n)").globalMatch(text);
    while (matches.hasNext())
        all.append(matches.next().captured());
    all.sort();
    return all;
}

// Ellipsis, colon and full stop tell what a text is: a dialog follows, a value follows, a sentence.
QString EndOf(QString const& text)
{
    if (text.endsWith("..."))
        return "...";
    return text.endsWith(':') || text.endsWith('.') ? text.right(1) : QString();
}

// Letters after "&"; "&&" is an ampersand.
int Mnemonics(QString const& text)
{
    return QString(text).remove("&&").count('&');
}

QString Faults(Text const& text, QString const& translation)
{
    QStringList faults;
    if (translation.isEmpty())
        faults.append("not translated");
    if (Placeholders(translation) != Placeholders(text.source))
        faults.append("other placeholders");
    if (EndOf(translation) != EndOf(text.source))
        faults.append("another end");
    if (Mnemonics(translation) != Mnemonics(text.source))
        faults.append("other mnemonics");
    return faults.join(", ");
}

} // namespace

class tst_Catalogs : public QObject
{
    Q_OBJECT

private slots:
    void complete_data();
    void complete();
    void sameTexts();
    void shortcutsStay_data() { languages(); }
    void shortcutsStay();

private:
    static void languages();
};

// All but English, which has only plural forms.
void tst_Catalogs::languages()
{
    QTest::addColumn<QString>("code");
    const QStringList files = QDir(CATALOGS).entryList({"velocor_*.ts"});
    for (QString const& file : files) {
        const QString code = file.mid(8).section('.', 0, 0);
        if (code != "en")
            QTest::newRow(qPrintable(code)) << code;
    }
}

void tst_Catalogs::complete_data()
{
    languages();
    QTest::newRow("en") << "en";
}

void tst_Catalogs::complete()
{
    QFETCH(QString, code);
    const QList<Text> texts = ReadCatalog(code);
    QVERIFY(!texts.isEmpty());
    QStringList faults;
    for (Text const& text : texts) {
        const QString name = text.context + ": " + text.source + ": ";
        if (!text.isFinished)
            faults.append(name + "unfinished");
        // All languages so far have a singular and a plural.
        if (text.translations.size() != (text.isCounted ? 2 : 1))
            faults.append(name + "forms");
        for (QString const& translation : text.translations) {
            const QString fault = Faults(text, translation);
            if (!fault.isEmpty())
                faults.append(name + fault);
        }
    }
    QVERIFY2(faults.isEmpty(), qPrintable(faults.join('\n')));
}

void tst_Catalogs::sameTexts()
{
    const auto sources = [](QString const& code) {
        QStringList all;
        const QList<Text> texts = ReadCatalog(code);
        for (Text const& text : texts)
            all.append(text.context + ": " + text.source);
        return all;
    };
    QCOMPARE(sources("fr"), sources("de"));
}

// The manual and the tests name them; a translated one may be taken, or be unknown to Qt.
void tst_Catalogs::shortcutsStay()
{
    QFETCH(QString, code);
    const QRegularExpression shortcut("^((Ctrl|Alt|Shift)\\+)+.+$|^F\\d+$");
    int seen = 0;
    const QList<Text> texts = ReadCatalog(code);
    for (Text const& text : texts) {
        if (!shortcut.match(text.source).hasMatch())
            continue;
        ++seen;
        QCOMPARE(text.translations, QStringList(text.source));
    }
    QVERIFY(seen > 20);
}

QTEST_GUILESS_MAIN(tst_Catalogs)

#include "tst_Catalogs.moc"

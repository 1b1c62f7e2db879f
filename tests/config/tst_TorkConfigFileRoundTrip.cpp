// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Which values and names survive a save and a load without an encoding, and what happens to the
// rest of the file: the warning in docs/config-file.md, row by row.

#include "common/config/TorkConfigFile.h"
#include "common/config/TorkConfigText.h"
#include "support/MessageCapture.h"

#include <QTemporaryDir>
#include <QtTest>

class tst_TorkConfigFileRoundTrip : public QObject
{
    Q_OBJECT

private slots:
    void value_data();
    void value();
    void name_data();
    void name();

private:
    bool saveAndLoad(TorkConfigFile& saved, TorkConfigFile& loaded) const;

    QTemporaryDir m_folder;
};

namespace {

enum Fate {
    Same,    // comes back
    Changed, // comes back as something else; the rest of the file is unchanged
    Lost,    // does not come back; the rest of the file does
    Refused  // the load fails, and all later sections are lost
};

QString Read(TorkConfigFile& settings, QString const& section, QString const& key)
{
    QString missing = QStringLiteral("(missing)");
    QString value;
    settings.ReadItem(section, key, missing, value);
    return value;
}

// What became of the item, judging by what is there now.
Fate FateOf(bool loaded, QString const& stored, QString const& wanted)
{
    if (!loaded)
        return Refused;
    if (stored == wanted)
        return Same;
    return stored == QLatin1String("(missing)") ? Lost : Changed;
}

} // namespace

// The section "Later" comes after the one under test.
bool tst_TorkConfigFileRoundTrip::saveAndLoad(TorkConfigFile& saved, TorkConfigFile& loaded) const
{
    const MessageCapture messages; // the reader complains about what it refuses
    saved.SetFileName(m_folder.filePath("settings.cfg"));
    saved.WriteItem("Later", "key", "still here");
    saved.Save();
    loaded.SetFileName(m_folder.filePath("settings.cfg"));
    return loaded.Load();
}

void tst_TorkConfigFileRoundTrip::value_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("fate");

    QTest::newRow("words") << "My file" << int(Same);
    QTest::newRow("spaces around") << "  x  " << int(Same);
    QTest::newRow("one space") << " " << int(Same);
    QTest::newRow("empty") << "" << int(Lost);
    QTest::newRow("line feed and tab") << "\ta\nb\n" << int(Same);
    QTest::newRow("carriage return") << "a\r\nb\rc" << int(Same);
    QTest::newRow("control characters") << QString("\x01\x1f\x7f") + QChar(0) + "a" << int(Same);
    QTest::newRow("markup") << "<a href=\"b\">&'c'</a>" << int(Same);
    QTest::newRow("brackets") << "]] ]" << int(Same);
    QTest::newRow("end of a CDATA section") << "a]]>b" << int(Refused);
    QTest::newRow("percent sign alone") << "100% %% %a %" << int(Same);
    QTest::newRow("disk 90%1") << "disk 90%1" << int(Refused);
    QTest::newRow("http://h/a%20b%2Fc") << "http://h/a%20b%2Fc" << int(Refused);
    QTest::newRow("%L1") << "%L1" << int(Refused);
    QTest::newRow("%0") << "%0" << int(Refused);
    QTest::newRow("%01") << "%01" << int(Refused);
    QTest::newRow("%2") << "%2" << int(Refused);
    QTest::newRow("%3") << "%3" << int(Changed);
    QTest::newRow("%L3") << "%L3" << int(Changed);
    QTest::newRow("%4 to %99") << "%4 %20 %99 %L10" << int(Same);
    QTest::newRow("Latin-1") << QString::fromUtf8("naïve") << int(Changed);
    QTest::newRow("Latin-1 that looks like UTF-8") << QString::fromUtf8("Ã¯") << int(Changed);
    QTest::newRow("beyond Latin-1") << QString::fromUtf8("5 €") << int(Changed);
}

void tst_TorkConfigFileRoundTrip::value()
{
    QFETCH(QString, text);
    QFETCH(int, fate);
    TorkConfigFile saved{QString()};
    QVERIFY(saved.WriteItem("Section", "key", text));
    TorkConfigFile loaded{QString()};
    const bool isLoaded = saveAndLoad(saved, loaded);

    QCOMPARE(int(FateOf(isLoaded, Read(loaded, "Section", "key"), text)), fate);
    QCOMPARE(Read(loaded, "Later", "key"), QString(fate == Refused ? "(missing)" : "still here"));

    TorkConfigFile encoded{QString()};
    QVERIFY(encoded.WriteItem("Section", "key", TorkConfigText::EncodeValue(text)));
    QVERIFY(saveAndLoad(encoded, loaded));
    QCOMPARE(TorkConfigText::DecodeValue(Read(loaded, "Section", "key")), text);
    QCOMPARE(Read(loaded, "Later", "key"), QString("still here"));
}

void tst_TorkConfigFileRoundTrip::name_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("fate");

    QTest::newRow("letters, digits and signs") << "A.name_with-1" << int(Same);
    QTest::newRow("underscore first") << "_a" << int(Same);
    QTest::newRow("with spaces, found without") << "My Key" << int(Same);
    QTest::newRow("1st") << "1st" << int(Refused);
    QTest::newRow("C++") << "C++" << int(Refused);
    QTest::newRow("a/b") << "a/b" << int(Refused);
    QTest::newRow("naïve") << QString::fromUtf8("naïve") << int(Refused);
    QTest::newRow("empty") << "" << int(Refused);
    QTest::newRow("only a space") << " " << int(Refused);
    QTest::newRow("dot first") << ".a" << int(Refused);
    QTest::newRow("hyphen first") << "-a" << int(Refused);
    QTest::newRow("tab") << "a\tb" << int(Refused);
    QTest::newRow("markup") << "a<b" << int(Refused);
    QTest::newRow("placeholder") << "a%1" << int(Refused);
    QTest::newRow("beyond Latin-1") << QString::fromUtf8("€") << int(Refused);
    QTest::newRow("> first") << ">a" << int(Refused);
    QTest::newRow("colon") << "a:b" << int(Lost);
    QTest::newRow("> later") << "a>b" << int(Lost);
    QTest::newRow("tab last") << "a\t" << int(Lost);
    QTest::newRow("line feed last") << "a\n" << int(Lost);
    QTest::newRow("name of the root element") << "VelocorSettings" << int(Lost);
}

void tst_TorkConfigFileRoundTrip::name()
{
    QFETCH(QString, text);
    QFETCH(int, fate);
    const QString name = TorkConfigText::EncodeName(text);
    for (bool isSection : {false, true}) {
        const auto section = [isSection](QString const& it) {
            return isSection ? it : QString("Section");
        };
        const auto key = [isSection](QString const& it) {
            return isSection ? QString("key") : it;
        };

        TorkConfigFile saved{QString()};
        QVERIFY(saved.WriteItem(section(text), key(text), "value"));
        TorkConfigFile loaded{QString()};
        const bool isLoaded = saveAndLoad(saved, loaded);
        QCOMPARE(int(FateOf(isLoaded, Read(loaded, section(text), key(text)), "value")), fate);
        QCOMPARE(Read(loaded, "Later", "key"),
                 QString(fate == Refused ? "(missing)" : "still here"));

        TorkConfigFile encoded{QString()};
        QVERIFY(encoded.WriteItem(section(name), key(name), "value"));
        QVERIFY(saveAndLoad(encoded, loaded));
        QCOMPARE(Read(loaded, section(name), key(name)), QString("value"));
        QVERIFY(loaded.keyList(section(name)).contains(key(name)));
        QCOMPARE(TorkConfigText::DecodeName(name), text);
        QCOMPARE(Read(loaded, "Later", "key"), QString("still here"));
    }
}

QTEST_GUILESS_MAIN(tst_TorkConfigFileRoundTrip)

#include "tst_TorkConfigFileRoundTrip.moc"

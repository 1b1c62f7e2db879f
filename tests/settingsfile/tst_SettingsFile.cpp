// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares reading configuration-store files with the store, and saves them through it.

#include "app/settingsfile/SettingsFileReader.h"
#include "app/settingsfile/SettingsFileWriter.h"
#include "common/config/TorkConfigFile.h"
#include "support/ProcessLimits.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace Velocor;

namespace {

QString Joined(SettingsDocument const& document)
{
    QStringList texts;
    for (SettingsDocument::Section const& section : document.sections) {
        texts.append("[" + section.name + "]");
        for (SettingsDocument::Item const& item : section.items)
            texts.append(item.key + "=" + item.value);
    }
    return texts.join(' ');
}

SettingsDocument OneValue(QString const& value)
{
    SettingsDocument document;
    document.rootName = "Root";
    document.SetValue("S", "k", value);
    return document;
}

} // namespace

class tst_SettingsFile : public QObject
{
    Q_OBJECT

private slots:
    void read_data();
    void read();
    void lossTexts_data();
    void lossTexts();
    void lossesAreInTheirPlaces_data();
    void lossesAreInTheirPlaces();
    void readsWhatTheStoreReads_data();
    void readsWhatTheStoreReads();
    void errors_data();
    void errors();
    void unreadable();
    void endsAfterSoManyKeys_data();
    void endsAfterSoManyKeys();
    void readsUpToASize_data();
    void readsUpToASize();
    void copiesAFile_data();
    void copiesAFile();
    void deepNesting();
    void deepDocumentType();
    void losses_data();
    void losses();
    void lossesOfNames_data();
    void lossesOfNames();
    void reasons_data();
    void reasons();
    void manyLosses_data();
    void manyLosses();
    void lossesWriteNoFile();
    void sameValues_data();
    void sameValues();
    void valueByName();
    void errorAsLoss_data();
    void errorAsLoss();
    void save();
    void saveFails();
    void savesNothingInPlaceOfAFile_data();
    void savesNothingInPlaceOfAFile();
    void savedIncompletely();
    void fullDisk();
    void savesTextInAReadOnlyFolder();
    void backup();
    void fullDiskKeepsTheBackup();
    void linkInPlaceOfTheBackup();
    void noBackup();
};

void tst_SettingsFile::read_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<QString>("values");
    QTest::addColumn<int>("lossCount");
    QTest::addColumn<QString>("firstLoss");

    const auto row = [](char const* name, QByteArray const& inside, char const* values,
                        int lossCount, char const* loss) {
        QTest::newRow(name) << QByteArray("<R>\n" + inside + "\n</R>\n") << QString(values)
                            << lossCount << QString(loss);
    };
    row("empty", "", "", 0, "");
    row("values in their order", "<S><b>1</b><a>2</a></S><Q><c>3</c></Q>", "[S] b=1 a=2 [Q] c=3", 0,
        "");
    row("markup in CDATA", "<S><a><![CDATA[<&>]]></a></S>", "[S] a=<&>", 0, "");
    row("attribute", "<S><a x='1'>v</a></S>", "[S] a=v", 1, "Line 2: the attribute \"x\" of \"a\"");
    row("comment", "<S><!-- why --><a>v</a></S>", "[S] a=v", 1, "Line 2: the comment \"why\"");
    row("nesting", "<S><a>v<deep>w</deep></a></S>", "[S] a=v", 2,
        "Line 2: the nesting of the element \"deep\"");
    row("element without text", "<S><a></a></S>", "[S]", 1, "Line 2: the empty item \"a\"");
    row("empty element", "<S><a/></S>", "[S]", 1, "Line 2: the empty item \"a\"");
    row("key twice", "<S><a>1</a><a>2</a></S>", "[S] a=2", 1,
        "Line 2: the first value of \"a\", replaced by a second one");
    row("section twice", "<S><a>1</a></S><S><b>2</b></S>", "[S] a=1 b=2", 1,
        "Line 2: a second section \"S\", merged with the first");
    row("text in a section", "<S>text<a>1</a></S>", "[S] a=1", 1,
        "Line 2: the text \"text\" outside any value");
    row("long text in a section", "<S>  0123456789 123456789 <a>1</a></S>", "[S] a=1", 1,
        "Line 2: the text \"0123456789 123456789\" outside any value");
    row("instruction", "<?do it?><S><a>1</a></S>", "[S] a=1", 1,
        "Line 2: the processing instruction \"do\"");
    row("section name beyond ASCII", "<\xC3\xA9><a>1</a></\xC3\xA9>", "[\xEF\xBF\xBD] a=1", 1,
        "Line 2: the name of the section \"\xC3\xA9\"");
    row("section named like the root", "<R><a>1</a></R>", "", 2,
        "Line 2: the element \"R\", which has the same name as the root element");
    const auto declared = [](char const* name, QByteArray const& declaration, int lossCount) {
        QTest::newRow(name) << declaration + QByteArray("<R><S><a>1</a></S></R>")
                            << QString("[S] a=1") << lossCount
                            << QString(lossCount > 0 ? "Line 1: the XML declaration" : "");
    };
    declared("declaration", "<?xml version=\"1.0\"?>", 0);
    declared("declaration of UTF-8", "<?xml version='1.0' encoding=\"utf-8\"?>\n", 0);
    declared("declaration of Latin-1", "<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>", 1);
    declared("declaration of standing alone", "<?xml version='1.0' standalone='yes'?>", 1);
    const QByteArray blanks(180, ' '); // a declaration of 200 bytes is looked at
    declared("long declaration", "<?xml" + blanks + "version='1.0'?>", 0);
    declared("longer declaration", "<?xml " + blanks + "version='1.0'?>", 1);
}

void tst_SettingsFile::read()
{
    QFETCH(QByteArray, text);
    QFETCH(QString, firstLoss);
    const SettingsDocument document = SettingsFileReader::ReadBytes(text);
    QVERIFY2(document.isParsed, qPrintable(document.error));
    QCOMPARE(document.rootName, QString("R"));
    QTEST(Joined(document), "values");
    if (!firstLoss.isEmpty())
        QCOMPARE(document.losses.value(0).text, firstLoss);
    QTEST(document.lossCount, "lossCount");
}

void tst_SettingsFile::lossTexts_data()
{
    QTest::addColumn<QByteArray>("document");
    QTest::addColumn<QStringList>("losses");

    const auto row = [](char const* name, QByteArray const& document, QStringList const& losses) {
        QTest::newRow(name) << document << losses;
    };
    const QByteArray digits = "0123456789012345678901234567890123456789";
    row("document type", "<!DOCTYPE T><R><S><a>1</a></S></R>", {"Line 1: the document type \"T\""});
    row("long comment on two lines", "<R>\n<!--  0\n1 " + digits + "--></R>",
        {"Line 3: the comment \"0 1 " + digits.left(36) + "\""});
    row("instruction after the root", "<R/>\n\n<?do it?>",
        {"Line 3: the processing instruction \"do\""});
    row("long text outside any value", "<R>" + digits + "</R>",
        {"Line 1: the text \"" + digits.left(20) + "\" outside any value"});
    row("rest of a value after a comment", "<R><S><a>v<!--c-->" + digits + "</a></S></R>",
        {"Line 1: the comment \"c\"",
         "Line 1: the value of \"a\", starting at \"" + digits.left(20) + "\""});
    row("value after a comment", "<R><S><a><!--c-->v</a></S></R>", {"Line 1: the comment \"c\""});
    row("text after an element in an item", "<R><S><a>v<d/>w</a></S></R>",
        {"Line 1: the nesting of the element \"d\"", "Line 1: the text \"w\" outside any value"});
    row("text in an element in an item", "<R><S><a>v<d>w</d></a></S></R>",
        {"Line 1: the nesting of the element \"d\"", "Line 1: the text \"w\" outside any value"});
    row("text between items", "<R><S><a>v</a>w<b>1</b></S></R>",
        {"Line 1: the text \"w\" outside any value"});
    row("text between sections", "<R><S><a>v</a></S>w<T><b>1</b></T></R>",
        {"Line 1: the text \"w\" outside any value"});
    row("deeply nested value", "<R><S><a><d><e>v</e></d></a></S></R>",
        {"Line 1: the nesting of the element \"d\"", "Line 1: the nesting of the element \"e\""});
    row("value outside any section", "<R>\n<R>\n<k>v</k></R></R>",
        {"Line 2: the element \"R\", which has the same name as the root element",
         "Line 3: \"k\", which is outside any section"});
    row("section named like the root after another", "<R><S><a>1</a></S><R><k>v</k></R></R>",
        {"Line 1: the element \"R\", which has the same name as the root element"});
    row("item named like the root", "<R><S><R>v</R></S></R>",
        {"Line 1: the element \"R\", which has the same name as the root element",
         "Line 1: the text \"v\" outside any value"});
    row("empty section", "<R><S/></R>", {});
    row("empty sections of one name", "<R><S/><S/></R>",
        {"Line 1: a second section \"S\", merged with the first"});
    row("empty item with a comment", "<R><S><a><!--c--></a></S></R>",
        {"Line 1: the comment \"c\"", "Line 1: the empty item \"a\""});
    row("empty element in an item", "<R><S><a><b/></a></S></R>",
        {"Line 1: the nesting of the element \"b\""});
    row("attributes", "<R x='1'><S y='2'><a n:z='3' w='4'>v</a></S></R>",
        {"Line 1: the attribute \"x\" of \"R\"", "Line 1: the attribute \"y\" of \"S\"",
         "Line 1: the attribute \"n:z\" of \"a\"", "Line 1: the attribute \"w\" of \"a\""});
    row("prefixes that are not declared", "<q:R><p:S><p:a>v</p:a></p:S></q:R>",
        {"Line 1: the prefix of \"q:R\"", "Line 1: the prefix of \"p:S\"",
         "Line 1: the prefix of \"p:a\""});
    row("prefix that is declared", "<R xmlns:p='urn:x'>\n<S><p:a>v</p:a><b>w</b></S></R>",
        {"Line 1: the namespace \"urn:x\" of \"R\"", "Line 2: the prefix of \"p:a\""});
    row("namespace without a prefix", "<R>\n<S xmlns='urn:x'><a>v</a></S></R>",
        {"Line 2: the namespace \"urn:x\" of \"S\""});
    row("prefix that makes a key the same", "<R><S><p:a>1</p:a><q:a>2</q:a></S></R>",
        {"Line 1: the prefix of \"p:a\"", "Line 1: the prefix of \"q:a\"",
         "Line 1: the first value of \"a\", replaced by a second one"});
    row("key thrice", "<R><S><a>1</a><a>2</a><a>3</a></S></R>",
        {"Line 1: the first value of \"a\", replaced by a second one",
         "Line 1: the first value of \"a\", replaced by a second one"});
    row("declaration and comment", "<?xml version='1.0' encoding='ISO-8859-1'?>\n<!--c--><R/>",
        {"Line 1: the XML declaration", "Line 2: the comment \"c\""});
}

// What saving the file would lose, for the user: each loss with its line.
void tst_SettingsFile::lossTexts()
{
    QFETCH(QByteArray, document);
    const SettingsDocument read = SettingsFileReader::ReadBytes(document);
    QVERIFY2(read.isParsed, qPrintable(read.error));
    QFETCH(QStringList, losses);
    QCOMPARE(SettingsDocument::TextsOf(read.losses).join('\n'), losses.join('\n'));
    QCOMPARE(read.lossCount, read.losses.size());
}

void tst_SettingsFile::lossesAreInTheirPlaces_data()
{
    QTest::addColumn<QByteArray>("inside");
    QTest::addColumn<QString>("places");

    const auto row = [](char const* name, char const* inside, char const* places) {
        QTest::newRow(name) << QByteArray(inside) << QString(places);
    };
    row("before any section", "<!--c--><S/>", "/");
    row("between sections", "<S/><!--c--><T/>", "/");
    row("of a section", "<S><a>1</a></S><T x='1'/>", "T/");
    row("in a section, after an item", "<S><a>1</a><!--c--></S>", "S/");
    row("of an item", "<S><a>1</a><b x='1'>2</b></S>", "S/b");
    row("in an item", "<S><a>1<!--c--></a></S>", "S/a");
    row("deep in an item", "<S><a>1<d><e/></d></a></S>", "S/a S/a");
    row("empty item", "<S><a>1</a></S><T><b/></T>", "T/b");
    row("key twice", "<S><a>1</a><b>2</b><a>3</a></S>", "S/a");
    row("prefix of an item", "<S><a>1</a><p:b>2</p:b></S>", "S/b");
    row("namespace of a section", "<S/><T xmlns='urn:x'/>", "T/");
    row("section twice", "<S/><T/><S/>", "S/");
}

void tst_SettingsFile::lossesAreInTheirPlaces()
{
    QFETCH(QByteArray, inside);
    const SettingsDocument read = SettingsFileReader::ReadBytes("<R>" + inside + "</R>");
    QStringList places;
    for (SettingsDocument::Loss const& loss : read.losses)
        places.append(loss.section + '/' + loss.key);
    QTEST(places.join(' '), "places");
}

void tst_SettingsFile::readsWhatTheStoreReads_data()
{
    QTest::addColumn<QByteArray>("inside");
    QTest::newRow("plain") << QByteArray("<S><a>1</a><b> </b></S>");
    QTest::newRow("entities") << QByteArray("<S><a>x&amp;y</a><b>&lt;</b></S>");
    QTest::newRow("CDATA in pieces") << QByteArray("<S><a>x<![CDATA[y]]>z</a></S>");
    QTest::newRow("nested") << QByteArray("<S><a><b>1</b></a><c>2</c></S>");
    QTest::newRow("nested after a text") << QByteArray("<S><a>0<b>1</b></a></S>");
    QTest::newRow("no text") << QByteArray("<S><a/></S><T>text<b>1</b></T>");
    QTest::newRow("named like the root") << QByteArray("<R><a>1</a></R><S><R>2</R><b>3</b></S>");
    QTest::newRow("comment in a value") << QByteArray("<S><a>x<!-- c -->y</a></S>");
    QTest::newRow("comment before a value") << QByteArray("<S><a><!-- c -->y</a></S>");
    QTest::newRow("long value") << "<S><a>" + QByteArray(100000, 'x') + "</a></S>";
    QTest::newRow("prefix") << QByteArray("<S xmlns:p='u'><p:a>1</p:a></S>");
    QTest::newRow("Latin-1 bytes") << QByteArray("<S><a>\xE9t\xE9</a></S>");
}

void tst_SettingsFile::readsWhatTheStoreReads()
{
    QFETCH(QByteArray, inside);
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    QVERIFY(TestFiles::write(path, "<R>\n" + inside + "\n</R>\n"));
    const SettingsDocument document = SettingsFileReader::Read(path);
    TorkConfigFile store(path, document.rootName);
    QVERIFY(store.Load());
    for (SettingsDocument::Section const& section : document.sections) {
        QVERIFY2(store.HasSection(section.name), qPrintable(section.name));
        QCOMPARE(store.keyList(section.name).size(), section.items.size());
        for (SettingsDocument::Item const& item : section.items) {
            QString none;
            QString value;
            QVERIFY2(store.ReadItem(section.name, item.key, none, value), qPrintable(item.key));
            QCOMPARE(value, item.value);
        }
    }
}

void tst_SettingsFile::errors_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<int>("line");
    QTest::addColumn<int>("column");
    QTest::addColumn<QString>("error");
    QTest::newRow("empty") << QByteArray("") << 1 << 1 << "unexpected end of file";
    QTest::newRow("no XML") << QByteArray("a = 1\n") << 1 << 1
                            << "error occurred while parsing element";
    QTest::newRow("cut off") << QByteArray("<R>\n<S>\n<a>1") << 3 << 5 << "unexpected end of file";
    QTest::newRow("wrong end") << QByteArray("<R>\n<S>\n<a>1</b>\n</S>\n</R>\n") << 3 << 8
                               << "tag mismatch";
    QTest::newRow("two roots") << QByteArray("<R/>\n<R/>") << 2 << 2 << "unexpected character";
    QTest::newRow("binary") << QByteArray("\x7f\x45\x4c\x46\0\1", 6) << 1 << 1
                            << "error occurred while parsing element";
}

void tst_SettingsFile::errors()
{
    QFETCH(QByteArray, text);
    const SettingsDocument document = SettingsFileReader::ReadBytes(text);
    QVERIFY(document.isReadable);
    QVERIFY(!document.isParsed);
    QTEST(document.error, "error");
    QTEST(document.line, "line");
    QTEST(document.column, "column");
}

void tst_SettingsFile::unreadable()
{
    const QTemporaryDir folder;
    QCOMPARE(SettingsFileReader::Read(folder.path()).error, QString("Is a folder"));
    QCOMPARE(SettingsFileReader::Read(folder.filePath("missing.cfg")).error,
             QString("No such file or directory"));
    QCOMPARE(SettingsFileReader::Read("/dev/null").error, QString("Not a regular file"));
    for (QString const& path : {folder.filePath("missing.cfg"), folder.path()}) {
        const SettingsDocument document = SettingsFileReader::Read(path);
        QVERIFY(!document.isReadable);
        QVERIFY(!document.isParsed);
        QVERIFY(!document.error.isEmpty());
    }
}

void tst_SettingsFile::endsAfterSoManyKeys_data()
{
    QTest::addColumn<int>("most");
    QTest::addColumn<bool>("isParsed");
    QTest::addColumn<int>("keys");
    QTest::addColumn<QString>("error");
    QTest::newRow("more than it has") << 4 << true << 3 << "";
    QTest::newRow("as many") << 3 << true << 3 << "";
    QTest::newRow("one fewer") << 2 << false << 2 << "It has more than 2 keys";
    QTest::newRow("of the first section") << 1 << false << 1 << "It has more than 1 keys";
}

void tst_SettingsFile::endsAfterSoManyKeys()
{
    QFETCH(int, most);
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    QVERIFY(TestFiles::write(path, "<R><S><a>1</a><b>2<c>no key</c></b></S><T><a>3</a></T></R>"));
    const SettingsDocument document = SettingsFileReader::Read(path, most);
    QVERIFY(document.isReadable);
    QTEST(document.isParsed, "isParsed");
    QCOMPARE(document.isTooLarge, !document.isParsed);
    QTEST(int(document.AllValues().size()), "keys");
    QTEST(document.error, "error");
}

void tst_SettingsFile::readsUpToASize_data()
{
    QTest::addColumn<qint64>("size");
    QTest::addColumn<bool>("isTooLarge");
    QTest::newRow("as large") << SettingsFileReader::ShownSize << false;
    QTest::newRow("one byte more") << SettingsFileReader::ShownSize + 1 << true;
    QTest::newRow("two gigabytes") << (qint64(1) << 31) << true;
    QTest::newRow("four gigabytes") << (qint64(1) << 32) << true;
}

// The files have holes, so they take no space.
void tst_SettingsFile::readsUpToASize()
{
    QFETCH(qint64, size);
    QFETCH(bool, isTooLarge);
    const QTemporaryDir folder;
    QFile file(folder.filePath("x.cfg"));
    QVERIFY(file.open(QIODevice::WriteOnly) && file.write("<R><S><a>1</a></S></R>") > 0);
    QVERIFY(file.resize(size));
    file.close();
    const SettingsDocument document = SettingsFileReader::ReadShown(file.fileName());
    QVERIFY(document.isReadable && !document.isParsed);
    QCOMPARE(document.isTooLarge, isTooLarge);
    QCOMPARE(document.sections.isEmpty(), isTooLarge);
    QCOMPARE(document.error == "It is larger than 128 MiB", isTooLarge);
}

void tst_SettingsFile::copiesAFile_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<QByteArray>("before");
    QTest::newRow("nothing") << QByteArray() << QByteArray("old");
    QTest::newRow("less than a piece") << QByteArray("<R/>") << QByteArray("longer than that");
    QTest::newRow("a piece and a byte") << QByteArray((1 << 16) + 1, 'x') << QByteArray();
    QTest::newRow("several pieces") << QByteArray("0123456789").repeated(100000) << QByteArray();
}

void tst_SettingsFile::copiesAFile()
{
    QFETCH(QByteArray, content);
    QFETCH(QByteArray, before);
    const QTemporaryDir folder;
    const QString from = folder.filePath("from.cfg");
    const QString to = folder.filePath("to.cfg");
    QVERIFY(TestFiles::write(from, content) && TestFiles::write(to, before));
    QString error;
    QVERIFY(SettingsFileWriter::SaveCopy(to, from, &error));
    QCOMPARE(TestFiles::read(to), content);
    QCOMPARE(error, QString());

    QVERIFY(QFile::remove(from));
    QVERIFY(!SettingsFileWriter::SaveCopy(to, from, &error));
    QCOMPARE(error, from + " cannot be read any more.");
    QCOMPARE(TestFiles::read(to), content);
}

void tst_SettingsFile::deepNesting()
{
    QByteArray text;
    for (int i = 0; i < 100000; ++i)
        text += "<a>";
    const SettingsDocument document = SettingsFileReader::ReadBytes(text);
    QVERIFY(!document.isParsed);
    QCOMPARE(document.error, QString("More than 1000 elements are inside each other."));
}

void tst_SettingsFile::deepDocumentType()
{
    QByteArray text = "<!DOCTYPE S [<!ELEMENT S ";
    text += QByteArray(100000, '(') + "a" + QByteArray(100000, ')') + ">]><S/>";
    const SettingsDocument document = SettingsFileReader::ReadBytes(text);
    QVERIFY(!document.isParsed);
    QCOMPARE(document.error,
             QString("More than 1000 groups are inside each other in a document type."));
}

void tst_SettingsFile::losses_data()
{
    QTest::addColumn<QString>("value");
    QTest::addColumn<bool>("isKept");
    QTest::newRow("plain") << "value" << true;
    QTest::newRow("markup") << "<a href=\"x\">&'" << true;
    QTest::newRow("blank") << " " << true;
    QTest::newRow("line feed") << "a\nb" << true;
    QTest::newRow("percent") << "100 %" << true;
    QTest::newRow("placeholder") << "%1" << false;
    QTest::newRow("end of CDATA") << "x]]>y" << false;
    QTest::newRow("outside Latin-1") << QString::fromUtf8("\xE2\x82\xAC") << false;
    QTest::newRow("empty") << "" << false;
    QTest::newRow("carriage return") << "a\rb" << true;
    QTest::newRow("null character") << QString("a") + QChar(0) << true;
}

// What is reported as kept comes back unchanged, what is reported as lost does not.
void tst_SettingsFile::losses()
{
    QFETCH(QString, value);
    QFETCH(bool, isKept);
    const SettingsDocument document = OneValue(value);
    QCOMPARE(SettingsFileWriter::Losses(document).isEmpty(), isKept);
    QCOMPARE(SettingsFileWriter::ValueProblem(value).isEmpty(), isKept);

    const QTemporaryDir folder;
    QString error;
    SettingsFileWriter::Save(folder.filePath("x.cfg"), document, &error);
    const SettingsDocument after = SettingsFileReader::Read(folder.filePath("x.cfg"));
    QCOMPARE(after.isParsed && after.HasSameValues(document), isKept);
}

void tst_SettingsFile::lossesOfNames_data()
{
    QTest::addColumn<QString>("section");
    QTest::addColumn<QString>("key");
    QTest::addColumn<QStringList>("expected");
    QTest::newRow("names") << "S"
                           << "k" << QStringList();
    QTest::newRow("blank in a key") << "S"
                                    << "a b" << QStringList("S / a b: the key is not a valid name");
    QTest::newRow("blank in a section") << "A B"
                                        << "k" << QStringList("A B: the section name is not valid");
    QTest::newRow("section without a name")
        << ""
        << "k" << QStringList(": the section name is not valid");
    QTest::newRow("section called as the root")
        << "Root"
        << "k" << QStringList("Root: the section has the same name as the root element");
    QTest::newRow("key called as the root")
        << "S"
        << "Root" << QStringList("S / Root: the value would change when read back");
}

void tst_SettingsFile::lossesOfNames()
{
    QFETCH(QString, section);
    QFETCH(QString, key);
    SettingsDocument document;
    document.rootName = "Root";
    document.SetValue(section, key, "v");
    QTEST(SettingsDocument::TextsOf(SettingsFileWriter::Losses(document)), "expected");
}

void tst_SettingsFile::reasons_data()
{
    QTest::addColumn<QString>("value");
    QTest::addColumn<QString>("reason");

    QTest::newRow("end of CDATA") << "a]]>"
                                  << "a value with \"]]>\" makes the file unreadable";
    QTest::newRow("first letter outside Latin-1")
        << QString(QChar(0x100)) << "characters outside Latin-1 become \"?\"";
    QTest::newRow("last letter of Latin-1")
        << QString(QChar(0xff)) << "the value would change when read back";
    QTest::newRow("first letter outside ASCII")
        << QString(QChar(0x80)) << "the value would change when read back";
    QTest::newRow("empty") << ""
                           << "empty values are not saved";
    QTest::newRow("null") << QString() << "empty values are not saved";
    QTest::newRow("placeholder and brackets") << "]]%1"
                                              << "the value would change when read back";
}

void tst_SettingsFile::reasons()
{
    QFETCH(QString, value);
    QFETCH(QString, reason);
    QCOMPARE(SettingsDocument::TextsOf(SettingsFileWriter::Losses(OneValue(value))),
             QStringList("S / k: " + reason));
    QCOMPARE(SettingsFileWriter::ValueProblem(value), reason);
}

void tst_SettingsFile::manyLosses_data()
{
    QTest::addColumn<int>("count");
    QTest::newRow("as many as are listed") << int(SettingsFileReader::MaximumLosses);
    QTest::newRow("one more") << int(SettingsFileReader::MaximumLosses) + 1;
}

void tst_SettingsFile::manyLosses()
{
    QFETCH(int, count);
    const SettingsDocument document =
        SettingsFileReader::ReadBytes("<R>" + QByteArray("<!--c-->").repeated(count) + "</R>");
    QCOMPARE(document.lossCount, count);
    QCOMPARE(document.losses.size(), int(SettingsFileReader::MaximumLosses));
}

// Neither in the settings folder nor in the temporary one.
void tst_SettingsFile::lossesWriteNoFile()
{
    const QTemporaryDir folder;
    const QByteArray temporary = qgetenv("TMPDIR");
    QCoreApplication::instance()->setProperty("DataPath", QString(folder.path() + "/data/"));
    qputenv("TMPDIR", QFile::encodeName(folder.path()));
    // A file that is created there makes it new, also when it is removed again.
    const timespec longAgo[] = {{1000000000, 0}, {1000000000, 0}};
    const QByteArray path = QFile::encodeName(folder.path());
    QCOMPARE(utimensat(AT_FDCWD, path.constData(), longAgo, 0), 0);
    const auto losses = SettingsFileWriter::Losses(OneValue("%1"));
    if (temporary.isNull())
        qunsetenv("TMPDIR");
    else
        qputenv("TMPDIR", temporary);
    QCoreApplication::instance()->setProperty("DataPath", QVariant());
    QCOMPARE(losses.size(), 1);
    QCOMPARE(QFileInfo(folder.path()).lastModified().toSecsSinceEpoch(), qint64(1000000000));
    QCOMPARE(QDir(folder.path()).entryList(QDir::AllEntries | QDir::NoDotAndDotDot), QStringList());
}

void tst_SettingsFile::sameValues_data()
{
    QTest::addColumn<QByteArray>("other");
    QTest::addColumn<bool>("isSame");
    QTest::newRow("the same") << QByteArray("<R><S><a>1</a><b>2</b></S></R>") << true;
    QTest::newRow("under another root") << QByteArray("<Q><S><a>1</a><b>2</b></S></Q>") << true;
    QTest::newRow("another value") << QByteArray("<R><S><a>1</a><b>3</b></S></R>") << false;
    QTest::newRow("another key") << QByteArray("<R><S><a>1</a><c>2</c></S></R>") << false;
    QTest::newRow("another order") << QByteArray("<R><S><b>2</b><a>1</a></S></R>") << false;
    QTest::newRow("a key less") << QByteArray("<R><S><a>1</a></S></R>") << false;
    QTest::newRow("another section") << QByteArray("<R><T><a>1</a><b>2</b></T></R>") << false;
    QTest::newRow("a section more") << QByteArray("<R><S><a>1</a><b>2</b></S><T/></R>") << false;
}

void tst_SettingsFile::sameValues()
{
    QFETCH(QByteArray, other);
    const SettingsDocument one = SettingsFileReader::ReadBytes("<R><S><a>1</a><b>2</b></S></R>");
    QTEST(one.HasSameValues(SettingsFileReader::ReadBytes(other)), "isSame");
    QTEST(SettingsFileReader::ReadBytes(other).HasSameValues(one), "isSame");
}

void tst_SettingsFile::valueByName()
{
    SettingsDocument document =
        SettingsFileReader::ReadBytes("<R><S><a>1</a></S><T><a>2</a></T></R>");
    QCOMPARE(document.Value("T", "a", "none"), QString("2"));
    QCOMPARE(document.Value("T", "b", "none"), QString("none"));
    QCOMPARE(document.Value("U", "a", "none"), QString("none"));
    document.SetValue("T", "a", "3");
    document.SetValue("T", "b", "4");
    document.SetValue("U", "a", "5");
    QCOMPARE(Joined(document), QString("[S] a=1 [T] a=3 b=4 [U] a=5"));
}

void tst_SettingsFile::errorAsLoss_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<QString>("root");
    QTest::addColumn<QStringList>("losses");
    QTest::newRow("none") << QByteArray("<R>\n<!--c--><S/></R>") << "R"
                          << QStringList("Line 2: the comment \"c\"");
    QTest::newRow("after another loss")
        << QByteArray("<R>\n<!--c--><S><a>1</a>") << "R"
        << QStringList({"Line 2: everything from there on (unexpected end of file)",
                        "Line 2: the comment \"c\""});
    QTest::newRow("no root") << QByteArray() << "VelocorSettings"
                             << QStringList(
                                    "Line 1: everything from there on (unexpected end of file)");
}

// What could be read of a damaged file can be edited.
void tst_SettingsFile::errorAsLoss()
{
    QFETCH(QByteArray, bytes);
    QFETCH(QStringList, losses);
    const SettingsDocument parsed = SettingsFileReader::ReadBytes(bytes);
    const SettingsDocument document = parsed.WithErrorAsLoss();
    QVERIFY(document.isParsed);
    QTEST(document.rootName, "root");
    QCOMPARE(SettingsDocument::TextsOf(document.losses), losses);
    QCOMPARE(document.lossCount, losses.size());
    QVERIFY(document.HasSameValues(parsed));
}

void tst_SettingsFile::save()
{
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    SettingsDocument document;
    document.rootName = "LogSettings";
    document.SetValue("config", "filePrefix", "app");
    document.SetValue("config", "x", "<");
    document.sections.append(SettingsDocument::Section{"Empty", {}});
    QString error;
    QVERIFY(SettingsFileWriter::Save(path, document, &error));
    QCOMPARE(error, QString());
    QCOMPARE(TestFiles::read(path),
             QByteArray("<LogSettings>\n<config>\n<filePrefix>app</filePrefix>\n"
                        "<x><![CDATA[<]]></x>\n</config>\n<Empty>\n</Empty>\n</LogSettings>\n"));
}

void tst_SettingsFile::saveFails()
{
    const QTemporaryDir folder;
    QString error;
    QVERIFY(!SettingsFileWriter::Save(folder.filePath("no/x.cfg"), OneValue("v"), &error));
    QCOMPARE(error,
             "Unable to save " + folder.filePath("no/x.cfg") + ": No such file or directory");
}

void tst_SettingsFile::savesNothingInPlaceOfAFile_data()
{
    QTest::addColumn<QString>("path");
    QTest::newRow("device") << "/dev/null";
    QTest::newRow("folder") << QDir::tempPath();
}

void tst_SettingsFile::savesNothingInPlaceOfAFile()
{
    QFETCH(QString, path);
    QString error;
    QVERIFY(!SettingsFileWriter::Save(path, OneValue("v"), &error));
    QCOMPARE(error, QString("Not a regular file"));
}

// As from a full disk that did not tell.
void tst_SettingsFile::savedIncompletely()
{
    const QTemporaryDir folder;
    SettingsDocument twice = OneValue("v");
    twice.sections.append(twice.sections.first());
    for (SettingsDocument const& document : {OneValue("]]>"), twice}) {
        QString error;
        QVERIFY(!SettingsFileWriter::Save(folder.filePath("x.cfg"), document, &error));
        QCOMPARE(error, QString("The file was written, but does not read back completely. "
                                "The disk may be full."));
    }
}

void tst_SettingsFile::fullDisk()
{
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    QVERIFY(TestFiles::write(path, "old\n"));
    if (!ProcessLimits::limitFileSize(100))
        QSKIP("the size of files cannot be limited here");
    QString error;
    const bool saved = SettingsFileWriter::Save(path, OneValue(QString(1000, 'v')), &error);
    ProcessLimits::unlimitFileSize();
    QVERIFY(!saved);
    QVERIFY(!error.isEmpty());
    QCOMPARE(TestFiles::listing(folder.path()), QStringList("x.cfg: old\n"));
}

// Only for those whom permissions bind: the administrator may write to every folder.
void tst_SettingsFile::savesTextInAReadOnlyFolder()
{
    if (geteuid() == 0)
        QSKIP("the administrator can write to every folder");
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    QVERIFY(TestFiles::write(path, "old and longer\n"));
    const QFileDevice::Permissions readOnly = QFileDevice::ReadOwner | QFileDevice::ExeOwner;
    QVERIFY(QFile::setPermissions(folder.path(), readOnly));
    QString error;
    const bool isSaved = SettingsFileWriter::SaveBytes(path, "new\n", &error);
    QVERIFY(QFile::setPermissions(folder.path(), readOnly | QFileDevice::WriteOwner));
    QVERIFY2(isSaved, qPrintable(error));
    QCOMPARE(TestFiles::listing(folder.path()), QStringList("x.cfg: new\n"));
}

void tst_SettingsFile::backup()
{
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    QString error;
    QVERIFY(SettingsFileWriter::KeepBackup(path, &error)); // nothing to lose
    QCOMPARE(TestFiles::listing(folder.path()), QStringList());
    for (char const* content : {"one", "two"}) {
        QVERIFY(TestFiles::write(path, content));
        QVERIFY(SettingsFileWriter::KeepBackup(path, &error));
        QCOMPARE(TestFiles::read(path + ".bak"), QByteArray(content));
        QCOMPARE(TestFiles::read(path), QByteArray(content));
    }
    QCOMPARE(error, QString());
}

void tst_SettingsFile::fullDiskKeepsTheBackup()
{
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    QVERIFY(TestFiles::write(path, QByteArray(1000, 'v')));
    QVERIFY(TestFiles::write(path + ".bak", "old"));
    if (!ProcessLimits::limitFileSize(100))
        QSKIP("the size of files cannot be limited here");
    QString error;
    const bool isKept = SettingsFileWriter::KeepBackup(path, &error);
    ProcessLimits::unlimitFileSize();
    QVERIFY(!isKept && !error.isEmpty());
    QCOMPARE(TestFiles::read(path + ".bak"), QByteArray("old"));
    QCOMPARE(QDir(folder.path()).entryList(QDir::Files), QStringList({"x.cfg", "x.cfg.bak"}));
}

void tst_SettingsFile::linkInPlaceOfTheBackup()
{
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    const QString other = folder.filePath("other");
    QVERIFY(TestFiles::write(path, "one"));
    QString error;
    QVERIFY(TestFiles::write(other, "other"));
    QVERIFY(QFile::link(other, path + ".bak"));
    QVERIFY2(SettingsFileWriter::KeepBackup(path, &error), qPrintable(error));
    QVERIFY(!QFileInfo(path + ".bak").isSymLink());
    QCOMPARE(TestFiles::read(path + ".bak"), QByteArray("one"));
    QCOMPARE(TestFiles::read(other), QByteArray("other"));
}

void tst_SettingsFile::noBackup()
{
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    const QString copy = path + ".bak";
    QString error;
    QVERIFY(QDir().mkpath(path));
    QVERIFY(!SettingsFileWriter::KeepBackup(path, &error));
    QCOMPARE(error, QString("Not a regular file"));
    QVERIFY(QDir().rmdir(path));

    QVERIFY(TestFiles::write(path, "one"));
    QVERIFY(QDir().mkpath(copy + "/in the way"));
    QVERIFY(!SettingsFileWriter::KeepBackup(path, &error));
    QCOMPARE(error, "Cannot replace the file " + copy + ".");
    QVERIFY(QDir(copy).removeRecursively());

    // A link to nowhere is no file that could be removed, and nothing is renamed over it.
    error.clear();
    QVERIFY(QFile::link(folder.filePath("nowhere/y"), copy));
    QVERIFY(!SettingsFileWriter::KeepBackup(path, &error));
    QCOMPARE(error, "Cannot replace the file " + copy + ".");
    QCOMPARE(TestFiles::read(path), QByteArray("one"));
    QCOMPARE(QDir(folder.path()).entryList(QDir::Files), QStringList("x.cfg"));
}

QTEST_GUILESS_MAIN(tst_SettingsFile)
#include "tst_SettingsFile.moc"

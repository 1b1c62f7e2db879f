// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares what the settings editor says saving would lose with what is really missing from the
// file after the store has loaded and saved it.

#include "app/settingsfile/SettingsFileReader.h"
#include "app/settingsfile/SettingsFileWriter.h"
#include "common/config/TorkConfigFile.h"

#include "Rounds.h"
#include "support/MessageCapture.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QtTest>

#include <random>

using namespace Velocor;

namespace {

// Everything a document contains, one line each, except for white space between elements.
// Consecutive pieces of text are joined.
class Contents : public QXmlDefaultHandler
{
public:
    static QStringList of(QByteArray const& document)
    {
        Contents contents;
        QXmlInputSource source;
        source.setData(document);
        QXmlSimpleReader reader;
        reader.setContentHandler(&contents);
        reader.setLexicalHandler(&contents);
        const bool parses = reader.parse(source);
        return parses ? contents.m_lines : QStringList();
    }

    bool startPrefixMapping(QString const& prefix, QString const& uri) override
    {
        return add("namespace " + prefix + "=" + uri);
    }

    bool startElement(QString const&, QString const&, QString const& name,
                      QXmlAttributes const& attributes) override
    {
        add("<" + name);
        for (int i = 0; i < attributes.count(); ++i)
            m_lines.append(attributes.qName(i) + "=" + attributes.value(i));
        m_isLeaf = ++m_depth == 3;
        return true;
    }

    bool endElement(QString const&, QString const&, QString const& name) override
    {
        add(">" + name);
        m_isLeaf = false;
        --m_depth;
        return true;
    }

    bool characters(QString const& text) override
    {
        m_text += text;
        return true;
    }

    bool comment(QString const& text) override { return add("comment " + text); }

    bool startDTD(QString const& name, QString const&, QString const&) override
    {
        return add("type " + name);
    }

    bool processingInstruction(QString const& target, QString const& data) override
    {
        // The parser reports the declaration, too.
        return target == "xml" || add("instruction " + target + data);
    }

private:
    bool add(QString const& line)
    {
        const bool isBlank = m_text.trimmed().isEmpty() && !(m_isLeaf && line.startsWith('>'));
        if (!isBlank)
            m_lines.append("text " + m_text);
        m_text.clear();
        m_lines.append(line);
        return true;
    }

    QStringList m_lines;
    QString m_text;
    int m_depth = 0;
    bool m_isLeaf = false;
};

// Generates documents; most contain one or two things that the store ignores, or none.
class Documents
{
public:
    explicit Documents(quint32 seed) : m_random(seed) {}

    QByteArray next()
    {
        QString document;
        if (chance(40))
            document += chance(2) ? "<?xml version=\"1.0\"?>"
                                  : "<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>";
        if (chance(40))
            document += "<!DOCTYPE R [<!ENTITY e 'x'>]>";
        spoil(document);
        document += "<R>\n";
        for (int sections = below(4); sections > 0; --sections) {
            const QString section = name("S" + QString::number(below(40)));
            open(document, section);
            spoil(document);
            for (int items = below(5); items > 0; --items) {
                item(document);
                spoil(document);
            }
            document += "</" + section + ">\n";
        }
        spoil(document);
        return (document + "</R>\n" + (chance(60) ? "<" : "")).toUtf8();
    }

    SettingsDocument nextValues()
    {
        SettingsDocument document;
        document.rootName = "R";
        QStringList names;
        for (int sections = 1 + below(3); sections > 0; --sections) {
            const QString section = writtenName("S" + QString::number(sections));
            if (names.contains(section))
                continue; // a document holds each section once
            names.append(section);
            document.sections.append({section, {}});
            for (int items = below(4); items > 0; --items)
                document.SetValue(section, writtenName("k" + QString::number(items)), value());
        }
        return document;
    }

private:
    int below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }
    bool chance(int oneIn) { return below(oneIn) == 0; }

    QString oneOf(QStringList const& texts) { return texts[below(texts.size())]; }

    QString name(QString const& usual)
    {
        static const QStringList names = {"R", "n:p", QString::fromUtf8("\xC3\xA9"), "a.b-c"};
        return chance(25) ? oneOf(names) : usual;
    }

    QString writtenName(QString const& usual)
    {
        static const QStringList names = {"R",   "1a", "a b", "a/b", "a:b", "a>", "a\t",
                                          "a%1", "",   "-",   "_",   "a.b", "a_", "-a"};
        if (chance(40))
            return oneOf(names);
        return chance(60) ? QString(QChar(0xE9)) : usual;
    }

    QString value()
    {
        static const QStringList pieces = {"%",    "%1", "%L3", "%04", "%4",   "]]>",
                                           "]]",   "<",  "&",   "\r",  "\xE9", "\n",
                                           "\x01", "L",  "3",   " ",   "0",    QChar(0x20AC)};
        if (!chance(4))
            return "v";
        QString text = "";
        for (int left = below(4); left > 0; --left)
            text += oneOf(pieces);
        return text;
    }

    void open(QString& document, QString const& element)
    {
        document += "<" + element;
        if (chance(40))
            document += oneOf({" a='1'", " xmlns='urn:x'", " xmlns:n='urn:x'"});
        document += ">";
    }

    void spoil(QString& document)
    {
        static const QStringList things = {
            "<!-- c -->",      "text",         "<?do it?>", "\n ",
            "<R><k>v</k></R>", "<R>v</R>",     "<k/>",      "<a><b/></a>",
            "<a><b>v</b></a>", "<![CDATA[]]>", "&e;"};
        if (chance(40))
            document += oneOf(things);
    }

    void item(QString& document)
    {
        static const QStringList values = {
            "v", " ", "<![CDATA[<&>]]>", "&amp;", "x&amp;y", "1\n", "&#65;b", "\t", "50 %"};
        static const QStringList spoiled = {"",
                                            "<![CDATA[]]>",
                                            "v<!-- c -->",
                                            "<!-- c -->v",
                                            "v<!-- c -->w",
                                            "x<![CDATA[y]]>",
                                            "<![CDATA[x]]> ",
                                            "v<d>w</d>",
                                            "v<d/>w",
                                            "<d>w</d>v",
                                            "<d/>",
                                            " <d>w</d>",
                                            "<d><e>w</e></d>",
                                            "<R>v</R>",
                                            "<R/>v",
                                            "v<?do it?>w",
                                            "%1",
                                            "]]&gt;",
                                            "&#xE9;",
                                            "&#x20AC;",
                                            "&e;",
                                            "x&e;y"};
        const QString key = name("k" + QString::number(below(60)));
        open(document, key);
        document += oneOf(chance(12) ? spoiled : values) + "</" + key + ">";
    }

    std::mt19937 m_random;
};

} // namespace

class tst_PlainSettingsFile : public QObject
{
    Q_OBJECT

private slots:
    void randomDocuments();
    void randomValues();
    void cleanupTestCase();

private:
    void compareDocument(QByteArray const& text);
    void compareValues(SettingsDocument const& document);

    QTemporaryDir m_folder;
    int m_documents = 0;
    int m_keptDocuments = 0;
    int m_values = 0;
    int m_keptValues = 0;
};

void tst_PlainSettingsFile::compareDocument(QByteArray const& text)
{
    const SettingsDocument document = SettingsFileReader::ReadBytes(text);
    const QString path = m_folder.filePath("x.cfg");
    QVERIFY(TestFiles::write(path, text));
    TorkConfigFile store(path, "R");
    {
        const MessageCapture messages;
        QCOMPARE(store.Load(), document.isParsed);
    }
    QCOMPARE(document.error.isEmpty(), document.isParsed);
    if (!document.isParsed)
        return;
    QCOMPARE(document.losses.isEmpty(), document.lossCount == 0);

    QVERIFY(QFile::remove(path)); // some disks are slow to truncate a file
    QVERIFY(store.Save());
    const QByteArray saved = TestFiles::read(path);
    {
        const MessageCapture messages;
        store.Load(); // an empty value is in the file, but is gone after loading it
    }
    const QStringList before = Contents::of(text);
    const bool isKept = !text.contains("ISO-8859-1") && before == Contents::of(saved) &&
                        before == Contents::of(store.ToXml());
    const QStringList losses =
        SettingsDocument::TextsOf(document.losses + SettingsFileWriter::Losses(document));
    QVERIFY(!before.isEmpty());
    QVERIFY2(losses.isEmpty() == isKept, qPrintable("named: " + losses.join(" | ")));
    QVERIFY(QFile::remove(path));
    ++m_documents;
    m_keptDocuments += isKept;
}

void tst_PlainSettingsFile::randomDocuments()
{
    Documents documents(Rounds::seed());
    const int count = Rounds::count(3000, 100000);
    for (int i = 0; i < count; ++i) {
        const QByteArray text = documents.next();
        compareDocument(text);
        if (QTest::currentTestFailed()) {
            qWarning("document %d:\n%s", i, text.constData());
            return;
        }
    }
    // Otherwise the documents prove little.
    QVERIFY(m_keptDocuments > m_documents / 5 && m_keptDocuments < m_documents * 4 / 5);
}

void tst_PlainSettingsFile::compareValues(SettingsDocument const& document)
{
    const QString path = m_folder.filePath("x.cfg");
    TorkConfigFile store(path, document.rootName);
    for (SettingsDocument::Section const& section : document.sections) {
        if (!store.HasSection(section.name))
            store.AppendSection(new TorkConfigFileSection(section.name.toUtf8().constData()));
        for (SettingsDocument::Item const& item : section.items)
            store.FindSection(section.name)->AddValue(item.key, item.value);
    }
    QVERIFY(store.Save());
    {
        const MessageCapture messages;
        store.Load();
    }
    bool isKept = store.sectionList().size() == document.sections.size();
    for (SettingsDocument::Section const& section : document.sections) {
        isKept = isKept && store.HasSection(section.name) &&
                 store.keyList(section.name).size() == section.items.size();
        for (SettingsDocument::Item const& item : section.items) {
            TorkConfigFileSection* const found = store.FindSection(section.name);
            QString value;
            isKept = isKept && found && found->FindValue(item.key, value) && value == item.value;
        }
    }
    const QStringList losses = SettingsDocument::TextsOf(SettingsFileWriter::Losses(document));
    QVERIFY2(losses.isEmpty() == isKept, qPrintable("named: " + losses.join(" | ")));
    QVERIFY(QFile::remove(path));
    ++m_values;
    m_keptValues += isKept;
}

void tst_PlainSettingsFile::randomValues()
{
    Documents documents(Rounds::seed() + 1);
    const int count = Rounds::count(3000, 100000);
    for (int i = 0; i < count; ++i) {
        const SettingsDocument document = documents.nextValues();
        compareValues(document);
        if (QTest::currentTestFailed()) {
            for (SettingsDocument::Section const& section : document.sections) {
                qWarning("[%s]", qPrintable(section.name));
                for (SettingsDocument::Item const& item : section.items)
                    qWarning("%s=%s", qPrintable(item.key), qPrintable(item.value));
            }
            return;
        }
    }
    QVERIFY(m_keptValues > m_values / 5 && m_keptValues < m_values * 4 / 5);
}

void tst_PlainSettingsFile::cleanupTestCase()
{
    std::printf(
        "plain settings file: %d files compared, %d of them kept whole; %d documents saved, "
        "%d of them kept whole\n",
        m_documents, m_keptDocuments, m_values, m_keptValues);
    std::fflush(stdout);
}

QTEST_GUILESS_MAIN(tst_PlainSettingsFile)
#include "tst_PlainSettingsFile.moc"

// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares loading of random documents with the plain version: a handler that keeps lists of texts,
// on Qt's reader alone.

#include "common/config/TorkConfigFile.h"

#include "PlainLine.h"
#include "PlainLoader.h"
#include "Rounds.h"
#include "support/MessageCapture.h"
#include "support/TestFiles.h"

#include <QFile>
#include <QTemporaryDir>
#include <QVector>
#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QtTest>

#include <random>

namespace {

// Generates documents that touch every rule of the format, and some that are not well-formed XML.
class Documents
{
public:
    explicit Documents(quint32 seed) : m_random(seed) {}

    QByteArray next()
    {
        m_hasType = chance(3);
        QString document;
        if (chance(6))
            document += "<?xml version=\"1.0\"?>";
        filler(document);
        if (m_hasType)
            type(document);
        filler(document);
        const QString root = chance(2) ? QStringLiteral("VelocorSettings") : name();
        element(document, root, 1);
        filler(document);

        QByteArray bytes = document.toUtf8();
        if (chance(6))
            damage(bytes);
        return bytes;
    }

private:
    int below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }
    bool chance(int oneIn) { return below(oneIn) == 0; }

    template <int Count>
    QString oneOf(char const* const (&texts)[Count])
    {
        return QString::fromUtf8(texts[below(Count)]);
    }

    QString name()
    {
        static char const* const names[] = {"s",   "t",        "u",        "k",
                                            "l",   "d",        "e",        "S",
                                            "n:s", "k1",       "n:k",      "long-name.x_y",
                                            "x:t", "\xC3\xA9", "\xD0\xBA", "\xC3\x83\xC2\xA9"};
        if (chance(8))
            return chance(4) ? QStringLiteral("n:VelocorSettings")
                             : QStringLiteral("VelocorSettings");
        return oneOf(names);
    }

    void filler(QString& document)
    {
        static char const* const fillers[] = {" ",        "\n",     "\r\n\t", "<!-- <s> & -->",
                                              "<?pi d?>", "<!---->"};
        while (chance(3))
            document += oneOf(fillers);
    }

    void type(QString& document)
    {
        static char const* const declarations[] = {
            "<!ENTITY e 'text'>",
            "<!ENTITY e \"\">",
            "<!ENTITY f '<d>x</d>'>",
            "<!ENTITY g '&e;&#37;&e;'>",
            "<!ENTITY g '&g;'>",
            "<!ENTITY h '100&#37; &lt;'>",
            "<!ENTITY h SYSTEM 'none.xml'>",
            "<!ENTITY % p 'x'>",
            "<!ELEMENT s (k|l)*>",
            "<!ELEMENT k (#PCDATA)>",
            "<!ELEMENT s ((k,l)?,(d|e)+)>",
            "<!ELEMENT k ANY>",
            "<!ATTLIST k a CDATA #IMPLIED b (x|y) 'x'>",
            "<!NOTATION n SYSTEM 'n'>",
            "<!-- (((( %p; -->",
            "<?pi (?>",
            "\n",
        };
        document += "<!DOCTYPE " + name();
        if (!chance(5)) {
            document += " [";
            while (!chance(6))
                document += oneOf(declarations);
            document += ']';
        }
        document += '>';
    }

    void text(QString& document)
    {
        static char const* const texts[] = {"v",
                                            "w",
                                            "1 2",
                                            " ",
                                            "\n  ",
                                            "\r\n",
                                            "&amp;",
                                            "&lt;x&gt;",
                                            "&#65;",
                                            "&#x20AC;",
                                            "<![CDATA[a&b]]>",
                                            "<![CDATA[]]>",
                                            "<!-- c -->",
                                            "<?pi?>",
                                            "&none;",
                                            "\xC3\xA9\xE2\x82\xAC",
                                            "%1",
                                            "yes"};
        static char const* const references[] = {"&e;", "&f;", "&g;", "&h;", "a&e;b"};
        document += m_hasType && chance(3) ? oneOf(references) : oneOf(texts);
    }

    void element(QString& document, QString const& elementName, int depth)
    {
        document += '<' + elementName;
        if (chance(8))
            document += QStringLiteral(" a='1'");
        if (chance(12))
            document += chance(2) ? " xmlns:n='urn:n'" : " xmlns='urn:d'";
        if (chance(8)) {
            document += "/>";
            return;
        }
        document += '>';
        while (!chance(depth <= 2 ? 8 : 3)) {
            const bool wantsText = depth >= 3 ? !chance(4) : chance(4);
            if (wantsText)
                text(document);
            else if (depth < 7)
                element(document, name(), depth + 1);
        }
        document += "</" + elementName + (chance(20) ? " >" : ">");
    }

    void damage(QByteArray& bytes)
    {
        static char const* const pieces[] = {"<",    ">",    "&", "/",  "]]>", "<s>",
                                             "</s>", "\xFF", "'", "<!", ";"};
        const int place = below(bytes.size());
        switch (below(4)) {
        case 0:
            bytes.truncate(place);
            break;
        case 1:
            bytes.remove(place, 1 + below(8));
            break;
        case 2:
            bytes.insert(place, pieces[below(static_cast<int>(sizeof pieces / sizeof *pieces))]);
            break;
        default:
            bytes.insert(place, bytes.mid(below(bytes.size()), 1 + below(20)));
        }
    }

    std::mt19937 m_random;
    bool m_hasType = false;
};

QByteArray SavedBytes(QVector<PlainSection> const& sections)
{
    QByteArray bytes = "<VelocorSettings>\n";
    for (PlainSection const& section : sections) {
        bytes += PlainLine::tag("<%1>\n", section.name);
        for (auto const& item : section.items)
            bytes += PlainLine::item(item.first, item.second);
        bytes += PlainLine::tag("</%1>\n", section.name);
    }
    return bytes + "</VelocorSettings>\n";
}

} // namespace

class tst_PlainLoad : public QObject
{
    Q_OBJECT

private slots:
    void randomDocuments();

private:
    void compare(QByteArray const& document, bool& parses, int& values);

    QTemporaryDir m_folder;
};

void tst_PlainLoad::compare(QByteArray const& document, bool& parses, int& values)
{
    QXmlInputSource source;
    source.setData(document);
    PlainLoader plain(QStringLiteral("VelocorSettings"));
    QXmlSimpleReader reader;
    reader.setContentHandler(&plain);
    parses = reader.parse(source);

    const QString path = m_folder.filePath("x.cfg");
    QVERIFY(TestFiles::write(path, document));
    TorkConfigFile file(path);
    file.WriteItem("before", "k", "v");
    {
        const MessageCapture messages;
        QCOMPARE(file.Load(), parses);
        QCOMPARE(messages.texts().size(), parses ? 0 : 1);
    }
    QCOMPARE(file.m_lastError.isEmpty(), parses);

    for (PlainSection const& section : plain.sections()) {
        TorkConfigFileSection* found = file.FindSection(section.name);
        QVERIFY(found != nullptr);
        QVERIFY(found->IsCalled(section.name));
        const auto items = found->values();
        QCOMPARE(items.size(), section.items.size());
        for (int i = 0; i < items.size(); ++i) {
            QCOMPARE(items[i].key, section.items[i].first);
            QCOMPARE(items[i].value, section.items[i].second);
            ++values;
        }
    }
    // The file gives the order of the sections and shows that there are no others.
    QVERIFY(QFile::remove(path)); // some disks are slow to truncate a file
    QVERIFY(file.Save());
    QCOMPARE(TestFiles::read(path), SavedBytes(plain.sections()));
    QVERIFY(QFile::remove(path));
}

void tst_PlainLoad::randomDocuments()
{
    Documents documents(Rounds::seed());
    const int count = Rounds::count(3000, 100000);
    int wellFormed = 0;
    int values = 0;
    for (int i = 0; i < count; ++i) {
        const QByteArray document = documents.next();
        bool parses = false;
        compare(document, parses, values);
        if (QTest::currentTestFailed()) {
            qWarning("document %d:\n%s", i, document.constData());
            return;
        }
        wellFormed += parses;
    }
    std::printf("plain load: %d documents compared, %d of them well-formed, %d values\n", count,
                wellFormed, values);
    // Otherwise the documents prove little.
    QVERIFY(wellFormed > count / 4 && wellFormed < count);
    QVERIFY(values > count);
}

QTEST_APPLESS_MAIN(tst_PlainLoad)
#include "tst_PlainLoad.moc"

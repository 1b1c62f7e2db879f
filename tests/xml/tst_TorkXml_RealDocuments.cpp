// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseManager_Base.h"
#include "common/xml/TorkXml_ParseState_Base.h"

#include <QFile>
#include <QMap>
#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QXmlStreamReader>
#include <QtTest>

// Documents that this project did not write, found where their packages install them. What the
// manager's states see is compared with what Qt's other XML parser sees.

namespace {

char const* const MimeDatabase = "/usr/share/mime/packages/freedesktop.org.xml";

// The contents of a document, by element name: how many, their attributes and their text in order.
struct Census
{
    QMap<QString, int> elements;
    QMap<QString, QStringList> attributes; // "name=value"
    QMap<QString, QString> text;
};

// One for each open element; counts itself and keeps what it is given.
class CountingState : public TorkXml_ParseState_Base
{
public:
    static int alive;

    CountingState(QString const& name, TorkXml_ParseManager_Base* manager, Census& census)
        : TorkXml_ParseState_Base(name, manager), m_name(name), m_census(census)
    {
        ++alive;
        ++m_census.elements[name];
    }

    ~CountingState() override { --alive; }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        return new CountingState(name, ParseManager(), m_census);
    }

    bool ProcessContent(QString const& name, QString const& content) override
    {
        // Attributes come first. One with its element's own name would be taken for text, and the
        // comparison would fail.
        if (name == m_name)
            m_census.text[m_name] += content;
        else
            m_census.attributes[m_name] << name + "=" + content;
        return true;
    }

private:
    QString m_name;
    Census& m_census;
};

int CountingState::alive = 0;

class CountingManager : public TorkXml_ParseManager_Base
{
public:
    Census census;

    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return new CountingState(name, this, census);
    }
};

// Skips the whole document, and counts how often it was called on the way.
class FlushingManager : public TorkXml_ParseManager_Base
{
public:
    int asked = 0;

    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        ++asked;
        return new TorkXml_FlushUnknownElement(name, this);
    }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        ++asked;
        return TorkXml_ParseManager_Base::GetNextState(name);
    }
};

// Knows the root's children by name alone and skips their contents.
class ChildCountingState : public TorkXml_ParseState_Base
{
public:
    ChildCountingState(QString const& name, TorkXml_ParseManager_Base* manager,
                       QMap<QString, int>& children)
        : TorkXml_ParseState_Base(name, manager), m_children(children)
    {}

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        ++m_children[name];
        return new TorkXml_FlushUnknownElement(name, ParseManager());
    }

    bool ProcessContent(QString const&, QString const&) override { return true; }

private:
    QMap<QString, int>& m_children;
};

class ChildCountingManager : public TorkXml_ParseManager_Base
{
public:
    QMap<QString, int> children;

    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return new ChildCountingState(name, this, children);
    }
};

Census CensusByStreamReader(QByteArray const& document, QMap<QString, int>* children = nullptr)
{
    Census census;
    QXmlStreamReader reader(document);
    QStringList open;
    while (!reader.atEnd()) {
        const QXmlStreamReader::TokenType token = reader.readNext();
        if (token == QXmlStreamReader::StartElement) {
            const QString name = reader.name().toString();
            ++census.elements[name];
            if (children && open.size() == 1)
                ++(*children)[name];
            open << name;
            for (QXmlStreamAttribute const& attribute : reader.attributes()) {
                if (attribute.isDefault()) // declared, not written: the SAX reader leaves it out
                    continue;
                const QString local = attribute.name().toString();
                census.attributes[name] << (local == "href" ? QString("xlink:href") : local) + "=" +
                                               attribute.value().toString();
            }
        } else if (token == QXmlStreamReader::EndElement) {
            open.removeLast();
        } else if (token == QXmlStreamReader::Characters && !open.isEmpty()) {
            census.text[open.last()] += reader.text().toString();
        }
    }
    if (reader.hasError())
        qWarning("%s", qPrintable(reader.errorString()));
    return census;
}

bool Parse(TorkXml_ParseManager_Base& manager, QByteArray const& document)
{
    QXmlInputSource source;
    source.setData(document);
    QXmlSimpleReader reader;
    reader.setContentHandler(&manager);
    return reader.parse(source);
}

int Sum(QMap<QString, int> const& counts)
{
    int sum = 0;
    for (int count : counts)
        sum += count;
    return sum;
}

QByteArray ContentOf(QString const& name)
{
    QFile file(name);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

} // namespace

class tst_TorkXml_RealDocuments : public QObject
{
    Q_OBJECT

private slots:
    void cleanup();

    void flushedWhole_data() { documents(); }
    void flushedWhole();
    void countedWhole_data() { documents(); }
    void countedWhole();
    void childrenCountedAndSkipped_data() { documents(); }
    void childrenCountedAndSkipped();
    void readInPieces_data() { documents(); }
    void readInPieces();
    void cutShort_data();
    void cutShort();
    void mimeTypesAndGlobs();

private:
    static void documents();
};

void tst_TorkXml_RealDocuments::cleanup()
{
    QCOMPARE(CountingState::alive, 0);
}

void tst_TorkXml_RealDocuments::documents()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("shared MIME database") << MimeDatabase;

    // Where installed, documents of other makers with other habits.
    static const struct
    {
        char const* title;
        char const* name;
    } others[] = {
        {"keyboard layouts, with an external subset", "/usr/share/X11/xkb/rules/evdev.xml"},
        {"languages, with an internal subset", "/usr/share/xml/iso-codes/iso_639-3.xml"},
        {"font settings", "/etc/fonts/fonts.conf"},
    };
    for (auto const& other : others) {
        if (QFile::exists(other.name))
            QTest::newRow(other.title) << other.name;
    }
}

void tst_TorkXml_RealDocuments::flushedWhole()
{
    QFETCH(QString, name);
    const QByteArray document = ContentOf(name);
    if (document.isEmpty())
        QSKIP("the document is not installed");

    FlushingManager manager;
    QVERIFY(Parse(manager, document));

    QCOMPARE(manager.asked, Sum(CensusByStreamReader(document).elements));
    QVERIFY(manager.LastState() == nullptr);
    QVERIFY(!manager.PopElement());
    QString report;
    manager.FormatErrors(report);
    QCOMPARE(report, QString("Failed to parse the XML content:\n"));
}

void tst_TorkXml_RealDocuments::countedWhole()
{
    QFETCH(QString, name);
    const QByteArray document = ContentOf(name);
    if (document.isEmpty())
        QSKIP("the document is not installed");

    CountingManager manager;
    QVERIFY(Parse(manager, document));
    QCOMPARE(CountingState::alive, 0);

    const Census expected = CensusByStreamReader(document);
    QVERIFY(Sum(expected.elements) > 1);
    QCOMPARE(manager.census.elements, expected.elements);
    for (QString const& element : expected.elements.keys()) {
        QCOMPARE(manager.census.attributes.value(element), expected.attributes.value(element));
        QCOMPARE(manager.census.text.value(element), expected.text.value(element));
    }
}

void tst_TorkXml_RealDocuments::childrenCountedAndSkipped()
{
    QFETCH(QString, name);
    const QByteArray document = ContentOf(name);
    if (document.isEmpty())
        QSKIP("the document is not installed");

    ChildCountingManager manager;
    QVERIFY(Parse(manager, document));

    QMap<QString, int> expected;
    CensusByStreamReader(document, &expected);
    QVERIFY(!expected.isEmpty());
    QCOMPARE(manager.children, expected);
}

void tst_TorkXml_RealDocuments::readInPieces()
{
    QFETCH(QString, name);
    const QByteArray document = ContentOf(name);
    if (document.isEmpty())
        QSKIP("the document is not installed");

    CountingManager manager;
    QXmlSimpleReader reader;
    reader.setContentHandler(&manager);
    QXmlInputSource source;
    const int pieceSize = 4096;
    source.setData(document.left(pieceSize));
    bool ok = reader.parse(&source, true);
    for (int at = pieceSize; ok && at < document.size(); at += pieceSize) {
        source.setData(document.mid(at, pieceSize));
        ok = reader.parseContinue();
    }
    QVERIFY(ok);
    source.setData(QByteArray());
    QVERIFY(reader.parseContinue());

    QCOMPARE(manager.census.elements, CensusByStreamReader(document).elements);
    QVERIFY(manager.LastState() == nullptr);
}

void tst_TorkXml_RealDocuments::cutShort_data()
{
    QTest::addColumn<int>("percent");

    for (int percent : {1, 10, 25, 50, 75, 90, 99})
        QTest::addRow("after %d %%", percent) << percent;
}

void tst_TorkXml_RealDocuments::cutShort()
{
    QFETCH(int, percent);
    const QByteArray document = ContentOf(MimeDatabase);
    if (document.isEmpty())
        QSKIP("the shared MIME database is not installed");

    {
        CountingManager manager;
        QVERIFY(!Parse(manager, document.left(document.size() / 100 * percent)));

        int openElements = 0;
        const int states = CountingState::alive;
        while (manager.PopElement())
            ++openElements;
        QCOMPARE(states, openElements);
    }
    QCOMPARE(CountingState::alive, 0);
}

void tst_TorkXml_RealDocuments::mimeTypesAndGlobs()
{
    const QByteArray document = ContentOf(MimeDatabase);
    if (document.isEmpty())
        QSKIP("the shared MIME database is not installed");

    CountingManager manager;
    QVERIFY(Parse(manager, document));

    const Census expected = CensusByStreamReader(document);
    QVERIFY(expected.elements.value("mime-type") > 0);
    QVERIFY(expected.elements.value("glob") > 0);
    QCOMPARE(manager.census.elements.value("mime-type"), expected.elements.value("mime-type"));
    QCOMPARE(manager.census.elements.value("glob"), expected.elements.value("glob"));
    QCOMPARE(manager.census.attributes.value("mime-type").filter("type=").size(),
             expected.elements.value("mime-type"));
}

QTEST_GUILESS_MAIN(tst_TorkXml_RealDocuments)
#include "tst_TorkXml_RealDocuments.moc"

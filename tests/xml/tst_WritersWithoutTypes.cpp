// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "xml/WritersWithoutTypes.h"

#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

using WritersWithoutTypes::Overrides;
Q_DECLARE_METATYPE(Overrides)

namespace {

const QString Document = "<a>\n  <b>c</b>\n  <d><![CDATA[e&f]]></d>\n  <g  h=\"i\"/>\n</a>\n";

template <class Writer>
void WriteDocument(Writer& writer)
{
    writer.WriteElementStart("a", 1);
    writer.WriteElement("b", "c");
    writer.WriteElement("d", "e&f");
    writer.WriteElementOpen("g", 1);
    writer.WriteAttribute("h", "i");
    writer.WriteElementCloseAndEnd("g", 1);
    writer.WriteElementEnd("a", 1);
}

} // namespace

class tst_WritersWithoutTypes : public QObject
{
    Q_OBJECT

private slots:
    void stream_data() { addRows(); }
    void stream();
    void file_data() { addRows(); }
    void file();

private:
    void addRows();
};

void tst_WritersWithoutTypes::addRows()
{
    QTest::addColumn<Overrides>("overrides");
    QTest::addColumn<QStringList>("calls");

    QStringList pieces;
    for (char const* piece : {"<a>\n", "  ", "<b>", "c", "</b>\n", "  ", "<d>", "<![CDATA[e&f]]>",
                              "</d>\n", "  ", "<g ", " h=\"i\"/>\n", "</a>\n"})
        pieces << QString("Write %1").arg(piece);
    QTest::newRow("overrides nothing") << Overrides::Nothing << QStringList();
    QTest::newRow("overrides Write()") << Overrides::Write << pieces;
    QTest::newRow("overrides WriteElementValue()")
        << Overrides::ElementValue << QStringList({"WriteElementValue c", "WriteElementValue e&f"});
}

void tst_WritersWithoutTypes::stream()
{
    QFETCH(Overrides, overrides);
    QString text;
    const QStringList calls =
        WritersWithoutTypes::withStream(overrides, text, WriteDocument<TorkXmlStream>);
    QCOMPARE(text, Document);
    QTEST(calls, "calls");
}

void tst_WritersWithoutTypes::file()
{
    QFETCH(Overrides, overrides);
    const QTemporaryDir folder;
    const QString path = folder.filePath("written.xml");
    const QStringList calls =
        WritersWithoutTypes::withFile(overrides, path, WriteDocument<TorkXmlFile>);
    QCOMPARE(QString::fromLatin1(TestFiles::read(path)), Document);
    QTEST(calls, "calls");
}

QTEST_GUILESS_MAIN(tst_WritersWithoutTypes)
#include "tst_WritersWithoutTypes.moc"

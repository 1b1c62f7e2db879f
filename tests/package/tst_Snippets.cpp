// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The usage examples in the headers are those that are compiled: examples/snippets has a file for
// each header, with the same code as the header.

#include "support/TestFiles.h"

#include <QDir>
#include <QFileInfo>
#include <QRegularExpression>
#include <QtTest>

class tst_Snippets : public QObject
{
    Q_OBJECT

private slots:
    void headerShowsCompiledExample_data();
    void headerShowsCompiledExample();
    void snippetHasHeader_data();
    void snippetHasHeader();
};

namespace {

const char* const headerFolders[] = {"app", "common/config", "common/log", "common/xml"};

QString Source(QString const& path)
{
    return QString::fromUtf8(TestFiles::read(QStringLiteral(PROJECT_FOLDER "/") + path));
}

QString WithoutSpace(QString text)
{
    return text.remove(QRegularExpression("\\s"));
}

// The examples in the comment of a class: in each, lines that are indented by five or more.
QStringList Examples(QString const& header)
{
    QStringList examples;
    bool inExample = false;
    const QStringList lines = header.split('\n');
    for (QString const& line : lines) {
        const bool code = line.startsWith("///     ");
        if (code && !inExample)
            examples.append(QString());
        if (code)
            examples.last() += line.mid(3);
        inExample = code;
    }
    return examples;
}

} // namespace

void tst_Snippets::headerShowsCompiledExample_data()
{
    QTest::addColumn<QString>("header");

    for (const QString folder : headerFolders) {
        const QStringList headers =
            QDir(QStringLiteral(PROJECT_FOLDER "/") + folder).entryList({"*.h"}, QDir::Files);
        QVERIFY2(!headers.isEmpty(), qPrintable(folder));
        for (QString const& header : headers) {
            // A member of both writers, which no application uses by name.
            if (!header.endsWith("_p.h") && header != "TorkXmlLayout.h")
                QTest::newRow(qPrintable(header)) << folder + '/' + header;
        }
    }
}

void tst_Snippets::headerShowsCompiledExample()
{
    QFETCH(QString, header);

    const QStringList examples = Examples(Source(header));
    QVERIFY2(!examples.isEmpty(), "the header has no usage example");

    const QString name = QFileInfo(header).completeBaseName();
    const QString snippet = WithoutSpace(Source("examples/snippets/" + name + ".cpp"));
    for (QString const& example : examples)
        QVERIFY2(snippet.contains(WithoutSpace(example)), qPrintable(example));
}

void tst_Snippets::snippetHasHeader_data()
{
    QTest::addColumn<QString>("snippet");

    const QStringList snippets =
        QDir(PROJECT_FOLDER "/examples/snippets").entryList({"*.cpp"}, QDir::Files);
    QVERIFY(!snippets.isEmpty());
    for (QString const& snippet : snippets)
        QTest::newRow(qPrintable(snippet)) << snippet;
}

void tst_Snippets::snippetHasHeader()
{
    QFETCH(QString, snippet);

    const QString header = QFileInfo(snippet).completeBaseName() + ".h";
    const bool found = std::any_of(
        std::begin(headerFolders), std::end(headerFolders), [&header](QString const& folder) {
            return QFile::exists(QStringLiteral(PROJECT_FOLDER "/") + folder + '/' + header);
        });
    QVERIFY2(found, qPrintable(header));
}

QTEST_GUILESS_MAIN(tst_Snippets)

#include "tst_Snippets.moc"

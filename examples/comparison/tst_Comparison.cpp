// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Gives the programs on the framework and those on plain Qt the same input, prints what they do as
// the tables of docs/comparison.md, and compares these with the page.

#include "common/config/TorkConfigFile.h"
#include "common/config/TorkConfigText.h"

#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QFileInfo>
#include <QLibraryInfo>
#include <QProcess>
#include <QSettings>
#include <QTemporaryDir>
#include <QVersionNumber>
#include <QtTest>

#include <csignal>
#include <cstdio>
#include <functional>

class tst_Comparison : public QObject
{
    Q_OBJECT

private slots:
    void lines();
    void converter();
    void editor();
    void page();

private:
    QString m_tables;
};

namespace {

const QStringList Sides = {"Tork", "Qt"};

// Lines with code: neither blank nor a comment or an #include.
int CodeLines(QString const& source)
{
    QFile file(SOURCES "/" + source);
    if (!file.open(QIODevice::ReadOnly))
        qFatal("%s: %s", qPrintable(source), qPrintable(file.errorString()));
    int count = 0;
    const QList<QByteArray> lines = file.readAll().split('\n');
    for (QByteArray const& line : lines) {
        const QByteArray text = line.trimmed();
        if (!text.isEmpty() && !text.startsWith("//") && !text.startsWith("#include"))
            ++count;
    }
    return count;
}

QByteArray ReadAll(QString const& path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

void Write(QString const& path, QByteArray const& content)
{
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly) || file.write(content) != content.size())
        qFatal("%s: %s", qPrintable(path), qPrintable(file.errorString()));
}

QString Row(QStringList const& cells)
{
    return "| " + cells.join(" | ") + " |\n";
}

// As one line, with the pictures of control characters.
QString Visible(QString text)
{
    text = text.simplified();
    for (QChar& character : text) {
        if (character < QChar(' '))
            character = QChar(0x2400 + character.unicode());
    }
    return '`' + text + '`';
}

// What it says about the document, or the text that it writes.
QString Convert(QString const& side, QByteArray const& document)
{
    const QTemporaryDir folder;
    Write(folder.filePath("in.xml"), document);
    QProcess process;
    process.start(PROGRAMS "/converter_on_" + side.toLower(),
                  {folder.filePath("in.xml"), folder.filePath("out.html")});
    if (!process.waitForFinished(60000) || process.exitStatus() != QProcess::NormalExit)
        return "does not end by itself";

    QString errors = QString::fromUtf8(process.readAllStandardError());
    errors.remove("Failed to parse the XML content:\n").remove("Public ID: , System ID: \n");
    if (process.exitCode() != 0)
        return "refuses: " + Visible(errors);
    // With the size, as Qt 5 ends at a null otherwise.
    const QByteArray written = ReadAll(folder.filePath("out.html"));
    return "writes " + Visible(QString::fromUtf8(written.constData(), written.size()));
}

// Runs an editor as its user would: starts it, and asks it to end when it is ready.
class Run
{
public:
    explicit Run(QString const& side) : m_side(side) { QDir().mkpath(data()); }

    QString data() const { return m_folder.path() + "/Tork/Editor"; }
    QString settings() const { return data() + (m_side == "Tork" ? "/editor.cfg" : "/editor.ini"); }

    QString File(QString const& name) const
    {
        Write(m_folder.filePath(name), "text");
        return m_folder.filePath(name);
    }

    // The exit code, what it warned of, and how many of the files are recent ones afterwards.
    QString Start(QStringList const& arguments)
    {
        QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
        environment.insert("XDG_DATA_HOME", m_folder.path());
        environment.insert("QT_QPA_PLATFORM", "offscreen");
        QProcess process;
        process.setProcessEnvironment(environment);
        QFile::remove(Log());
        process.start(PROGRAMS "/editor_on_" + m_side.toLower(), arguments);
        QElapsedTimer waited;
        waited.start();
        while (!IsReady()) {
            if (waited.hasExpired(60000)) {
                process.kill();
                process.waitForFinished();
                return "is not ready";
            }
            QTest::qWait(10);
        }
        kill(pid_t(process.processId()), SIGTERM);
        if (!process.waitForFinished(60000)) {
            process.kill();
            process.waitForFinished();
            return "does not end";
        }

        // Other warnings are those of Qt about this display.
        const QByteArray text = ReadAll(Log());
        const bool told = text.contains(" Warning \"ConfigFile - ") ||
                          text.contains("[warning] The settings cannot be read");
        return QString("exit code %1, %2, recent: %3")
            .arg(process.exitCode())
            .arg(told ? "tells the user" : "tells nothing", Recent());
    }

private:
    QString Log() const { return data() + "/logs/editor.log"; }

    // Or waits for an answer to what is wrong with the settings.
    bool IsReady() const
    {
        const QByteArray text = ReadAll(Log());
        return text.contains("ready") || text.contains("Could not parse");
    }

    QString Recent() const
    {
        QStringList names;
        if (m_side == "Tork") {
            TorkConfigFile file(settings());
            QString none, list;
            if (QFileInfo(settings()).isFile() && file.Load())
                file.ReadItem("Files", "recent", none, list);
            names = TorkConfigText::DecodeValue(list).split('|');
        } else {
            names = QSettings(settings(), QSettings::IniFormat).value("recent").toStringList();
        }
        names.removeAll(QString());
        for (QString& name : names)
            name = '`' + QFileInfo(name).fileName() + '`';
        return names.isEmpty() ? "none" : names.join(", ");
    }

    QTemporaryDir m_folder;
    QString m_side;
};

} // namespace

void tst_Comparison::lines()
{
    m_tables += Row({"lines of code", "on the framework", "on plain Qt"}) + "|---|---|---|\n";
    for (char const* program : {"Editor", "Converter"}) {
        QStringList cells(QString(program).toLower());
        for (QString const& side : Sides)
            cells.append(
                QString::number(CodeLines(program + QStringLiteral("On") + side + ".cpp")));
        m_tables += Row(cells);
    }
}

void tst_Comparison::converter()
{
    const auto inTitle = [](QByteArray const& text) {
        return "<books><book><title>" + text + "</title></book></books>";
    };
    QByteArray entities = "<!DOCTYPE books [<!ENTITY e0 \"x\">";
    for (int i = 1; i < 10; ++i) {
        entities += "<!ENTITY e" + QByteArray::number(i) + " \"" +
                    QByteArray("&e" + QByteArray::number(i - 1) + ";").repeated(10) + "\">";
    }
    QByteArray prefixes = "<books>";
    for (int i = 0; i < 3000; ++i)
        prefixes += "<book xmlns:p" + QByteArray::number(i) + "=\"u\">";
    prefixes += QByteArray("</book>").repeated(3000) + "</books>";

    struct Input
    {
        char const* name;
        QByteArray document;
    };
    const QVector<Input> inputs = {
        {"a book", inTitle("A &lt; B &amp; \xe2\x98\x83")},
        {"mismatched tags", "<books>\n<book></books>"},
        {"an unknown element", "<books>\n<pen/></books>"},
        {"text after the end", "<books/>text"},
        {"empty", ""},
        {"an attribute twice", "<books><book year=\"1\" year=\"2\"/></books>"},
        {"bytes that are not UTF-8", inTitle("a\xff\xfe"
                                             "b")},
        {"an entity that is not declared", inTitle("a&undeclared;b")},
        {"a control character", inTitle("a\x01"
                                        "b")},
        {"a reference to character 0", inTitle("a&#0;b")},
        {"version 9.0", "<?xml version=\"9.0\"?><books/>"},
        {"entities of a gigabyte", entities + "]>" + inTitle("&e9;")},
        {"100,000 nested elements", "<books><book>" + QByteArray("<x>").repeated(100000) +
                                        QByteArray("</x>").repeated(100000) + "</book></books>"},
        {"200,000 nested groups in a document type",
         "<!DOCTYPE books [<!ELEMENT books " + QByteArray("(").repeated(200000) + "a" +
             QByteArray(")").repeated(200000) + ">]><books/>"},
        {"3,000 namespace prefixes", prefixes},
    };
    m_tables += '\n' + Row({"XML", "on the framework", "on plain Qt"}) + "|---|---|---|\n";
    for (Input const& input : inputs) {
        m_tables += Row({input.name, Convert(Sides.at(0), input.document),
                         Convert(Sides.at(1), input.document)});
    }
}

void tst_Comparison::editor()
{
    struct Input
    {
        char const* name;
        std::function<QString(Run&)> result;
    };
    const QVector<Input> inputs = {
        {"a file, and SIGTERM",
         [](Run& run) {
             return run.Start({run.File("text.txt")});
         }},
        {"a file name with `%`, `<` and `☃`",
         [](Run& run) {
             return run.Start({run.File(QString::fromUtf8("90%1 <b> \xe2\x98\x83.txt"))});
         }},
        {"a file name with a vertical bar",
         [](Run& run) {
             return run.Start({run.File("left|right.txt")}).replace('|', "\\|");
         }},
        {"settings cut off in the middle",
         [](Run& run) {
             run.Start({run.File("text.txt")});
             const QByteArray all = ReadAll(run.settings());
             Write(run.settings(), all.left(all.size() / 2));
             return run.Start({});
         }},
        {"settings that are something else",
         [](Run& run) {
             Write(run.settings(), "<broken>");
             return run.Start({});
         }},
    };
    m_tables += '\n' + Row({"editor", "on the framework", "on plain Qt"}) + "|---|---|---|\n";
    for (Input const& input : inputs) {
        QStringList cells(QString::fromUtf8(input.name));
        for (QString const& side : Sides) {
            Run run(side);
            cells.append(input.result(run));
        }
        m_tables += Row(cells);
    }
}

void tst_Comparison::page()
{
    std::printf("%s", qPrintable(m_tables));
    std::fflush(stdout);
    // Other versions of Qt have other messages.
    if (QLibraryInfo::version().majorVersion() != 5)
        QSKIP("the page shows what Qt 5 does");
    QVERIFY2(QString::fromUtf8(ReadAll(PAGE)).contains(m_tables),
             "the page does not show these tables");
}

QTEST_GUILESS_MAIN(tst_Comparison)

#include "tst_Comparison.moc"

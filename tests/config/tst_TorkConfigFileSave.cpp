// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include "ConfigContents.h"
#include "StoreTest.h"
#include "support/MessageCapture.h"
#include "support/ProcessLimits.h"
#include "support/TestFiles.h"

#include <QDir>
#include <QTemporaryDir>
#include <QtTest>

#include <memory>

#ifdef Q_OS_UNIX
#include <unistd.h>
#endif

using namespace StoreTest;

class tst_TorkConfigFileSave : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void cleanupTestCase();
    void init();

    void filterContent_data();
    void filterContent();

    void save_data();
    void save();
    void saveManyKeysInTheOrderOfTheKeyList();
    void saveManySections();
    void saveReplacesALongerFile();
    void saveShortFileName_data();
    void saveShortFileName();
    void saveUnopenable_data();
    void saveUnopenable();
    void saveAsOtherUser();
    void saveIgnoresWriteErrors_data();
    void saveIgnoresWriteErrors();
    void saveKeepsLastErrorOnSuccess();
    void setFileName();

    void saveAndLoad_data();
    void saveAndLoad();
    void fileNames_data();
    void fileNames();

private:
    QString path(QString const& name) const { return m_folder->filePath(name); }

    std::unique_ptr<QTemporaryDir> m_folder;
    QString m_startFolder;
};

void tst_TorkConfigFileSave::initTestCase()
{
    m_startFolder = QDir::currentPath();
}

void tst_TorkConfigFileSave::cleanupTestCase()
{
    QDir::setCurrent(m_startFolder);
}

void tst_TorkConfigFileSave::init()
{
    QDir::setCurrent(m_startFolder);
    m_folder = std::make_unique<QTemporaryDir>();
    QVERIFY2(m_folder->isValid(), qPrintable(m_folder->errorString()));
    QDir::setCurrent(m_folder->path());
}

void tst_TorkConfigFileSave::filterContent_data()
{
    QTest::addColumn<QString>("in");
    QTest::addColumn<QString>("expected");

    QTest::newRow("plain stays bare") << "ab"
                                      << "ab";
    QTest::newRow("ampersand") << "a&b"
                               << "<![CDATA[a&b]]>";
    QTest::newRow("apostrophe") << "a'b"
                                << "<![CDATA[a'b]]>";
    QTest::newRow("less than") << "a<b"
                               << "<![CDATA[a<b]]>";
    QTest::newRow("greater than") << "a>b"
                                  << "<![CDATA[a>b]]>";
    QTest::newRow("double quotation mark") << "a\"b"
                                           << "<![CDATA[a\"b]]>";
    QTest::newRow("only a mark") << "&"
                                 << "<![CDATA[&]]>";
    QTest::newRow("mark at the start") << "<a"
                                       << "<![CDATA[<a]]>";
    QTest::newRow("mark at the end") << "a\""
                                     << "<![CDATA[a\"]]>";
    QTest::newRow("all of them") << "&'<>\""
                                 << "<![CDATA[&'<>\"]]>";
    QTest::newRow("entities are not resolved") << "&amp;"
                                               << "<![CDATA[&amp;]]>";
    QTest::newRow("end of a CDATA section is not escaped") << "a]]>b"
                                                           << "<![CDATA[a]]>b]]>";
    QTest::newRow("wrapped already") << "<![CDATA[a]]>"
                                     << "<![CDATA[<![CDATA[a]]>]]>";
    QTest::newRow("empty") << ""
                           << "";
    QTest::newRow("blank") << " "
                           << " ";
    QTest::newRow("brackets alone stay bare") << "a]]"
                                              << "a]]";
    QTest::newRow("line ends stay bare") << "a\nb\r\n"
                                         << "a\nb\r\n";
    QTest::newRow("other punctuation stays bare") << "`!?%#;/\\="
                                                  << "`!?%#;/\\=";
    QTest::newRow("typographic marks stay bare")
        << QString("\u2019\u201D\u2039") << QString("\u2019\u201D\u2039");
    QTest::newRow("placeholder stays bare") << "%1"
                                            << "%1";
    QTest::newRow("placeholder beside a mark") << "%1&%2"
                                               << "<![CDATA[%1&%2]]>";
}

void tst_TorkConfigFileSave::filterContent()
{
    QFETCH(QString, in);
    TorkConfigFile file{QString()};

    QString given = in;
    QString out = QStringLiteral("before");
    file.FilterContent(given, out);
    QTEST(out, "expected");
    QCOMPARE(given, in);

    file.FilterContent(given, given);
    QTEST(given, "expected");
}

void tst_TorkConfigFileSave::save_data()
{
    QTest::addColumn<QString>("root");
    QTest::addColumn<Setup>("fill");
    QTest::addColumn<QByteArray>("expected");

    const QString usual("VelocorSettings");
    const auto items = [](QStringList const& keysAndValues) {
        return Setup([keysAndValues](TorkConfigFile& file) {
            for (int i = 0; i < keysAndValues.size(); i += 2)
                file.WriteItem("s", keysAndValues[i], keysAndValues[i + 1]);
        });
    };
    const auto inside = [](QByteArray const& lines) {
        return "<VelocorSettings>\n<s>\n" + lines + "</s>\n</VelocorSettings>\n";
    };

    QTest::newRow("no section") << usual << items({})
                                << QByteArray("<VelocorSettings>\n</VelocorSettings>\n");
    QTest::newRow("its own root element")
        << "LogSettings" << items({"k", "v"})
        << QByteArray("<LogSettings>\n<s>\n<k>v</k>\n</s>\n</LogSettings>\n");
    QTest::newRow("empty root element name") << "" << items({}) << QByteArray("<>\n</>\n");
    QTest::newRow("root element name is a placeholder")
        << "%1" << items({}) << QByteArray("<%1>\n</%1>\n");
    QTest::newRow("empty section") << usual << Setup([](TorkConfigFile& f) {
        f.AppendSection(new TorkConfigFileSection("s"));
    }) << inside("");
    QTest::newRow("cleared section") << usual << Setup([](TorkConfigFile& f) {
        f.WriteItem("s", "k", "v");
        f.ClearSection("s");
    }) << inside("");
    QTest::newRow("section name is a placeholder")
        << usual << Setup([](TorkConfigFile& f) { f.WriteItem("%1", "k", "v"); })
        << QByteArray("<VelocorSettings>\n<%1>\n<k>v</k>\n</%1>\n</VelocorSettings>\n");
    QTest::newRow("names without their blanks")
        << usual << Setup([](TorkConfigFile& f) { f.WriteItem("Main Window", "my key", "v w"); })
        << QByteArray("<VelocorSettings>\n<MainWindow>\n<mykey>v w</mykey>\n</MainWindow>\n"
                      "</VelocorSettings>\n");

    QTest::newRow("plain value") << usual << items({"k", "ab"}) << inside("<k>ab</k>\n");
    QTest::newRow("empty value") << usual << items({"k", ""}) << inside("<k></k>\n");
    QTest::newRow("blank value") << usual << items({"k", " "}) << inside("<k> </k>\n");
    QTest::newRow("empty key") << usual << items({"", "v"}) << inside("<>v</>\n");
    QTest::newRow("replaced value") << usual << items({"k", "v", "k", "w"}) << inside("<k>w</k>\n");
    QTest::newRow("line ends in a value")
        << usual << items({"k", "a\nb\r\nc"}) << inside("<k>a\nb\r\nc</k>\n");
    QTest::newRow("ampersand") << usual << items({"k", "a&b"})
                               << inside("<k><![CDATA[a&b]]></k>\n");
    QTest::newRow("apostrophe") << usual << items({"k", "a'b"})
                                << inside("<k><![CDATA[a'b]]></k>\n");
    QTest::newRow("less than") << usual << items({"k", "a<b"})
                               << inside("<k><![CDATA[a<b]]></k>\n");
    QTest::newRow("greater than") << usual << items({"k", "a>b"})
                                  << inside("<k><![CDATA[a>b]]></k>\n");
    QTest::newRow("double quotation mark")
        << usual << items({"k", "a\"b"}) << inside("<k><![CDATA[a\"b]]></k>\n");
    QTest::newRow("end of a CDATA section")
        << usual << items({"k", "a]]>b"}) << inside("<k><![CDATA[a]]>b]]></k>\n");
    QTest::newRow("Latin-1 text") << usual << items({QString("gr\u00FC\u00DF"), QString("\u00E9")})
                                  << inside("<gr\xFC\xDF>\xE9</gr\xFC\xDF>\n");
    QTest::newRow("text beyond Latin-1")
        << usual << items({QString("\u043A\u043B"), QString("1 \u20AC")})
        << inside("<?"
                  "?>1 ?</?"
                  "?>\n");

    // Key, value and key are substituted one at a time, each at the lowest marker left by then.
    QTest::newRow("value holds %1") << usual << items({"k", "%1"}) << inside("<k>k</%3>\n");
    QTest::newRow("value holds %2") << usual << items({"k", "a%2b"}) << inside("<k>akb</%3>\n");
    QTest::newRow("value holds %3") << usual << items({"k", "%3"}) << inside("<k>k</k>\n");
    QTest::newRow("value holds %4") << usual << items({"k", "%4"}) << inside("<k>%4</k>\n");
    QTest::newRow("value holds %1 twice")
        << usual << items({"k", "%1-%1"}) << inside("<k>k-k</%3>\n");
    QTest::newRow("value holds %1 and %2")
        << usual << items({"k", "%1%2"}) << inside("<k>k%2</%3>\n");
    QTest::newRow("value holds a localised marker")
        << usual << items({"k", "%L1"}) << inside("<k>k</%3>\n");
    QTest::newRow("value holds a two-digit marker")
        << usual << items({"k", "%12"}) << inside("<k>%12</k>\n");
    QTest::newRow("value holds %1 and markup")
        << usual << items({"k", "%1 & more"}) << inside("<k><![CDATA[k & more]]></%3>\n");
    QTest::newRow("value holds a bare percent sign")
        << usual << items({"k", "100%"}) << inside("<k>100%</k>\n");
    QTest::newRow("key is %1") << usual << items({"%1", "v"}) << inside("<v>%1</%3>\n");
    QTest::newRow("key is %2") << usual << items({"%2", "v"}) << inside("<v>v</%2>\n");
    QTest::newRow("key is %4") << usual << items({"%4", "v"}) << inside("<%4>v</%4>\n");
}

void tst_TorkConfigFileSave::save()
{
    QFETCH(QString, root);
    QFETCH(Setup, fill);
    TorkConfigFile file(path("x.cfg"), root);
    fill(file);

    QVERIFY(file.Save());
    QTEST(TestFiles::read(path("x.cfg")), "expected");
    QVERIFY(file.m_lastError.isEmpty());

    // Saving changes nothing in memory.
    QVERIFY(file.Save());
    QTEST(TestFiles::read(path("x.cfg")), "expected");
}

void tst_TorkConfigFileSave::saveManyKeysInTheOrderOfTheKeyList()
{
    TorkConfigFile file(path("x.cfg"));
    for (int i = 0; i < 50; ++i)
        file.WriteItem("s", QStringLiteral("key%1").arg(i), QString::number(i * i));

    QByteArray expected = "<VelocorSettings>\n<s>\n";
    const QStringList keys = file.keyList("s");
    QCOMPARE(keys.size(), 50);
    for (QString const& key : keys) {
        const int i = key.mid(3).toInt();
        expected += "<key" + QByteArray::number(i) + '>' + QByteArray::number(i * i) + "</key" +
                    QByteArray::number(i) + ">\n";
    }
    expected += "</s>\n</VelocorSettings>\n";

    file.Save();
    QCOMPARE(TestFiles::read(path("x.cfg")), expected);
}

void tst_TorkConfigFileSave::saveManySections()
{
    TorkConfigFile file(path("x.cfg"));
    file.WriteItem("One", "k", "1");
    file.WriteItem("Two", "k", "2");
    file.Save();

    const QByteArray one = "<One>\n<k>1</k>\n</One>\n";
    const QByteArray two = "<Two>\n<k>2</k>\n</Two>\n";
    const QByteArray saved = TestFiles::read(path("x.cfg"));
    const QByteArray oneFirst = "<VelocorSettings>\n" + one + two + "</VelocorSettings>\n";
    const QByteArray twoFirst = "<VelocorSettings>\n" + two + one + "</VelocorSettings>\n";
    QVERIFY2(saved == oneFirst || saved == twoFirst, saved.constData());
}

void tst_TorkConfigFileSave::saveReplacesALongerFile()
{
    QVERIFY(TestFiles::write(path("x.cfg"), QByteArray(10000, 'x')));
    TorkConfigFile file(path("x.cfg"));
    file.Save();
    QCOMPARE(TestFiles::read(path("x.cfg")), QByteArray("<VelocorSettings>\n</VelocorSettings>\n"));
}

void tst_TorkConfigFileSave::saveShortFileName_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QStringList>("files");

    const QString saved("<VelocorSettings>\n<s>\n<k>v</k>\n</s>\n</VelocorSettings>\n");
    QTest::newRow("null") << QString() << QStringList();
    QTest::newRow("empty") << "" << QStringList();
    QTest::newRow("one character") << "a" << QStringList();
    QTest::newRow("two characters are enough") << "ab" << QStringList{"ab: " + saved};
}

void tst_TorkConfigFileSave::saveShortFileName()
{
    QFETCH(QString, name);
    TorkConfigFile file(path("missing.cfg"));
    file.WriteItem("s", "k", "v");
    QVERIFY(!file.Load());
    QCOMPARE(file.m_lastError, NotFoundText);
    file.SetFileName(name);

    QVERIFY(file.Save());
    QTEST(TestFiles::listing(m_folder->path()), "files");
    QCOMPARE(file.m_lastError, NotFoundText);
}

void tst_TorkConfigFileSave::saveUnopenable_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("a folder in its place") << "folder";
    QTest::newRow("folder missing") << "none/x.cfg";
    QTest::newRow("a file for a folder") << "file/x.cfg";
    QTest::newRow("placeholder in the name") << "none/%1 %2.cfg";
    QTest::newRow("blanks and other letters in the name") << QString("no ne/Gr\u00F6\u00DFe.cfg");
}

void tst_TorkConfigFileSave::saveUnopenable()
{
    QFETCH(QString, name);
    QVERIFY(QDir(m_folder->path()).mkdir("folder"));
    QVERIFY(TestFiles::write(path("file"), "here"));
    const QStringList before = TestFiles::listing(m_folder->path());
    TorkConfigFile file(path(name));
    file.WriteItem("s", "k", "v");

    QVERIFY(file.Save());
    QCOMPARE(file.m_lastError, "Unable to open file: " + path(name));
    QCOMPARE(TestFiles::listing(m_folder->path()), before);
    QCOMPARE(ConfigContents::of(file, {"s"}), QString("s{k=[v]}"));
}

void tst_TorkConfigFileSave::saveAsOtherUser()
{
    QVERIFY(TestFiles::write(path("x.cfg"), "not to be touched"));
    QVERIFY(QFile::setPermissions(path("x.cfg"), QFile::ReadOwner | QFile::ReadOther));
    QVERIFY(QFile::setPermissions(m_folder->path(), QFile::ReadOwner | QFile::ExeOwner |
                                                        QFile::WriteOwner | QFile::ReadOther |
                                                        QFile::ExeOther));
    TorkConfigFile file(path("x.cfg"));
    {
        const ProcessLimits::OrdinaryUser user;
        if (!user.isInForce())
            QSKIP("no right to become another user");
        QVERIFY(file.Save());
    }
    QCOMPARE(file.m_lastError, "Unable to open file: " + path("x.cfg"));
    QCOMPARE(TestFiles::read(path("x.cfg")), QByteArray("not to be touched"));
}

void tst_TorkConfigFileSave::saveIgnoresWriteErrors_data()
{
    QTest::addColumn<bool>("fullDevice");

    QTest::newRow("full device") << true;
    QTest::newRow("file size limit") << false;
}

void tst_TorkConfigFileSave::saveIgnoresWriteErrors()
{
    QFETCH(bool, fullDevice);
    const QString name = fullDevice ? QStringLiteral("/dev/full") : path("x.cfg");
    if (fullDevice && !QFile::exists(name))
        QSKIP("this system has no device that is always full");
    TorkConfigFile file(name);
    file.WriteItem("s", "k", QString(100000, 'v'));

    const MessageCapture messages;
    if (!fullDevice && !ProcessLimits::limitFileSize(4096))
        QSKIP("no limit for file sizes here");
    const bool saved = file.Save();
    if (!fullDevice)
        QVERIFY(ProcessLimits::unlimitFileSize());

    QVERIFY(saved);
    QVERIFY(file.m_lastError.isEmpty());
    QCOMPARE(messages.texts(), QStringList());
    QCOMPARE(file.keyList("s"), QStringList{"k"});
    if (!fullDevice)
        QCOMPARE(QFileInfo(name).size(), 4096);
}

void tst_TorkConfigFileSave::saveKeepsLastErrorOnSuccess()
{
    TorkConfigFile file(path("none/x.cfg"));
    file.Save();
    const QString failure = "Unable to open file: " + path("none/x.cfg");
    QCOMPARE(file.m_lastError, failure);

    file.SetFileName(path("x.cfg"));
    QVERIFY(file.Save());
    QVERIFY(QFile::exists(path("x.cfg")));
    QCOMPARE(file.m_lastError, failure);
}

void tst_TorkConfigFileSave::setFileName()
{
    TorkConfigFile file(path("one.cfg"), "Root");
    file.WriteItem("s", "k", "v");
    file.m_lastError = "kept";

    file.SetFileName(path("two.cfg"));
    QCOMPARE(file.m_lastError, QString("kept"));
    QCOMPARE(ConfigContents::of(file, {"s"}), QString("s{k=[v]}"));

    file.Save();
    QCOMPARE(TestFiles::listing(m_folder->path()),
             QStringList{"two.cfg: <Root>\n<s>\n<k>v</k>\n</s>\n</Root>\n"});

    QVERIFY(TestFiles::write(path("three.cfg"), "<Root><t><a>b</a></t></Root>"));
    file.SetFileName(path("three.cfg"));
    QVERIFY(file.Load());
    QCOMPARE(ConfigContents::of(file, {"s", "t"}), QString("t{a=[b]}"));
}

void tst_TorkConfigFileSave::saveAndLoad_data()
{
    QTest::addColumn<QString>("value");
    QTest::addColumn<bool>("parses");
    QTest::addColumn<bool>("comesBack");

    QTest::newRow("plain") << "ab" << true << true;
    QTest::newRow("ampersand") << "a&b" << true << true;
    QTest::newRow("an entity's text") << "&lt;&#65;" << true << true;
    QTest::newRow("tags") << "<a>b</a><!-- c -->" << true << true;
    QTest::newRow("both quotation marks") << "'\"" << true << true;
    QTest::newRow("one blank") << " " << true << true;
    QTest::newRow("blanks around") << "  a b  " << true << true;
    QTest::newRow("line ends and tabs") << "a\n\tb\n" << true << true;
    QTest::newRow("brackets") << "a]]b]" << true << true;
    QTest::newRow("brackets beside a mark") << "a&b]]" << true << true;
    QTest::newRow("percent signs") << "100 % %%" << true << true;
    QTest::newRow("200000 characters") << QString(200000, 'y') << true << true;
    QTest::newRow("200000 characters in CDATA") << QString(200000, '&') << true << true;
    QTest::newRow("empty is lost") << "" << true << false;
    QTest::newRow("end of a CDATA section does not parse back") << "a]]>b" << false << false;
    QTest::newRow("placeholder does not parse back") << "a%1b" << false << false;
    QTest::newRow("third placeholder turns into the key") << "%3" << true << false;
}

void tst_TorkConfigFileSave::saveAndLoad()
{
    QFETCH(QString, value);
    QFETCH(bool, parses);
    QFETCH(bool, comesBack);
    TorkConfigFile writer(path("x.cfg"));
    writer.WriteItem("Main", "key", value);
    writer.Save();

    const MessageCapture messages;
    TorkConfigFile reader(path("x.cfg"));
    QCOMPARE(reader.Load(), parses);
    QCOMPARE(reader.m_lastError, parses ? QString() : NotParsedText);
    QCOMPARE(messages.texts().size(), parses ? 0 : 1);

    QString none("none");
    QString back;
    const bool found = reader.ReadItem("Main", "key", none, back);
    QCOMPARE(found && back == value, comesBack);
}

void tst_TorkConfigFileSave::fileNames_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("relative") << "x.cfg";
    QTest::newRow("two characters") << "ab";
    QTest::newRow("blanks") << " my file .cfg";
    QTest::newRow("other letters") << QString("Gr\u00F6\u00DFe \u043A\u043B\u044E\u0447.cfg");
    QTest::newRow("placeholder") << "%1%2.cfg";
    QTest::newRow("markup") << "a&b'<>.cfg";
    QTest::newRow("hidden") << ".x";
}

void tst_TorkConfigFileSave::fileNames()
{
    QFETCH(QString, name);
    TorkConfigFile writer(name);
    writer.WriteItem("s", "k", "v");
    QVERIFY(writer.Save());
    QVERIFY(writer.m_lastError.isEmpty());
    QCOMPARE(TestFiles::listing(m_folder->path()),
             QStringList{name + ": <VelocorSettings>\n<s>\n<k>v</k>\n</s>\n</VelocorSettings>\n"});

    TorkConfigFile reader(name);
    QVERIFY(reader.Load());
    QCOMPARE(ConfigContents::of(reader, {"s"}), QString("s{k=[v]}"));
}

QTEST_GUILESS_MAIN(tst_TorkConfigFileSave)

#include "tst_TorkConfigFileSave.moc"

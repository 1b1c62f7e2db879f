// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares a settings file with a plain model, a list of lists, through random programs: sections,
// texts and typed values, ownership, loading and saving.

#include "common/TorkQt_p.h"
#include "common/config/TorkConfigFile.h"
#include "plain/PlainLine.h"
#include "plain/PlainLoader.h"
#include "plain/Program.h"
#include "support/TestFiles.h"

#include <QApplication>
#include <QBuffer>
#include <QColor>
#include <QFont>
#include <QMap>
#include <QScreen>
#include <QTemporaryDir>
#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QtTest>

#include <memory>

class tst_PlainStore : public QObject
{
    Q_OBJECT

private slots:
    void programs();
};

namespace {

// Those of files that do not parse; Qt warns of fonts.
int g_messages = 0;

void CountMessage(QtMsgType type, QMessageLogContext const&, QString const&)
{
    g_messages += type == QtCriticalMsg;
}

// A section that shows whether it is deleted, once and in time.
class CountedSection : public TorkConfigFileSection
{
public:
    using TorkConfigFileSection::TorkConfigFileSection;
    explicit CountedSection(char const* name) : TorkConfigFileSection(name) { ++alive; }
    ~CountedSection() override { --alive; }

    static inline int alive = 0;
};

struct PlainHeldSection : PlainSection
{
    PlainHeldSection(QString const& sectionName, bool counted) : isCounted(counted)
    {
        name = sectionName;
        alive += isCounted;
    }
    ~PlainHeldSection() { alive -= isCounted; }
    Q_DISABLE_COPY(PlainHeldSection)

    QString const* find(QString const& key) const
    {
        for (auto const& item : items) {
            if (item.first == key)
                return &item.second;
        }
        return nullptr;
    }

    void add(QString const& key, QString const& value)
    {
        for (auto& item : items) {
            if (item.first == key) {
                item.second = value;
                return;
            }
        }
        items.append({key, value});
    }

    QStringList keys() const
    {
        QStringList result;
        for (auto const& item : items)
            result.append(item.first);
        return result;
    }

    const bool isCounted;
    static inline int alive = 0;
};

class PlainStore
{
public:
    using Section = std::shared_ptr<PlainHeldSection>;

    QVector<Section> sections;
    Section current;
    QString rootName = "VelocorSettings";
    QString lastError = QLatin1String("");

    Section find(QString const& name)
    {
        for (Section const& section : sections) {
            if (section->name == name)
                return current = section;
        }
        return nullptr;
    }

    // In the place of the section that had the name.
    void put(Section const& added)
    {
        for (Section& section : sections) {
            if (section->name != added->name)
                continue;
            if (current == section)
                current = added;
            section = added;
            return;
        }
        sections.append(added);
    }

    bool write(QString section, QString key, QString const& value)
    {
        if (key.isNull() || value.isNull())
            return false;
        section.remove(' ');
        key.remove(' ');
        Section target = find(section);
        if (!target) {
            target = std::make_shared<PlainHeldSection>(
                QString::fromUtf8(section.toLatin1().constData()), false);
            put(target);
            current = target;
        }
        target->add(key, value);
        return true;
    }

    QString const* read(QString section, QString key)
    {
        section.remove(' ');
        key.remove(' ');
        const Section found = find(section);
        return found ? found->find(key) : nullptr;
    }

    void clear()
    {
        sections.clear();
        current.reset();
    }

    bool load(QByteArray const& document)
    {
        clear();
        QXmlInputSource source;
        source.setData(document);
        PlainLoader loader(rootName);
        QXmlSimpleReader reader;
        reader.setContentHandler(&loader);
        const bool parsed = reader.parse(source);
        for (PlainSection const& section : loader.sections()) {
            sections.append(std::make_shared<PlainHeldSection>(section.name, false));
            sections.last()->items = section.items;
        }
        if (loader.current() >= 0)
            current = sections[loader.current()];
        return parsed;
    }

    QByteArray xml() const
    {
        QByteArray bytes = PlainLine::tag("<%1>\n", rootName);
        for (Section const& section : sections) {
            bytes += PlainLine::tag("<%1>\n", section->name);
            for (auto const& item : section->items)
                bytes += PlainLine::item(item.first, item.second);
            bytes += PlainLine::tag("</%1>\n", section->name);
        }
        return bytes + PlainLine::tag("</%1>\n", rootName);
    }

    QStringList names() const
    {
        QStringList result;
        for (Section const& section : sections)
            result.append(section->name);
        return result;
    }
};

// The numbers of a text that is split at commas and minus signs.
QVector<int> Numbers(QString text)
{
    QVector<int> numbers;
    for (QString const& part : text.replace('-', ',').split(','))
        numbers.append(part.toInt());
    return numbers;
}

QStringList Texts(QVector<int> const& numbers)
{
    QStringList texts;
    for (int number : numbers)
        texts.append(QString::number(number));
    return texts;
}

// One edge of a window: its position, its extent and the desktop's.
void Fit(int& position, int& extent, int desktop, int minimum, bool keepsMinimum)
{
    int end = static_cast<int>(qint64(position) + extent); // wraps, as stored numbers may be any
    if (extent < 0)
        extent = minimum;
    if (extent > desktop)
        extent = desktop - 1;
    if (position < 0) {
        position = 0;
        end = extent;
    }
    if (extent < minimum) {
        end = static_cast<int>(qint64(position) + minimum);
        if (keepsMinimum)
            extent = minimum;
    }
    if (end >= desktop) {
        end = desktop - 1;
        position = qMax(0, desktop - 1 - qMax(extent, minimum));
    }
    extent = static_cast<int>(qint64(end) - position);
}

class Stores : public Program::Pair
{
public:
    Stores() : m_store("x.cfg")
    {
        g_messages = 0;
        QFile::remove("x.cfg");
        QFile::remove("y.cfg");
    }

    ~Stores()
    {
        for (Held const& held : m_held) {
            if (!isInFile(held))
                delete held.real;
        }
    }

    Q_DISABLE_COPY(Stores)

    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(64);
        if (kind < 14)
            writeText();
        else if (kind < 20)
            readText();
        else if (kind < 26)
            writeTyped();
        else if (kind < 34)
            readTyped();
        else if (kind < 40)
            lookUp();
        else if (kind < 48)
            own();
        else if (kind < 52)
            useHeld();
        else if (kind < 55)
            file();
        else if (kind < 59)
            save();
        else if (kind < 62)
            load();
        else
            change();
        compareCurrent();
    }

    void finish()
    {
        same("bytes", m_store.ToXml(), m_plain.xml());
        same("sections", m_store.sectionList(), m_plain.names());
        same("last error", m_store.m_lastError, m_plain.lastError);
        same("alive", CountedSection::alive, PlainHeldSection::alive);
        same("messages", g_messages, m_messages);
        for (char const* name : {"x.cfg", "y.cfg"})
            same(name, QFile::exists(name) ? TestFiles::read(name) : QByteArray("(none)"),
                 m_files.value(name, "(none)"));
    }

private:
    struct Held
    {
        TorkConfigFileSection* real;
        PlainStore::Section plain;
    };

    QString name()
    {
        static char const* const names[] = {"A",
                                            "B",
                                            "A",
                                            "B",
                                            "C",
                                            "a",
                                            "Main Window",
                                            "MainWindow",
                                            "ApplicationScreens",
                                            " A",
                                            "",
                                            "VelocorSettings",
                                            "\xC3\xA9",
                                            "\xC3\x83\xC2\xA9",
                                            "\xE6\x97\xA5",
                                            "x.y-z_1",
                                            "n:B",
                                            "?",
                                            "x%1"};
        return m_draws->once(2) ? QString::fromUtf8(m_draws->oneOf(names)) : "A";
    }

    QString key()
    {
        static char const* const keys[] = {"k",        "l",     "m",  "k", "K",
                                           "my key",   "mykey", "",   "A", "VelocorSettings",
                                           "\xC3\xA9", "a%1",   "n:k"};
        if (!m_draws->once(2))
            return "k";
        return m_draws->once(30) ? QString() : QString::fromUtf8(m_draws->oneOf(keys));
    }

    // Of windows, some that end just at the edges of the usual desktop of 800 by 600.
    QString value()
    {
        static char const* const values[] = {"v",
                                             "w",
                                             "",
                                             " ",
                                             "a&b",
                                             "<x>",
                                             "'",
                                             "\"",
                                             "yes",
                                             "YES",
                                             "t",
                                             "no",
                                             " yes",
                                             "1",
                                             "0",
                                             "-1",
                                             "42",
                                             " 42 ",
                                             "0x10",
                                             "2147483647",
                                             "2147483648",
                                             "4294967295",
                                             "-2147483648",
                                             "1,2,3",
                                             "1-2-3",
                                             "255,0,300",
                                             "a,b,c",
                                             "1,2",
                                             "640,480",
                                             "800-600",
                                             "10,-5",
                                             "1,2,3,4",
                                             "10,20,800,600",
                                             "-50,10,300,100",
                                             "9000,10,5,5",
                                             "0,0,9999,9999",
                                             "400,10,400,300",
                                             "100,300,320,300",
                                             "0,0,800,600",
                                             "0,0,801,601",
                                             "-1,-1,799,599",
                                             "1:",
                                             "1/",
                                             "1,2,x,4",
                                             "%1",
                                             "%2 %3",
                                             "]]>",
                                             "a\nb",
                                             "\xC3\xA9",
                                             "\xE6\x97\xA5",
                                             "Sans,9,-1,5,50,0,0,0,0,0",
                                             "+7",
                                             "1e3",
                                             "y",
                                             "True",
                                             "n,o,p",
                                             "-",
                                             ",",
                                             "123456789",
                                             "1234567890",
                                             "-00",
                                             "\t1"};
        return m_draws->once(30) ? QString() : QString::fromUtf8(m_draws->oneOf(values));
    }

    void writeText()
    {
        const QString section = name();
        const QString item = key();
        const QString text = value();
        tell("WriteItem(#, #, #)", section, item, text);
        same("WriteItem()", m_store.WriteItem(section, item, text),
             m_plain.write(section, item, text));
    }

    void readText()
    {
        const QString section = name();
        const QString item = key();
        QString byDefault = value();
        QString text = "before";
        tell("ReadItem(#, #, #, value)", section, item, byDefault);
        QString const* plain = m_plain.read(section, item);
        const QString expected = plain ? *plain : byDefault;
        if (m_draws->once(4)) {
            same("ReadItem()", m_store.ReadItem(section, item, byDefault, byDefault), !!plain);
            text = byDefault;
        } else {
            same("ReadItem()", m_store.ReadItem(section, item, byDefault, text), !!plain);
        }
        same("value", text, expected);
        same("null", text.isNull(), plain && plain->isNull()); // only a section may hold null
    }

    void writeTyped()
    {
        static int const numbers[] = {0, 1, -1, 255, 300, INT_MAX, INT_MIN, 42};
        const QString section = name();
        const QString item = key();
        const int a = m_draws->oneOf(numbers);
        const int b = m_draws->oneOf(numbers);
        QString text;
        bool written = false;
        switch (m_draws->below(7)) {
        case 0:
            tell("WriteItem(#, #, int #)", section, item, a);
            written = m_store.WriteItem(section, item, a);
            text = QString::number(a);
            break;
        case 1:
            tell("WriteItem(#, #, unsigned #)", section, item, uint(a));
            written = m_store.WriteItem(section, item, uint(a));
            text = QString::number(uint(a));
            break;
        case 2:
            tell("WriteBool(#, #, #)", section, item, a > 0);
            written = m_store.WriteBool(section, item, a > 0);
            text = a > 0 ? "yes" : "no";
            break;
        case 3: {
            QColor color(a & 255, b & 255, 7, 100);
            tell("WriteColor(#, #, #)", section, item, color.name());
            written = m_store.WriteColor(section, item, color);
            text = QString("%1,%2,7").arg(a & 255).arg(b & 255);
            break;
        }
        case 4: {
            QSize size(a, b);
            tell("WriteSize(#, #, QSize(#, #))", section, item, a, b);
            written = m_store.WriteSize(section, item, size);
            text = QString("%1,%2").arg(a).arg(b);
            break;
        }
        case 5: {
            QFont font("Serif", 8 + (a & 15));
            tell("WriteFont(#, #, #)", section, item, font.toString());
            written = m_store.WriteFont(section, item, font);
            text = TorkQt::FontText(font);
            break;
        }
        default: {
            QPoint position(a, b);
            QSize size(b, a);
            const QByteArray window = item.toLatin1();
            tell("WriteScreenMetrics(#, QPoint(#, #), QSize(#, #))", window, a, b, b, a);
            same("WriteScreenMetrics()",
                 m_store.WriteScreenMetrics(window.constData(), position, size),
                 m_plain.write("ApplicationScreens", QString::fromLatin1(window.constData()),
                               QString("%1,%2,%3,%4").arg(a).arg(b).arg(b).arg(a)));
            return;
        }
        }
        same("written", written, m_plain.write(section, item, text));
    }

    void readTyped()
    {
        const QString section = name();
        const QString item = key();
        QString const* text = nullptr;
        const int kind = m_draws->below(8);
        if (kind != 7)
            text = m_plain.read(section, item);
        switch (kind) {
        case 0:
        case 1: {
            int number = 99;
            tell("ReadInt(#, #, 5, value)", section, item);
            bool isNumber = false;
            const int plain = text ? text->toInt(&isNumber) : 0;
            same("ReadInt()", m_store.ReadInt(section, item, 5, number), isNumber);
            same("value", number, isNumber ? plain : 5);
            break;
        }
        case 2: {
            const uint byDefault = m_draws->once(3) ? 4000000000U : 5;
            uint number = 99;
            tell("ReadUint(#, #, #, value)", section, item, byDefault);
            bool isNumber = false;
            const int plain = (text ? *text : QString::number(byDefault)).toInt(&isNumber);
            same("ReadUint()", m_store.ReadUint(section, item, byDefault, number), isNumber);
            same("value", number, isNumber ? uint(plain) : 99);
            break;
        }
        case 3: {
            const bool byDefault = m_draws->once(2);
            bool value = !byDefault;
            tell("ReadBool(#, #, #, value)", section, item, byDefault);
            same("ReadBool()", m_store.ReadBool(section, item, byDefault, value), !!text);
            const QStringList yes({"1", "y", "yes", "t", "true"});
            same("value", value, text ? yes.contains(text->toLower()) : byDefault);
            break;
        }
        case 4: {
            QColor color(1, 2, 3, 4);
            tell("ReadColor(#, #, value)", section, item);
            const QVector<int> plain = text ? Numbers(*text) : QVector<int>();
            same("ReadColor()", m_store.ReadColor(section, item, color), plain.size() == 3);
            QColor expected(1, 2, 3, 4);
            if (plain.size() == 3)
                expected.setRgb(plain[0], plain[1], plain[2]);
            same("value", color.name(QColor::HexArgb), expected.name(QColor::HexArgb));
            same("valid", color.isValid(), expected.isValid());
            break;
        }
        case 5: {
            QSize size(1, 2);
            tell("ReadSize(#, #, value)", section, item);
            const QVector<int> plain = text ? Numbers(*text) : QVector<int>();
            same("ReadSize()", m_store.ReadSize(section, item, size), plain.size() == 2);
            const QVector<int> expected = plain.size() == 2 ? plain : QVector<int>({1, 2});
            same("value", Texts({size.width(), size.height()}), Texts(expected));
            break;
        }
        case 6: {
            QFont font("Before", 7);
            QFont expected = font;
            tell("ReadFont(#, #, value)", section, item);
            same("ReadFont()", m_store.ReadFont(section, item, font), !!text);
            if (text)
                expected.fromString(*text);
            same("value", font.toString(), expected.toString());
            break;
        }
        default:
            readMetrics(item.toLatin1());
        }
    }

    void readMetrics(QByteArray const& window)
    {
        QPoint position(-7, -8);
        QSize size(-9, -10);
        tell("ReadScreenMetrics(#, position, size)", window);
        QString const* text =
            m_plain.read("ApplicationScreens", QString::fromLatin1(window.constData()));
        const QStringList fields = text ? text->split(',') : QStringList();
        QVector<int> plain({0, 0, 0, 0});
        bool isRead = text;
        if (fields.size() == 4) {
            for (int i = 0; i < 4 && isRead; ++i)
                plain[i] = fields[i].toInt(&isRead);
            const QSize desktop = QGuiApplication::primaryScreen()->virtualSize();
            Fit(plain[0], plain[2], desktop.width(), 320, false);
            Fit(plain[1], plain[3], desktop.height(), 200, true);
            if (!isRead)
                plain = {-7, -8, -9, -10};
        }
        same("ReadScreenMetrics()", m_store.ReadScreenMetrics(window.constData(), position, size),
             isRead);
        same("metrics", Texts({position.x(), position.y(), size.width(), size.height()}),
             Texts(plain));
    }

    void lookUp()
    {
        QString section = name();
        switch (m_draws->below(5)) {
        case 0: {
            tell("keyList(#)", section);
            const PlainStore::Section plain = m_plain.find(section);
            same("keyList()", m_store.keyList(section), plain ? plain->keys() : QStringList());
            break;
        }
        case 1:
            tell("HasSection(#)", section);
            same("HasSection()", m_store.HasSection(section), m_plain.find(section) != nullptr);
            break;
        case 2:
            tell("ClearSection(#)", section);
            m_store.ClearSection(section);
            if (const PlainStore::Section plain = m_plain.find(section))
                plain->items.clear();
            break;
        case 3: {
            QString in = value();
            QString out;
            tell("FilterContent(#, out)", in);
            m_store.FilterContent(in, out);
            same("out", out, PlainLine::filtered(in));
            break;
        }
        default:
            tell("sectionList()");
            same("sectionList()", m_store.sectionList(), m_plain.names());
        }
    }

    // Sections that the program holds, in the file or pushed out of it.
    void own()
    {
        const QString section = name();
        switch (m_draws->below(4)) {
        case 0: {
            tell("FindSection(#)", section);
            TorkConfigFileSection* real = m_store.FindSection(section);
            const PlainStore::Section plain = m_plain.find(section);
            same("FindSection()", real != nullptr, plain != nullptr);
            if (real && plain)
                hold(real, plain);
            break;
        }
        case 1: {
            const bool isNull = m_draws->once(10);
            tell(isNull ? "AppendSection(nullptr)" : "AppendSection(new Section(#))", section);
            if (isNull) {
                same("AppendSection()", m_store.AppendSection(nullptr), true);
                break;
            }
            const QByteArray utf8 = section.toUtf8();
            auto* real = new CountedSection(utf8.constData());
            real->AddValue("k", "appended");
            same("AppendSection()", m_store.AppendSection(real), true);
            auto plain = std::make_shared<PlainHeldSection>(section, true);
            plain->add("k", "appended");
            m_plain.put(plain);
            hold(real, plain);
            break;
        }
        case 2: {
            if (m_held.isEmpty())
                break;
            const Held held = m_held[m_draws->below(m_held.size())];
            tell("AppendSection(a held one: #)", held.plain->name);
            same("AppendSection()", m_store.AppendSection(held.real), true);
            m_plain.put(held.plain);
            break;
        }
        default: {
            if (m_held.isEmpty())
                break;
            const int at = m_draws->below(m_held.size());
            if (isInFile(m_held[at]))
                break;
            tell("delete a section that was pushed out: #", m_held[at].plain->name);
            delete m_held[at].real;
            m_held.removeAt(at);
        }
        }
    }

    void useHeld()
    {
        if (m_held.isEmpty())
            return;
        Held& held = m_held[m_draws->below(m_held.size())];
        const QString item = key();
        QString text = value();
        switch (m_draws->below(4)) {
        case 0:
            tell("held #.AddValue(#, #)", held.plain->name, item, text);
            same("AddValue()", held.real->AddValue(item, text), true);
            held.plain->add(item, text);
            break;
        case 1: {
            tell("held #.FindValue(#, text)", held.plain->name, item);
            QString const* plain = held.plain->find(item);
            const QString expected = plain ? *plain : text;
            same("FindValue()", held.real->FindValue(item, text), !!plain);
            same("text", text, expected);
            break;
        }
        case 2:
            tell("held #.Clear()", held.plain->name);
            held.real->Clear();
            held.plain->items.clear();
            break;
        default:
            tell("held #.IsCalled(#)", held.plain->name, item);
            same("IsCalled()", held.real->IsCalled(item), held.plain->name == item);
            same("keyList()", held.real->keyList(), held.plain->keys());
        }
    }

    void hold(TorkConfigFileSection* real, PlainStore::Section const& plain)
    {
        for (Held const& held : m_held) {
            if (held.real == real)
                return;
        }
        m_held.append({real, plain});
    }

    bool isInFile(Held const& held) const { return m_plain.sections.contains(held.plain); }

    // The file deletes what is in it.
    void forgetDeleted()
    {
        for (int i = m_held.size() - 1; i >= 0; --i) {
            if (isInFile(m_held[i]))
                m_held.removeAt(i);
        }
    }

    // What somebody else writes to the file.
    void file()
    {
        static char const* const documents[] = {
            "<VelocorSettings><A><k>v</k><l>w</l></A><B><k>1</k></B></VelocorSettings>",
            "<Other><A><k>1</k><k>2</k></A><A><l>3</l></A></Other>",
            "<VelocorSettings><A><k><d>deep</d></k></A></VelocorSettings>",
            "<VelocorSettings><A><k></k> <l/>text<m> </m></A></VelocorSettings>",
            "<VelocorSettings><A><k>v</k><l>cut",
            "<VelocorSettings><A><k>v</k></B></VelocorSettings>",
            ("<r><VelocorSettings><k>v</k></VelocorSettings><A><VelocorSettings>v"
             "</VelocorSettings></A></r>"),
            "<r><A><k>a<!-- c -->b</k><l><![CDATA[x&y]]></l></A></r>",
            "<r><n:A><n:k>v</n:k></n:A><\xC3\xA9><k>v</k></\xC3\xA9></r>",
            "",
            "no xml",
            "<r/>"};
        const QString path = m_draws->once(3) ? "y.cfg" : "x.cfg";
        const QByteArray bytes = m_draws->oneOf(documents);
        if (m_draws->once(8)) {
            tell("no file #", path);
            QFile::remove(path);
            m_files.remove(path);
            return;
        }
        tell("file # = #", path, bytes);
        TestFiles::write(path, bytes);
        m_files[path] = bytes;
    }

    void save()
    {
        const bool isFile = m_fileName == "x.cfg" || m_fileName == "y.cfg";
        const bool isNamed = m_fileName.length() >= 2;
        if (m_draws->once(3)) {
            tell("SaveAtomically()");
            same("SaveAtomically()", m_store.SaveAtomically(), isFile || !isNamed);
            if (isFile)
                m_plain.lastError = QLatin1String("");
            else if (isNamed)
                m_plain.lastError =
                    QString("Unable to save %1: %2")
                        .arg(m_fileName, m_fileName == "folder" ? "Is a directory"
                                                                : "No such file or directory");
        } else {
            tell("Save()");
            same("Save()", m_store.Save(), true);
            if (!isFile && isNamed)
                m_plain.lastError = "Unable to open file: " + m_fileName;
        }
        if (isFile)
            m_files[m_fileName] = m_plain.xml();
        same("last error", m_store.m_lastError, m_plain.lastError);
    }

    void load()
    {
        if (m_draws->once(3)) {
            const QByteArray bytes = m_files.value(m_draws->once(3) ? "y.cfg" : "x.cfg");
            tell("LoadFrom(#)", bytes);
            QBuffer buffer;
            buffer.setData(bytes);
            forgetDeleted();
            const bool parsed = m_plain.load(bytes);
            same("LoadFrom()", m_store.LoadFrom(&buffer), parsed);
            same("last error", m_store.m_lastError, m_plain.lastError);
            return;
        }
        tell("Load()");
        const bool isThere = m_files.contains(m_fileName) || m_fileName == "folder";
        bool parsed = false;
        if (m_fileName.isEmpty()) {
            m_plain.lastError = "ConfigFile - Load failed - No file name specified.";
        } else if (!isThere) {
            m_plain.lastError = "ConfigFile - File not found.";
        } else {
            forgetDeleted();
            parsed = m_plain.load(m_files.value(m_fileName));
            m_plain.lastError = parsed ? "" : "ConfigFile - Could not parse the input file.";
            m_messages += !parsed;
        }
        same("Load()", m_store.Load(), parsed);
        same("last error", m_store.m_lastError, m_plain.lastError);
    }

    void change()
    {
        static char const* const files[] = {"x.cfg", "y.cfg", "", "a", "none/x.cfg", "folder"};
        static char const* const roots[] = {"VelocorSettings", "A", "LogSettings", "r", "x%1"};
        switch (m_draws->below(3)) {
        case 0:
            m_fileName = m_draws->oneOf(files);
            tell("SetFileName(#)", m_fileName);
            m_store.SetFileName(m_fileName);
            break;
        case 1:
            m_plain.rootName = m_draws->oneOf(roots);
            tell("SetRootElementName(#)", m_plain.rootName);
            m_store.SetRootElementName(m_plain.rootName);
            break;
        default:
            tell("Clear()");
            forgetDeleted();
            m_store.Clear();
            m_plain.clear();
        }
    }

    void compareCurrent()
    {
        TorkConfigFileSection const* current = m_store.CurrentSection();
        same("has a current section", current != nullptr, m_plain.current != nullptr);
        if (!current || !m_plain.current)
            return;
        same("current section", current->name(), m_plain.current->name);
        same("its keys", current->keyList(), m_plain.current->keys());
    }

    PlainStore m_plain;
    TorkConfigFile m_store;
    QVector<Held> m_held;
    QString m_fileName = "x.cfg";
    QMap<QString, QByteArray> m_files;
    int m_messages = 0;
};

} // namespace

void tst_PlainStore::programs()
{
    QTemporaryDir folder;
    QVERIFY(QDir(folder.path()).mkpath("folder"));
    const QString before = QDir::currentPath();
    QVERIFY(QDir::setCurrent(folder.path()));
    const QtMessageHandler handler = qInstallMessageHandler(CountMessage);
    Program::compare<Stores>("store", Rounds::count(60000, 1000000, 10000000), 40);
    qInstallMessageHandler(handler);
    QDir::setCurrent(before);
}

int main(int argc, char** argv)
{
    Program::useMemoryForFiles();
    QApplication application(argc, argv);
    tst_PlainStore test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_PlainStore.moc"

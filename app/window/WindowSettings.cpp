// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/WindowSettings.h"

#include "app/settingsfile/SettingsFileReader.h"
#include "app/window/widgets/PlainText.h"
#include "common/config/TorkConfigEscapes_p.h"
#include "common/config/TorkConfigText.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QGuiApplication>
#include <QScreen>
#include <QStringList>
#include <QWidget>

namespace Velocor {

namespace {

char const* const WindowName = "MainWindow";

QString Section()
{
    return QStringLiteral("MainWindow");
}

// Whether enough of the top of the rectangle is on a screen to see and move the window.
bool IsOnScreen(QRect const& rectangle)
{
    const QRect top(rectangle.topLeft(), QSize(rectangle.width(), 40));
    const QList<QScreen*> screens = QGuiApplication::screens();
    for (QScreen const* screen : screens) {
        const QRect common = screen->availableGeometry().intersected(top);
        if (common.width() >= 80 && common.height() >= 10)
            return true;
    }
    return false;
}

QRect Centered(QSize const& size)
{
    QScreen const* screen = QGuiApplication::primaryScreen();
    const QRect available = screen ? screen->availableGeometry() : QRect(0, 0, 800, 600);
    QRect rectangle(QPoint(), size.boundedTo(available.size()));
    rectangle.moveCenter(available.center());
    return rectangle;
}

// Falls back to geometry(), which differs only for maximized and full-screen windows.
QRect NormalGeometry(QWidget const* window)
{
    const QRect normal = window->normalGeometry();
    return normal.isValid() ? normal : window->geometry();
}

} // namespace

WindowSettings::WindowSettings(QString const& dataPath)
    : m_fileName(dataPath + QLatin1String("velocor.cfg")), m_file(m_fileName)
{}

QString WindowSettings::Load()
{
    if (!QFile::exists(m_fileName))
        return QString();

    const SettingsDocument document = SettingsFileReader::Read(m_fileName);
    if (!document.isReadable) {
        m_mayWrite = false;
        return QObject::tr("Cannot read the settings file %1 (%2). It is left unchanged.")
            .arg(LeftToRight(m_fileName), document.error);
    }
    if (!document.isParsed)
        return renameDamagedFile();

    m_known = document.AllValues();
    for (SettingsDocument::Section const& section : document.sections) {
        for (SettingsDocument::Item const& item : section.items)
            take(section.name, item.key, item.value);
    }
    return QString();
}

void WindowSettings::TakeOverEdits()
{
    const SettingsDocument document = SettingsFileReader::Read(m_fileName);
    if (!document.isParsed)
        return;
    const SettingsValues values = document.AllValues();
    for (auto value = values.begin(); value != values.end(); ++value) {
        if (!m_known.contains(value.key()) || m_known.value(value.key()) != value.value())
            m_edited.insert(value.key(), value.value());
    }
    for (auto value = m_known.begin(); value != m_known.end(); ++value) {
        if (!values.contains(value.key()))
            m_edited.insert(value.key(), QString());
    }
    m_known = values;
}

// The store cannot remove a key, so it is filled again.
void WindowSettings::applyEdits()
{
    if (m_edited.isEmpty())
        return;
    SettingsDocument document;
    const QStringList names = m_file.sectionList();
    for (QString const& name : names) {
        const auto items = m_file.FindSection(name)->values();
        for (auto const& item : items) {
            if (!m_edited.contains({name, item.key}))
                document.SetValue(name, item.key, item.value);
        }
    }
    for (auto edit = m_edited.begin(); edit != m_edited.end(); ++edit) {
        if (!edit.value().isNull())
            document.SetValue(edit.key().first, edit.key().second, edit.value());
    }
    m_file.Clear();
    for (SettingsDocument::Section const& section : qAsConst(document.sections)) {
        for (SettingsDocument::Item const& item : section.items)
            take(section.name, item.key, item.value);
    }
}

// A text that the store does not give back would damage the file when it is saved. Only what was
// edited by hand has such names, and they are none of the window's.
void WindowSettings::take(QString const& section, QString const& key, QString const& value)
{
    if (!TorkConfigText::IsPlainName(section) || !TorkConfigText::IsPlainName(key))
        return;
    const bool isPlain = TorkConfigText::IsPlainValue(value);
    m_file.WriteItem(
        section, key,
        isPlain ? value : TorkConfigText::EncodeValue(TorkUnescaped(QLatin1Char('\\'), value)));
}

// To the first free name with this ending and a number.
bool WindowSettings::rename(QString const& ending, QString& name)
{
    for (int number = 1; number < 1000; ++number) {
        // Not by arg(): a product or user whose name holds "%1" would get the number there.
        name = m_fileName + ending + QString::number(number);
        if (!QFile::exists(name))
            return QFile::rename(m_fileName, name);
    }
    return false;
}

QString WindowSettings::SetAside(QString& name)
{
    if (!rename(QStringLiteral(".set-aside-"), name))
        return QObject::tr("%1 cannot be renamed").arg(LeftToRight(m_fileName));
    m_mayWrite = false;
    return QString();
}

QString WindowSettings::renameDamagedFile()
{
    QString name;
    if (rename(QStringLiteral(".damaged-"), name)) {
        return QObject::tr("The settings file was damaged, so default settings are used. "
                           "The damaged file was kept as %1.")
            .arg(LeftToRight(name));
    }
    m_mayWrite = false;
    return QObject::tr("The settings file %1 is damaged and cannot be renamed. It is left "
                       "unchanged, and window settings will not be saved.")
        .arg(LeftToRight(m_fileName));
}

QString WindowSettings::Save()
{
    if (!m_mayWrite)
        return QString();
    if (QFileInfo::exists(m_fileName) && !QFileInfo(m_fileName).isFile())
        return QObject::tr("The settings file %1 is not a regular file")
            .arg(LeftToRight(m_fileName));
    QDir().mkpath(QFileInfo(m_fileName).path());
    applyEdits();
    return m_file.SaveAtomically() ? QString() : m_file.m_lastError;
}

void WindowSettings::RestoreGeometry(QWidget* window)
{
    QPoint position;
    QSize size;
    const bool found =
        m_file.ReadScreenMetrics(WindowName, position, size) && size.isValid() && !size.isEmpty();
    if (!found)
        return;

    QRect rectangle(position, size);
    if (!IsOnScreen(rectangle))
        rectangle = Centered(size);
    window->setGeometry(rectangle);
    if (Flag(QStringLiteral("maximized"), false))
        window->setWindowState(window->windowState() | Qt::WindowMaximized);
}

void WindowSettings::NoteGeometry(QWidget* window)
{
    const QRect normal = NormalGeometry(window);
    QPoint position = normal.topLeft();
    QSize size = normal.size();
    m_file.WriteScreenMetrics(WindowName, position, size);
    SetFlag(QStringLiteral("maximized"), window->isMaximized());
}

QList<int> WindowSettings::Numbers(QString const& key)
{
    QList<int> numbers;
    const QString text = Text(key);
    if (text.isEmpty())
        return numbers;
    const QStringList fields = text.split(QLatin1Char(','));
    for (QString const& field : fields) {
        bool converted = false;
        numbers.append(field.toInt(&converted));
        if (!converted || numbers.last() < 0 || numbers.last() > 100000)
            return QList<int>();
    }
    return numbers;
}

void WindowSettings::SetNumbers(QString const& key, QList<int> const& numbers)
{
    QStringList fields;
    for (int number : numbers)
        fields.append(QString::number(number));
    SetText(key, fields.join(QLatin1Char(',')));
}

bool WindowSettings::Flag(QString const& key, bool byDefault)
{
    bool value = byDefault;
    m_file.ReadBool(Section(), key, byDefault, value);
    return value;
}

void WindowSettings::SetFlag(QString const& key, bool value)
{
    m_file.WriteBool(Section(), key, value);
}

QString WindowSettings::Text(QString const& key)
{
    QString none;
    QString value;
    m_file.ReadItem(Section(), key, none, value);
    bool isEncoded = false;
    const QString text = TorkConfigText::DecodeValue(value, &isEncoded);
    // Earlier versions escaped fewer characters.
    return isEncoded ? text : TorkUnescaped(QLatin1Char('\\'), value);
}

void WindowSettings::SetText(QString const& key, QString const& value)
{
    m_file.WriteItem(Section(), key, TorkConfigText::EncodeValue(value));
}

} // namespace Velocor

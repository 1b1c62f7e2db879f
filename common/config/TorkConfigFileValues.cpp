// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The typed values of TorkConfigFile: how each type is formatted and parsed.

#include "common/config/TorkConfigFile.h"

#include "common/TorkQt_p.h"
#include "common/config/TorkScreenFit_p.h"

#include <QApplication>
#include <QColor>
#include <QFont>
#include <QPoint>
#include <QRect>
#include <QScreen>
#include <QSize>
#include <QStringList>
#include <QVector>

namespace {

QString Join(std::initializer_list<int> numbers)
{
    QStringList fields;
    for (int number : numbers)
        fields.append(QString::number(number));
    return fields.join(QLatin1Char(','));
}

// '-' separates too, so no negative number survives: the format's rule.
QVector<int> Numbers(QString const& text)
{
    QVector<int> numbers;
    const QStringList fields =
        QString(text).replace(QLatin1Char('-'), QLatin1Char(',')).split(QLatin1Char(','));
    for (QString const& field : fields)
        numbers.append(field.toInt());
    return numbers;
}

// The size of all screens together; invalid without a QApplication.
QSize DesktopSize()
{
    if (!qobject_cast<QApplication*>(QCoreApplication::instance()))
        return QSize();
    QRect desktop;
    const QList<QScreen*> screens = QGuiApplication::screens();
    for (QScreen const* screen : screens)
        desktop |= screen->geometry();
    return desktop.size();
}

// Same result as QString::toInt(). Plain short numbers, which almost all are, are parsed here,
// without Qt's locale-aware conversion. For the goal "typed reads" in docs/performance.md;
// tests/plain/tst_PlainNumbers.cpp compares the two.
int ToInt(QString const& text, bool* converted)
{
    QChar const* const characters = text.constData();
    const int length = text.length();
    const bool negative = length > 0 && characters[0] == QLatin1Char('-');
    const int digits = length - (negative ? 1 : 0);
    if (digits > 9)
        return text.toInt(converted);

    int number = 0;
    for (int i = length - digits; i < length; ++i) {
        const uint digit = characters[i].unicode() - uint('0');
        if (digit > 9)
            return text.toInt(converted);
        number = 10 * number + static_cast<int>(digit);
    }
    *converted = digits > 0;
    return negative ? -number : number;
}

// Parses all fields as numbers; false at the first that is not one.
bool ToInts(QStringList const& fields, QVector<int>& numbers)
{
    for (QString const& field : fields) {
        bool converted = false;
        numbers.append(field.toInt(&converted));
        if (!converted)
            return false;
    }
    return true;
}

bool MeansTrue(QString const& text)
{
    const QString lower = text.toLower();
    for (char const* yes : {"1", "y", "yes", "t", "true"}) {
        if (lower == QLatin1String(yes))
            return true;
    }
    return false;
}

} // namespace

bool TorkConfigFile::WriteItem(QString const& section, QString const& key, int value)
{
    return WriteItem(section, key, QString::number(value));
}

bool TorkConfigFile::WriteItem(QString const& section, QString const& key, unsigned int value)
{
    return WriteItem(section, key, QString::number(value));
}

bool TorkConfigFile::ReadInt(QString const& section, QString const& key, int defaultValue,
                             int& value)
{
    QString const* text = findValue(section, key);
    bool converted = false;
    const int number = text ? ToInt(*text, &converted) : defaultValue;
    value = converted ? number : defaultValue;
    return converted;
}

bool TorkConfigFile::ReadUint(QString const& section, QString const& key, unsigned int defaultValue,
                              unsigned int& value)
{
    // The default goes through the signed conversion too, like a stored text.
    QString const* text = findValue(section, key);
    bool converted = false;
    const int number = ToInt(text ? *text : QString::number(defaultValue), &converted);
    if (converted)
        value = static_cast<unsigned int>(number);
    return converted;
}

bool TorkConfigFile::WriteBool(QString const& section, QString const& key, bool value)
{
    return WriteItem(section, key, value ? QStringLiteral("yes") : QStringLiteral("no"));
}

bool TorkConfigFile::ReadBool(QString const& section, QString const& key, bool defaultValue,
                              bool& value)
{
    QString const* text = findValue(section, key);
    value = text ? MeansTrue(*text) : defaultValue;
    return text != nullptr;
}

bool TorkConfigFile::WriteColor(QString const& section, QString const& key, QColor& color)
{
    return WriteItem(section, key, Join({color.red(), color.green(), color.blue()}));
}

bool TorkConfigFile::ReadColor(QString const& section, QString const& key, QColor& color)
{
    QString const* text = findValue(section, key);
    if (!text)
        return false;

    const QVector<int> numbers = Numbers(*text);
    if (numbers.size() != 3)
        return false;

    color.setRgb(numbers[0], numbers[1], numbers[2]);
    return true;
}

bool TorkConfigFile::WriteSize(QString const& section, QString const& key, QSize& size)
{
    return WriteItem(section, key, Join({size.width(), size.height()}));
}

bool TorkConfigFile::ReadSize(QString const& section, QString const& key, QSize& size)
{
    QString const* text = findValue(section, key);
    if (!text)
        return false;

    const QVector<int> numbers = Numbers(*text);
    if (numbers.size() != 2)
        return false;

    size = QSize(numbers[0], numbers[1]);
    return true;
}

// cppcheck-suppress constParameter ; applications build on it
bool TorkConfigFile::WriteFont(QString const& section, QString const& key, QFont& font)
{
    return WriteItem(section, key, TorkQt::FontText(font));
}

bool TorkConfigFile::ReadFont(QString const& section, QString const& key, QFont& font)
{
    QString const* text = findValue(section, key);
    if (!text)
        return false;

    font.fromString(*text);
    return true;
}

bool TorkConfigFile::WriteScreenMetrics(char const* name, QPoint& position, QSize& size)
{
    return WriteItem(m_screensSectionName, QString::fromLatin1(name),
                     Join({position.x(), position.y(), size.width(), size.height()}));
}

bool TorkConfigFile::ReadScreenMetrics(char const* name, QPoint& position, QSize& size)
{
    QString const* text = findValue(m_screensSectionName, QString::fromLatin1(name));
    const QStringList fields = text ? text->split(QLatin1Char(',')) : QStringList();
    if (fields.size() != 4) {
        position = QPoint(0, 0);
        size = QSize(0, 0);
        return text != nullptr;
    }

    const QSize desktop = DesktopSize();
    QVector<int> numbers;
    if (!desktop.isValid() || !ToInts(fields, numbers))
        return false;

    const TorkWindowRect fitted =
        TorkFitToDesktop(numbers[0], numbers[1], numbers[2], numbers[3], desktop);
    position = fitted.position;
    size = fitted.size;
    return true;
}

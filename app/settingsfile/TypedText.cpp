// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/TypedText.h"

#include "common/config/TorkConfigFile.h"

#include <QColor>
#include <QFont>
#include <QPoint>
#include <QSize>

#include <algorithm>

namespace Velocor {

namespace {

// Ten of the longest paths. Kinds are guessed for each row that is painted.
constexpr int MaximumGuessedLength = 100000;

// In its texts, QFont gives each font that many numbers after its family, and a style if it has
// one. It would complain in the log about a text with another number of fields.
constexpr int FontSeparators = 9;

// The store with a single value.
class ValueStore : public TorkConfigFile
{
public:
    ValueStore() : TorkConfigFile(QString()) {}
    explicit ValueStore(QString const& text) : ValueStore() { WriteItem(Name, Name, text); }

    QString text()
    {
        QString none;
        QString text;
        ReadItem(Name, Name, none, text);
        return text;
    }

    const QString Name = QStringLiteral("value");
};

bool HasFontFields(QString const& text)
{
    const int separators = text.count(QLatin1Char(','));
    return separators == FontSeparators || separators == FontSeparators + 1;
}

QString ScreensSection()
{
    ValueStore store;
    QPoint position;
    QSize size;
    store.WriteScreenMetrics("value", position, size);
    return store.sectionList().value(0);
}

bool LooksLikeFiles(QString const& text)
{
    const QStringList entries = TypedText::ToFileList(text);
    const auto isFile = [](QString const& entry) {
        return entry.contains(QLatin1Char('/')) || entry.contains(QLatin1Char('\\'));
    };
    return entries.size() > 1 && std::any_of(entries.begin(), entries.end(), isFile) &&
           std::all_of(entries.begin(), entries.end(),
                       [isFile](QString const& entry) { return entry.isEmpty() || isFile(entry); });
}

} // namespace

QList<ValueKind> TypedText::AllKinds()
{
    return {ValueKind::Text, ValueKind::YesNo, ValueKind::Number,      ValueKind::Color,
            ValueKind::Size, ValueKind::Font,  ValueKind::WindowPlace, ValueKind::FileList};
}

bool TypedText::IsPossible(ValueKind kind, QString const& section)
{
    static const QString screens = ScreensSection();
    return kind != ValueKind::WindowPlace || section == screens;
}

ValueKind TypedText::Guess(QString const& section, QString const& text)
{
    if (text.isEmpty() || text.size() > MaximumGuessedLength)
        return ValueKind::Text;
    QPoint position;
    QSize size;
    if (IsPossible(ValueKind::WindowPlace, section) && ToWindowPlace(text, position, size))
        return ValueKind::WindowPlace;
    if (text == FromYesNo(ToYesNo(text)))
        return ValueKind::YesNo;
    int number = 0;
    if (ToNumber(text, number) && text == FromNumber(number))
        return ValueKind::Number;
    QColor color;
    if (ToColor(text, color) && text == FromColor(color))
        return ValueKind::Color;
    if (ToSize(text, size) && text == FromSize(size))
        return ValueKind::Size;
    QFont font;
    if (ToFont(text, font) && text == FromFont(font))
        return ValueKind::Font;
    return LooksLikeFiles(text) ? ValueKind::FileList : ValueKind::Text;
}

bool TypedText::ToYesNo(QString const& text)
{
    ValueStore store(text);
    bool value = false;
    store.ReadBool(store.Name, store.Name, false, value);
    return value;
}

QString TypedText::FromYesNo(bool value)
{
    ValueStore store;
    store.WriteBool(store.Name, store.Name, value);
    return store.text();
}

bool TypedText::ToNumber(QString const& text, int& value)
{
    ValueStore store(text);
    return store.ReadInt(store.Name, store.Name, value, value);
}

QString TypedText::FromNumber(int value)
{
    ValueStore store;
    store.WriteItem(store.Name, store.Name, value);
    return store.text();
}

bool TypedText::ToColor(QString const& text, QColor& value)
{
    ValueStore store(text);
    QColor color;
    const bool isValid = store.ReadColor(store.Name, store.Name, color) && color.isValid();
    if (isValid)
        value = color;
    return isValid;
}

QString TypedText::FromColor(QColor value)
{
    ValueStore store;
    store.WriteColor(store.Name, store.Name, value);
    return store.text();
}

bool TypedText::ToSize(QString const& text, QSize& value)
{
    ValueStore store(text);
    return store.ReadSize(store.Name, store.Name, value);
}

QString TypedText::FromSize(QSize value)
{
    ValueStore store;
    store.WriteSize(store.Name, store.Name, value);
    return store.text();
}

bool TypedText::ToFont(QString const& text, QFont& value)
{
    ValueStore store(text);
    return HasFontFields(text) && store.ReadFont(store.Name, store.Name, value);
}

QString TypedText::FromFont(QFont value)
{
    ValueStore store;
    store.WriteFont(store.Name, store.Name, value);
    return store.text();
}

// The store also reads other texts, as no place at all.
bool TypedText::ToWindowPlace(QString const& text, QPoint& position, QSize& size)
{
    if (text.count(QLatin1Char(',')) != 3)
        return false;
    ValueStore store;
    store.WriteItem(ScreensSection(), store.Name, text);
    return store.ReadScreenMetrics("value", position, size);
}

QString TypedText::FromWindowPlace(QPoint position, QSize size)
{
    ValueStore store;
    store.WriteScreenMetrics("value", position, size);
    QString none;
    QString text;
    store.ReadItem(ScreensSection(), store.Name, none, text);
    return text;
}

QStringList TypedText::ToFileList(QString const& text)
{
    return text.split(QLatin1Char('|'));
}

QString TypedText::FromFileList(QStringList const& value)
{
    return QLatin1String("") + value.join(QLatin1Char('|'));
}

} // namespace Velocor

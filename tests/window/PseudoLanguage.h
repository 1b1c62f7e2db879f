// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "support/TestFiles.h"

#include <QCoreApplication>
#include <QDomDocument>
#include <QRegularExpression>
#include <QSet>
#include <QTranslator>

/// A generated language. Each text of the catalogs is longer by two fifths and is in brackets, so a
/// text without brackets cannot be translated. The application uses it as long as the object lives.
class PseudoLanguage : public QTranslator
{
public:
    enum Writing {
        Accented, ///< from left to right, with accents
        Mirrored, ///< from right to left, in Hebrew letters
    };

    explicit PseudoLanguage(Writing writing) : m_writing(writing)
    {
        QDomDocument catalog;
        catalog.setContent(TestFiles::read(PROJECT_FOLDER "/translations/velocor_de.ts"));
        const QDomNodeList messages = catalog.elementsByTagName("message");
        for (int i = 0; i < messages.size(); ++i) {
            const QDomElement message = messages.at(i).toElement();
            const QString source = message.firstChildElement("source").text();
            const bool isKey = source.contains(QRegularExpression("^(Ctrl|Shift|Alt)\\+|^F\\d"));
            if (!isKey && !message.hasAttribute("numerus"))
                m_texts.insert(message.parentNode().toElement().firstChildElement("name").text() +
                               '\n' + source);
        }
        QCoreApplication::installTranslator(this);
    }

    ~PseudoLanguage() override { QCoreApplication::removeTranslator(this); }

    PseudoLanguage(PseudoLanguage const&) = delete;
    PseudoLanguage& operator=(PseudoLanguage const&) = delete;

    /// An English text in this language.
    QString of(QString const& text) const
    {
        QString longer = m_writing == Mirrored ? inHebrewLetters(text) : text;
        longer.replace('a', QString::fromUtf8("\xC3\xA1"));
        longer.replace('o', QString::fromUtf8("\xC3\xB6"));
        return "[" + longer + QString(text.size() * 2 / 5, '~') + "]";
    }

    bool isEmpty() const override { return m_texts.isEmpty(); }

    QString translate(char const* context, char const* text, char const*, int) const override
    {
        const QString source = QString::fromUtf8(text);
        if (source == "QT_LAYOUT_DIRECTION")
            return m_writing == Mirrored ? "RTL" : "LTR";
        const bool isOfQt = qstrcmp(context, "QPlatformTheme") == 0; // the buttons of dialogs
        const bool isKnown = m_texts.contains(QString::fromUtf8(context) + '\n' + source);
        return isKnown || isOfQt ? of(source) : QString();
    }

private:
    // Without a change to placeholders.
    static QString inHebrewLetters(QString const& text)
    {
        QString letters;
        for (int i = 0; i < text.size(); ++i) {
            const bool isPlaceholder = i > 0 && text.at(i - 1) == '%';
            const ushort letter = text.at(i).toLower().unicode();
            const bool isLatin = letter >= 'a' && letter <= 'z' && !isPlaceholder;
            letters += isLatin ? QChar(0x05d0 + (letter - 'a') % 22) : text.at(i);
        }
        return letters;
    }

    Writing m_writing;
    QSet<QString> m_texts;
};

Q_DECLARE_METATYPE(PseudoLanguage::Writing)

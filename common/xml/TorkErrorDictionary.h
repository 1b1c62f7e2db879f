// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>
#include <QString>

/// The base of an error-code dictionary: a named, contiguous range of codes and their texts.
///
/// This base knows no codes; a derived dictionary overrides decode() and sets the maximum to the
/// last code that it knows. No code is ever checked against the range. Made without a parent.
///
///     class BookmarkErrors : public TorkErrorDictionary
///     {
///     public:
///         BookmarkErrors() : TorkErrorDictionary("bookmarks", 2000) { setMaxErrorCode(2000); }
///         bool decode(int code, QString& text) override
///         {
///             if (code != 2000)
///                 return TorkErrorDictionary::decode(code, text);
///             text = "A bookmark without an address.";
///             return true;
///         }
///     };
class TorkErrorDictionary : public QObject
{
public:
    /// @param name  the name of the range
    /// @param baseErrorCode  its first code; the maximum is 0 until it is set
    TorkErrorDictionary(QString const& name, unsigned int baseErrorCode);
    ~TorkErrorDictionary() override;

    QString const& name() const { return m_name; }
    unsigned int baseErrorCode() const { return m_baseErrorCode; }
    unsigned int maxErrorCode() const { return m_maxErrorCode; }
    void setMaxErrorCode(unsigned int code) { m_maxErrorCode = code; }

    /// Turns a code into a readable text.
    ///
    /// @param text  the text of the code; emptied if the code is not known
    /// @return whether the code is known; here always false
    virtual bool decode(int code, QString& text);

private:
    QString m_name;
    quint32 m_baseErrorCode;
    quint32 m_maxErrorCode = 0;
};

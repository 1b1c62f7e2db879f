// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/TorkExport.h"

#include <QObject>
#include <QString>

/// The base of an error-code dictionary: a named, contiguous range of codes and their texts.
///
/// The base knows no codes; a derived dictionary overrides decode() and sets the maximum to its
/// last code. No code is ever checked against the range. Created without a parent; the caller owns
/// it. One thread at a time.
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
class TORK_EXPORT TorkErrorDictionary : public QObject
{
public:
    /// @param name  the name of the range
    /// @param baseErrorCode  its first code; the last one is 0 until setMaxErrorCode() is called
    TorkErrorDictionary(QString const& name, unsigned int baseErrorCode);
    ~TorkErrorDictionary() override;

    /// The name of the range.
    QString const& name() const { return m_name; }

    /// The first code of the range.
    unsigned int baseErrorCode() const { return m_baseErrorCode; }

    /// The last code of the range; 0 until it is set.
    unsigned int maxErrorCode() const { return m_maxErrorCode; }

    /// Sets the last code of the range. It may be less than the first: nothing is checked.
    void setMaxErrorCode(unsigned int code) { m_maxErrorCode = code; }

    /// Turns a code into a readable text.
    ///
    /// @param text  set to the text of the code; cleared if the code is unknown
    /// @return whether the code is known; always false here
    virtual bool decode(int code, QString& text);

private:
    QString m_name;
    quint32 m_baseErrorCode;
    quint32 m_maxErrorCode = 0;
};

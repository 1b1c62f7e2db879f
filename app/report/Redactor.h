// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/report/SecretFinder.h"
#include "app/report/SecretKind.h"

#include <QHash>
#include <QPair>
#include <QRegularExpression>
#include <QString>
#include <QStringList>

#include <vector>

namespace Velocor {

/// Replaces what gives somebody away by placeholders such as `<user-1>` and `<mail-2>`.
///
/// The same secret always gets the same placeholder, in all texts, so that a reader still sees what
/// belongs together. What it looks for: SecretFinder, and texts that it is told. Pure; one thread
/// at a time.
///
///     Redactor redactor;
///     OwnNames::AddTo(redactor);
///     const QString text = redactor.Redact(log).text;
class Redactor
{
public:
    /// A placeholder in a redacted text, or the secret if that is shown.
    struct Place
    {
        int start;
        int length;
        int secret; ///< see Placeholder()
    };

    struct Text
    {
        QString text;
        std::vector<Place> places; ///< by position
    };

    /// Replaces this text, too, in any case and as files and addresses spell it: percent-encoded,
    /// escaped for XML or a settings file, in the wrong encoding. Names are replaced only as whole
    /// words; texts of one character not at all.
    ///
    /// @param isCased  only if upper and lower case are the same
    void AddSecret(SecretKind kind, QString const& text, bool isCased = false);

    /// Replaces these texts, too, wherever they are: the words of the user. Others that have been
    /// set before are no longer replaced.
    void SetWords(QStringList const& words);

    /// A text with placeholders.
    Text Redact(QString const& text);

    /// Secrets found so far.
    int count() const { return static_cast<int>(m_secrets.size()); }

    /// Of a secret, from 0 to count() - 1.
    QString const& Placeholder(int secret) const { return at(secret).placeholder; }
    QString const& Original(int secret) const { return at(secret).text; }
    SecretKind Kind(int secret) const { return at(secret).kind; }

    /// Whether a secret stays as it is from now on.
    void SetShown(int secret, bool isShown) { at(secret).isShown = isShown; }
    bool isShown(int secret) const { return at(secret).isShown; }

private:
    struct Secret
    {
        SecretKind kind;
        QString text;
        QString placeholder;
        bool isShown = false;
    };

    struct Known
    {
        SecretKind kind;
        QString text;
        bool isCased;
    };

    Secret& at(int secret) { return m_secrets[static_cast<size_t>(secret)]; }
    Secret const& at(int secret) const { return m_secrets[static_cast<size_t>(secret)]; }
    void findKnown(QString const& text, std::vector<SecretFinder::Place>& places) const;
    QString newPlaceholder(SecretKind kind, QString const& text) const;
    int secretFor(SecretKind kind, QString const& text);
    void learn();

    std::vector<Known> m_known;
    std::vector<QPair<SecretKind, QRegularExpression>> m_expressions; // one for each of them
    QHash<QString, QString> m_spellings;                              // known texts by spelling
    std::vector<Secret> m_secrets;
    QHash<QPair<int, QString>, int> m_numbers; // of secrets, by kind and text
};

} // namespace Velocor

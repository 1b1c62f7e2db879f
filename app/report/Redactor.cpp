// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/report/Redactor.h"

#include <QUrl>

#include <algorithm>

namespace Velocor {

namespace {

char const* NameOf(SecretKind kind)
{
    switch (kind) {
    case SecretKind::Word:
        return "word";
    case SecretKind::HomeFolder:
        return "home";
    case SecretKind::UserName:
        return "user";
    case SecretKind::FullName:
        return "name";
    case SecretKind::HostName:
        return "host";
    case SecretKind::MailAddress:
        return "mail";
    case SecretKind::NetworkAddress:
        return "address";
    case SecretKind::HardwareAddress:
        return "hardware";
    case SecretKind::PrivateKey:
        return "key";
    case SecretKind::Token:
        return "token";
    case SecretKind::Password:
        return "password";
    }
    return "";
}

// As a settings file has them; see docs/config-file.md.
QString Escaped(QString const& text, char const* kept)
{
    QString escaped;
    for (QChar character : text) {
        const bool isAscii = character > QLatin1Char(' ') && character <= QLatin1Char('~');
        if (isAscii && !QString::fromLatin1(kept).contains(character))
            escaped += character;
        else
            escaped += QStringLiteral("\\u%1").arg(character.unicode(), 4, 16, QLatin1Char('0'));
    }
    return escaped;
}

// Logs are in Latin-1, which has not all characters; and UTF-8 is often read as Latin-1.
QStringList SpellingsOf(QString const& text)
{
    QStringList spellings = {
        text,
        QString::fromLatin1(text.toLatin1()),
        QString::fromLatin1(text.toUtf8()),
        text.toHtmlEscaped(),
        QString(text).replace(QLatin1Char('\\'), QLatin1String("\\\\")),
        QString(text).replace(QLatin1Char('/'), QLatin1String("\\/")),
        QString::fromLatin1(QUrl::toPercentEncoding(text)),
        QString::fromLatin1(QUrl::toPercentEncoding(text, "/")),
        Escaped(text, "%&'<>\"]\\"),
        Escaped(text, "%&'<>\"]\\").replace(QLatin1String("\\u0020"), QLatin1String(" "))};
    spellings.removeDuplicates();
    std::sort(spellings.begin(), spellings.end(),
              [](QString const& a, QString const& b) { return a.size() > b.size(); });
    return spellings;
}

// One that is not the part of another word.
QString Alone(QString const& expression, SecretKind kind)
{
    if (kind == SecretKind::Word)
        return expression;
    if (kind == SecretKind::HomeFolder)
        return expression + QStringLiteral("(?![\\w-]|\\.\\w)");
    return QStringLiteral("(?<![\\p{L}\\p{N}])") + expression +
           QStringLiteral("(?![\\p{L}\\p{N}])");
}

// Upper and lower case are different only where programs distinguish them.
QString Comparable(SecretKind kind, QString const& text)
{
    if (kind == SecretKind::Token || kind == SecretKind::Password || kind == SecretKind::PrivateKey)
        return text;
    QString same = text.toCaseFolded();
    if (kind == SecretKind::MailAddress)
        same.replace(QLatin1String("%40"), QLatin1String("@"));
    if (kind == SecretKind::HomeFolder)
        same.replace(QLatin1String("%2f"), QLatin1String("/"));
    if (kind == SecretKind::HardwareAddress)
        same.remove(QLatin1Char(':')).remove(QLatin1Char('-')).remove(QLatin1Char('.'));
    return same;
}

// In the home folder "/data/home", what "/home/" is followed by is not a name but a file of the
// user.
void DropHomesInside(std::vector<SecretFinder::Place> const& known,
                     std::vector<SecretFinder::Place>& found)
{
    const auto isInside = [&known](SecretFinder::Place const& place) {
        return place.kind == SecretKind::HomeFolder &&
               std::any_of(known.begin(), known.end(), [&place](SecretFinder::Place const& home) {
                   return home.kind == SecretKind::HomeFolder && home.start < place.start &&
                          place.start < home.start + home.length;
               });
    };
    found.erase(std::remove_if(found.begin(), found.end(), isInside), found.end());
}

// Everything that any of them covers; of those that overlap, the longest tells what it is.
void Merge(std::vector<SecretFinder::Place>& places)
{
    std::sort(places.begin(), places.end(),
              [](SecretFinder::Place const& a, SecretFinder::Place const& b) {
                  return a.start < b.start;
              });
    std::vector<SecretFinder::Place> merged;
    int longest = 0;
    for (SecretFinder::Place const& place : places) {
        const int end = place.start + place.length;
        if (merged.empty() || place.start >= merged.back().start + merged.back().length) {
            merged.push_back(place);
            longest = place.length;
            continue;
        }
        SecretFinder::Place& last = merged.back();
        const bool isMeant =
            place.length > longest || (place.length == longest && place.kind < last.kind);
        if (isMeant)
            last.kind = place.kind;
        longest = std::max(longest, place.length);
        last.length = std::max(last.start + last.length, end) - last.start;
    }
    places = merged;
}

} // namespace

void Redactor::AddSecret(SecretKind kind, QString const& text, bool isCased)
{
    const auto isSame = [&](Known const& known) {
        return known.kind == kind && known.text == text && known.isCased == isCased;
    };
    if (text.size() < 2 || std::any_of(m_known.begin(), m_known.end(), isSame))
        return;
    m_known.push_back({kind, text, isCased});
}

void Redactor::SetWords(QStringList const& words)
{
    m_known.erase(std::remove_if(m_known.begin(), m_known.end(),
                                 [](Known const& known) { return known.kind == SecretKind::Word; }),
                  m_known.end());
    m_expressions.clear();
    for (QString const& word : words)
        AddSecret(SecretKind::Word, word.trimmed());
}

void Redactor::learn()
{
    if (m_expressions.size() == m_known.size())
        return;
    m_expressions.clear();
    m_spellings.clear();
    for (Known const& known : m_known) {
        QStringList escaped;
        const QStringList spellings = SpellingsOf(known.text);
        for (QString const& spelling : spellings) {
            escaped.append(QRegularExpression::escape(spelling));
            const QString same = Comparable(known.kind, spelling);
            if (!m_spellings.contains(same))
                m_spellings.insert(same, Comparable(known.kind, known.text));
        }
        const QString any = QStringLiteral("(?:%1)").arg(escaped.join(QLatin1Char('|')));
        QRegularExpression::PatternOptions options = QRegularExpression::UseUnicodePropertiesOption;
        if (!known.isCased)
            options |= QRegularExpression::CaseInsensitiveOption;
        m_expressions.emplace_back(known.kind, QRegularExpression(Alone(any, known.kind), options));
    }
}

void Redactor::findKnown(QString const& text, std::vector<SecretFinder::Place>& places) const
{
    for (auto const& known : m_expressions)
        SecretFinder::FindMatches(text, known.second, known.first, nullptr, places);
}

int Redactor::secretFor(SecretKind kind, QString const& text)
{
    const QString same = Comparable(kind, text);
    const QPair<int, QString> key(static_cast<int>(kind), m_spellings.value(same, same));
    const auto known = m_numbers.constFind(key);
    if (known != m_numbers.constEnd())
        return known.value();
    m_secrets.push_back({kind, text, newPlaceholder(kind, key.second), false});
    m_numbers.insert(key, count() - 1);
    return count() - 1;
}

// The first home folder that is known is the user's.
QString Redactor::newPlaceholder(SecretKind kind, QString const& text) const
{
    const QString name = QLatin1String(NameOf(kind));
    if (kind == SecretKind::HomeFolder) {
        const auto own = std::find_if(m_known.begin(), m_known.end(), [](Known const& known) {
            return known.kind == SecretKind::HomeFolder;
        });
        if (own != m_known.end() && Comparable(kind, own->text) == text)
            return QStringLiteral("<%1>").arg(name);
    }
    int number = 1;
    for (Secret const& secret : m_secrets) {
        if (secret.kind == kind && secret.placeholder != QStringLiteral("<%1>").arg(name))
            ++number;
    }
    return QStringLiteral("<%1-%2>").arg(name).arg(number);
}

Redactor::Text Redactor::Redact(QString const& text)
{
    learn();
    std::vector<SecretFinder::Place> places;
    findKnown(text, places);
    std::vector<SecretFinder::Place> found;
    SecretFinder::Find(text, found);
    DropHomesInside(places, found);
    places.insert(places.end(), found.begin(), found.end());
    Merge(places);

    Text redacted;
    int end = 0;
    for (SecretFinder::Place const& place : places) {
        redacted.text += text.mid(end, place.start - end);
        end = place.start + place.length;
        const int secret = secretFor(place.kind, text.mid(place.start, place.length));
        const QString shown =
            isShown(secret) ? text.mid(place.start, place.length) : Placeholder(secret);
        redacted.places.push_back(
            {static_cast<int>(redacted.text.size()), static_cast<int>(shown.size()), secret});
        redacted.text += shown;
    }
    redacted.text += text.mid(end);
    return redacted;
}

} // namespace Velocor

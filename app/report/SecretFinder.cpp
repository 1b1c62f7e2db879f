// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/report/SecretFinder.h"

#include <algorithm>

namespace Velocor {

namespace {

constexpr int LongestKeyBlock = 64 * 1024; // characters

// The value that follows these is a secret, whatever it looks like.
char const* const PasswordWords = "passw(?:or)?d|passwort|kennwort|passphrase|passcode|pwd";

// It is one if it is no plain word.
char const* const TokenWords =
    "token|secret|credentials?|(?:api|access|auth|secret|private|encryption|signing|license|"
    "client|account|shared|master|session)[-_ ]?key|passkey|bearer|jwt|auth[-_]?code";

// It is one if it is long and looks random.
char const* const KeyWords = "(?:key|auth|session(?:[-_ ]?id)?|cookie|signature|nonce|salt|"
                             "authorization|sid)";

struct Pattern
{
    SecretKind kind;
    QRegularExpression expression;
    bool (*filter)(QString const& text);
};

bool HasDigit(QString const& text)
{
    return std::any_of(text.begin(), text.end(),
                       [](QChar character) { return character.isDigit(); });
}

// "mainWindow", "main-window", "MAIN_WINDOW", "Main/Window".
bool IsMadeOfWords(QString const& text)
{
    static const QRegularExpression words(
        QStringLiteral("\\A(?:(?:[A-Z]?[a-z]{2,}|[-_./:])*|[A-Z_]*)\\z"));
    return words.match(text).hasMatch();
}

bool IsNoWord(QString const& text)
{
    constexpr int LongestWord = 20;
    return text.size() > LongestWord || !IsMadeOfWords(text);
}

bool IsRandom(QString const& text)
{
    return !IsMadeOfWords(text);
}

// What programs print in place of a password.
bool IsNoPlaceholder(QString const& text)
{
    static const QRegularExpression placeholders(
        QStringLiteral("\\A(?:[*.x?-]*|\\(?(?:null|nil|none|empty|unset|set|true|false|yes|no|"
                       "undefined|hidden|redacted|left out)\\)?)[.,;]?\\z"),
        QRegularExpression::CaseInsensitiveOption);
    return !placeholders.match(text).hasMatch();
}

// What "Basic" is followed by in a header: a name and a password.
bool IsBasicCredentials(QString const& text)
{
    const QByteArray decoded = QByteArray::fromBase64(text.toLatin1());
    const auto isPrintable = [](char character) {
        return static_cast<unsigned char>(character) >= ' ';
    };
    return decoded.contains(':') && std::all_of(decoded.begin(), decoded.end(), isPrintable);
}

// Not "a::b", which is code, nor the address of every computer.
bool IsNetworkAddress(QString const& text)
{
    constexpr int Groups = 8;
    const QStringList parts = text.split(QLatin1Char(':'));
    const auto isUsed = [](QString const& part) {
        return !part.isEmpty();
    };
    const auto groups = std::count_if(parts.begin(), parts.end(), isUsed);
    const bool isComplete = !text.contains(QLatin1String("::"));
    return text != QLatin1String("::1") && (isComplete || groups < Groups) &&
           (HasDigit(text) || groups > 2);
}

bool IsHardwareAddress(QString const& text)
{
    QString digits = text.toLower();
    digits.remove(QRegularExpression(QStringLiteral("[:.-]")));
    return digits != QString(digits.size(), QLatin1Char('0')) &&
           digits != QString(digits.size(), QLatin1Char('f'));
}

QString Word(char const* words)
{
    // Not "passwordLength", whose value tells nothing.
    return QStringLiteral("(?:%1)(?:s|[0-9]|[-_]?(?:value|text|string|data|hash|id|key))*")
        .arg(QLatin1String(words));
}

// Name and value, as in most formats: name=, "name": ", <name>, <arg key="name">. Not </name>.
QString Assigned(QString const& name, char const* value)
{
    return QStringLiteral("</[^<>\\s]*>(*SKIP)(*F)|") + name +
           QStringLiteral("(?:\\\\*[\"']?\\s{0,3}(?:=>|:=|[:=])\\s{0,3}|"
                          "\\\\?[\"']?(?:\\s[^<>\\n]{0,80})?(?<!/)>\\s*(?:<!\\[CDATA\\[)?)"
                          "\\\\*[\"']?\\K") +
           QStringLiteral("(?:%1)").arg(QLatin1String(value));
}

// What a shell passes as one argument.
char const* const Argument = "(?:\\\\?\"\\K[^\"\\\\\\n]+|\\\\?'\\K[^'\\\\\\n]+|\\K[^\\s\"'<>]+)";

QString NameBeforeValue(QString const& name)
{
    return QStringLiteral("\\b(?:name|key|id)\"?\\s{0,3}[:=]\\s{0,3}[\"'][^\"'<>\\n]{0,80}%1[\"']"
                          "[^<>{}\\n]{0,200}?[\\s\"',]value\"?\\s{0,3}[:=]\\s{0,3}"
                          "(?:\"\\K[^\"\\n]+|'\\K[^'\\n]+|\\K[^\\s\"'<>/,}]+)")
        .arg(name);
}

QString ValueBeforeName(QString const& name)
{
    return QStringLiteral("\\bvalue\"?\\s{0,3}[:=]\\s{0,3}(?:\"\\K[^\"\\n]{1,200}(?=\")|"
                          "'\\K[^'\\n]{1,200}(?='))(?=[\"'][^<>{}\\n]{0,200}?\\b(?:name|key|id)"
                          "\"?\\s{0,3}[:=]\\s{0,3}[\"'][^\"'<>\\n]{0,80}%1[\"'])")
        .arg(name);
}

Pattern Case(SecretKind kind, QString const& expression, bool (*filter)(QString const&) = nullptr)
{
    return {kind, QRegularExpression(expression), filter};
}

Pattern AnyCase(SecretKind kind, QString const& expression,
                bool (*filter)(QString const&) = nullptr)
{
    return {kind, QRegularExpression(expression, QRegularExpression::CaseInsensitiveOption),
            filter};
}

// Each repetition ends where the next part begins, or is possessive, so that no text takes long.
std::vector<Pattern> AddressPatterns()
{
    const QString domain =
        QStringLiteral("[\\w-]++(?:\\.[\\w-]++)++(?<!\\.service)(?<!\\.socket)(?<!\\.slice)"
                       "(?<!\\.timer)(?<!\\.target)(?<!\\.scope)");
    const QString byte = QStringLiteral("(?:25[0-5]|2[0-4][0-9]|1[0-9][0-9]|[1-9]?[0-9])");
    const QString four = byte + QStringLiteral("(?:\\.%1){3}").arg(byte);
    const QString group = QStringLiteral("[0-9a-f]{1,4}");
    const QString some = QStringLiteral("(?:%1(?::%1){0,6})?").arg(group);
    return {
        // Of anybody; spelled for this system, for macOS and for Windows, and in addresses.
        Case(SecretKind::HomeFolder,
             QStringLiteral("/(?:home|Users)/[^/\\\\\\s\"'<>:;,|()\\[\\]{}&?*=]+")),
        AnyCase(SecretKind::HomeFolder,
                QStringLiteral("%2F(?:home|Users)%2F(?:(?!%2F)[\\w.~%-])+")),
        AnyCase(SecretKind::HomeFolder, QStringLiteral("\\b[a-z]:[\\\\/]{1,4}Users[\\\\/]{1,4}"
                                                       "[^/\\\\\\s\"'<>:;,|()\\[\\]{}&?*]+")),
        // Not the end of a password before "@", nor units of the system's services.
        {SecretKind::MailAddress,
         QRegularExpression(QStringLiteral("://[^\\s/\"<>]*@(*SKIP)(*F)|(?<![\\w.+%-])[\\w.+%-]++"
                                           "(?:'[\\w.+%-]++)*+@") +
                                domain,
                            QRegularExpression::UseUnicodePropertiesOption),
         nullptr},
        {SecretKind::MailAddress,
         QRegularExpression(QStringLiteral("(?<![\\w.+-])[\\w.+-]++%40") + domain,
                            QRegularExpression::UseUnicodePropertiesOption),
         nullptr},
        // Not versions such as 1.2.3.4.5, nor addresses that every computer has.
        AnyCase(
            SecretKind::NetworkAddress,
            QStringLiteral("(?<![0-9])(?<![0-9]\\.)(?<!\\bv)(?<!version )(?!127\\.|0\\.0\\.0\\.0"
                           "|255\\.255\\.)%1(?![0-9]|\\.[0-9])")
                .arg(four)),
        // Neither does a longer row of bytes, such as a fingerprint, contain an address.
        AnyCase(
            SecretKind::NetworkAddress,
            QStringLiteral("(?<![0-9a-z])(?<![^0-9a-z][0-9a-f]{2}:)(?:(?:%1:){7}%1|(?:%1:){6}%2|"
                           "%3::(?:(?:%1:){0,5}%2|%3))(?![0-9a-z_]|:[0-9a-f])")
                .arg(group, four, some),
            IsNetworkAddress),
        AnyCase(
            SecretKind::HardwareAddress,
            QStringLiteral("(?<![0-9a-z])(?<![0-9a-f]{2}[:-])[0-9a-f]{2}([:-])(?:[0-9a-f]{2}\\1)"
                           "{4}[0-9a-f]{2}(?![0-9a-z]|\\1[0-9a-f]{2})|(?<![0-9a-z.])[0-9a-f]{4}"
                           "\\.[0-9a-f]{4}\\.[0-9a-f]{4}(?![0-9a-z]|\\.[0-9a-z])"),
            IsHardwareAddress),
    };
}

std::vector<Pattern> TokenPatterns()
{
    return {
        Case(SecretKind::Token, QStringLiteral("(?<![A-Za-z0-9_-])eyJ[A-Za-z0-9_-]{6,}"
                                               "(?:\\.[A-Za-z0-9_-]+){2,4}")),
        // What well-known services start their keys with.
        Case(
            SecretKind::Token,
            QStringLiteral(
                "(?<![A-Za-z0-9])(?:gh[a-z]_[A-Za-z0-9]{20,}|github_pat_\\w{20,}|glpat-[\\w-]{16,}|"
                "[spr]k(?:[-_][a-z0-9]{2,8})*[-_][A-Za-z0-9_-]{16,}|xox[a-z]-[A-Za-z0-9-]{10,}|"
                "A(?:KIA|SIA|IDA|ROA)[A-Z0-9]{16,}|AIza[\\w-]{35,}|ya29\\.[\\w-]{20,}|"
                "npm_[A-Za-z0-9]{30,}|pypi-[\\w-]{20,}|hf_[A-Za-z0-9]{20,}|"
                "SG\\.[\\w-]{16,}\\.[\\w-]{16,}|do[a-z]_v1_[a-f0-9]{32,}|"
                "shp[a-z]{2}_[A-Fa-f0-9]{32}|dckr_pat_[\\w-]{16,})")),
        // A line of a key whose beginning is elsewhere.
        Case(SecretKind::PrivateKey,
             QStringLiteral("(?m)^[ \\t]*+\\K(?=[^\\n]*[0-9])(?=[^\\n]*[a-z])(?=[^\\n]*[A-Z])"
                            "[A-Za-z0-9+/]{48,}+={0,2}(?=[ \\t]*\\r?$)")),
        Case(SecretKind::Password, QStringLiteral("://[^\\s/:@\"<>]*+:\\K[^\\s/\"<>]+(?=@)")),
        AnyCase(SecretKind::Password,
                Assigned(Word(PasswordWords),
                         "(?:(?<=[>\\[])[^<\\]\\n]+|(?<=\\\\\")(?:(?!\\\\\").)+|"
                         "(?<=\")(?:[^\"\\\\\\n]|\\\\.)+|(?<=')[^'\\n]+|"
                         "(?<![\"'])(?:[^\\s\"<>&]|&(?![\\w-]+=))+)"),
                IsNoPlaceholder),
        AnyCase(SecretKind::Token,
                Assigned(Word(TokenWords), "(?:[A-Za-z0-9+/_.~%-]|\\\\/){8,}={0,2}"), IsNoWord),
        AnyCase(SecretKind::Token,
                Assigned(QLatin1String(KeyWords), "(?!/)[A-Za-z0-9+/_~%-]{20,}={0,2}"), IsRandom),
        AnyCase(SecretKind::Token,
                Word("bearer|basic|digest|token|key|secret|password") +
                    QStringLiteral("\\s+(?:is\\s+)?\\K(?=[A-Za-z0-9])[A-Za-z0-9+/_~-]{20,}={0,2}"),
                IsRandom),
        AnyCase(SecretKind::Token,
                QStringLiteral("authorization\\\\?[\"']?\\s*[:=]\\s*\\\\?[\"']?(?:bearer|basic|"
                               "digest|token|negotiate|ntlm)\\s+\\K[^\\s\"'<>]+")),
        AnyCase(SecretKind::Token, QStringLiteral("\\bcookie\\s*:\\s*\\K[^\\s<>\"][^\\n<>\"]*")),
    };
}

// What is named beside it, in the arguments of programs, addresses, sentences and attributes.
std::vector<Pattern> NamedPatterns()
{
    return {
        AnyCase(SecretKind::Password,
                QStringLiteral("--[\\w-]*(?:%1|token|secret|api-?key)[\\w-]*[= ]\\s*%2")
                    .arg(QLatin1String(PasswordWords), QLatin1String(Argument)),
                IsNoPlaceholder),
        // Programs whose -p is a password, and not a port or a folder.
        Case(SecretKind::Password,
             QStringLiteral("\\b(?:mysql|mariadb)[\\w-]*+(?=\\s)[^\\n]{0,200}?\\s-p%1")
                 .arg(QLatin1String(Argument)),
             IsNoPlaceholder),
        Case(SecretKind::Password,
             QStringLiteral("\\bsshpass\\s+-p\\s*%1").arg(QLatin1String(Argument)),
             IsNoPlaceholder),
        AnyCase(SecretKind::Password,
                Word(PasswordWords) +
                    QStringLiteral("\\s+(?:is\\s+|was\\s+)?(?:\"\\K[^\"\\n]+(?=\")|"
                                   "'\\K[^'\\n]+(?='))"),
                IsNoPlaceholder),
        AnyCase(SecretKind::Password,
                Word(PasswordWords) + QStringLiteral("%3D\\K(?:(?!%26)[^\\s\"'<>&])+"),
                IsNoPlaceholder),
        AnyCase(SecretKind::Token,
                Word(TokenWords) + QStringLiteral("%3D\\K(?:(?!%26)[^\\s\"'<>&]){8,}"), IsNoWord),
        AnyCase(SecretKind::Password,
                QStringLiteral("(?<![\\p{L}\\p{N}])pin(?:[-_ ]?code)?[\"']?"
                               "\\s{0,3}[:=]\\s{0,3}[\"']?\\K[0-9]{4,12}(?![0-9])")),
        AnyCase(SecretKind::Token,
                QStringLiteral("\\bbasic\\s+\\K[A-Za-z0-9+/]{4,}={0,2}(?![\\w+/])"),
                IsBasicCredentials),
        // The name is the value of an attribute, or of a member in JSON, and the value is another.
        AnyCase(SecretKind::Password, NameBeforeValue(Word(PasswordWords)), IsNoPlaceholder),
        AnyCase(SecretKind::Token, NameBeforeValue(Word(TokenWords)), IsNoWord),
        AnyCase(SecretKind::Password, ValueBeforeName(Word(PasswordWords)), IsNoPlaceholder),
        AnyCase(SecretKind::Token, ValueBeforeName(Word(TokenWords)), IsNoWord),
    };
}

// A key may be in any number of lines, with something before each, as in a log.
void FindKeyBlocks(QString const& text, std::vector<SecretFinder::Place>& places)
{
    static const QRegularExpression begin(
        QStringLiteral("-----BEGIN [A-Z0-9 ]{0,40}PRIVATE KEY(?: BLOCK)?-----"));
    static const QRegularExpression end(
        QStringLiteral("-----END [A-Z0-9 ]{0,40}PRIVATE KEY(?: BLOCK)?-----"));
    static const QRegularExpression rest(
        QStringLiteral("\\A(?:(?:\\s|\\\\[nr])*+[A-Za-z0-9+/]{16,}+={0,2})*+"));
    int from = 0;
    for (;;) {
        const QRegularExpressionMatch first = begin.match(text, from);
        if (!first.hasMatch())
            return;
        const int start = static_cast<int>(first.capturedStart());
        const int headerEnd = static_cast<int>(first.capturedEnd());
        const QString block = text.mid(headerEnd, LongestKeyBlock);
        const QRegularExpressionMatch last = end.match(block);
        const bool isWhole =
            last.hasMatch() &&
            !block.left(last.capturedStart()).contains(QLatin1String("-----BEGIN"));
        from = headerEnd +
               static_cast<int>(isWhole ? last.capturedEnd() : rest.match(block).capturedLength());
        places.push_back({start, from - start, SecretKind::PrivateKey});
    }
}

} // namespace

void SecretFinder::FindMatches(QString const& text, QRegularExpression const& expression,
                               SecretKind kind, bool (*filter)(QString const&),
                               std::vector<Place>& places)
{
    int from = 0;
    while (from < text.size()) {
        QRegularExpressionMatchIterator matches = expression.globalMatch(text, from);
        while (matches.hasNext()) {
            const QRegularExpressionMatch match = matches.next();
            from = static_cast<int>(match.capturedEnd());
            const int length = static_cast<int>(match.capturedLength());
            if (length > 0 && (!filter || filter(match.captured())))
                places.push_back({from - length, length, kind});
        }
        if (matches.isValid())
            return;
        const int lineEnd = static_cast<int>(text.indexOf(QLatin1Char('\n'), from));
        const int end = lineEnd < 0 ? static_cast<int>(text.size()) : lineEnd + 1;
        places.push_back({from, end - from, kind});
        from = end;
    }
}

void SecretFinder::Find(QString const& text, std::vector<Place>& places)
{
    static const std::vector<Pattern> addresses = AddressPatterns();
    static const std::vector<Pattern> tokens = TokenPatterns();
    static const std::vector<Pattern> named = NamedPatterns();
    FindKeyBlocks(text, places);
    for (auto const* patterns : {&addresses, &tokens, &named}) {
        for (Pattern const& pattern : *patterns)
            FindMatches(text, pattern.expression, pattern.kind, pattern.filter, places);
    }
}

bool SecretFinder::IsSecretName(QString const& name)
{
    static const QRegularExpression secret(
        QStringLiteral("(?:%1|%2)(?:s|[0-9]|[-_]?(?:value|text|string|data|hash|id|key))*\\z|"
                       "(?:\\A|[-_.])(?:key|auth|cookie|sid|pin|pass)\\z")
            .arg(QLatin1String(PasswordWords), QLatin1String(TokenWords)),
        QRegularExpression::CaseInsensitiveOption);
    return secret.match(name).hasMatch();
}

} // namespace Velocor

// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>

/// How namespace prefixes are found in names and counted, for TorkXmlGuard and the parse manager.
namespace TorkXmlPrefixes {

/// What a prefix counts: the reader compares prefixes character by character.
inline int Weight(QString const& prefix)
{
    return 1 + prefix.length() / 16;
}

/// What an element with this weight in force counts: the reader compares each with all others.
inline qint64 Comparisons(int weight)
{
    return qint64(weight) * weight;
}

/// The prefix that an element or attribute of this name puts in force; empty if it does not. An
/// attribute "xmlns:p" declares p, and a prefix that nothing declares is kept by the reader as
/// well.
inline QString OfName(QString const& name, bool isAttribute)
{
    const int colon = name.indexOf(QLatin1Char(':'));
    if (colon < 0)
        return QString();
    const QString prefix = name.left(colon);
    return isAttribute && prefix == QLatin1String("xmlns") ? name.mid(colon + 1) : prefix;
}

inline QString TooMany(int limit)
{
    return QStringLiteral("More than %1 namespace prefixes are in force.").arg(limit);
}

inline QString TooManyComparisons(qint64 limit)
{
    return QStringLiteral("More than %1 comparisons of namespace prefixes are needed.").arg(limit);
}

inline QString TooDeep(int limit)
{
    return QStringLiteral("More than %1 elements are inside each other.").arg(limit);
}

} // namespace TorkXmlPrefixes

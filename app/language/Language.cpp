// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/language/Language.h"

#include "common/TorkQt_p.h"

#include <QCoreApplication>
#include <QDir>
#include <QLocale>
#include <QTranslator>

#include <algorithm>
#include <memory>

// Resources of a static library must be initialized explicitly, outside any namespace.
static void InitializeCatalogs()
{
    Q_INIT_RESOURCE(catalogs);
}

namespace Velocor {

namespace {

// Qt asks the catalogs for it whenever the language changes. Its own may not be installed.
//: "RTL" if the language is written from right to left, else "LTR"
[[maybe_unused]] char const* const Direction =
    QT_TRANSLATE_NOOP("QGuiApplication", "QT_LAYOUT_DIRECTION");

// Tells the translators of this file from those of others.
QString ObjectName()
{
    return QStringLiteral("VelocorCatalog");
}

QString Catalogs()
{
    return QStringLiteral(":/catalogs");
}

QString& UsedCode()
{
    // cppcheck-suppress unassignedVariable ; the reference to it is assigned
    static QString code;
    return code;
}

// Not that of a country: Qt's name for "en" is "American English".
QString NameOf(QString const& code)
{
    const QLocale locale(code);
    QString name = locale.language() == QLocale::English
                       ? QLocale::languageToString(QLocale::English)
                       : locale.nativeLanguageName();
    name[0] = name.at(0).toUpper();
    return name;
}

bool Install(QLocale const& locale, QString const& prefix, QString const& folder)
{
    auto translator = std::make_unique<QTranslator>(QCoreApplication::instance());
    translator->setObjectName(ObjectName());
    if (!translator->load(locale, prefix, QStringLiteral("_"), folder))
        return false;
    QCoreApplication::installTranslator(translator.release());
    return true;
}

} // namespace

QList<Language> Language::All()
{
    InitializeCatalogs();
    QList<Language> languages;
    const QStringList files = QDir(Catalogs()).entryList(QDir::Files, QDir::Name);
    for (QString const& file : files) {
        const QString code = file.section(QLatin1Char('_'), 1).section(QLatin1Char('.'), 0, 0);
        languages.append({code, NameOf(code)});
    }
    return languages;
}

void Language::Use(QString const& code)
{
    const QList<Language> all = All();
    const bool isKnown =
        std::any_of(all.begin(), all.end(), [&](Language const& one) { return one.code == code; });
    const QLocale locale = isKnown ? QLocale(code) : QLocale::system();

    qDeleteAll(QCoreApplication::instance()->findChildren<QTranslator*>(ObjectName()));
    // The last one installed is asked first. English has the plural forms of what the others lack.
    Install(QLocale(QStringLiteral("en")), QStringLiteral("velocor"), Catalogs());
    const bool isTranslated = locale.language() != QLocale::English &&
                              Install(locale, QStringLiteral("velocor"), Catalogs());
    // Not without ours: one of a language that is written from right to left would mirror a window
    // with English texts.
    if (isTranslated)
        Install(locale, QStringLiteral("qtbase"), TorkQt::TranslationsFolder());
    UsedCode() =
        isTranslated ? locale.name().section(QLatin1Char('_'), 0, 0) : QStringLiteral("en");
}

QString Language::Used()
{
    return UsedCode();
}

} // namespace Velocor

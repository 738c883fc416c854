// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "pane/texts.h"

#include <QtCore/QFile>
#include <QtCore/QLocale>
#include <QtCore/QTranslator>
#include <QtGui/QGuiApplication>

// The code is a static library, from which a linker takes no resources that nobody names.
static void makeStringsAvailable()
{
    Q_INIT_RESOURCE(pane_strings);
}

namespace kavell::pane {

namespace {

void install(QGuiApplication &application, const QString &language)
{
    const QString path = QStringLiteral(":/kavell-accounts-pane/Localizable_%1.qm").arg(language);
    auto *const table = new QTranslator(&application);
    if (QFile::exists(path) && table->load(path))
        application.installTranslator(table);
    else
        delete table;
}

/// For each of the user's languages the language itself, then the long name: what is installed last is asked first.
QStringList languagesByRisingPreference()
{
    QStringList names{QStringLiteral("en")};
    const QStringList wanted = QLocale::system().uiLanguages();
    for (auto language = wanted.crbegin(); language != wanted.crend(); ++language) {
        QString name = *language;
        name.replace(u'-', u'_');
        names += name.section(u'_', 0, 0);
        if (name.contains(u'_'))
            names += name;
    }
    return names;
}

}  // namespace

void installTexts(QGuiApplication &application)
{
    makeStringsAvailable();
    const QStringList languages = languagesByRisingPreference();
    for (const QString &language : languages)
        install(application, language);
    QGuiApplication::setLayoutDirection(qtTrId("LAYOUT_DIRECTION") == QLatin1String("RTL") ? Qt::RightToLeft
                                                                                           : Qt::LeftToRight);
}

}  // namespace kavell::pane

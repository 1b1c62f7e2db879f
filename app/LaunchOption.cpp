// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/LaunchOption.h"

LaunchOption::LaunchOption(QString const& optionName, QString const& longForm,
                           QString const& shortForm, qint32 arguments, QString const& text)
    : name(optionName), longName(longForm), shortName(shortForm), argCount(arguments),
      description(text), value(QLatin1String(""))
{}

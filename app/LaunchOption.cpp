// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/LaunchOption.h"

#include "app/EmptyText_p.h"

LaunchOption::LaunchOption(QString const& optionName, QString const& longForm,
                           QString const& shortForm, qint32 arguments, QString const& text)
    : name(optionName), longName(longForm), shortName(shortForm), argCount(arguments),
      description(text), value(Velocor::EmptyText())
{}

// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkErrorHandler.h"

#include "app/UserMessages.h"
#include "common/log/TorkLog.h"

#include <QWidget>
#include <QXmlInputSource>
#include <QXmlSimpleReader>

void Check(QXmlInputSource const& source, QWidget* window)
{
    QXmlSimpleReader reader;
    TorkErrorHandler errors(TorkLog::logger());
    reader.setErrorHandler(&errors);
    if (!reader.parse(source))
        WarningMessage(window, errors.errorString(), true);
}

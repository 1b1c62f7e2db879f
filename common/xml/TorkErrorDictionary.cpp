// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkErrorDictionary.h"

#include "common/log/TorkEmptyText_p.h"

TorkErrorDictionary::TorkErrorDictionary(QString const& name, unsigned int baseErrorCode)
    : QObject(nullptr), m_name(name), m_baseErrorCode(baseErrorCode)
{}

TorkErrorDictionary::~TorkErrorDictionary() = default;

bool TorkErrorDictionary::decode(int, QString& text)
{
    text = TorkEmptyText();
    return false;
}

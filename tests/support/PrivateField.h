// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// Accesses a private field that no operation sets, for the rules that depend on it anyway.
///
/// Explicit instantiations may name private members; this relies on nothing else.
///
///     struct Extension { using Field = QString TorkLog::*; friend Field privateField(Extension);
///     }; template struct PrivateField<Extension, &TorkLog::m_fileExtension>;
///
///     log.*privateField(Extension()) = "txt";
template <class Tag, typename Tag::Field Member>
struct PrivateField
{
    friend typename Tag::Field privateField(Tag) { return Member; }
};

// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

/// Accesses a private field that no operation sets, for the rules that depend on it anyway.
///
/// Explicit instantiations may name private members; this relies on nothing else.
///
///     PRIVATE_FIELD(Extension, TorkLog, QString, m_fileExtension);
///
///     log.*privateField(Extension()) = "txt";
template <class Tag, typename Tag::Field Member>
struct PrivateField
{
    friend typename Tag::Field privateField(Tag) { return Member; }
};

#define PRIVATE_FIELD(Tag, Class, Type, Member)                                                    \
    struct Tag                                                                                     \
    {                                                                                              \
        using Field = Type Class::*;                                                               \
        friend Field privateField(Tag);                                                            \
    };                                                                                             \
    template struct PrivateField<Tag, &Class::Member>

// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QMetaType>
#include <QString>
#include <QVector>

/// One call on an XML writer and the result code it must give.
///
/// Both writers have the same operations but no common base, so a test describes the calls once
/// as a list of steps and performs it on each.
struct Step
{
    enum Operation {
        ElementOpen,
        ElementClose,
        ElementCloseAndEnd,
        ElementStart,
        ElementEnd,
        Element,
        ElementValue,
        Attribute,
        CurrentIndent,
        Text
    };

    Operation operation;
    QString name;
    QString value;
    int indent;
    int code;
};

using Steps = QVector<Step>;
Q_DECLARE_METATYPE(Steps)

inline Step Open(QString const& name, int indent = 1)
{
    return {Step::ElementOpen, name, QString(), indent, 0};
}

inline Step Close(QString const& name, int indent = 1)
{
    return {Step::ElementClose, name, QString(), indent, 0};
}

inline Step CloseAndEnd(QString const& name, int indent = 1)
{
    return {Step::ElementCloseAndEnd, name, QString(), indent, 0};
}

inline Step Start(QString const& name, int indent = 1)
{
    return {Step::ElementStart, name, QString(), indent, 0};
}

inline Step End(QString const& name, int indent = 1)
{
    return {Step::ElementEnd, name, QString(), indent, 0};
}

inline Step Element(QString const& name, QString const& value)
{
    return {Step::Element, name, value, 0, 0};
}

inline Step Value(QString const& value)
{
    return {Step::ElementValue, QString(), value, 0, 0};
}

inline Step Attribute(QString const& name, QString const& value)
{
    return {Step::Attribute, name, value, 0, 0};
}

inline Step Indent()
{
    return {Step::CurrentIndent, QString(), QString(), 0, 0};
}

inline Step Gives(int code, Step step)
{
    step.code = code;
    return step;
}

/// The step is refused for its empty name.
inline Step Refused(Step const& step)
{
    return Gives(1005, step);
}

/// The step reports that the text could not be written.
inline Step Failed(Step const& step)
{
    return Gives(1006, step);
}

template <class Writer>
int Perform(Writer& writer, Step const& step)
{
    switch (step.operation) {
    case Step::ElementOpen:
        return writer.WriteElementOpen(step.name, step.indent);
    case Step::ElementClose:
        return writer.WriteElementClose(step.name, step.indent);
    case Step::ElementCloseAndEnd:
        return writer.WriteElementCloseAndEnd(step.name, step.indent);
    case Step::ElementStart:
        return writer.WriteElementStart(step.name, step.indent);
    case Step::ElementEnd:
        return writer.WriteElementEnd(step.name, step.indent);
    case Step::Element:
        return writer.WriteElement(step.name, step.value);
    case Step::ElementValue:
        return writer.WriteElementValue(step.value);
    case Step::Attribute:
        return writer.WriteAttribute(step.name, step.value);
    case Step::CurrentIndent:
        return writer.WriteCurrentIndent();
    case Step::Text:
        return writer.Write(step.value);
    }
    return -1;
}

template <class Writer>
QVector<int> Perform(Writer& writer, Steps const& steps)
{
    QVector<int> codes;
    for (Step const& step : steps)
        codes.append(Perform(writer, step));
    return codes;
}

inline QVector<int> ExpectedCodes(Steps const& steps)
{
    QVector<int> codes;
    for (Step const& step : steps)
        codes.append(step.code);
    return codes;
}

// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "xml/WritersWithoutTypes.h"

#if defined(__GXX_RTTI) || (defined(__cpp_rtti) && !defined(_MSC_VER))
#error "this file has to be compiled without run-time type information"
#endif

namespace {

template <class Writer>
class OverridesNothing : public Writer
{
public:
    using Writer::Writer;
    QStringList calls;
};

template <class Writer>
class OverridesWrite : public OverridesNothing<Writer>
{
public:
    using OverridesNothing<Writer>::OverridesNothing;

    int Write(QString const& text) override
    {
        this->calls << "Write " + text;
        return Writer::Write(text);
    }
};

template <class Writer>
class OverridesElementValue : public OverridesNothing<Writer>
{
public:
    using OverridesNothing<Writer>::OverridesNothing;

    int WriteElementValue(QString const& value) override
    {
        this->calls << "WriteElementValue " + value;
        return Writer::WriteElementValue(value);
    }
};

template <class Derived, class Writer, class... Arguments>
QStringList Use(std::function<void(Writer&)> const& use, Arguments&&... arguments)
{
    Derived writer(arguments...);
    use(writer);
    writer.flush();
    return writer.calls;
}

template <class Writer, class... Arguments>
QStringList UseOneOf(WritersWithoutTypes::Overrides overrides,
                     std::function<void(Writer&)> const& use, Arguments&&... arguments)
{
    switch (overrides) {
    case WritersWithoutTypes::Overrides::Write:
        return Use<OverridesWrite<Writer>>(use, arguments...);
    case WritersWithoutTypes::Overrides::ElementValue:
        return Use<OverridesElementValue<Writer>>(use, arguments...);
    default:
        return Use<OverridesNothing<Writer>>(use, arguments...);
    }
}

} // namespace

QStringList WritersWithoutTypes::withStream(Overrides overrides, QString& text,
                                            std::function<void(TorkXmlStream&)> const& use)
{
    return UseOneOf<TorkXmlStream>(overrides, use, &text, QIODevice::WriteOnly);
}

QStringList WritersWithoutTypes::withFile(Overrides overrides, QString const& path,
                                          std::function<void(TorkXmlFile&)> const& use)
{
    const std::function<void(TorkXmlFile&)> useOpen = [&use](TorkXmlFile& writer) {
        if (writer.open(QIODevice::WriteOnly))
            use(writer);
    };
    return UseOneOf<TorkXmlFile>(overrides, useOpen, path);
}

// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The parse manager with any document, with states that accept and refuse as the input says: no
// state is lost, none is deleted twice, and no document crashes the manager.

#include "FuzzInput.h"
#include "XmlMutator.h"

#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseManager_Base.h"

#include <QVector>
#include <QXmlInputSource>
#include <QXmlSimpleReader>

namespace {

int s_states = 0;
bool s_refused = false; // whether a state refused the last piece of content

// Answers by the bits of a byte and the name it is asked about.
class MoodyState : public TorkXml_ParseState_Base
{
public:
    MoodyState(QString const& element, TorkXml_ParseManager_Base* manager, FuzzInput& moods)
        : TorkXml_ParseState_Base(element, manager), m_moods(moods)
    {
        ++s_states;
    }

    ~MoodyState() override { --s_states; }

    bool CanHandleElement(QString const&) override { return m_moods.byte() % 8 == 1; }

    TorkXml_ParseState_Base* GetNextState(QString const& name) override
    {
        switch (m_moods.byte() % 16) {
        case 1:
            return nullptr;
        case 2:
            return new TorkXml_FlushUnknownElement(name, ParseManager());
        case 3: // for a different element than requested
            return new MoodyState(name + "x", ParseManager(), m_moods);
        default:
            return new MoodyState(name, ParseManager(), m_moods);
        }
    }

    bool ProcessContent(QString const& name, QString const& content) override
    {
        const uint8_t mood = m_moods.byte();
        if (mood % 16 == 1)
            ParseManager()->AppendError(name, content, mood);
        s_refused = mood % 32 == 2;
        return !s_refused;
    }

    // Now and then it changes the stack, as it may: whoever pops a state owns it.
    bool EndElement(QString const&) override
    {
        const uint8_t mood = m_moods.byte();
        if (mood % 16 == 3)
            ParseManager()->PushState(new MoodyState("pushed", ParseManager(), m_moods));
        else if (mood % 16 == 5)
            taken.append(ParseManager()->PopState());
        return mood % 2;
    }

    static QVector<TorkXml_ParseState_Base*> taken;

private:
    FuzzInput& m_moods;
};

QVector<TorkXml_ParseState_Base*> MoodyState::taken;

class MoodyManager : public TorkXml_ParseManager_Base
{
public:
    explicit MoodyManager(FuzzInput& moods) : m_moods(moods) {}

    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return m_moods.byte() % 16 == 1 ? nullptr : new MoodyState(name, this, m_moods);
    }

    bool startElement(QString const& uri, QString const& localName, QString const& qName,
                      QXmlAttributes const& attributes) override
    {
        const bool goesOn =
            TorkXml_ParseManager_Base::startElement(uri, localName, qName, attributes);
        Require(CurrentElement() == localName);
        m_stopped = m_stopped || !goesOn;
        return goesOn;
    }

    bool characters(QString const& text) override
    {
        s_refused = false;
        const bool hasState = LastState() != nullptr;
        const bool goesOn = TorkXml_ParseManager_Base::characters(text);
        Require(goesOn == (hasState && !s_refused));
        m_stopped = m_stopped || !goesOn;
        return goesOn;
    }

    /// Whether any call told the reader to stop.
    bool isStopped() const { return m_stopped; }

private:
    FuzzInput& m_moods;
    bool m_stopped = false;
};

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***)
{
    SilenceMessages();
    return 0;
}

// The moods and the document are mutated separately, so that neither runs into the other.
extern "C" size_t LLVMFuzzerCustomMutator(uint8_t* data, size_t size, size_t maximum,
                                          unsigned int seed)
{
    const size_t moodCount = size < 1 ? 0 : qMin<size_t>(data[0], size - 1);
    const std::string all(reinterpret_cast<char*>(data), size);
    std::string moods = all.substr(qMin<size_t>(1, size), moodCount);
    std::string document = all.substr(qMin(1 + moodCount, size));

    XmlMutator mutator(seed);
    if (mutator.Below(4) == 0) {
        moods.resize(255);
        moods.resize(LLVMFuzzerMutate(reinterpret_cast<uint8_t*>(&moods[0]), moodCount, 255));
    }
    if (moods.size() + 1 < maximum)
        document = mutator.Mutate(document, maximum - moods.size() - 1);
    const std::string mutated = static_cast<char>(moods.size()) + moods + document;
    return mutated.copy(reinterpret_cast<char*>(data), maximum);
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    const size_t moodCount = size < 1 ? 0 : qMin<size_t>(data[0], size - 1);
    FuzzInput moods(data + 1, moodCount);
    QXmlInputSource source;
    if (size > 0) {
        char const* document = reinterpret_cast<char const*>(data) + 1 + moodCount;
        source.setData(QByteArray(document, int(size - 1 - moodCount)));
    }
    {
        MoodyManager manager(moods);
        QXmlSimpleReader reader;
        reader.setContentHandler(&manager);
        const bool parsed = reader.parse(source);
        Require(!parsed || !manager.isStopped());
        Require(!parsed || !manager.PopElement()); // every opened element has ended
        QString report;
        manager.FormatErrors(report);
        Require(report.startsWith("Failed to parse the XML content:\n"));
    }
    for (TorkXml_ParseState_Base* state : MoodyState::taken)
        Require(MoodyState::taken.count(state) == 1);
    qDeleteAll(MoodyState::taken);
    MoodyState::taken.clear();
    Require(s_states == 0);
    return 0;
}

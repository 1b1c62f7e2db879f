// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QVector>
#include <QXmlDefaultHandler>

#include <utility>

/// A section of a settings file as a list of its items.
struct PlainSection
{
    QString name;
    QVector<std::pair<QString, QString>> items;
};

/// Loads a settings file one step at a time; every lookup is a linear search.
class PlainLoader : public QXmlDefaultHandler
{
public:
    explicit PlainLoader(QString const& rootElementName) : m_rootElementName(rootElementName) {}

    QVector<PlainSection> const& sections() const { return m_sections; }

    /// The index of the current section; -1 if there is none.
    int current() const { return m_current; }

    bool startElement(QString const&, QString const& localName, QString const&,
                      QXmlAttributes const&) override
    {
        m_isFirstText = true;
        ++m_depth;

        m_currentElement = localName;
        m_atRoot = localName == m_rootElementName;
        if (m_atRoot)
            return true;
        // No text is expected at the depth of the root and of sections.
        if (m_depth <= 2)
            m_expectingValue = false;
        if (m_depth == 3)
            m_expectingValue = true;
        if (m_depth == 2 && !find(localName))
            make(localName);
        return true;
    }

    bool endElement(QString const&, QString const&, QString const&) override
    {
        m_isFirstText = false;
        --m_depth;
        m_currentElement = QLatin1String("");
        return true;
    }

    bool characters(QString const& text) override
    {
        if (!m_isFirstText)
            return true;
        m_isFirstText = false;
        if (m_atRoot || !m_expectingValue)
            return true;
        m_expectingValue = false;
        if (m_current >= 0)
            writeItem(m_sections[m_current].name, m_currentElement, text);
        return true;
    }

private:
    bool find(QString const& name)
    {
        for (int i = 0; i < m_sections.size(); ++i) {
            if (m_sections[i].name == name) {
                m_current = i;
                return true;
            }
        }
        return false;
    }

    void make(QString const& asked)
    {
        const QString name = QString::fromUtf8(asked.toLatin1().constData());
        if (find(name)) {
            m_sections[m_current].items.clear();
            return;
        }
        m_current = m_sections.size();
        m_sections.append({name, {}});
    }

    void writeItem(QString sectionName, QString key, QString const& value)
    {
        if (key.isNull() || value.isNull())
            return;
        sectionName.remove(' ');
        key.remove(' ');
        if (!find(sectionName))
            make(sectionName);
        auto& items = m_sections[m_current].items;
        for (auto& item : items) {
            if (item.first == key) {
                item.second = value;
                return;
            }
        }
        items.append({key, value});
    }

    QString m_rootElementName;
    bool m_atRoot = false;
    bool m_expectingValue = false;
    bool m_isFirstText = false;
    int m_depth = 0;
    int m_current = -1;
    QString m_currentElement;
    QVector<PlainSection> m_sections;
};

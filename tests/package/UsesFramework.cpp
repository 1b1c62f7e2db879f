// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A program outside the tree for which settings, log and XML have to work. Returns 0 if they do.

#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLog.h"
#include "common/xml/TorkXmlStream.h"
#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseManager_Base.h"

#include <QCoreApplication>
#include <QFile>
#include <QTemporaryDir>
#include <QXmlInputSource>
#include <QXmlSimpleReader>

#include <cstdio>

namespace {

int s_failures = 0;

void Check(bool holds, char const* what)
{
    if (holds)
        return;
    std::fprintf(stderr, "does not hold: %s\n", what);
    ++s_failures;
}

class Skipper : public TorkXml_ParseManager_Base
{
    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return name == "list" ? new TorkXml_FlushUnknownElement(name, this) : nullptr;
    }
};

void Settings(QString const& path)
{
    TorkConfigFile written(path);
    written.WriteItem("Main", "count", 3);
    written.Save();

    TorkConfigFile read(path);
    int count = 0;
    Check(read.Load() && read.ReadInt("Main", "count", 0, count) && count == 3,
          "settings come back");
}

// Operations that access the classes' fields, or make them grow.
void Sections()
{
    TorkConfigFile settings{QString()};
    for (int i = 0; i < 100; ++i)
        settings.WriteItem("Main", "key" + QString::number(i), i);
    TorkConfigFileSection* found = settings.FindSection(QStringLiteral("Main"));
    Check(found && found->values().size() == 100 && found->values().last().value == "99",
          "a section shows its values");
    Check(found && found->name() == "Main", "a section shows its name");
    Check(!settings.Load() && settings.m_lastError.startsWith("ConfigFile - Load failed"),
          "the last error shows");

    auto* section = new TorkConfigFileSection("Main");
    section->AddValue("key", "value");
    settings.AppendSection(section);
    delete found; // replaced, so no longer owned by the settings
    Check(settings.keyList("Main") == QStringList("key"), "a section pushes out its namesake");
    settings.Clear();
    Check(!settings.HasSection(QStringLiteral("Main")), "sections are cleared");
}

void Log(QString const& folder)
{
    TorkLog* log = TorkLog::initialize(folder, "outside", QString(), true);
    log->warning("hello");
    const QString path = log->newLogFileName();
    TorkLog::shutdown();

    QFile file(path);
    Check(file.open(QIODevice::ReadOnly) && file.readAll().endsWith(" Warning hello\n"),
          "the log has the entry");
}

void Xml()
{
    QString text;
    TorkXmlStream writer(&text);
    writer.WriteElementStart("list", 1);
    writer.WriteElement("entry", "a");
    writer.WriteElementEnd("list", 1);
    writer.flush();
    Check(text == "<list>\n  <entry>a</entry>\n</list>\n", "XML is written");

    QXmlInputSource source;
    source.setData(text);
    Skipper skipper;
    QXmlSimpleReader reader;
    reader.setContentHandler(&skipper);
    Check(reader.parse(source), "XML is read");
}

} // namespace

int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    QTemporaryDir folder;
    Check(folder.isValid(), "there is a folder to write into");
    Settings(folder.filePath("settings.cfg"));
    Sections();
    Log(folder.path() + '/');
    Xml();
    return s_failures == 0 ? 0 : 1;
}

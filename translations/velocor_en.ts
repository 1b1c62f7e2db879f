<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="en" sourcelanguage="en">
<context>
    <name>LogStateText</name>
    <message numerus="yes">
        <source>%Ln line(s)</source>
        <translation>
            <numerusform>%Ln line</numerusform>
            <numerusform>%Ln lines</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>%Ln problem(s)</source>
        <translation>
            <numerusform>%Ln problem</numerusform>
            <numerusform>%Ln problems</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message numerus="yes">
        <source>%Ln older file(s)</source>
        <translation>
            <numerusform>%Ln older file</numerusform>
            <numerusform>%Ln older files</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>%Ln file(s)</source>
        <translation>
            <numerusform>%Ln file</numerusform>
            <numerusform>%Ln files</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::CurrentTab</name>
    <message numerus="yes">
        <source>%Ln new problem(s): %1</source>
        <translation>
            <numerusform>%Ln new problem: %1</numerusform>
            <numerusform>%Ln new problems: %1</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::DifferenceDialog</name>
    <message numerus="yes">
        <source>%Ln difference(s)</source>
        <translation>
            <numerusform>%Ln difference</numerusform>
            <numerusform>%Ln differences</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::FindControl</name>
    <message numerus="yes">
        <source>%Ln line(s)</source>
        <translation>
            <numerusform>%Ln line</numerusform>
            <numerusform>%Ln lines</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::GoToDialog</name>
    <message numerus="yes">
        <source>The file has only %Ln line(s).</source>
        <translation>
            <numerusform>The file has only %Ln line.</numerusform>
            <numerusform>The file has only %Ln lines.</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::LineCommands</name>
    <message numerus="yes">
        <source>%Ln line(s) saved to %1</source>
        <translation>
            <numerusform>%Ln line saved to %1</numerusform>
            <numerusform>%Ln lines saved to %1</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::LineCopier</name>
    <message numerus="yes">
        <source>%Ln line(s) copied</source>
        <translation>
            <numerusform>%Ln line copied</numerusform>
            <numerusform>%Ln lines copied</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::LogModel</name>
    <message numerus="yes">
        <source>%Ln time(s)</source>
        <translation>
            <numerusform>%Ln time</numerusform>
            <numerusform>%Ln times</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>%Ln time(s), %1</source>
        <translation>
            <numerusform>%Ln time, %1</numerusform>
            <numerusform>%Ln times, %1</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsCommands</name>
    <message numerus="yes">
        <source>Removed %Ln key(s): </source>
        <translation>
            <numerusform>Removed %Ln key: </numerusform>
            <numerusform>Removed %Ln keys: </numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>%Ln section(s)</source>
        <translation>
            <numerusform>%Ln section</numerusform>
            <numerusform>%Ln sections</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>, with %Ln key(s): </source>
        <translation>
            <numerusform>, with %Ln key: </numerusform>
            <numerusform>, with %Ln keys: </numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsEditor</name>
    <message numerus="yes">
        <source>Saving would lose %Ln item(s) in this file.</source>
        <translation>
            <numerusform>Saving would lose %Ln item in this file.</numerusform>
            <numerusform>Saving would lose %Ln items in this file.</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsFindBar</name>
    <message numerus="yes">
        <source>%Ln key(s)</source>
        <translation>
            <numerusform>%Ln key</numerusform>
            <numerusform>%Ln keys</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>%Ln match(es)</source>
        <translation>
            <numerusform>%Ln match</numerusform>
            <numerusform>%Ln matches</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::TextFindBar</name>
    <message numerus="yes">
        <source>%Ln match(es)</source>
        <translation>
            <numerusform>%Ln match</numerusform>
            <numerusform>%Ln matches</numerusform>
        </translation>
    </message>
</context>
</TS>

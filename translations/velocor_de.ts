<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="de" sourcelanguage="en">
<context>
    <name>HighlightColors</name>
    <message>
        <source>Green</source>
        <translation>Grün</translation>
    </message>
    <message>
        <source>Blue</source>
        <translation>Blau</translation>
    </message>
    <message>
        <source>Orange</source>
        <translation>Orange</translation>
    </message>
    <message>
        <source>Purple</source>
        <translation>Violett</translation>
    </message>
    <message>
        <source>Red</source>
        <translation>Rot</translation>
    </message>
    <message>
        <source>Pink</source>
        <translation>Rosa</translation>
    </message>
    <message>
        <source>Gray</source>
        <translation>Grau</translation>
    </message>
</context>
<context>
    <name>LogStateText</name>
    <message numerus="yes">
        <source>%Ln line(s)</source>
        <translation>
            <numerusform>%Ln Zeile</numerusform>
            <numerusform>%Ln Zeilen</numerusform>
        </translation>
    </message>
    <message>
        <source>%1 of %2</source>
        <translation>%1 von %2</translation>
    </message>
    <message>
        <source>Line %1 of %2</source>
        <translation>Zeile %1 von %2</translation>
    </message>
    <message>
        <source>Reading: %1%</source>
        <translation>Lesen: %1&#xa0;%</translation>
    </message>
    <message numerus="yes">
        <source>%Ln problem(s)</source>
        <translation>
            <numerusform>%Ln Problem</numerusform>
            <numerusform>%Ln Probleme</numerusform>
        </translation>
    </message>
    <message>
        <source>%1 shown</source>
        <translation>%1 angezeigt</translation>
    </message>
    <message>
        <source>%1% read</source>
        <translation>%1&#xa0;% gelesen</translation>
    </message>
    <message>
        <source>paused</source>
        <translation>angehalten</translation>
    </message>
    <message>
        <source>Cannot be read, so their lines are missing: %1</source>
        <translation>Nicht lesbar, ihre Zeilen fehlen daher: %1</translation>
    </message>
    <message>
        <source>This looks like a compressed file. To read it: %1</source>
        <translation>Das scheint eine komprimierte Datei zu sein. Um sie zu lesen: %1</translation>
    </message>
    <message>
        <source>This looks like a binary file. Its bytes are shown as text.</source>
        <translation>Das scheint eine Binärdatei zu sein. Ihre Bytes werden als Text gezeigt.</translation>
    </message>
    <message>
        <source>Cannot read %1:
%2</source>
        <translation>%1 kann nicht gelesen werden:
%2</translation>
    </message>
    <message>
        <source>%1 does not exist.
It is shown here as soon as it is created.</source>
        <translation>%1 existiert nicht.
Die Datei wird hier gezeigt, sobald sie angelegt ist.</translation>
    </message>
    <message>
        <source>No lines match the filter.
Clear it with Ctrl+Shift+F.</source>
        <translation>Keine Zeile passt zum Filter.
Mit Strg+Umschalt+F wird er gelöscht.</translation>
    </message>
    <message>
        <source>The log is empty.
New lines appear here as they are written.</source>
        <translation>Das Protokoll ist leer.
Neue Zeilen erscheinen hier, sobald sie geschrieben werden.</translation>
    </message>
</context>
<context>
    <name>QGuiApplication</name>
    <message>
        <source>QT_LAYOUT_DIRECTION</source>
        <extracomment>&quot;RTL&quot; if the language is written from right to left, else &quot;LTR&quot;</extracomment>
        <translation>LTR</translation>
    </message>
</context>
<context>
    <name>QObject</name>
    <message>
        <source>No such file</source>
        <translation>Datei nicht gefunden</translation>
    </message>
    <message>
        <source>Not a regular file</source>
        <translation>Keine gewöhnliche Datei</translation>
    </message>
    <message>
        <source>A compressed file. To read it: %1 FILE | velocor-log -</source>
        <translation>Eine komprimierte Datei. Um sie zu lesen: %1 DATEI | velocor-log -</translation>
    </message>
    <message>
        <source>%1 at character %2</source>
        <translation>%1 bei Zeichen %2</translation>
    </message>
    <message>
        <source>No file has so many lines.</source>
        <translation>Keine Datei hat so viele Zeilen.</translation>
    </message>
    <message>
        <source>The first line is 1.</source>
        <translation>Die erste Zeile ist 1.</translation>
    </message>
    <message>
        <source>Add a unit: %1s, %1m, %1h or %1d.</source>
        <translation>Mit Einheit angeben: %1s, %1m, %1h oder %1d.</translation>
    </message>
    <message>
        <source>The interval is too long.</source>
        <translation>Die Zeitspanne ist zu lang.</translation>
    </message>
    <message>
        <source>The hours go up to 23.</source>
        <translation>Die Stunden gehen bis 23.</translation>
    </message>
    <message>
        <source>The minutes go up to 59.</source>
        <translation>Die Minuten gehen bis 59.</translation>
    </message>
    <message>
        <source>The seconds go up to 59.</source>
        <translation>Die Sekunden gehen bis 59.</translation>
    </message>
    <message>
        <source>There is no such day.</source>
        <translation>Diesen Tag gibt es nicht.</translation>
    </message>
    <message>
        <source>Neither a line number nor a time.</source>
        <translation>Weder eine Zeilennummer noch eine Zeit.</translation>
    </message>
    <message>
        <source>words</source>
        <translation>Wörter</translation>
    </message>
    <message>
        <source>home folders</source>
        <translation>persönliche Ordner</translation>
    </message>
    <message>
        <source>names of users</source>
        <translation>Benutzernamen</translation>
    </message>
    <message>
        <source>full names</source>
        <translation>volle Namen</translation>
    </message>
    <message>
        <source>names of computers</source>
        <translation>Rechnernamen</translation>
    </message>
    <message>
        <source>mail addresses</source>
        <translation>E-Mail-Adressen</translation>
    </message>
    <message>
        <source>network addresses</source>
        <translation>Netzwerkadressen</translation>
    </message>
    <message>
        <source>hardware addresses</source>
        <translation>Hardwareadressen</translation>
    </message>
    <message>
        <source>private keys</source>
        <translation>private Schlüssel</translation>
    </message>
    <message>
        <source>tokens</source>
        <translation>Token</translation>
    </message>
    <message>
        <source>passwords</source>
        <translation>Passwörter</translation>
    </message>
    <message>
        <source>Only a part could be written</source>
        <translation>Nur ein Teil konnte geschrieben werden</translation>
    </message>
    <message>
        <source># Report

Created %1
</source>
        <translation># Bericht

Erstellt %1
</translation>
    </message>
    <message>
        <source>
## Replaced by placeholders

</source>
        <translation>
## Durch Platzhalter ersetzt

</translation>
    </message>
    <message>
        <source>Nothing.
</source>
        <translation>Nichts.
</translation>
    </message>
    <message>
        <source>| what | different | places |
</source>
        <translation>| Was | Verschiedene | Stellen |
</translation>
    </message>
    <message>
        <source>It exists</source>
        <translation>Existiert bereits</translation>
    </message>
    <message>
        <source>The folder cannot be created</source>
        <translation>Der Ordner kann nicht angelegt werden</translation>
    </message>
    <message>
        <source> (does not exist)</source>
        <translation> (existiert nicht)</translation>
    </message>
    <message>
        <source>it ended normally</source>
        <translation>normal beendet</translation>
    </message>
    <message>
        <source>it was killed or crashed</source>
        <translation>gewaltsam beendet oder abgestürzt</translation>
    </message>
    <message>
        <source>it is running</source>
        <translation>läuft noch</translation>
    </message>
    <message>
        <source>nothing tells how it ended</source>
        <translation>nichts sagt, wie er endete</translation>
    </message>
    <message>
        <source>unknown</source>
        <translation>unbekannt</translation>
    </message>
    <message>
        <source>from %1 to %2, %3 lines, problems: %4; %5</source>
        <translation>von %1 bis %2, %3 Zeilen, Probleme: %4; %5</translation>
    </message>
    <message>
        <source>This run and the one before</source>
        <translation>Dieser Lauf und der vorige</translation>
    </message>
    <message>
        <source>The log is empty.
</source>
        <translation>Das Protokoll ist leer.
</translation>
    </message>
    <message>
        <source>The last run</source>
        <translation>Der letzte Lauf</translation>
    </message>
    <message>
        <source>The run before</source>
        <translation>Der Lauf davor</translation>
    </message>
    <message>
        <source>None.
</source>
        <translation>Keine.
</translation>
    </message>
    <message>
        <source>Program</source>
        <translation>Programm</translation>
    </message>
    <message>
        <source>Built with Qt</source>
        <translation>Gebaut mit Qt</translation>
    </message>
    <message>
        <source>Running with Qt</source>
        <translation>Läuft mit Qt</translation>
    </message>
    <message>
        <source>Build ABI</source>
        <translation>Binärschnittstelle (ABI)</translation>
    </message>
    <message>
        <source>System</source>
        <translation>System</translation>
    </message>
    <message>
        <source>Kernel</source>
        <translation>Kernel</translation>
    </message>
    <message>
        <source>Processor</source>
        <translation>Prozessor</translation>
    </message>
    <message>
        <source>Locale</source>
        <translation>Gebietsschema</translation>
    </message>
    <message>
        <source>Organization</source>
        <translation>Organisation</translation>
    </message>
    <message>
        <source>Product</source>
        <translation>Produkt</translation>
    </message>
    <message>
        <source>Installation</source>
        <translation>Installation</translation>
    </message>
    <message>
        <source>Data</source>
        <translation>Daten</translation>
    </message>
    <message>
        <source>Documents</source>
        <translation>Dokumente</translation>
    </message>
    <message>
        <source>%1 bytes</source>
        <translation>%1 Bytes</translation>
    </message>
    <message>
        <source>There are none.
</source>
        <translation>Es gibt keine.
</translation>
    </message>
    <message>
        <source>Problems</source>
        <translation>Probleme</translation>
    </message>
    <message>
        <source>There is no log</source>
        <translation>Es gibt kein Protokoll</translation>
    </message>
    <message>
        <source>Logging is off</source>
        <translation>Die Protokollierung ist ausgeschaltet</translation>
    </message>
    <message>
        <source>Cannot write the log: %1</source>
        <translation>Das Protokoll kann nicht geschrieben werden: %1</translation>
    </message>
    <message>
        <source>Cannot write the log: %1 is not writable</source>
        <translation>Das Protokoll kann nicht geschrieben werden: %1 ist nicht beschreibbar</translation>
    </message>
    <message>
        <source>Cannot write the log: the disk is full</source>
        <translation>Das Protokoll kann nicht geschrieben werden: Der Datenträger ist voll</translation>
    </message>
    <message>
        <source>Another running program writes to the same log (process %1)</source>
        <translation>Ein anderes laufendes Programm schreibt in dasselbe Protokoll (Prozess %1)</translation>
    </message>
    <message>
        <source>Other running programs write to the same log (processes %1)</source>
        <translation>Andere laufende Programme schreiben in dasselbe Protokoll (Prozesse %1)</translation>
    </message>
    <message>
        <source>There is no log.</source>
        <translation>Es gibt kein Protokoll.</translation>
    </message>
    <message>
        <source>The settings file %1 is incomplete after saving.</source>
        <translation>Die Einstellungsdatei %1 ist nach dem Speichern unvollständig.</translation>
    </message>
    <message>
        <source>Cannot create the folder %1</source>
        <translation>Der Ordner %1 kann nicht angelegt werden</translation>
    </message>
    <message>
        <source>Cannot protect the folder %1</source>
        <translation>Der Ordner %1 kann nicht geschützt werden</translation>
    </message>
    <message>
        <source>it is larger than 1 MiB</source>
        <translation>sie ist größer als 1 MiB</translation>
    </message>
    <message>
        <source>Line %1: everything from there on (%2)</source>
        <translation>Zeile %1: alles ab dort (%2)</translation>
    </message>
    <message>
        <source>Is a folder</source>
        <translation>Ist ein Ordner</translation>
    </message>
    <message>
        <source>Line 1: the XML declaration</source>
        <translation>Zeile 1: die XML-Deklaration</translation>
    </message>
    <message>
        <source>Line %1: %2</source>
        <translation>Zeile %1: %2</translation>
    </message>
    <message>
        <source>the attribute &quot;%1&quot; of &quot;%2&quot;</source>
        <translation>das Attribut „%1“ von „%2“</translation>
    </message>
    <message>
        <source>the element &quot;%1&quot;, which has the same name as the root element</source>
        <translation>das Element „%1“, das wie das Wurzelelement heißt</translation>
    </message>
    <message>
        <source>a second section &quot;%1&quot;, merged with the first</source>
        <translation>ein zweiter Abschnitt „%1“, mit dem ersten zusammengelegt</translation>
    </message>
    <message>
        <source>the nesting of the element &quot;%1&quot;</source>
        <translation>die Verschachtelung des Elements „%1“</translation>
    </message>
    <message>
        <source>the name of the section &quot;%1&quot;</source>
        <translation>der Name des Abschnitts „%1“</translation>
    </message>
    <message>
        <source>the empty item &quot;%1&quot;</source>
        <translation>der leere Eintrag „%1“</translation>
    </message>
    <message>
        <source>&quot;%1&quot;, which is outside any section</source>
        <translation>„%1“, außerhalb aller Abschnitte</translation>
    </message>
    <message>
        <source>the first value of &quot;%1&quot;, replaced by a second one</source>
        <translation>der erste Wert von „%1“, durch einen zweiten ersetzt</translation>
    </message>
    <message>
        <source>the value of &quot;%1&quot;, starting at &quot;%2&quot;</source>
        <translation>der Wert von „%1“, ab „%2“</translation>
    </message>
    <message>
        <source>the text &quot;%1&quot; outside any value</source>
        <translation>der Text „%1“ außerhalb aller Werte</translation>
    </message>
    <message>
        <source>the processing instruction &quot;%1&quot;</source>
        <translation>die Verarbeitungsanweisung „%1“</translation>
    </message>
    <message>
        <source>the comment &quot;%1&quot;</source>
        <translation>der Kommentar „%1“</translation>
    </message>
    <message>
        <source>the document type &quot;%1&quot;</source>
        <translation>der Dokumenttyp „%1“</translation>
    </message>
    <message>
        <source>a value with &quot;]]&gt;&quot; makes the file unreadable</source>
        <translation>ein Wert mit „]]&gt;“ macht die Datei unlesbar</translation>
    </message>
    <message>
        <source>characters outside Latin-1 become &quot;?&quot;</source>
        <translation>Zeichen außerhalb von Latin-1 werden zu „?“</translation>
    </message>
    <message>
        <source>empty values are not saved</source>
        <translation>leere Werte werden nicht gespeichert</translation>
    </message>
    <message>
        <source>the value would change when read back</source>
        <translation>der Wert würde beim Lesen ein anderer</translation>
    </message>
    <message>
        <source>the key is not a valid name</source>
        <translation>der Schlüssel ist kein gültiger Name</translation>
    </message>
    <message>
        <source>the section name is not valid</source>
        <translation>der Name des Abschnitts ist ungültig</translation>
    </message>
    <message>
        <source>the section has the same name as the root element</source>
        <translation>der Abschnitt heißt wie das Wurzelelement</translation>
    </message>
    <message>
        <source>The file was written, but does not read back completely. The disk may be full.</source>
        <translation>Die Datei wurde geschrieben, lässt sich aber nicht vollständig lesen. Vielleicht ist der Datenträger voll.</translation>
    </message>
    <message>
        <source>Cannot replace the file %1.</source>
        <translation>Die Datei %1 kann nicht ersetzt werden.</translation>
    </message>
    <message>
        <source>%1 is damaged, so marks and encodings are not saved</source>
        <translation>%1 ist beschädigt, daher werden Markierungen und Kodierungen nicht gespeichert</translation>
    </message>
    <message>
        <source>Screen %1</source>
        <translation>Bildschirm %1</translation>
    </message>
    <message>
        <source>does not exist</source>
        <translation>existiert nicht</translation>
    </message>
    <message>
        <source>writable</source>
        <translation>beschreibbar</translation>
    </message>
    <message>
        <source>not writable</source>
        <translation>nicht beschreibbar</translation>
    </message>
    <message>
        <source>not a regular file</source>
        <translation>keine gewöhnliche Datei</translation>
    </message>
    <message>
        <source>none</source>
        <translation>keine</translation>
    </message>
    <message>
        <source>on</source>
        <translation>ein</translation>
    </message>
    <message>
        <source>off</source>
        <translation>aus</translation>
    </message>
    <message>
        <source>, limit %1 per file, </source>
        <translation>, höchstens %1 pro Datei, </translation>
    </message>
    <message numerus="yes">
        <source>%Ln older file(s)</source>
        <translation>
            <numerusform>%Ln ältere Datei</numerusform>
            <numerusform>%Ln ältere Dateien</numerusform>
        </translation>
    </message>
    <message>
        <source>, last error: %1</source>
        <translation>, letzter Fehler: %1</translation>
    </message>
    <message numerus="yes">
        <source>%Ln file(s)</source>
        <translation>
            <numerusform>%Ln Datei</numerusform>
            <numerusform>%Ln Dateien</numerusform>
        </translation>
    </message>
    <message>
        <source>%1, %2 in total</source>
        <translation>%1, %2 insgesamt</translation>
    </message>
    <message>
        <source>Compiler</source>
        <translation>Compiler</translation>
    </message>
    <message>
        <source>Platform</source>
        <translation>Plattform</translation>
    </message>
    <message>
        <source>Style</source>
        <translation>Stil</translation>
    </message>
    <message>
        <source>Font</source>
        <translation>Schrift</translation>
    </message>
    <message>
        <source>Settings file</source>
        <translation>Einstellungsdatei</translation>
    </message>
    <message>
        <source>Log settings</source>
        <translation>Protokolleinstellungen</translation>
    </message>
    <message>
        <source>Log file</source>
        <translation>Protokolldatei</translation>
    </message>
    <message>
        <source>Log files</source>
        <translation>Protokolldateien</translation>
    </message>
    <message>
        <source>Log</source>
        <translation>Protokoll</translation>
    </message>
    <message>
        <source>Free space for data</source>
        <translation>Freier Platz für Daten</translation>
    </message>
    <message>
        <source>Cannot read the settings file %1 (%2). It is left unchanged.</source>
        <translation>Die Einstellungsdatei %1 kann nicht gelesen werden (%2). Sie bleibt unverändert.</translation>
    </message>
    <message>
        <source>%1 cannot be renamed</source>
        <translation>%1 kann nicht umbenannt werden</translation>
    </message>
    <message>
        <source>The settings file was damaged, so default settings are used. The damaged file was kept as %1.</source>
        <translation>Die Einstellungsdatei war beschädigt, daher gelten die Standardeinstellungen. Die beschädigte Datei wurde als %1 aufgehoben.</translation>
    </message>
    <message>
        <source>The settings file %1 is damaged and cannot be renamed. It is left unchanged, and window settings will not be saved.</source>
        <translation>Die Einstellungsdatei %1 ist beschädigt und kann nicht umbenannt werden. Sie bleibt unverändert, und Einstellungen des Fensters werden nicht gespeichert.</translation>
    </message>
    <message>
        <source>The settings file %1 is not a regular file</source>
        <translation>Die Einstellungsdatei %1 ist keine gewöhnliche Datei</translation>
    </message>
    <message>
        <source>and %1 more</source>
        <translation>und %1 weitere</translation>
    </message>
    <message>
        <source>What Will Be Written to %1</source>
        <translation>Was in %1 geschrieben wird</translation>
    </message>
    <message>
        <source>The file now</source>
        <translation>Die Datei jetzt</translation>
    </message>
    <message>
        <source>After saving</source>
        <translation>Nach dem Speichern</translation>
    </message>
    <message>
        <source>Cannot compare with %1.
%2</source>
        <translation>Der Vergleich mit %1 ist nicht möglich.
%2</translation>
    </message>
    <message>
        <source>Compare With %1</source>
        <translation>Mit %1 vergleichen</translation>
    </message>
    <message>
        <source>In the editor</source>
        <translation>Im Editor</translation>
    </message>
    <message>
        <source>Take Over</source>
        <translation>Übernehmen</translation>
    </message>
    <message>
        <source>Saving %1 would lose:</source>
        <translation>Beim Speichern von %1 ginge verloren:</translation>
    </message>
    <message>
        <source>Save Anyway</source>
        <translation>Trotzdem speichern</translation>
    </message>
    <message>
        <source>%1 was changed by another program.</source>
        <translation>%1 wurde von einem anderen Programm geändert.</translation>
    </message>
    <message>
        <source>Saving would overwrite those changes.</source>
        <translation>Beim Speichern würden diese Änderungen überschrieben.</translation>
    </message>
    <message>
        <source>Cannot back up %1.</source>
        <translation>%1 kann nicht gesichert werden.</translation>
    </message>
    <message>
        <source>Save Without Backup</source>
        <translation>Ohne Sicherung speichern</translation>
    </message>
    <message>
        <source>Programs cannot read all of %1 yet.</source>
        <translation>Programme können %1 noch nicht ganz lesen.</translation>
    </message>
    <message>
        <source>Line %1, column %2: %3</source>
        <translation>Zeile %1, Spalte %2: %3</translation>
    </message>
    <message>
        <source>Could not save %1.
%2</source>
        <translation>%1 konnte nicht gespeichert werden.
%2</translation>
    </message>
    <message>
        <source>Edit Value</source>
        <translation>Wert bearbeiten</translation>
    </message>
    <message>
        <source>Long lines are split for display; only %1 marks a line break.</source>
        <translation>Lange Zeilen werden zur Anzeige geteilt; nur %1 bezeichnet einen Zeilenumbruch.</translation>
    </message>
    <message>
        <source>This value contains carriage returns or Unicode line separators, so it cannot be edited here.</source>
        <translation>Dieser Wert enthält Wagenrückläufe oder Unicode-Zeilentrenner und kann daher hier nicht bearbeitet werden.</translation>
    </message>
    <message>
        <source>Value</source>
        <translation>Wert</translation>
    </message>
    <message>
        <source>Color of %1</source>
        <translation>Farbe von %1</translation>
    </message>
    <message>
        <source>Font of %1</source>
        <translation>Schrift von %1</translation>
    </message>
    <message>
        <source>1 byte</source>
        <translation>1 Byte</translation>
    </message>
    <message>
        <source>It has more than %L1 keys</source>
        <translation>Sie hat mehr als %L1 Schlüssel</translation>
    </message>
    <message>
        <source>It is larger than %L1 MiB</source>
        <translation>Sie ist größer als %L1&#xa0;MiB</translation>
    </message>
    <message>
        <source>%1 cannot be read any more.</source>
        <translation>%1 kann nicht mehr gelesen werden.</translation>
    </message>
    <message>
        <source>the namespace &quot;%1&quot; of &quot;%2&quot;</source>
        <translation>der Namensraum „%1“ von „%2“</translation>
    </message>
    <message>
        <source>the prefix of &quot;%1&quot;</source>
        <translation>das Präfix von „%1“</translation>
    </message>
</context>
<context>
    <name>RunText</name>
    <message>
        <source>%1 to %2</source>
        <translation>%1 bis %2</translation>
    </message>
    <message>
        <source>ended normally</source>
        <translation>normal beendet</translation>
    </message>
    <message>
        <source>killed or crashed</source>
        <translation>gewaltsam beendet oder abgestürzt</translation>
    </message>
    <message>
        <source>still running</source>
        <translation>läuft noch</translation>
    </message>
    <message>
        <source>1 warning</source>
        <translation>1 Warnung</translation>
    </message>
    <message>
        <source>%1 warnings</source>
        <translation>%1 Warnungen</translation>
    </message>
    <message>
        <source>1 error</source>
        <translation>1 Fehler</translation>
    </message>
    <message>
        <source>%1 errors</source>
        <translation>%1 Fehler</translation>
    </message>
</context>
<context>
    <name>ShortcutList</name>
    <message>
        <source>Settings files
</source>
        <translation>Einstellungsdateien
</translation>
    </message>
    <message>
        <source>Tabs
</source>
        <translation>Tabs
</translation>
    </message>
    <message>
        <source>Buttons
</source>
        <translation>Schaltflächen
</translation>
    </message>
</context>
<context>
    <name>SpanText</name>
    <message>
        <source>%1 %2</source>
        <translation>%1 %2</translation>
    </message>
    <message>
        <source>1 minute</source>
        <translation>1 Minute</translation>
    </message>
    <message>
        <source>%1 minutes</source>
        <translation>%1 Minuten</translation>
    </message>
    <message>
        <source>1 hour</source>
        <translation>1 Stunde</translation>
    </message>
    <message>
        <source>%1 hours</source>
        <translation>%1 Stunden</translation>
    </message>
    <message>
        <source>1 day</source>
        <translation>1 Tag</translation>
    </message>
    <message>
        <source>%1 days</source>
        <translation>%1 Tage</translation>
    </message>
    <message>
        <source>1 second</source>
        <translation>1 Sekunde</translation>
    </message>
    <message>
        <source>%1 seconds</source>
        <translation>%1 Sekunden</translation>
    </message>
    <message>
        <source>%1 ms</source>
        <translation>%1 ms</translation>
    </message>
    <message>
        <source>%1 s</source>
        <translation>%1 s</translation>
    </message>
    <message>
        <source>%1 min %2 s</source>
        <translation>%1 min %2 s</translation>
    </message>
    <message>
        <source>%1 h %2 min</source>
        <translation>%1 h %2 min</translation>
    </message>
    <message>
        <source>%1 d %2 h</source>
        <translation>%1 T %2 h</translation>
    </message>
    <message>
        <source>1 millisecond</source>
        <translation>1 Millisekunde</translation>
    </message>
    <message>
        <source>%1 milliseconds</source>
        <translation>%1 Millisekunden</translation>
    </message>
</context>
<context>
    <name>ValueKind</name>
    <message>
        <source>Yes or no</source>
        <translation>Ja oder nein</translation>
    </message>
    <message>
        <source>Number</source>
        <translation>Zahl</translation>
    </message>
    <message>
        <source>Color</source>
        <translation>Farbe</translation>
    </message>
    <message>
        <source>Size</source>
        <translation>Größe</translation>
    </message>
    <message>
        <source>Font</source>
        <translation>Schrift</translation>
    </message>
    <message>
        <source>Window place</source>
        <translation>Fensterplatz</translation>
    </message>
    <message>
        <source>File list</source>
        <translation>Dateiliste</translation>
    </message>
    <message>
        <source>Text</source>
        <translation>Text</translation>
    </message>
</context>
<context>
    <name>Velocor::ActivityStrip</name>
    <message>
        <source>Activity</source>
        <translation>Aktivität</translation>
    </message>
    <message>
        <source>%1 to %2: %L3 entries, %L4 problems</source>
        <translation>%1 bis %2: %L3 Einträge, %L4 Probleme</translation>
    </message>
    <message>
        <source>The times in this log have no dates</source>
        <translation>Die Zeiten in diesem Protokoll haben kein Datum</translation>
    </message>
    <message>
        <source>No times</source>
        <translation>Keine Zeiten</translation>
    </message>
    <message>
        <source>%1: %L2 entries, %L3 problems</source>
        <translation>%1: %L2 Einträge, %L3 Probleme</translation>
    </message>
    <message>
        <source>%1 to %2</source>
        <translation>%1 bis %2</translation>
    </message>
</context>
<context>
    <name>Velocor::CurrentLine</name>
    <message>
        <source>Note on the current line</source>
        <translation>Notiz zur aktuellen Zeile</translation>
    </message>
    <message>
        <source>Full text of the current line</source>
        <translation>Ganzer Text der aktuellen Zeile</translation>
    </message>
    <message>
        <source>Select a line to see its full text here</source>
        <translation>Eine Zeile auswählen, um hier ihren ganzen Text zu sehen</translation>
    </message>
    <message>
        <source>Note: %1</source>
        <translation>Notiz: %1</translation>
    </message>
    <message>
        <source>&amp;Filter by This</source>
        <translation>Danach &amp;filtern</translation>
    </message>
    <message>
        <source>&amp;Hide This</source>
        <translation>&amp;Ausblenden</translation>
    </message>
    <message>
        <source>Hi&amp;ghlight This</source>
        <translation>Hervor&amp;heben</translation>
    </message>
</context>
<context>
    <name>Velocor::CurrentTab</name>
    <message>
        <source>&amp;Undo %1</source>
        <translation>&amp;Rückgängig: %1</translation>
    </message>
    <message>
        <source>&amp;Redo %1</source>
        <translation>Wieder&amp;herstellen: %1</translation>
    </message>
    <message>
        <source>%1 – %2</source>
        <translation>%1 – %2</translation>
    </message>
    <message numerus="yes">
        <source>%Ln new problem(s): %1</source>
        <translation>
            <numerusform>%Ln neues Problem: %1</numerusform>
            <numerusform>%Ln neue Probleme: %1</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::DifferenceDialog</name>
    <message>
        <source>&amp;Differences only</source>
        <translation>Nur &amp;Unterschiede</translation>
    </message>
    <message>
        <source>&amp;Take Over</source>
        <translation>Ü&amp;bernehmen</translation>
    </message>
    <message>
        <source>&amp;Undo</source>
        <translation>&amp;Rückgängig</translation>
    </message>
    <message>
        <source>Summary</source>
        <translation>Zusammenfassung</translation>
    </message>
    <message>
        <source>&amp;Lines</source>
        <translation>&amp;Zeilen</translation>
    </message>
    <message>
        <source>Show the lines of the files; those that the other file does not have are marked</source>
        <translation>Die Zeilen der Dateien zeigen; die der anderen Datei fehlenden sind markiert</translation>
    </message>
    <message>
        <source>&amp;Close</source>
        <translation>Schl&amp;ießen</translation>
    </message>
    <message>
        <source>Change the selected rows in the editor to what is on the right</source>
        <translation>Die ausgewählten Zeilen im Editor so ändern, wie sie rechts sind</translation>
    </message>
    <message>
        <source>Take back the last change in the editor (Ctrl+Z)</source>
        <translation>Die letzte Änderung im Editor zurücknehmen (Strg+Z)</translation>
    </message>
    <message numerus="yes">
        <source>%Ln difference(s)</source>
        <translation>
            <numerusform>%Ln Unterschied</numerusform>
            <numerusform>%Ln Unterschiede</numerusform>
        </translation>
    </message>
    <message>
        <source>No differences</source>
        <translation>Keine Unterschiede</translation>
    </message>
    <message>
        <source>; saving would lose what the last column names</source>
        <translation>; beim Speichern ginge verloren, was die letzte Spalte nennt</translation>
    </message>
    <message>
        <source>Lines: %1</source>
        <translation>Zeilen: %1</translation>
    </message>
</context>
<context>
    <name>Velocor::DifferenceTree</name>
    <message>
        <source>Differences</source>
        <translation>Unterschiede</translation>
    </message>
    <message>
        <source>Columns of the differences</source>
        <translation>Spalten der Unterschiede</translation>
    </message>
    <message>
        <source>Section / key</source>
        <translation>Abschnitt / Schlüssel</translation>
    </message>
    <message>
        <source>Difference</source>
        <translation>Unterschied</translation>
    </message>
    <message>
        <source>Lost in saving</source>
        <translation>Beim Speichern verloren</translation>
    </message>
    <message>
        <source>(whole file)</source>
        <translation>(ganze Datei)</translation>
    </message>
    <message>
        <source>Other root element</source>
        <translation>Anderes Wurzelelement</translation>
    </message>
    <message>
        <source>Moved</source>
        <translation>Verschoben</translation>
    </message>
    <message>
        <source>Only left</source>
        <translation>Nur links</translation>
    </message>
    <message>
        <source>Only right</source>
        <translation>Nur rechts</translation>
    </message>
    <message>
        <source>Changed, moved</source>
        <translation>Geändert, verschoben</translation>
    </message>
    <message>
        <source>Changed</source>
        <translation>Geändert</translation>
    </message>
</context>
<context>
    <name>Velocor::FieldHint</name>
    <message>
        <source>Problem with what is typed</source>
        <translation>Problem mit der Eingabe</translation>
    </message>
</context>
<context>
    <name>Velocor::FileListDialog</name>
    <message>
        <source>Edit File List</source>
        <translation>Dateiliste bearbeiten</translation>
    </message>
    <message>
        <source>Files</source>
        <translation>Dateien</translation>
    </message>
    <message>
        <source>Problem with the files</source>
        <translation>Problem mit den Dateien</translation>
    </message>
    <message>
        <source>&amp;Add</source>
        <translation>&amp;Hinzufügen</translation>
    </message>
    <message>
        <source>&amp;Remove</source>
        <translation>&amp;Entfernen</translation>
    </message>
    <message>
        <source>Move &amp;Up</source>
        <translation>Nach &amp;oben</translation>
    </message>
    <message>
        <source>Move &amp;Down</source>
        <translation>Nach u&amp;nten</translation>
    </message>
    <message>
        <source>&quot;|&quot; separates the files, so no name can have it</source>
        <translation>„|“ trennt die Dateien, daher darf es in keinem Namen vorkommen</translation>
    </message>
</context>
<context>
    <name>Velocor::FileNotice</name>
    <message>
        <source>State of the file</source>
        <translation>Zustand der Datei</translation>
    </message>
    <message>
        <source>Reload</source>
        <translation>Neu laden</translation>
    </message>
    <message>
        <source>Show what is in the file now; can be undone</source>
        <translation>Zeigen, was jetzt in der Datei steht; kann rückgängig gemacht werden</translation>
    </message>
    <message>
        <source>Compare...</source>
        <translation>Vergleichen...</translation>
    </message>
    <message>
        <source>Show what differs, and take over single values</source>
        <translation>Unterschiede zeigen und einzelne Werte übernehmen</translation>
    </message>
    <message>
        <source>Keep Mine</source>
        <translation>Meine behalten</translation>
    </message>
    <message>
        <source>Leave the editor as it is; saving replaces the file</source>
        <translation>Den Editor lassen, wie er ist; Speichern ersetzt die Datei</translation>
    </message>
    <message>
        <source>Save As...</source>
        <translation>Speichern unter...</translation>
    </message>
    <message>
        <source>Save to another file</source>
        <translation>In eine andere Datei speichern</translation>
    </message>
    <message>
        <source>The folder of %1 is gone.</source>
        <translation>Den Ordner von %1 gibt es nicht mehr.</translation>
    </message>
    <message>
        <source>%1 was removed. Saving changes creates it again.</source>
        <translation>%1 wurde entfernt. Beim Speichern von Änderungen wird die Datei wieder angelegt.</translation>
    </message>
    <message>
        <source>%1 is a folder now, not a file.</source>
        <translation>%1 ist jetzt ein Ordner, keine Datei.</translation>
    </message>
    <message>
        <source>%1 is not a regular file any more.</source>
        <translation>%1 ist keine gewöhnliche Datei mehr.</translation>
    </message>
    <message>
        <source>%1 was changed by another program.</source>
        <translation>%1 wurde von einem anderen Programm geändert.</translation>
    </message>
    <message>
        <source>%1 is read-only. Changes can only be saved to another file.</source>
        <translation>%1 ist schreibgeschützt. Änderungen lassen sich nur in eine andere Datei speichern.</translation>
    </message>
</context>
<context>
    <name>Velocor::FileOpener</name>
    <message>
        <source>Open</source>
        <translation>Öffnen</translation>
    </message>
    <message>
        <source>Logs (*.log *.log.* *.txt);;Settings files (*.cfg *.xml);;All files (*)</source>
        <translation>Protokolle (*.log *.log.* *.txt);;Einstellungsdateien (*.cfg *.xml);;Alle Dateien (*)</translation>
    </message>
    <message>
        <source>%1 does not exist</source>
        <translation>%1 existiert nicht</translation>
    </message>
    <message>
        <source>%1 is a folder</source>
        <translation>%1 ist ein Ordner</translation>
    </message>
    <message>
        <source>%1 is not a regular file</source>
        <translation>%1 ist keine gewöhnliche Datei</translation>
    </message>
    <message>
        <source>Only the first %1 of %2 files were opened</source>
        <translation>Nur die ersten %1 von %2 Dateien wurden geöffnet</translation>
    </message>
    <message>
        <source>Standard input cannot be shown, because no file can be created in %1</source>
        <translation>Die Standardeingabe kann nicht gezeigt werden, weil in %1 keine Datei angelegt werden kann</translation>
    </message>
    <message>
        <source>%1 no longer exists.
Remove it from the list of recent files?</source>
        <translation>%1 existiert nicht mehr.
Aus der Liste der zuletzt geöffneten Dateien entfernen?</translation>
    </message>
</context>
<context>
    <name>Velocor::FileTabs</name>
    <message>
        <source>Open files</source>
        <translation>Geöffnete Dateien</translation>
    </message>
    <message>
        <source>Log</source>
        <translation>Protokoll</translation>
    </message>
    <message>
        <source>Next Tab</source>
        <translation>Nächster Tab</translation>
    </message>
    <message>
        <source>Ctrl+PgDown</source>
        <translation>Ctrl+PgDown</translation>
    </message>
    <message>
        <source>Previous Tab</source>
        <translation>Vorheriger Tab</translation>
    </message>
    <message>
        <source>Ctrl+PgUp</source>
        <translation>Ctrl+PgUp</translation>
    </message>
    <message>
        <source>Close %1</source>
        <translation>%1 schließen</translation>
    </message>
    <message>
        <source>Close the file (Ctrl+W)</source>
        <translation>Die Datei schließen (Strg+W)</translation>
    </message>
</context>
<context>
    <name>Velocor::FindControl</name>
    <message>
        <source>Not found</source>
        <translation>Nicht gefunden</translation>
    </message>
    <message>
        <source>Continued from the top</source>
        <translation>Vom Anfang fortgesetzt</translation>
    </message>
    <message>
        <source>Continued from the bottom</source>
        <translation>Vom Ende fortgesetzt</translation>
    </message>
    <message>
        <source>Searching: %1%</source>
        <translation>Suchen: %1&#xa0;%</translation>
    </message>
    <message>
        <source>%L1 of %L2</source>
        <translation>%L1 von %L2</translation>
    </message>
    <message numerus="yes">
        <source>%Ln line(s)</source>
        <translation>
            <numerusform>%Ln Zeile</numerusform>
            <numerusform>%Ln Zeilen</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::GoToDialog</name>
    <message>
        <source>Go To</source>
        <translation>Gehe zu</translation>
    </message>
    <message>
        <source>&amp;Line or time:</source>
        <translation>Zei&amp;le oder Zeit:</translation>
    </message>
    <message>
        <source>Line or time</source>
        <translation>Zeile oder Zeit</translation>
    </message>
    <message>
        <source>Problem</source>
        <translation>Problem</translation>
    </message>
    <message numerus="yes">
        <source>The file has only %Ln line(s).</source>
        <translation>
            <numerusform>Die Datei hat nur %Ln Zeile.</numerusform>
            <numerusform>Die Datei hat nur %Ln Zeilen.</numerusform>
        </translation>
    </message>
    <message>
        <source>Select an entry first, from which to count.</source>
        <translation>Zuerst einen Eintrag auswählen, von dem aus gezählt wird.</translation>
    </message>
    <message>
        <source>line 214 of the file</source>
        <translation>Zeile 214 der Datei</translation>
    </message>
    <message>
        <source>time, on the day of the current entry</source>
        <translation>Zeit, am Tag des aktuellen Eintrags</translation>
    </message>
    <message>
        <source>date and time</source>
        <translation>Datum und Zeit</translation>
    </message>
    <message>
        <source>from the current entry</source>
        <translation>vom aktuellen Eintrag aus</translation>
    </message>
</context>
<context>
    <name>Velocor::HighlightDialog</name>
    <message>
        <source>&amp;Match case</source>
        <translation>&amp;Groß-/Kleinschreibung beachten</translation>
    </message>
    <message>
        <source>Regular &amp;expression</source>
        <translation>&amp;Regulärer Ausdruck</translation>
    </message>
    <message>
        <source>Highlight Rules</source>
        <translation>Hervorhebungsregeln</translation>
    </message>
    <message>
        <source>Rules look at the first %1 bytes of a line.</source>
        <translation>Regeln betrachten die ersten %1 Bytes einer Zeile.</translation>
    </message>
    <message>
        <source>Highlight rules</source>
        <translation>Hervorhebungsregeln</translation>
    </message>
    <message>
        <source>&amp;Add</source>
        <translation>&amp;Hinzufügen</translation>
    </message>
    <message>
        <source>&amp;Remove</source>
        <translation>&amp;Entfernen</translation>
    </message>
    <message>
        <source>Move &amp;Up</source>
        <translation>Nach &amp;oben</translation>
    </message>
    <message>
        <source>Move &amp;Down</source>
        <translation>Nach u&amp;nten</translation>
    </message>
    <message>
        <source>Text to highlight</source>
        <translation>Hervorzuhebender Text</translation>
    </message>
    <message>
        <source>Lines with this text get the color</source>
        <translation>Zeilen mit diesem Text erhalten die Farbe</translation>
    </message>
    <message>
        <source>Match case</source>
        <translation>Groß-/Kleinschreibung beachten</translation>
    </message>
    <message>
        <source>Regular expression</source>
        <translation>Regulärer Ausdruck</translation>
    </message>
    <message>
        <source>Color</source>
        <translation>Farbe</translation>
    </message>
    <message>
        <source>Problem of the rule</source>
        <translation>Problem der Regel</translation>
    </message>
    <message>
        <source>&amp;Text:</source>
        <translation>&amp;Text:</translation>
    </message>
    <message>
        <source>C&amp;olor:</source>
        <translation>&amp;Farbe:</translation>
    </message>
    <message>
        <source>(no text)</source>
        <translation>(kein Text)</translation>
    </message>
    <message>
        <source>Invalid regular expression: %1</source>
        <translation>Ungültiger regulärer Ausdruck: %1</translation>
    </message>
</context>
<context>
    <name>Velocor::HighlightRules</name>
    <message>
        <source>There are %1 highlight rules already</source>
        <translation>Es gibt schon %1 Hervorhebungsregeln</translation>
    </message>
    <message>
        <source>Highlighted; Ctrl+Shift+H changes the rules</source>
        <translation>Hervorgehoben; Strg+Umschalt+H ändert die Regeln</translation>
    </message>
    <message>
        <source>The highlight rule &quot;%1&quot; takes too long and is not applied</source>
        <translation>Die Hervorhebungsregel „%1“ dauert zu lange und wird nicht angewendet</translation>
    </message>
</context>
<context>
    <name>Velocor::LineCommands</name>
    <message>
        <source>Save Lines</source>
        <translation>Zeilen speichern</translation>
    </message>
    <message>
        <source>-lines.log</source>
        <translation>-zeilen.log</translation>
    </message>
    <message>
        <source>Logs (*.log);;All files (*)</source>
        <translation>Protokolle (*.log);;Alle Dateien (*)</translation>
    </message>
    <message>
        <source>Saving lines: %1%</source>
        <translation>Zeilen speichern: %1&#xa0;%</translation>
    </message>
    <message>
        <source>Could not save lines to %1: %2</source>
        <translation>Die Zeilen konnten nicht in %1 gespeichert werden: %2</translation>
    </message>
    <message numerus="yes">
        <source>%Ln line(s) saved to %1</source>
        <translation>
            <numerusform>%Ln Zeile in %1 gespeichert</numerusform>
            <numerusform>%Ln Zeilen in %1 gespeichert</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::LineCopier</name>
    <message>
        <source>No lines selected</source>
        <translation>Keine Zeilen ausgewählt</translation>
    </message>
    <message>
        <source>Copied only the first %L1 selected lines</source>
        <translation>Nur die ersten %L1 ausgewählten Zeilen kopiert</translation>
    </message>
    <message numerus="yes">
        <source>%Ln line(s) copied</source>
        <translation>
            <numerusform>%Ln Zeile kopiert</numerusform>
            <numerusform>%Ln Zeilen kopiert</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::LineDialog</name>
    <message>
        <source>Go to Line</source>
        <translation>Zu Zeile gehen</translation>
    </message>
    <message>
        <source>Line</source>
        <translation>Zeile</translation>
    </message>
    <message>
        <source>&amp;Line, 1 to %L1</source>
        <translation>Zei&amp;le, 1 bis %L1</translation>
    </message>
</context>
<context>
    <name>Velocor::LineNumberMargin</name>
    <message>
        <source>Line numbers</source>
        <translation>Zeilennummern</translation>
    </message>
</context>
<context>
    <name>Velocor::LineSaver</name>
    <message>
        <source>The log has changed in the meantime</source>
        <translation>Das Protokoll hat sich inzwischen geändert</translation>
    </message>
    <message>
        <source>Only a part could be written</source>
        <translation>Nur ein Teil konnte geschrieben werden</translation>
    </message>
    <message>
        <source>Not a regular file</source>
        <translation>Keine gewöhnliche Datei</translation>
    </message>
    <message>
        <source>This is the log itself</source>
        <translation>Das ist das Protokoll selbst</translation>
    </message>
    <message>
        <source>The log no longer exists</source>
        <translation>Das Protokoll existiert nicht mehr</translation>
    </message>
    <message>
        <source>Canceled</source>
        <translation>Abgebrochen</translation>
    </message>
</context>
<context>
    <name>Velocor::LogFileBox</name>
    <message>
        <source>Log file</source>
        <translation>Protokolldatei</translation>
    </message>
    <message>
        <source>The current log file and older log files</source>
        <translation>Die aktuelle Protokolldatei und ältere</translation>
    </message>
    <message>
        <source>does not exist</source>
        <translation>existiert nicht</translation>
    </message>
    <message>
        <source>%1 (%2)</source>
        <translation>%1 (%2)</translation>
    </message>
    <message>
        <source>All files, by time</source>
        <translation>Alle Dateien nach Zeit</translation>
    </message>
    <message>
        <source>Every run that the files still have, oldest first</source>
        <translation>Jeder Lauf, den die Dateien noch enthalten, der älteste zuerst</translation>
    </message>
    <message>
        <source>Whole family, by time</source>
        <translation>Protokolle der Familie nach Zeit</translation>
    </message>
    <message>
        <source>The logs of all programs of the family as one</source>
        <translation>Die Protokolle aller Programme der Familie als eines</translation>
    </message>
</context>
<context>
    <name>Velocor::LogFilterBar</name>
    <message>
        <source>Filter</source>
        <translation>Filter</translation>
    </message>
    <message>
        <source>Filter by text</source>
        <translation>Nach Text filtern</translation>
    </message>
    <message>
        <source>Show only lines that contain this text (Ctrl+L)</source>
        <translation>Nur Zeilen zeigen, die diesen Text enthalten (Strg+L)</translation>
    </message>
    <message>
        <source>Filter error</source>
        <translation>Fehler im Filter</translation>
    </message>
    <message>
        <source>Earlier filters</source>
        <translation>Frühere Filter</translation>
    </message>
    <message>
        <source>Earlier filters (Down)</source>
        <translation>Frühere Filter (Pfeil abwärts)</translation>
    </message>
    <message>
        <source>Aa</source>
        <translation>Aa</translation>
    </message>
    <message>
        <source>Match case</source>
        <translation>Groß-/Kleinschreibung beachten</translation>
    </message>
    <message>
        <source>.*</source>
        <translation>.*</translation>
    </message>
    <message>
        <source>Regular expression</source>
        <translation>Regulärer Ausdruck</translation>
    </message>
    <message>
        <source>Search each line with a regular expression</source>
        <translation>Jede Zeile mit einem regulären Ausdruck durchsuchen</translation>
    </message>
    <message>
        <source>More</source>
        <translation>Mehr</translation>
    </message>
    <message>
        <source>More filters</source>
        <translation>Weitere Filter</translation>
    </message>
    <message>
        <source>Terms</source>
        <translation>Begriffe</translation>
    </message>
    <message>
        <source>Terms that lines also contain</source>
        <translation>Begriffe, die Zeilen auch enthalten</translation>
    </message>
    <message>
        <source>Show only lines that contain all of these terms, too. Blanks separate terms; &quot;two words&quot; are one.</source>
        <translation>Nur Zeilen zeigen, die auch alle diese Begriffe enthalten. Leerzeichen trennen Begriffe; &quot;zwei Wörter&quot; sind einer.</translation>
    </message>
    <message>
        <source>Terms of lines to hide</source>
        <translation>Begriffe auszublendender Zeilen</translation>
    </message>
    <message>
        <source>Hide lines that contain any of these terms. Blanks separate terms; &quot;two words&quot; are one.</source>
        <translation>Zeilen ausblenden, die einen dieser Begriffe enthalten. Leerzeichen trennen Begriffe; &quot;zwei Wörter&quot; sind einer.</translation>
    </message>
    <message>
        <source>Also:</source>
        <translation>Auch:</translation>
    </message>
    <message>
        <source>Hide:</source>
        <translation>Ausblenden:</translation>
    </message>
    <message>
        <source>Least severity</source>
        <translation>Geringster Schweregrad</translation>
    </message>
    <message>
        <source>All severities</source>
        <translation>Alle Schweregrade</translation>
    </message>
    <message>
        <source>At least %1</source>
        <translation>Mindestens %1</translation>
    </message>
    <message>
        <source>Only %1</source>
        <translation>Nur %1</translation>
    </message>
    <message>
        <source>Some severities</source>
        <translation>Einige Schweregrade</translation>
    </message>
    <message>
        <source>Lines of context</source>
        <translation>Zeilen Umgebung</translation>
    </message>
    <message>
        <source>Lines to show before and after each one that matches</source>
        <translation>Zeilen, die vor und nach jeder passenden gezeigt werden</translation>
    </message>
    <message>
        <source>No context</source>
        <translation>Keine Umgebung</translation>
    </message>
    <message>
        <source>%1 around</source>
        <translation>%1 ringsum</translation>
    </message>
    <message>
        <source>More (%1)</source>
        <translation>Mehr (%1)</translation>
    </message>
    <message>
        <source>No earlier filters</source>
        <translation>Keine früheren Filter</translation>
    </message>
    <message>
        <source>Invalid regular expression, nothing is filtered: %1</source>
        <translation>Ungültiger regulärer Ausdruck, nichts wird gefiltert: %1</translation>
    </message>
    <message>
        <source>The regular expression takes too long at line %L1, nothing is filtered.</source>
        <translation>Der reguläre Ausdruck dauert in Zeile %L1 zu lange, nichts wird gefiltert.</translation>
    </message>
    <message>
        <source>More terms, terms to hide, times, least severity, context</source>
        <translation>Weitere Begriffe, auszublendende Begriffe, Zeiten, geringster Schweregrad, Kontext</translation>
    </message>
    <message>
        <source>A date, a time or both (2026-11-20, 14:03, 2026-11-20 14:03), or an interval until now such as -2h, -30m or -1d.</source>
        <translation>Ein Datum, eine Uhrzeit oder beides (2026-11-20, 14:03, 2026-11-20 14:03) oder eine Spanne bis jetzt wie -2h, -30m oder -1d.</translation>
    </message>
    <message>
        <source>Times shown</source>
        <translation>Gezeigte Zeiten</translation>
    </message>
    <message>
        <source>Show all times</source>
        <translation>Alle Zeiten zeigen</translation>
    </message>
    <message>
        <source>Only from %1 to %2</source>
        <translation>Nur von %1 bis %2</translation>
    </message>
    <message>
        <source>Only from %1 on</source>
        <translation>Nur ab %1</translation>
    </message>
    <message>
        <source>Only until %1</source>
        <translation>Nur bis %1</translation>
    </message>
    <message>
        <source>From</source>
        <translation>Von</translation>
    </message>
    <message>
        <source>Show only entries from this time on.</source>
        <translation>Nur Einträge ab dieser Zeit zeigen.</translation>
    </message>
    <message>
        <source>Until</source>
        <translation>Bis</translation>
    </message>
    <message>
        <source>Show only entries up to this time.</source>
        <translation>Nur Einträge bis zu dieser Zeit zeigen.</translation>
    </message>
    <message>
        <source>Not a time, which is not filtered: %1</source>
        <translation>Keine Zeit, daher nicht gefiltert: %1</translation>
    </message>
</context>
<context>
    <name>Velocor::LogFindBar</name>
    <message>
        <source>Find</source>
        <translation>Suchen</translation>
    </message>
    <message>
        <source>Find text</source>
        <translation>Text suchen</translation>
    </message>
    <message>
        <source>Go to lines that contain this text, among the others (Ctrl+F)</source>
        <translation>Zu Zeilen gehen, die diesen Text enthalten, zwischen den anderen (Strg+F)</translation>
    </message>
    <message>
        <source>Lines found</source>
        <translation>Gefundene Zeilen</translation>
    </message>
    <message>
        <source>Find error</source>
        <translation>Fehler in der Suche</translation>
    </message>
    <message>
        <source>Aa</source>
        <translation>Aa</translation>
    </message>
    <message>
        <source>Match case when finding</source>
        <translation>Beim Suchen Groß-/Kleinschreibung beachten</translation>
    </message>
    <message>
        <source>.*</source>
        <translation>.*</translation>
    </message>
    <message>
        <source>Find a regular expression</source>
        <translation>Einen regulären Ausdruck suchen</translation>
    </message>
    <message>
        <source>Next</source>
        <translation>Weiter</translation>
    </message>
    <message>
        <source>Find next</source>
        <translation>Nächstes suchen</translation>
    </message>
    <message>
        <source>Next line found (F3)</source>
        <translation>Nächste gefundene Zeile (F3)</translation>
    </message>
    <message>
        <source>Previous</source>
        <translation>Zurück</translation>
    </message>
    <message>
        <source>Find previous</source>
        <translation>Vorheriges suchen</translation>
    </message>
    <message>
        <source>Previous line found (Shift+F3)</source>
        <translation>Vorherige gefundene Zeile (Umschalt+F3)</translation>
    </message>
    <message>
        <source>Close find bar</source>
        <translation>Suchleiste schließen</translation>
    </message>
    <message>
        <source>Close (Esc)</source>
        <translation>Schließen (Esc)</translation>
    </message>
    <message>
        <source>Invalid regular expression: %1</source>
        <translation>Ungültiger regulärer Ausdruck: %1</translation>
    </message>
    <message>
        <source>The regular expression takes too long at line %L1.</source>
        <translation>Der reguläre Ausdruck dauert in Zeile %L1 zu lange.</translation>
    </message>
</context>
<context>
    <name>Velocor::LogGoTo</name>
    <message>
        <source>The line is not shown; this is the nearest one</source>
        <translation>Die Zeile wird nicht gezeigt; dies ist die nächstgelegene</translation>
    </message>
    <message>
        <source>The lines shown end before that</source>
        <translation>Die gezeigten Zeilen enden davor</translation>
    </message>
    <message>
        <source>The lines have no times</source>
        <translation>Die Zeilen haben keine Zeiten</translation>
    </message>
    <message>
        <source>The times in this log have no dates</source>
        <translation>Die Zeiten in diesem Protokoll haben kein Datum</translation>
    </message>
    <message>
        <source>The file does not have so many lines</source>
        <translation>So viele Zeilen hat die Datei nicht</translation>
    </message>
    <message>
        <source>Looking for that time... %1%</source>
        <translation>Die Zeit wird gesucht... %1&#xa0;%</translation>
    </message>
    <message>
        <source>Looking for that time...</source>
        <translation>Die Zeit wird gesucht...</translation>
    </message>
    <message>
        <source>Found</source>
        <translation>Gefunden</translation>
    </message>
</context>
<context>
    <name>Velocor::LogMarks</name>
    <message>
        <source>Select a line first</source>
        <translation>Zuerst eine Zeile auswählen</translation>
    </message>
    <message>
        <source>A file can have %1 marks</source>
        <translation>Eine Datei kann %1 Markierungen haben</translation>
    </message>
</context>
<context>
    <name>Velocor::LogModel</name>
    <message>
        <source> (%1)</source>
        <translation> (%1)</translation>
    </message>
    <message>
        <source> (more than %1)</source>
        <translation> (mehr als %1)</translation>
    </message>
    <message>
        <source>This line is no longer in the file</source>
        <translation>Diese Zeile steht nicht mehr in der Datei</translation>
    </message>
    <message>
        <source>(only the first %1 are shown)</source>
        <translation>(nur die ersten %1 werden gezeigt)</translation>
    </message>
    <message>
        <source>Earlier</source>
        <translation>Früher</translation>
    </message>
    <message>
        <source>This run</source>
        <translation>Dieser Lauf</translation>
    </message>
    <message>
        <source>Latest run in this file</source>
        <translation>Letzter Lauf in dieser Datei</translation>
    </message>
    <message>
        <source>%1 ms</source>
        <translation>%1 ms</translation>
    </message>
    <message>
        <source>Note: %1</source>
        <translation>Notiz: %1</translation>
    </message>
    <message>
        <source>Remainder of an entry that a later run overwrote</source>
        <translation>Rest eines Eintrags, den ein späterer Lauf überschrieben hat</translation>
    </message>
    <message>
        <source>%1, folded</source>
        <translation>%1, eingeklappt</translation>
    </message>
    <message>
        <source>Marked: %1</source>
        <translation>Markiert: %1</translation>
    </message>
    <message>
        <source>%1 after the entry above</source>
        <translation>%1 nach dem Eintrag darüber</translation>
    </message>
    <message>
        <source>Time since the entry above</source>
        <translation>Zeit seit dem Eintrag darüber</translation>
    </message>
    <message>
        <source>Time since %1</source>
        <translation>Zeit seit %1</translation>
    </message>
    <message>
        <source>Time</source>
        <translation>Zeit</translation>
    </message>
    <message>
        <source>Severity</source>
        <translation>Schweregrad</translation>
    </message>
    <message>
        <source>Elapsed</source>
        <translation>Vergangen</translation>
    </message>
    <message>
        <source>Since</source>
        <translation>Seit</translation>
    </message>
    <message>
        <source>Since Chosen</source>
        <translation>Seit gewähltem</translation>
    </message>
    <message>
        <source>Message</source>
        <translation>Meldung</translation>
    </message>
    <message>
        <source>Program</source>
        <translation>Programm</translation>
    </message>
    <message numerus="yes">
        <source>%Ln time(s)</source>
        <translation>
            <numerusform>%Ln-mal</numerusform>
            <numerusform>%Ln-mal</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>%Ln time(s), %1</source>
        <translation>
            <numerusform>%Ln-mal, %1</numerusform>
            <numerusform>%Ln-mal, %1</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::LogOverview</name>
    <message>
        <source>Overview</source>
        <translation>Übersicht</translation>
    </message>
    <message>
        <source>Where problems, lines found and marks are among all lines shown</source>
        <translation>Wo unter allen gezeigten Zeilen Probleme, gefundene Zeilen und Markierungen sind</translation>
    </message>
    <message>
        <source>%1: %2</source>
        <translation>%1: %2</translation>
    </message>
    <message>
        <source>Found</source>
        <translation>Gefunden</translation>
    </message>
    <message>
        <source>Marked</source>
        <translation>Markiert</translation>
    </message>
</context>
<context>
    <name>Velocor::LogPanel</name>
    <message>
        <source>&amp;File:</source>
        <translation>Da&amp;tei:</translation>
    </message>
    <message>
        <source>Log entries and current line</source>
        <translation>Protokolleinträge und aktuelle Zeile</translation>
    </message>
    <message>
        <source>This line has no time</source>
        <translation>Diese Zeile hat keine Zeit</translation>
    </message>
    <message>
        <source>No warnings or errors</source>
        <translation>Keine Warnungen oder Fehler</translation>
    </message>
    <message>
        <source>Continued from the top</source>
        <translation>Vom Anfang fortgesetzt</translation>
    </message>
    <message>
        <source>Continued from the bottom</source>
        <translation>Vom Ende fortgesetzt</translation>
    </message>
    <message>
        <source>Kind of file</source>
        <translation>Art der Datei</translation>
    </message>
    <message>
        <source>Add Logs</source>
        <translation>Protokolle hinzufügen</translation>
    </message>
</context>
<context>
    <name>Velocor::LogSettingsDialog</name>
    <message>
        <source>&amp;Enable logging</source>
        <translation>Protokoll &amp;einschalten</translation>
    </message>
    <message>
        <source>&amp;Log time since the previous entry</source>
        <translation>&amp;Zeit seit dem vorigen Eintrag protokollieren</translation>
    </message>
    <message>
        <source>Echo entries &amp;to the console</source>
        <translation>Einträge auch auf der &amp;Konsole ausgeben</translation>
    </message>
    <message>
        <source>Log Settings</source>
        <translation>Protokolleinstellungen</translation>
    </message>
    <message>
        <source>Older files to keep</source>
        <translation>Zu behaltende ältere Dateien</translation>
    </message>
    <message>
        <source>Sample entry</source>
        <translation>Beispieleintrag</translation>
    </message>
    <message>
        <source>Settings problem</source>
        <translation>Problem mit den Einstellungen</translation>
    </message>
    <message>
        <source>Immediately</source>
        <translation>Sofort</translation>
    </message>
    <message>
        <source>&amp;Older files to keep:</source>
        <translation>Ältere &amp;Dateien behalten:</translation>
    </message>
    <message>
        <source>After restart</source>
        <translation>Nach Neustart</translation>
    </message>
    <message>
        <source>&amp;Date format:</source>
        <translation>Da&amp;tumsformat:</translation>
    </message>
    <message>
        <source>Elapsed time &amp;prefix:</source>
        <translation>&amp;Präfix der vergangenen Zeit:</translation>
    </message>
    <message>
        <source>Log file &amp;name:</source>
        <translation>&amp;Name der Protokolldatei:</translation>
    </message>
    <message>
        <source>Sample:</source>
        <translation>Beispiel:</translation>
    </message>
    <message>
        <source>This date format cannot be saved.</source>
        <translation>Dieses Datumsformat kann nicht gespeichert werden.</translation>
    </message>
    <message>
        <source>This elapsed time prefix cannot be saved.</source>
        <translation>Dieses Präfix kann nicht gespeichert werden.</translation>
    </message>
    <message>
        <source>Not a valid log file name.</source>
        <translation>Kein gültiger Name für eine Protokolldatei.</translation>
    </message>
    <message>
        <source>message</source>
        <translation>Meldung</translation>
    </message>
</context>
<context>
    <name>Velocor::LogSeverities</name>
    <message>
        <source>Trace</source>
        <translation>Ablauf</translation>
    </message>
    <message>
        <source>Notification</source>
        <translation>Hinweis</translation>
    </message>
    <message>
        <source>Warning</source>
        <translation>Warnung</translation>
    </message>
    <message>
        <source>Error</source>
        <translation>Fehler</translation>
    </message>
    <message>
        <source>Fatal</source>
        <translation>Fatal</translation>
    </message>
</context>
<context>
    <name>Velocor::LogTableMenu</name>
    <message>
        <source>&amp;Copy</source>
        <translation>&amp;Kopieren</translation>
    </message>
    <message>
        <source>Copy as Mar&amp;kdown</source>
        <translation>Als Mark&amp;down kopieren</translation>
    </message>
    <message>
        <source>Copy as CS&amp;V</source>
        <translation>Als CS&amp;V kopieren</translation>
    </message>
    <message>
        <source>&amp;Filter by This</source>
        <translation>Danach &amp;filtern</translation>
    </message>
    <message>
        <source>&amp;Hide This</source>
        <translation>&amp;Ausblenden</translation>
    </message>
    <message>
        <source>Hi&amp;ghlight This</source>
        <translation>Hervor&amp;heben</translation>
    </message>
    <message>
        <source>Remove &amp;Mark</source>
        <translation>Markierun&amp;g entfernen</translation>
    </message>
    <message>
        <source>&amp;Mark</source>
        <translation>&amp;Markieren</translation>
    </message>
    <message>
        <source>&amp;Note...</source>
        <translation>&amp;Notiz...</translation>
    </message>
    <message>
        <source>Measure From He&amp;re</source>
        <translation>Ab hie&amp;r messen</translation>
    </message>
    <message>
        <source>Measure From &amp;Above</source>
        <translation>Ab dem Eintrag darü&amp;ber messen</translation>
    </message>
</context>
<context>
    <name>Velocor::LogView</name>
    <message>
        <source>Log entries</source>
        <translation>Protokolleinträge</translation>
    </message>
    <message>
        <source>Log columns</source>
        <translation>Spalten des Protokolls</translation>
    </message>
    <message>
        <source>Log rows</source>
        <translation>Zeilen des Protokolls</translation>
    </message>
    <message>
        <source>Select all rows</source>
        <translation>Alle Zeilen auswählen</translation>
    </message>
</context>
<context>
    <name>Velocor::MainMenus</name>
    <message>
        <source>&amp;Open...</source>
        <translation>Ö&amp;ffnen...</translation>
    </message>
    <message>
        <source>Open a log file or a settings file</source>
        <translation>Eine Protokoll- oder Einstellungsdatei öffnen</translation>
    </message>
    <message>
        <source>Open &amp;Recent</source>
        <translation>&amp;Zuletzt geöffnet</translation>
    </message>
    <message>
        <source>&amp;Save</source>
        <translation>&amp;Speichern</translation>
    </message>
    <message>
        <source>Save the current settings file</source>
        <translation>Die aktuelle Einstellungsdatei speichern</translation>
    </message>
    <message>
        <source>&amp;What Will Be Written...</source>
        <translation>&amp;Was geschrieben wird...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+W</source>
        <translation>Ctrl+Shift+W</translation>
    </message>
    <message>
        <source>Compare the settings file with what saving would make of it</source>
        <translation>Die Einstellungsdatei mit dem vergleichen, was Speichern aus ihr machen würde</translation>
    </message>
    <message>
        <source>Compare Wit&amp;h...</source>
        <translation>&amp;Vergleichen mit...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+D</source>
        <translation>Ctrl+Shift+D</translation>
    </message>
    <message>
        <source>Compare the settings with another file, and take over values</source>
        <translation>Die Einstellungen mit einer anderen Datei vergleichen und Werte übernehmen</translation>
    </message>
    <message>
        <source>&amp;Close Tab</source>
        <translation>Tab s&amp;chließen</translation>
    </message>
    <message>
        <source>Close the current file</source>
        <translation>Die aktuelle Datei schließen</translation>
    </message>
    <message>
        <source>Save &amp;Lines As...</source>
        <translation>Zei&amp;len speichern unter...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+S</source>
        <translation>Ctrl+Shift+S</translation>
    </message>
    <message>
        <source>Save the lines that the filter shows to a file</source>
        <translation>Die vom Filter gezeigten Zeilen in eine Datei speichern</translation>
    </message>
    <message>
        <source>Open Log &amp;Folder</source>
        <translation>Protokoll&amp;ordner öffnen</translation>
    </message>
    <message>
        <source>Ctrl+Shift+O</source>
        <translation>Ctrl+Shift+O</translation>
    </message>
    <message>
        <source>Show the log files in the file manager</source>
        <translation>Die Protokolldateien in der Dateiverwaltung zeigen</translation>
    </message>
    <message>
        <source>Save Re&amp;port...</source>
        <translation>&amp;Bericht speichern...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+R</source>
        <translation>Ctrl+Shift+R</translation>
    </message>
    <message>
        <source>Review and save the information for a bug report</source>
        <translation>Die Angaben für einen Fehlerbericht ansehen und speichern</translation>
    </message>
    <message>
        <source>&amp;Quit</source>
        <translation>B&amp;eenden</translation>
    </message>
    <message>
        <source>Ctrl+Q</source>
        <translation>Ctrl+Q</translation>
    </message>
    <message>
        <source>Close the program</source>
        <translation>Das Programm schließen</translation>
    </message>
    <message>
        <source>F&amp;ilter</source>
        <translation>F&amp;iltern</translation>
    </message>
    <message>
        <source>Ctrl+L</source>
        <translation>Ctrl+L</translation>
    </message>
    <message>
        <source>Show only lines that contain the filter text</source>
        <translation>Nur Zeilen zeigen, die den Filtertext enthalten</translation>
    </message>
    <message>
        <source>Als&amp;o Filter</source>
        <translation>&amp;Auch filtern</translation>
    </message>
    <message>
        <source>Ctrl+Shift+L</source>
        <translation>Ctrl+Shift+L</translation>
    </message>
    <message>
        <source>Show only lines that contain further terms, too</source>
        <translation>Nur Zeilen zeigen, die auch weitere Begriffe enthalten</translation>
    </message>
    <message>
        <source>&amp;Hide Lines</source>
        <translation>Zeilen aus&amp;blenden</translation>
    </message>
    <message>
        <source>Ctrl+Shift+K</source>
        <translation>Ctrl+Shift+K</translation>
    </message>
    <message>
        <source>Hide lines that contain certain terms</source>
        <translation>Zeilen ausblenden, die bestimmte Begriffe enthalten</translation>
    </message>
    <message>
        <source>Clear Fi&amp;lter</source>
        <translation>Filter &amp;löschen</translation>
    </message>
    <message>
        <source>Ctrl+Shift+F</source>
        <translation>Ctrl+Shift+F</translation>
    </message>
    <message>
        <source>Show all lines again</source>
        <translation>Wieder alle Zeilen zeigen</translation>
    </message>
    <message>
        <source>Log Se&amp;ttings...</source>
        <translation>Protokolleins&amp;tellungen...</translation>
    </message>
    <message>
        <source>Ctrl+,</source>
        <translation>Ctrl+,</translation>
    </message>
    <message>
        <source>Change what is logged and how many log files are kept</source>
        <translation>Ändern, was protokolliert wird und wie viele Protokolldateien bleiben</translation>
    </message>
    <message>
        <source>&amp;Undo</source>
        <translation>&amp;Rückgängig</translation>
    </message>
    <message>
        <source>Take back the last change of the settings file</source>
        <translation>Die letzte Änderung der Einstellungsdatei zurücknehmen</translation>
    </message>
    <message>
        <source>&amp;Redo</source>
        <translation>Wieder&amp;herstellen</translation>
    </message>
    <message>
        <source>Make the last change again</source>
        <translation>Die zurückgenommene Änderung wieder vornehmen</translation>
    </message>
    <message>
        <source>S&amp;ettings File</source>
        <translation>&amp;Einstellungsdatei</translation>
    </message>
    <message>
        <source>&amp;Copy</source>
        <translation>&amp;Kopieren</translation>
    </message>
    <message>
        <source>Copy the selected lines</source>
        <translation>Die ausgewählten Zeilen kopieren</translation>
    </message>
    <message>
        <source>Copy A&amp;s</source>
        <translation>Ko&amp;pieren als</translation>
    </message>
    <message>
        <source>&amp;Markdown</source>
        <translation>&amp;Markdown</translation>
    </message>
    <message>
        <source>Ctrl+Alt+D</source>
        <translation>Ctrl+Alt+D</translation>
    </message>
    <message>
        <source>Copy the selected lines as a Markdown code block</source>
        <translation>Die ausgewählten Zeilen als Markdown-Codeblock kopieren</translation>
    </message>
    <message>
        <source>&amp;CSV</source>
        <translation>&amp;CSV</translation>
    </message>
    <message>
        <source>Ctrl+Alt+V</source>
        <translation>Ctrl+Alt+V</translation>
    </message>
    <message>
        <source>Copy the selected lines as comma-separated values</source>
        <translation>Die ausgewählten Zeilen als kommagetrennte Werte kopieren</translation>
    </message>
    <message>
        <source>Select &amp;All</source>
        <translation>Alles aus&amp;wählen</translation>
    </message>
    <message>
        <source>Select all lines</source>
        <translation>Alle Zeilen auswählen</translation>
    </message>
    <message>
        <source>&amp;Find</source>
        <translation>&amp;Suchen</translation>
    </message>
    <message>
        <source>Go to lines that contain a text, among the others</source>
        <translation>Zu Zeilen gehen, die einen Text enthalten, zwischen den anderen</translation>
    </message>
    <message>
        <source>Find &amp;Next</source>
        <translation>&amp;Nächstes suchen</translation>
    </message>
    <message>
        <source>F3</source>
        <translation>F3</translation>
    </message>
    <message>
        <source>Go to the next line found</source>
        <translation>Zur nächsten gefundenen Zeile gehen</translation>
    </message>
    <message>
        <source>Find Pre&amp;vious</source>
        <translation>&amp;Vorheriges suchen</translation>
    </message>
    <message>
        <source>Shift+F3</source>
        <translation>Shift+F3</translation>
    </message>
    <message>
        <source>Go to the previous line found</source>
        <translation>Zur vorherigen gefundenen Zeile gehen</translation>
    </message>
    <message>
        <source>&amp;Go To...</source>
        <translation>&amp;Gehe zu...</translation>
    </message>
    <message>
        <source>Ctrl+G</source>
        <translation>Ctrl+G</translation>
    </message>
    <message>
        <source>Go to a line or to a time</source>
        <translation>Zu einer Zeile oder einer Zeit gehen</translation>
    </message>
    <message>
        <source>&amp;Places</source>
        <translation>&amp;Orte</translation>
    </message>
    <message>
        <source>F9</source>
        <translation>F9</translation>
    </message>
    <message>
        <source>Show program identity and file locations</source>
        <translation>Identität des Programms und Orte der Dateien zeigen</translation>
    </message>
    <message>
        <source>&amp;Tool Bar</source>
        <translation>&amp;Werkzeugleiste</translation>
    </message>
    <message>
        <source>Ctrl+Alt+B</source>
        <translation>Ctrl+Alt+B</translation>
    </message>
    <message>
        <source>Show the tool bar</source>
        <translation>Die Werkzeugleiste zeigen</translation>
    </message>
    <message>
        <source>&amp;Go to Next Pane</source>
        <translation>Zum &amp;nächsten Bereich</translation>
    </message>
    <message>
        <source>F6</source>
        <translation>F6</translation>
    </message>
    <message>
        <source>Go from the filter to the lines, to the full text, ...</source>
        <translation>Vom Filter zu den Zeilen, zum ganzen Text, ...</translation>
    </message>
    <message>
        <source>Go to Prev&amp;ious Pane</source>
        <translation>Zum &amp;vorherigen Bereich</translation>
    </message>
    <message>
        <source>Shift+F6</source>
        <translation>Shift+F6</translation>
    </message>
    <message>
        <source>Go to the pane before</source>
        <translation>Zum Bereich davor gehen</translation>
    </message>
    <message>
        <source>&amp;Reload</source>
        <translation>Neu &amp;laden</translation>
    </message>
    <message>
        <source>F5</source>
        <translation>F5</translation>
    </message>
    <message>
        <source>Reload the file</source>
        <translation>Die Datei neu laden</translation>
    </message>
    <message>
        <source>En&amp;coding</source>
        <translation>&amp;Kodierung</translation>
    </message>
    <message>
        <source>Te&amp;xt</source>
        <translation>Te&amp;xt</translation>
    </message>
    <message>
        <source>Anal&amp;yze</source>
        <translation>Anal&amp;yse</translation>
    </message>
    <message>
        <source>&amp;Highlight Rules...</source>
        <translation>&amp;Hervorhebungsregeln...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+H</source>
        <translation>Ctrl+Shift+H</translation>
    </message>
    <message>
        <source>Give lines with certain texts a color</source>
        <translation>Zeilen mit bestimmten Texten eine Farbe geben</translation>
    </message>
    <message>
        <source>Reopen Files at &amp;Start</source>
        <translation>Dateien beim &amp;Start wieder öffnen</translation>
    </message>
    <message>
        <source>Ctrl+Alt+O</source>
        <translation>Ctrl+Alt+O</translation>
    </message>
    <message>
        <source>Open the files of these tabs again when the program starts</source>
        <translation>Die Dateien dieser Tabs beim Start des Programms wieder öffnen</translation>
    </message>
    <message>
        <source>All Files, &amp;by Time</source>
        <translation>Alle Dateien nach &amp;Zeit</translation>
    </message>
    <message>
        <source>Ctrl+Shift+A</source>
        <translation>Ctrl+Shift+A</translation>
    </message>
    <message>
        <source>Show the older files of the log, too, as one, each run with a heading</source>
        <translation>Auch die älteren Dateien des Protokolls zeigen, als eine, jeden Lauf mit Überschrift</translation>
    </message>
    <message>
        <source>&amp;Earlier Runs</source>
        <translation>&amp;Frühere Läufe</translation>
    </message>
    <message>
        <source>Ctrl+Shift+E</source>
        <translation>Ctrl+Shift+E</translation>
    </message>
    <message>
        <source>Show entries from earlier runs</source>
        <translation>Einträge früherer Läufe zeigen</translation>
    </message>
    <message>
        <source>P&amp;ause</source>
        <translation>&amp;Anhalten</translation>
    </message>
    <message>
        <source>Ctrl+Shift+P</source>
        <translation>Ctrl+Shift+P</translation>
    </message>
    <message>
        <source>Stop updating the view while logging continues</source>
        <translation>Die Ansicht nicht mehr aktualisieren, während weiter protokolliert wird</translation>
    </message>
    <message>
        <source>&amp;Follow Newest</source>
        <translation>N&amp;euesten folgen</translation>
    </message>
    <message>
        <source>Ctrl+Shift+N</source>
        <translation>Ctrl+Shift+N</translation>
    </message>
    <message>
        <source>Scroll to new entries as they arrive</source>
        <translation>Zu neuen Einträgen rollen, sobald sie kommen</translation>
    </message>
    <message>
        <source>&amp;Next Problem</source>
        <translation>Nächstes &amp;Problem</translation>
    </message>
    <message>
        <source>F8</source>
        <translation>F8</translation>
    </message>
    <message>
        <source>Go to the next warning or error</source>
        <translation>Zur nächsten Warnung oder zum nächsten Fehler gehen</translation>
    </message>
    <message>
        <source>Pre&amp;vious Problem</source>
        <translation>Vorheriges P&amp;roblem</translation>
    </message>
    <message>
        <source>Shift+F8</source>
        <translation>Shift+F8</translation>
    </message>
    <message>
        <source>Go to the previous warning or error</source>
        <translation>Zur vorherigen Warnung oder zum vorherigen Fehler gehen</translation>
    </message>
    <message>
        <source>&amp;Mark</source>
        <translation>&amp;Markieren</translation>
    </message>
    <message>
        <source>Ctrl+M</source>
        <translation>Ctrl+M</translation>
    </message>
    <message>
        <source>Mark the current line, or remove its mark</source>
        <translation>Die aktuelle Zeile markieren oder ihre Markierung entfernen</translation>
    </message>
    <message>
        <source>N&amp;ote...</source>
        <translation>Not&amp;iz...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+M</source>
        <translation>Ctrl+Shift+M</translation>
    </message>
    <message>
        <source>Write a note on the current line</source>
        <translation>Eine Notiz zur aktuellen Zeile schreiben</translation>
    </message>
    <message>
        <source>Next Mar&amp;k</source>
        <translation>Nächste Markierun&amp;g</translation>
    </message>
    <message>
        <source>F2</source>
        <translation>F2</translation>
    </message>
    <message>
        <source>Go to the next marked line</source>
        <translation>Zur nächsten markierten Zeile gehen</translation>
    </message>
    <message>
        <source>Previo&amp;us Mark</source>
        <translation>Vorherige Markier&amp;ung</translation>
    </message>
    <message>
        <source>Shift+F2</source>
        <translation>Shift+F2</translation>
    </message>
    <message>
        <source>Go to the previous marked line</source>
        <translation>Zur vorherigen markierten Zeile gehen</translation>
    </message>
    <message>
        <source>A&amp;ll Marks...</source>
        <translation>Lis&amp;te der Markierungen...</translation>
    </message>
    <message>
        <source>Ctrl+F2</source>
        <translation>Ctrl+F2</translation>
    </message>
    <message>
        <source>List the marked lines and their notes</source>
        <translation>Die markierten Zeilen und ihre Notizen auflisten</translation>
    </message>
    <message>
        <source>&amp;Automatic</source>
        <translation>&amp;Automatisch</translation>
    </message>
    <message>
        <source>Find out how the file is encoded</source>
        <translation>Feststellen, wie die Datei kodiert ist</translation>
    </message>
    <message>
        <source>Read the file as %1</source>
        <translation>Die Datei als %1 lesen</translation>
    </message>
    <message>
        <source>&amp;Latin-1</source>
        <translation>&amp;Latin-1</translation>
    </message>
    <message>
        <source>&amp;UTF-8</source>
        <translation>&amp;UTF-8</translation>
    </message>
    <message>
        <source>UTF-&amp;16 LE</source>
        <translation>UTF-&amp;16 LE</translation>
    </message>
    <message>
        <source>UTF-16 &amp;BE</source>
        <translation>UTF-16 &amp;BE</translation>
    </message>
    <message>
        <source>&amp;Larger</source>
        <translation>&amp;Größer</translation>
    </message>
    <message>
        <source>Ctrl++</source>
        <translation>Ctrl++</translation>
    </message>
    <message>
        <source>Show logs in larger text</source>
        <translation>Protokolle in größerer Schrift zeigen</translation>
    </message>
    <message>
        <source>Ctrl+=</source>
        <translation>Ctrl+=</translation>
    </message>
    <message>
        <source>&amp;Smaller</source>
        <translation>&amp;Kleiner</translation>
    </message>
    <message>
        <source>Ctrl+-</source>
        <translation>Ctrl+-</translation>
    </message>
    <message>
        <source>Show logs in smaller text</source>
        <translation>Protokolle in kleinerer Schrift zeigen</translation>
    </message>
    <message>
        <source>&amp;Normal Size</source>
        <translation>&amp;Normale Größe</translation>
    </message>
    <message>
        <source>Ctrl+0</source>
        <translation>Ctrl+0</translation>
    </message>
    <message>
        <source>Show logs in the text size of the desktop</source>
        <translation>Protokolle in der Schriftgröße des Desktops zeigen</translation>
    </message>
    <message>
        <source>&amp;Monospaced Font</source>
        <translation>&amp;Festbreitenschrift</translation>
    </message>
    <message>
        <source>Ctrl+Alt+M</source>
        <translation>Ctrl+Alt+M</translation>
    </message>
    <message>
        <source>Show logs in a font whose characters are equally wide</source>
        <translation>Protokolle in einer Schrift mit gleich breiten Zeichen zeigen</translation>
    </message>
    <message>
        <source>Line &amp;Wrap</source>
        <translation>Zeilen&amp;umbruch</translation>
    </message>
    <message>
        <source>Ctrl+Alt+W</source>
        <translation>Ctrl+Alt+W</translation>
    </message>
    <message>
        <source>Show long messages of logs in several lines</source>
        <translation>Lange Meldungen von Protokollen in mehreren Zeilen zeigen</translation>
    </message>
    <message>
        <source>Line N&amp;umbers</source>
        <translation>&amp;Zeilennummern</translation>
    </message>
    <message>
        <source>Ctrl+Alt+N</source>
        <translation>Ctrl+Alt+N</translation>
    </message>
    <message>
        <source>Show the numbers of the lines in the file beside logs</source>
        <translation>Neben Protokollen die Nummern der Zeilen in der Datei zeigen</translation>
    </message>
    <message>
        <source>&amp;Activity</source>
        <translation>&amp;Aktivität</translation>
    </message>
    <message>
        <source>Ctrl+Alt+A</source>
        <translation>Ctrl+Alt+A</translation>
    </message>
    <message>
        <source>Show how many entries and problems there are by time, above logs</source>
        <translation>Über Protokollen zeigen, wie viele Einträge und Probleme es wann gibt</translation>
    </message>
    <message>
        <source>&amp;Time Since</source>
        <translation>&amp;Zeit seit</translation>
    </message>
    <message>
        <source>Ctrl+Alt+S</source>
        <translation>Ctrl+Alt+S</translation>
    </message>
    <message>
        <source>Show the time since the entry above or since a chosen one</source>
        <translation>Die Zeit seit dem Eintrag darüber oder seit einem gewählten zeigen</translation>
    </message>
    <message>
        <source>&amp;Gaps</source>
        <translation>&amp;Lücken</translation>
    </message>
    <message>
        <source>Show where no entry follows for %1</source>
        <translation>Zeigen, wo %1 lang kein Eintrag folgt</translation>
    </message>
    <message>
        <source>&amp;None</source>
        <translation>&amp;Keine</translation>
    </message>
    <message>
        <source>Do not show gaps between entries</source>
        <translation>Keine Lücken zwischen Einträgen zeigen</translation>
    </message>
    <message>
        <source>&amp;1 Second</source>
        <translation>&amp;1 Sekunde</translation>
    </message>
    <message>
        <source>10 &amp;Seconds</source>
        <translation>10 &amp;Sekunden</translation>
    </message>
    <message>
        <source>1 &amp;Minute</source>
        <translation>1 &amp;Minute</translation>
    </message>
    <message>
        <source>10 M&amp;inutes</source>
        <translation>10 M&amp;inuten</translation>
    </message>
    <message>
        <source>1 &amp;Hour</source>
        <translation>1 Stun&amp;de</translation>
    </message>
    <message>
        <source>&amp;System Language</source>
        <translation>&amp;Sprache des Systems</translation>
    </message>
    <message>
        <source>Use the language of the system from the next start on</source>
        <translation>Ab dem nächsten Start die Sprache des Systems verwenden</translation>
    </message>
    <message>
        <source>Use %1 from the next start on</source>
        <translation>Ab dem nächsten Start %1 verwenden</translation>
    </message>
    <message>
        <source>&amp;Manual</source>
        <translation>&amp;Handbuch</translation>
    </message>
    <message>
        <source>F1</source>
        <translation>F1</translation>
    </message>
    <message>
        <source>Open the manual</source>
        <translation>Das Handbuch öffnen</translation>
    </message>
    <message>
        <source>&amp;Keyboard Shortcuts</source>
        <translation>&amp;Tastenkürzel</translation>
    </message>
    <message>
        <source>Ctrl+F1</source>
        <translation>Ctrl+F1</translation>
    </message>
    <message>
        <source>List all keyboard shortcuts</source>
        <translation>Alle Tastenkürzel auflisten</translation>
    </message>
    <message>
        <source>&amp;About %1</source>
        <translation>Ü&amp;ber %1</translation>
    </message>
    <message>
        <source>Shift+F1</source>
        <translation>Shift+F1</translation>
    </message>
    <message>
        <source>Show version, license, system and directories</source>
        <translation>Version, Lizenz, System und Verzeichnisse zeigen</translation>
    </message>
    <message>
        <source>&amp;Display Language</source>
        <translation>Anzeigespra&amp;che</translation>
    </message>
    <message>
        <source>&amp;Patterns...</source>
        <translation>&amp;Muster...</translation>
    </message>
    <message>
        <source>Ctrl+Alt+P</source>
        <translation>Ctrl+Alt+P</translation>
    </message>
    <message>
        <source>List what messages have in common, and how often</source>
        <translation>Auflisten, was Meldungen gemeinsam haben, und wie oft</translation>
    </message>
    <message>
        <source>&amp;Whole Family, by Time</source>
        <translation>Protokolle &amp;der Familie nach Zeit</translation>
    </message>
    <message>
        <source>Ctrl+Alt+F</source>
        <translation>Ctrl+Alt+F</translation>
    </message>
    <message>
        <source>Show the logs of all programs of the family as one</source>
        <translation>Die Protokolle aller Programme der Familie als eines zeigen</translation>
    </message>
    <message>
        <source>Fold &amp;Repeats</source>
        <translation>&amp;Wiederholungen einklappen</translation>
    </message>
    <message>
        <source>Ctrl+Alt+R</source>
        <translation>Ctrl+Alt+R</translation>
    </message>
    <message>
        <source>Show entries that differ from the one above only in numbers and quoted names as one row</source>
        <translation>Einträge, die sich vom vorigen nur in Zahlen und zitierten Namen unterscheiden, als eine Zeile zeigen</translation>
    </message>
</context>
<context>
    <name>Velocor::MainToolBar</name>
    <message>
        <source>Tools</source>
        <translation>Werkzeuge</translation>
    </message>
    <message>
        <source>%1 (%2)</source>
        <translation>%1 (%2)</translation>
    </message>
</context>
<context>
    <name>Velocor::MainWindow</name>
    <message>
        <source>Menus</source>
        <translation>Menüs</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <translation>&amp;Datei</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <translation>&amp;Bearbeiten</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <translation>&amp;Ansicht</translation>
    </message>
    <message>
        <source>&amp;Help</source>
        <translation>&amp;Hilfe</translation>
    </message>
    <message>
        <source>Places and files</source>
        <translation>Orte und Dateien</translation>
    </message>
    <message>
        <source>State of the log</source>
        <translation>Zustand des Protokolls</translation>
    </message>
    <message>
        <source>These are the settings of this window. It takes over what you save here: your changes take effect at the next start, and everything else is written when the window closes.</source>
        <translation>Das sind die Einstellungen dieses Fensters. Es übernimmt, was Sie hier speichern: Ihre Änderungen gelten ab dem nächsten Start, und alles andere wird beim Schließen des Fensters geschrieben.</translation>
    </message>
    <message>
        <source>These are the settings of this program&apos;s log. It reads them at the next start, and replaces them only when you change something in Log Settings.</source>
        <translation>Das sind die Einstellungen des Protokolls dieses Programms. Es liest sie beim nächsten Start und ersetzt sie nur, wenn Sie in den Protokolleinstellungen etwas ändern.</translation>
    </message>
    <message>
        <source>Lines shown</source>
        <translation>Gezeigte Zeilen</translation>
    </message>
    <message>
        <source>Status</source>
        <translation>Status</translation>
    </message>
    <message>
        <source>The language changes when the program starts again.</source>
        <translation>Die Sprache ändert sich beim nächsten Start des Programms.</translation>
    </message>
    <message>
        <source>How the last run ended</source>
        <translation>Wie der letzte Lauf endete</translation>
    </message>
    <message>
        <source>Show</source>
        <translation>Zeigen</translation>
    </message>
    <message>
        <source>Show the last entries of that run</source>
        <translation>Die letzten Einträge dieses Laufs zeigen</translation>
    </message>
    <message>
        <source>Report...</source>
        <translation>Bericht...</translation>
    </message>
    <message>
        <source>Report how the last run ended</source>
        <translation>Berichten, wie der letzte Lauf endete</translation>
    </message>
    <message>
        <source>The program that was started at %1 did not end normally.</source>
        <translation>Das um %1 gestartete Programm wurde nicht normal beendet.</translation>
    </message>
    <message>
        <source>It ended within ten seconds at least three times in a row. If that is because of its settings, set them aside: %1</source>
        <translation>Es endete mindestens dreimal nacheinander innerhalb von zehn Sekunden. Wenn das an seinen Einstellungen liegt, legen Sie sie beiseite: %1</translation>
    </message>
    <message>
        <source>Set Aside</source>
        <translation>Beiseitelegen</translation>
    </message>
    <message>
        <source>Set the settings of this window aside</source>
        <translation>Die Einstellungen dieses Fensters beiseitelegen</translation>
    </message>
    <message>
        <source>The next start uses default settings. These are now in %1</source>
        <translation>Der nächste Start verwendet Standardeinstellungen. Diese sind jetzt in %1</translation>
    </message>
</context>
<context>
    <name>Velocor::MarkControl</name>
    <message>
        <source>Select a line first</source>
        <translation>Zuerst eine Zeile auswählen</translation>
    </message>
    <message>
        <source>No marks in the lines shown</source>
        <translation>Keine Markierungen in den gezeigten Zeilen</translation>
    </message>
    <message>
        <source>Continued from the top</source>
        <translation>Vom Anfang fortgesetzt</translation>
    </message>
    <message>
        <source>Continued from the bottom</source>
        <translation>Vom Ende fortgesetzt</translation>
    </message>
</context>
<context>
    <name>Velocor::MarkListDialog</name>
    <message>
        <source>Marks</source>
        <translation>Markierungen</translation>
    </message>
    <message>
        <source>Marked lines</source>
        <translation>Markierte Zeilen</translation>
    </message>
    <message>
        <source>Line</source>
        <translation>Zeile</translation>
    </message>
    <message>
        <source>Time</source>
        <translation>Zeit</translation>
    </message>
    <message>
        <source>Note</source>
        <translation>Notiz</translation>
    </message>
    <message>
        <source>Text</source>
        <translation>Text</translation>
    </message>
    <message>
        <source>&amp;Go There</source>
        <translation>Gehe &amp;dorthin</translation>
    </message>
</context>
<context>
    <name>Velocor::NoteDialog</name>
    <message>
        <source>Note</source>
        <translation>Notiz</translation>
    </message>
    <message>
        <source>&amp;Note on the current line:</source>
        <translation>&amp;Notiz zur aktuellen Zeile:</translation>
    </message>
</context>
<context>
    <name>Velocor::NoticeBar</name>
    <message>
        <source>%1 icon</source>
        <translation>Symbol: %1</translation>
    </message>
    <message>
        <source>Dismiss</source>
        <translation>Ausblenden</translation>
    </message>
    <message>
        <source>Dismiss %1</source>
        <translation>%1 ausblenden</translation>
    </message>
    <message>
        <source>Notice</source>
        <translation>Hinweis</translation>
    </message>
</context>
<context>
    <name>Velocor::PatternDialog</name>
    <message>
        <source>Message Patterns</source>
        <translation>Muster der Meldungen</translation>
    </message>
    <message>
        <source>What has been counted</source>
        <translation>Was gezählt wurde</translation>
    </message>
    <message>
        <source>Message patterns</source>
        <translation>Muster der Meldungen</translation>
    </message>
    <message>
        <source>Go to &amp;First</source>
        <translation>Zum &amp;ersten gehen</translation>
    </message>
    <message>
        <source>Go to &amp;Last</source>
        <translation>Zum &amp;letzten gehen</translation>
    </message>
    <message>
        <source>F&amp;ilter</source>
        <translation>F&amp;iltern</translation>
    </message>
    <message>
        <source>&amp;Stop Counting</source>
        <translation>Zählen &amp;anhalten</translation>
    </message>
    <message>
        <source>Counting…</source>
        <translation>Es wird gezählt …</translation>
    </message>
    <message>
        <source>%L1 patterns in %L2 entries</source>
        <translation>%L1 Muster in %L2 Einträgen</translation>
    </message>
    <message>
        <source>%1; stopped at %2%</source>
        <translation>%1; bei %2&#xa0;% angehalten</translation>
    </message>
    <message>
        <source>%1; counting, %2%</source>
        <translation>%1; es wird gezählt, %2&#xa0;%</translation>
    </message>
</context>
<context>
    <name>Velocor::PatternModel</name>
    <message>
        <source>… (other messages)</source>
        <translation>… (andere Meldungen)</translation>
    </message>
    <message>
        <source>Count</source>
        <translation>Anzahl</translation>
    </message>
    <message>
        <source>Severity</source>
        <translation>Schweregrad</translation>
    </message>
    <message>
        <source>First</source>
        <translation>Erste</translation>
    </message>
    <message>
        <source>Last</source>
        <translation>Letzte</translation>
    </message>
    <message>
        <source>Pattern</source>
        <translation>Muster</translation>
    </message>
</context>
<context>
    <name>Velocor::PlacesPanel</name>
    <message>
        <source>Organization</source>
        <translation>Organisation</translation>
    </message>
    <message>
        <source>Product</source>
        <translation>Produkt</translation>
    </message>
    <message>
        <source>Installation</source>
        <translation>Installation</translation>
    </message>
    <message>
        <source>Data</source>
        <translation>Daten</translation>
    </message>
    <message>
        <source>Documents</source>
        <translation>Dokumente</translation>
    </message>
    <message>
        <source>Log file</source>
        <translation>Protokolldatei</translation>
    </message>
    <message>
        <source>Settings file</source>
        <translation>Einstellungsdatei</translation>
    </message>
    <message>
        <source>Identity and places</source>
        <translation>Identität und Orte</translation>
    </message>
    <message>
        <source>Open</source>
        <translation>Öffnen</translation>
    </message>
    <message>
        <source>Open: %1</source>
        <translation>Öffnen: %1</translation>
    </message>
    <message>
        <source>Show in the file manager</source>
        <translation>In der Dateiverwaltung zeigen</translation>
    </message>
    <message>
        <source>Copy</source>
        <translation>Kopieren</translation>
    </message>
    <message>
        <source>Copy: %1</source>
        <translation>Kopieren: %1</translation>
    </message>
    <message>
        <source>Copy to the clipboard</source>
        <translation>In die Zwischenablage kopieren</translation>
    </message>
    <message>
        <source>Cannot open %1: it does not exist, or there is no file manager</source>
        <translation>%1 kann nicht geöffnet werden: Es existiert nicht, oder es gibt keine Dateiverwaltung</translation>
    </message>
    <message>
        <source>Copied: %1</source>
        <translation>Kopiert: %1</translation>
    </message>
</context>
<context>
    <name>Velocor::ProblemReportDialog</name>
    <message>
        <source>Save Report</source>
        <translation>Bericht speichern</translation>
    </message>
    <message>
        <source>&amp;Copy File</source>
        <translation>Datei &amp;kopieren</translation>
    </message>
    <message>
        <source>&amp;Save...</source>
        <translation>&amp;Speichern...</translation>
    </message>
    <message>
        <source>This is what will be saved. Placeholders, which are marked, replace what may give somebody away. Not everything can be recognized: look at it before you share it.</source>
        <translation>Das wird gespeichert. Platzhalter, die markiert sind, ersetzen, was jemanden verraten könnte. Nicht alles lässt sich erkennen: Sehen Sie es an, bevor Sie es weitergeben.</translation>
    </message>
    <message>
        <source>&amp;Also replace (separated by commas):</source>
        <translation>&amp;Auch ersetzen (durch Kommas getrennt):</translation>
    </message>
    <message>
        <source>Also replace</source>
        <translation>Auch ersetzen</translation>
    </message>
    <message>
        <source>&amp;Replaced; untick to keep:</source>
        <translation>&amp;Ersetzt; zum Behalten abwählen:</translation>
    </message>
    <message>
        <source>Replaced by placeholders</source>
        <translation>Durch Platzhalter ersetzt</translation>
    </message>
    <message>
        <source>&amp;File:</source>
        <translation>Da&amp;tei:</translation>
    </message>
    <message>
        <source>File of the report</source>
        <translation>Datei des Berichts</translation>
    </message>
    <message>
        <source>Report</source>
        <translation>Bericht</translation>
    </message>
    <message>
        <source>velocor-report.zip</source>
        <translation>velocor-bericht.zip</translation>
    </message>
    <message>
        <source>Archives (*.zip);;New folder (*)</source>
        <translation>Archive (*.zip);;Neuer Ordner (*)</translation>
    </message>
    <message>
        <source>Could not save %1.
%2</source>
        <translation>%1 konnte nicht gespeichert werden.
%2</translation>
    </message>
</context>
<context>
    <name>Velocor::ProgramsButton</name>
    <message>
        <source>Which programs&apos; lines are shown</source>
        <translation>Von welchen Programmen Zeilen gezeigt werden</translation>
    </message>
    <message>
        <source>&amp;Show All</source>
        <translation>&amp;Alle zeigen</translation>
    </message>
    <message>
        <source>&amp;Add Logs...</source>
        <translation>&amp;Protokolle hinzufügen...</translation>
    </message>
    <message>
        <source>&amp;Programs: %1 of %2</source>
        <translation>&amp;Programme: %1 von %2</translation>
    </message>
</context>
<context>
    <name>Velocor::ReachableStyle</name>
    <message>
        <source>Clear</source>
        <translation>Leeren</translation>
    </message>
    <message>
        <source>More tools</source>
        <translation>Weitere Werkzeuge</translation>
    </message>
</context>
<context>
    <name>Velocor::RecentFiles</name>
    <message>
        <source>&amp;Clear</source>
        <translation>&amp;Leeren</translation>
    </message>
    <message>
        <source>Clear the list of recent files</source>
        <translation>Die Liste der zuletzt geöffneten Dateien leeren</translation>
    </message>
</context>
<context>
    <name>Velocor::ReportDialog</name>
    <message>
        <source>Program icon</source>
        <translation>Symbol des Programms</translation>
    </message>
    <message>
        <source>&amp;Copy</source>
        <translation>&amp;Kopieren</translation>
    </message>
</context>
<context>
    <name>Velocor::SavedStatesDialog</name>
    <message>
        <source>Damaged: %1</source>
        <translation>Beschädigt: %1</translation>
    </message>
    <message>
        <source>Mended</source>
        <translation>Repariert</translation>
    </message>
    <message>
        <source>Only text that is no value</source>
        <translation>Nur Text, der kein Wert ist</translation>
    </message>
    <message>
        <source> and %1 more</source>
        <translation> und %1 weitere</translation>
    </message>
    <message>
        <source>&amp;Compare...</source>
        <translation>&amp;Vergleichen...</translation>
    </message>
    <message>
        <source>Show what differs from the editor</source>
        <translation>Zeigen, was sich vom Editor unterscheidet</translation>
    </message>
    <message>
        <source>&amp;Bring Back</source>
        <translation>Zurück&amp;holen</translation>
    </message>
    <message>
        <source>Show this state in the editor; can be undone</source>
        <translation>Diesen Zustand im Editor zeigen; kann rückgängig gemacht werden</translation>
    </message>
    <message>
        <source>&amp;Remove All...</source>
        <translation>Alle &amp;entfernen...</translation>
    </message>
    <message>
        <source>Remove all saved states of this file</source>
        <translation>Alle gespeicherten Zustände dieser Datei entfernen</translation>
    </message>
    <message>
        <source>Saved States of %1</source>
        <translation>Gespeicherte Zustände von %1</translation>
    </message>
    <message>
        <source>Summary</source>
        <translation>Zusammenfassung</translation>
    </message>
    <message>
        <source>Saved states</source>
        <translation>Gespeicherte Zustände</translation>
    </message>
    <message>
        <source>Columns of the saved states</source>
        <translation>Spalten der gespeicherten Zustände</translation>
    </message>
    <message>
        <source>Time</source>
        <translation>Zeit</translation>
    </message>
    <message>
        <source>Size</source>
        <translation>Größe</translation>
    </message>
    <message>
        <source>What changed</source>
        <translation>Was sich änderte</translation>
    </message>
    <message>
        <source>C&amp;lose</source>
        <translation>Sch&amp;ließen</translation>
    </message>
    <message>
        <source>No state is kept yet: the last %1 are kept when the file is saved here.</source>
        <translation>Noch ist kein Zustand aufgehoben: Beim Speichern der Datei werden hier die letzten %1 aufgehoben.</translation>
    </message>
    <message>
        <source>The last %1 states of the file, newest first.</source>
        <translation>Die letzten %1 Zustände der Datei, der neueste zuerst.</translation>
    </message>
    <message>
        <source>Oldest one kept</source>
        <translation>Ältester aufgehobener</translation>
    </message>
    <message>
        <source>Remove all saved states of %1?</source>
        <translation>Alle gespeicherten Zustände von %1 entfernen?</translation>
    </message>
    <message>
        <source>The file itself and its .bak stay as they are.</source>
        <translation>Die Datei selbst und ihre .bak-Datei bleiben, wie sie sind.</translation>
    </message>
    <message>
        <source>Remove All</source>
        <translation>Alle entfernen</translation>
    </message>
    <message>
        <source>Not all could be removed.</source>
        <translation>Nicht alle konnten entfernt werden.</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsCommands</name>
    <message>
        <source>Add Section</source>
        <translation>Abschnitt hinzufügen</translation>
    </message>
    <message>
        <source>Add Key</source>
        <translation>Schlüssel hinzufügen</translation>
    </message>
    <message>
        <source>Duplicate Section</source>
        <translation>Abschnitt duplizieren</translation>
    </message>
    <message>
        <source>Duplicate Key</source>
        <translation>Schlüssel duplizieren</translation>
    </message>
    <message>
        <source>Remove %1 Items</source>
        <translation>%1 Einträge entfernen</translation>
    </message>
    <message>
        <source>Remove Section</source>
        <translation>Abschnitt entfernen</translation>
    </message>
    <message>
        <source>Remove Key</source>
        <translation>Schlüssel entfernen</translation>
    </message>
    <message>
        <source>and %1 more</source>
        <translation>und %1 weitere</translation>
    </message>
    <message numerus="yes">
        <source>Removed %Ln key(s): </source>
        <translation>
            <numerusform>%Ln Schlüssel entfernt: </numerusform>
            <numerusform>%Ln Schlüssel entfernt: </numerusform>
        </translation>
    </message>
    <message>
        <source>section </source>
        <translation>Abschnitt </translation>
    </message>
    <message numerus="yes">
        <source>%Ln section(s)</source>
        <translation>
            <numerusform>%Ln Abschnitt</numerusform>
            <numerusform>%Ln Abschnitte</numerusform>
        </translation>
    </message>
    <message>
        <source>Removed </source>
        <translation>Entfernt: </translation>
    </message>
    <message numerus="yes">
        <source>, with %Ln key(s): </source>
        <translation>
            <numerusform>, mit %Ln Schlüssel: </numerusform>
            <numerusform>, mit %Ln Schlüsseln: </numerusform>
        </translation>
    </message>
    <message>
        <source>Back to Default</source>
        <translation>Auf Standard zurücksetzen</translation>
    </message>
    <message>
        <source>Move Section</source>
        <translation>Abschnitt verschieben</translation>
    </message>
    <message>
        <source>Move Key</source>
        <translation>Schlüssel verschieben</translation>
    </message>
    <message>
        <source>&quot;%1&quot; is not a valid section or key name</source>
        <translation>„%1“ ist kein gültiger Name für Abschnitt oder Schlüssel</translation>
    </message>
    <message>
        <source>Use letters, digits, &quot;_&quot;, &quot;-&quot; and &quot;.&quot;; start with a letter or &quot;_&quot;</source>
        <translation>Buchstaben, Ziffern, „_“, „-“ und „.“ verwenden; mit Buchstabe oder „_“ beginnen</translation>
    </message>
    <message>
        <source>&quot;%1&quot; is the name of the root element</source>
        <translation>„%1“ ist der Name des Wurzelelements</translation>
    </message>
    <message>
        <source>There is already a &quot;%1&quot; here</source>
        <translation>„%1“ gibt es hier schon</translation>
    </message>
    <message>
        <source>Change Value</source>
        <translation>Wert ändern</translation>
    </message>
    <message>
        <source>, so &quot;%1&quot; is kept. </source>
        <translation>, daher bleibt „%1“. </translation>
    </message>
    <message>
        <source>Rename Section</source>
        <translation>Abschnitt umbenennen</translation>
    </message>
    <message>
        <source>Rename Key</source>
        <translation>Schlüssel umbenennen</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsDelegate</name>
    <message>
        <source>Not a number from %1 to %2</source>
        <translation>Keine Zahl von %1 bis %2</translation>
    </message>
    <message>
        <source>Value</source>
        <translation>Wert</translation>
    </message>
    <message>
        <source>Name</source>
        <translation>Name</translation>
    </message>
    <message>
        <source>; the value becomes a text</source>
        <translation>; der Wert wird zum Text</translation>
    </message>
    <message>
        <source>, so &quot;%1&quot; is kept.</source>
        <translation>, daher bleibt „%1“.</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsEditor</name>
    <message>
        <source>Removal</source>
        <translation>Entfernung</translation>
    </message>
    <message>
        <source>Undo</source>
        <translation>Rückgängig</translation>
    </message>
    <message>
        <source>Bring back what was removed (Ctrl+Z)</source>
        <translation>Das Entfernte zurückholen (Strg+Z)</translation>
    </message>
    <message>
        <source>Add &amp;Section</source>
        <translation>Abschn&amp;itt hinzufügen</translation>
    </message>
    <message>
        <source>Add an empty section (Alt+Ins)</source>
        <translation>Einen leeren Abschnitt hinzufügen (Alt+Einfg)</translation>
    </message>
    <message>
        <source>Add &amp;Key</source>
        <translation>&amp;Schlüssel hinzufügen</translation>
    </message>
    <message>
        <source>Add a key to the selected section (Ins)</source>
        <translation>Dem ausgewählten Abschnitt einen Schlüssel hinzufügen (Einfg)</translation>
    </message>
    <message>
        <source>&amp;Remove</source>
        <translation>&amp;Entfernen</translation>
    </message>
    <message>
        <source>Remove the selected sections and keys (Del)</source>
        <translation>Die ausgewählten Abschnitte und Schlüssel entfernen (Entf)</translation>
    </message>
    <message>
        <source>Sa&amp;ve</source>
        <translation>Speicher&amp;n</translation>
    </message>
    <message>
        <source>Save the file (Ctrl+S)</source>
        <translation>Die Datei speichern (Strg+S)</translation>
    </message>
    <message>
        <source>Reload</source>
        <translation>Neu laden</translation>
    </message>
    <message>
        <source>In the file</source>
        <translation>In der Datei</translation>
    </message>
    <message>
        <source>Compare With</source>
        <translation>Vergleichen mit</translation>
    </message>
    <message>
        <source>Settings (*.cfg *.xml *.bak);;All files (*)</source>
        <translation>Einstellungen (*.cfg *.xml *.bak);;Alle Dateien (*)</translation>
    </message>
    <message>
        <source>Save Settings As</source>
        <translation>Einstellungen speichern unter</translation>
    </message>
    <message>
        <source>Settings (*.cfg *.xml);;All files (*)</source>
        <translation>Einstellungen (*.cfg *.xml);;Alle Dateien (*)</translation>
    </message>
    <message>
        <source>Saved %1</source>
        <translation>%1 gespeichert</translation>
    </message>
    <message>
        <source>, but its state is not kept: %1</source>
        <translation>, aber der Zustand ist nicht aufgehoben: %1</translation>
    </message>
    <message numerus="yes">
        <source>Saving would lose %Ln item(s) in this file.</source>
        <translation>
            <numerusform>Beim Speichern ginge %Ln Eintrag dieser Datei verloren.</numerusform>
            <numerusform>Beim Speichern gingen %Ln Einträge dieser Datei verloren.</numerusform>
        </translation>
    </message>
    <message>
        <source>Cannot show %1 as a tree: %2</source>
        <translation>%1 kann nicht als Baum gezeigt werden: %2</translation>
    </message>
    <message>
        <source> (line %1, column %2)</source>
        <translation> (Zeile %1, Spalte %2)</translation>
    </message>
    <message>
        <source>This file cannot be edited as text: save the changes first</source>
        <translation>Diese Datei kann nicht als Text bearbeitet werden: zuerst die Änderungen speichern</translation>
    </message>
    <message>
        <source>Edit as Text</source>
        <translation>Als Text bearbeiten</translation>
    </message>
    <message>
        <source>%1 / %2</source>
        <translation>%1 / %2</translation>
    </message>
    <message>
        <source>The state of %1 is gone</source>
        <translation>Den Zustand von %1 gibt es nicht mehr</translation>
    </message>
    <message>
        <source>Bring Back</source>
        <translation>Zurückholen</translation>
    </message>
    <message>
        <source>Brought back the state of %1; save to keep it</source>
        <translation>Der Zustand von %1 ist zurückgeholt; zum Behalten speichern</translation>
    </message>
    <message>
        <source>Save changes to %1?</source>
        <translation>Änderungen an %1 speichern?</translation>
    </message>
    <message>
        <source>This file is too large to be shown as settings</source>
        <translation>Diese Datei ist zu groß, um als Einstellungen gezeigt zu werden</translation>
    </message>
    <message>
        <source>Edit Text</source>
        <translation>Text bearbeiten</translation>
    </message>
    <message>
        <source>%1 cannot be read</source>
        <translation>%1 kann nicht gelesen werden</translation>
    </message>
    <message>
        <source>The file is shown as text, where Undo brings your changes back.</source>
        <translation>Die Datei wird als Text angezeigt; „Rückgängig“ bringt dort Ihre Änderungen zurück.</translation>
    </message>
    <message>
        <source>Discard your changes to %1?</source>
        <translation>Ihre Änderungen an %1 verwerfen?</translation>
    </message>
    <message>
        <source>They cannot be brought back after reloading this file.</source>
        <translation>Sie können nach dem Neuladen dieser Datei nicht zurückgeholt werden.</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsFindBar</name>
    <message>
        <source>&amp;Only Matches</source>
        <translation>Nur &amp;Treffer</translation>
    </message>
    <message>
        <source>Show only the sections and keys that match (Alt+O)</source>
        <translation>Nur passende Abschnitte und Schlüssel zeigen (Alt+T)</translation>
    </message>
    <message>
        <source>&amp;Changed</source>
        <translation>&amp;Geändert</translation>
    </message>
    <message>
        <source>Show only values that are not yet saved like that (Alt+C)</source>
        <translation>Nur Werte zeigen, die noch nicht so gespeichert sind (Alt+G)</translation>
    </message>
    <message>
        <source>Not &amp;Default</source>
        <translation>Nicht Standa&amp;rd</translation>
    </message>
    <message>
        <source>Show only values that differ from their default (Alt+D)</source>
        <translation>Nur Werte zeigen, die von ihrem Standard abweichen (Alt+R)</translation>
    </message>
    <message>
        <source>Find in names and values</source>
        <translation>In Namen und Werten suchen</translation>
    </message>
    <message>
        <source>Result of the search</source>
        <translation>Ergebnis der Suche</translation>
    </message>
    <message>
        <source>Find previous</source>
        <translation>Vorheriges suchen</translation>
    </message>
    <message>
        <source>Go to the previous match (Shift+F3)</source>
        <translation>Zum vorherigen Treffer gehen (Umschalt+F3)</translation>
    </message>
    <message>
        <source>Find next</source>
        <translation>Nächstes suchen</translation>
    </message>
    <message>
        <source>Go to the next match (F3)</source>
        <translation>Zum nächsten Treffer gehen (F3)</translation>
    </message>
    <message>
        <source>Close the find bar</source>
        <translation>Die Suchleiste schließen</translation>
    </message>
    <message>
        <source>Close (Esc)</source>
        <translation>Schließen (Esc)</translation>
    </message>
    <message>
        <source>No match</source>
        <translation>Kein Treffer</translation>
    </message>
    <message numerus="yes">
        <source>%Ln key(s)</source>
        <translation>
            <numerusform>%Ln Schlüssel</numerusform>
            <numerusform>%Ln Schlüssel</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>%Ln match(es)</source>
        <translation>
            <numerusform>%Ln Treffer</numerusform>
            <numerusform>%Ln Treffer</numerusform>
        </translation>
    </message>
    <message>
        <source>%L1 of %L2</source>
        <translation>%L1 von %L2</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsModel</name>
    <message>
        <source>%1. %2</source>
        <translation>%1. %2</translation>
    </message>
    <message>
        <source>Default: %1</source>
        <translation>Standard: %1</translation>
    </message>
    <message>
        <source>Section / key</source>
        <translation>Abschnitt / Schlüssel</translation>
    </message>
    <message>
        <source>Value</source>
        <translation>Wert</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsTextPage</name>
    <message>
        <source>%1 with %2</source>
        <translation>%1 mit %2</translation>
    </message>
    <message>
        <source>1 section</source>
        <translation>1 Abschnitt</translation>
    </message>
    <message>
        <source>%1 sections</source>
        <translation>%1 Abschnitte</translation>
    </message>
    <message>
        <source>1 key</source>
        <translation>1 Schlüssel</translation>
    </message>
    <message>
        <source>%1 keys</source>
        <translation>%1 Schlüssel</translation>
    </message>
    <message>
        <source>Sa&amp;ve</source>
        <translation>Speicher&amp;n</translation>
    </message>
    <message>
        <source>File text</source>
        <translation>Text der Datei</translation>
    </message>
    <message>
        <source>State of the text</source>
        <translation>Zustand des Textes</translation>
    </message>
    <message>
        <source>Save the file (Ctrl+S)</source>
        <translation>Die Datei speichern (Strg+S)</translation>
    </message>
    <message>
        <source>Go to &amp;Error</source>
        <translation>Zum &amp;Fehler</translation>
    </message>
    <message>
        <source>Go to where the text cannot be read</source>
        <translation>Dorthin gehen, wo der Text nicht gelesen werden kann</translation>
    </message>
    <message>
        <source>Show as Se&amp;ttings</source>
        <translation>Als Eins&amp;tellungen zeigen</translation>
    </message>
    <message>
        <source>Show what can be read of the text as sections, keys and values</source>
        <translation>Zeigen, was vom Text als Abschnitte, Schlüssel und Werte lesbar ist</translation>
    </message>
    <message>
        <source>Sa&amp;ved States...</source>
        <translation>Ges&amp;peicherte Zustände...</translation>
    </message>
    <message>
        <source>Bring back an earlier state of the file</source>
        <translation>Einen früheren Zustand der Datei zurückholen</translation>
    </message>
    <message>
        <source>the file is in Latin-1, which lacks this character</source>
        <translation>die Datei ist in Latin-1, dem dieses Zeichen fehlt</translation>
    </message>
    <message>
        <source>This text can be read: %1.</source>
        <translation>Dieser Text kann gelesen werden: %1.</translation>
    </message>
    <message>
        <source>Line %1, column %2: %3. Programs get what is before it: %4.</source>
        <translation>Zeile %1, Spalte %2: %3. Programme erhalten, was davor steht: %4.</translation>
    </message>
    <message>
        <source> Only the start of the file is shown, and it cannot be edited as text.</source>
        <translation> Nur der Anfang der Datei wird gezeigt, und sie kann nicht als Text bearbeitet werden.</translation>
    </message>
    <message>
        <source> This file cannot be edited as text.</source>
        <translation> Diese Datei kann nicht als Text bearbeitet werden.</translation>
    </message>
    <message>
        <source>&amp;Find</source>
        <translation>&amp;Suchen</translation>
    </message>
    <message>
        <source>Find a text in the file</source>
        <translation>Einen Text in der Datei suchen</translation>
    </message>
    <message>
        <source>Find Ne&amp;xt</source>
        <translation>&amp;Weitersuchen</translation>
    </message>
    <message>
        <source>Go to the next match in the text</source>
        <translation>Zum nächsten Treffer im Text gehen</translation>
    </message>
    <message>
        <source>Find &amp;Previous</source>
        <translation>&amp;Vorheriges suchen</translation>
    </message>
    <message>
        <source>Go to the previous match in the text</source>
        <translation>Zum vorherigen Treffer im Text gehen</translation>
    </message>
    <message>
        <source>&amp;Go to Line...</source>
        <translation>&amp;Zu Zeile gehen...</translation>
    </message>
    <message>
        <source>Go to a line of the text by its number</source>
        <translation>Zu einer Zeile des Textes gehen, mit ihrer Nummer</translation>
    </message>
    <message>
        <source>This file is too large to be shown as settings.</source>
        <translation>Diese Datei ist zu groß, um als Einstellungen gezeigt zu werden.</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsTree</name>
    <message>
        <source>Settings</source>
        <translation>Einstellungen</translation>
    </message>
    <message>
        <source>Settings columns</source>
        <translation>Spalten der Einstellungen</translation>
    </message>
    <message>
        <source>&amp;Edit Value</source>
        <translation>Wert &amp;bearbeiten</translation>
    </message>
    <message>
        <source>Edit the value</source>
        <translation>Den Wert bearbeiten</translation>
    </message>
    <message>
        <source>Edit in &amp;Large Field</source>
        <translation>In &amp;großem Feld bearbeiten</translation>
    </message>
    <message>
        <source>Edit the value as a text of several lines</source>
        <translation>Den Wert als mehrzeiligen Text bearbeiten</translation>
    </message>
    <message>
        <source>&amp;Toggle</source>
        <translation>&amp;Umschalten</translation>
    </message>
    <message>
        <source>Change yes to no, and no to yes</source>
        <translation>Ja zu Nein und Nein zu Ja ändern</translation>
    </message>
    <message>
        <source>C&amp;hoose Kind</source>
        <translation>Ar&amp;t wählen</translation>
    </message>
    <message>
        <source>Choose what kind of value this is</source>
        <translation>Wählen, welche Art von Wert das ist</translation>
    </message>
    <message>
        <source>Re&amp;name</source>
        <translation>U&amp;mbenennen</translation>
    </message>
    <message>
        <source>Edit the name of the section or key</source>
        <translation>Den Namen des Abschnitts oder Schlüssels bearbeiten</translation>
    </message>
    <message>
        <source>Add &amp;Key</source>
        <translation>&amp;Schlüssel hinzufügen</translation>
    </message>
    <message>
        <source>Add a key to the section</source>
        <translation>Dem Abschnitt einen Schlüssel hinzufügen</translation>
    </message>
    <message>
        <source>Add &amp;Section</source>
        <translation>Abschn&amp;itt hinzufügen</translation>
    </message>
    <message>
        <source>Add an empty section</source>
        <translation>Einen leeren Abschnitt hinzufügen</translation>
    </message>
    <message>
        <source>Dupl&amp;icate</source>
        <translation>Dupli&amp;zieren</translation>
    </message>
    <message>
        <source>Add a copy of the section or key</source>
        <translation>Eine Kopie des Abschnitts oder Schlüssels hinzufügen</translation>
    </message>
    <message>
        <source>Re&amp;move</source>
        <translation>&amp;Entfernen</translation>
    </message>
    <message>
        <source>Remove the selected sections and keys</source>
        <translation>Die ausgewählten Abschnitte und Schlüssel entfernen</translation>
    </message>
    <message>
        <source>Move &amp;Up</source>
        <translation>Nach &amp;oben</translation>
    </message>
    <message>
        <source>Move the section or key up</source>
        <translation>Den Abschnitt oder Schlüssel nach oben verschieben</translation>
    </message>
    <message>
        <source>Move &amp;Down</source>
        <translation>Nach u&amp;nten</translation>
    </message>
    <message>
        <source>Move the section or key down</source>
        <translation>Den Abschnitt oder Schlüssel nach unten verschieben</translation>
    </message>
    <message>
        <source>&amp;Back to Default</source>
        <translation>Auf Stan&amp;dard zurücksetzen</translation>
    </message>
    <message>
        <source>Give the selected keys their default values</source>
        <translation>Den ausgewählten Schlüsseln ihre Standardwerte geben</translation>
    </message>
    <message>
        <source>All Back t&amp;o Default</source>
        <translation>A&amp;lles auf Standard zurücksetzen</translation>
    </message>
    <message>
        <source>Give all keys of the file their default values</source>
        <translation>Allen Schlüsseln der Datei ihre Standardwerte geben</translation>
    </message>
    <message>
        <source>&amp;Find</source>
        <translation>Su&amp;chen</translation>
    </message>
    <message>
        <source>Find a text in names and values</source>
        <translation>Einen Text in Namen und Werten suchen</translation>
    </message>
    <message>
        <source>Find Ne&amp;xt</source>
        <translation>&amp;Weitersuchen</translation>
    </message>
    <message>
        <source>Go to the next match</source>
        <translation>Zum nächsten Treffer gehen</translation>
    </message>
    <message>
        <source>Find &amp;Previous</source>
        <translation>&amp;Vorheriges suchen</translation>
    </message>
    <message>
        <source>Go to the previous match</source>
        <translation>Zum vorherigen Treffer gehen</translation>
    </message>
    <message>
        <source>Edit &amp;as Text</source>
        <translation>Als Te&amp;xt bearbeiten</translation>
    </message>
    <message>
        <source>Edit the file as text</source>
        <translation>Die Datei als Text bearbeiten</translation>
    </message>
    <message>
        <source>Sa&amp;ved States...</source>
        <translation>Ges&amp;peicherte Zustände...</translation>
    </message>
    <message>
        <source>Compare with earlier states of the file, and bring one back</source>
        <translation>Mit früheren Zuständen der Datei vergleichen und einen zurückholen</translation>
    </message>
    <message>
        <source>Kind of value</source>
        <translation>Art des Wertes</translation>
    </message>
    <message>
        <source>&amp;Guess: %1</source>
        <translation>&amp;Vermutet: %1</translation>
    </message>
</context>
<context>
    <name>Velocor::SeveritySwitches</name>
    <message>
        <source>Other</source>
        <translation>Andere</translation>
    </message>
    <message>
        <source>Show %1</source>
        <translation>%1 zeigen</translation>
    </message>
    <message>
        <source>lines without a severity</source>
        <translation>Zeilen ohne Schweregrad</translation>
    </message>
    <message>
        <source>%1 entries</source>
        <translation>%1-Einträge</translation>
    </message>
    <message>
        <source>%1 in this file</source>
        <translation>%1 in dieser Datei</translation>
    </message>
    <message>
        <source>Show or hide %1 (Ctrl+%2): %3</source>
        <translation>%1 ein- oder ausblenden (Strg+%2): %3</translation>
    </message>
</context>
<context>
    <name>Velocor::SizeDialog</name>
    <message>
        <source>Width</source>
        <translation>Breite</translation>
    </message>
    <message>
        <source>Height</source>
        <translation>Höhe</translation>
    </message>
    <message>
        <source>Edit Size</source>
        <translation>Größe bearbeiten</translation>
    </message>
    <message>
        <source>&amp;Width</source>
        <translation>&amp;Breite</translation>
    </message>
    <message>
        <source>&amp;Height</source>
        <translation>&amp;Höhe</translation>
    </message>
</context>
<context>
    <name>Velocor::StandardInput</name>
    <message>
        <source>Standard input</source>
        <translation>Standardeingabe</translation>
    </message>
    <message>
        <source>Pipe %1</source>
        <translation>Pipe %1</translation>
    </message>
    <message>
        <source>Standard input cannot be read: %1</source>
        <translation>Die Standardeingabe kann nicht gelesen werden: %1</translation>
    </message>
    <message>
        <source>Standard input is cut off, because %1 cannot be written: %2</source>
        <translation>Die Standardeingabe ist abgeschnitten, weil %1 nicht geschrieben werden kann: %2</translation>
    </message>
</context>
<context>
    <name>Velocor::TextFindBar</name>
    <message>
        <source>Find in the text</source>
        <translation>Im Text suchen</translation>
    </message>
    <message>
        <source>Result of the search in the text</source>
        <translation>Ergebnis der Suche im Text</translation>
    </message>
    <message>
        <source>Find previous in the text</source>
        <translation>Vorheriges im Text suchen</translation>
    </message>
    <message>
        <source>Go to the previous match (Shift+F3)</source>
        <translation>Zum vorherigen Treffer gehen (Umschalt+F3)</translation>
    </message>
    <message>
        <source>Find next in the text</source>
        <translation>Nächstes im Text suchen</translation>
    </message>
    <message>
        <source>Go to the next match (F3)</source>
        <translation>Zum nächsten Treffer gehen (F3)</translation>
    </message>
    <message>
        <source>Close the find bar of the text</source>
        <translation>Die Suchleiste des Textes schließen</translation>
    </message>
    <message>
        <source>Close (Esc)</source>
        <translation>Schließen (Esc)</translation>
    </message>
    <message>
        <source>No match</source>
        <translation>Kein Treffer</translation>
    </message>
    <message numerus="yes">
        <source>%Ln match(es)</source>
        <translation>
            <numerusform>%Ln Treffer</numerusform>
            <numerusform>%Ln Treffer</numerusform>
        </translation>
    </message>
    <message>
        <source>%L1 of %L2</source>
        <translation>%L1 von %L2</translation>
    </message>
    <message>
        <source>%L1 of %L2, continued from the bottom</source>
        <translation>%L1 von %L2, vom Ende fortgesetzt</translation>
    </message>
    <message>
        <source>%L1 of %L2, continued from the top</source>
        <translation>%L1 von %L2, vom Anfang fortgesetzt</translation>
    </message>
</context>
<context>
    <name>Velocor::TextFont</name>
    <message>
        <source>Text size: %1%</source>
        <translation>Schriftgröße: %1&#xa0;%</translation>
    </message>
</context>
<context>
    <name>Velocor::WindowDialogs</name>
    <message>
        <source>About %1</source>
        <translation>Über %1</translation>
    </message>
    <message>
        <source>The startup program of the Tork family. MIT license.</source>
        <translation>Das Startprogramm der Tork-Familie. MIT-Lizenz.</translation>
    </message>
    <message>
        <source>Keyboard Shortcuts</source>
        <translation>Tastenkürzel</translation>
    </message>
    <message>
        <source>Alt and the underlined letter open a menu; Tab goes from one control to the next.</source>
        <translation>Alt und der unterstrichene Buchstabe öffnen ein Menü; Tab geht von einem Bedienelement zum nächsten.</translation>
    </message>
    <message>
        <source>The manual is not installed, or there is no program to show it</source>
        <translation>Das Handbuch ist nicht installiert, oder es gibt kein Programm, das es zeigt</translation>
    </message>
    <message>
        <source>Versions and system</source>
        <translation>Versionen und System</translation>
    </message>
    <message>
        <source>Identity and places</source>
        <translation>Identität und Orte</translation>
    </message>
    <message>
        <source>Log settings</source>
        <translation>Protokolleinstellungen</translation>
    </message>
    <message>
        <source>Settings files</source>
        <translation>Einstellungsdateien</translation>
    </message>
    <message>
        <source>Last Entries</source>
        <translation>Letzte Einträge</translation>
    </message>
    <message>
        <source>The log no longer has the entries of that run.</source>
        <translation>Das Protokoll hat die Einträge dieses Laufs nicht mehr.</translation>
    </message>
    <message>
        <source>The last entries before the program ended:</source>
        <translation>Die letzten Einträge vor dem Ende des Programms:</translation>
    </message>
    <message>
        <source>Log settings saved</source>
        <translation>Protokolleinstellungen gespeichert</translation>
    </message>
    <message>
        <source>Cannot open the log folder: it does not exist, or there is no file manager</source>
        <translation>Der Protokollordner kann nicht geöffnet werden: Er existiert nicht, oder es gibt keine Dateiverwaltung</translation>
    </message>
</context>
<context>
    <name>Velocor::WindowPicture</name>
    <message>
        <source>Picture of the desktop</source>
        <translation>Bild des Desktops</translation>
    </message>
</context>
<context>
    <name>Velocor::WindowPlaceDialog</name>
    <message>
        <source>From the left</source>
        <translation>Von links</translation>
    </message>
    <message>
        <source>From the top</source>
        <translation>Von oben</translation>
    </message>
    <message>
        <source>Width</source>
        <translation>Breite</translation>
    </message>
    <message>
        <source>Height</source>
        <translation>Höhe</translation>
    </message>
    <message>
        <source>Edit Window Place</source>
        <translation>Fensterplatz bearbeiten</translation>
    </message>
    <message>
        <source>Where the window opens</source>
        <translation>Wo das Fenster sich öffnet</translation>
    </message>
    <message>
        <source>From the &amp;left</source>
        <translation>Von &amp;links</translation>
    </message>
    <message>
        <source>From the &amp;top</source>
        <translation>Von &amp;oben</translation>
    </message>
    <message>
        <source>&amp;Width</source>
        <translation>&amp;Breite</translation>
    </message>
    <message>
        <source>&amp;Height</source>
        <translation>&amp;Höhe</translation>
    </message>
    <message>
        <source>On this desktop, the window opens at %1, %2 with %3 by %4 pixels</source>
        <translation>Auf diesem Desktop öffnet sich das Fenster bei %1, %2 mit %3 mal %4 Pixeln</translation>
    </message>
</context>
</TS>

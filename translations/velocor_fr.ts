<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="fr" sourcelanguage="en">
<context>
    <name>HighlightColors</name>
    <message>
        <source>Green</source>
        <translation>Vert</translation>
    </message>
    <message>
        <source>Blue</source>
        <translation>Bleu</translation>
    </message>
    <message>
        <source>Orange</source>
        <translation>Orange</translation>
    </message>
    <message>
        <source>Purple</source>
        <translation>Violet</translation>
    </message>
    <message>
        <source>Red</source>
        <translation>Rouge</translation>
    </message>
    <message>
        <source>Pink</source>
        <translation>Rose</translation>
    </message>
    <message>
        <source>Gray</source>
        <translation>Gris</translation>
    </message>
</context>
<context>
    <name>LogStateText</name>
    <message numerus="yes">
        <source>%Ln line(s)</source>
        <translation>
            <numerusform>%Ln ligne</numerusform>
            <numerusform>%Ln lignes</numerusform>
        </translation>
    </message>
    <message>
        <source>%1 of %2</source>
        <translation>%1 sur %2</translation>
    </message>
    <message>
        <source>Line %1 of %2</source>
        <translation>Ligne %1 sur %2</translation>
    </message>
    <message>
        <source>Reading: %1%</source>
        <translation>Lecture&#xa0;: %1&#xa0;%</translation>
    </message>
    <message numerus="yes">
        <source>%Ln problem(s)</source>
        <translation>
            <numerusform>%Ln problème</numerusform>
            <numerusform>%Ln problèmes</numerusform>
        </translation>
    </message>
    <message>
        <source>%1 shown</source>
        <translation>%1 affichées</translation>
    </message>
    <message>
        <source>%1% read</source>
        <translation>%1&#xa0;% lus</translation>
    </message>
    <message>
        <source>paused</source>
        <translation>en pause</translation>
    </message>
    <message>
        <source>Cannot be read, so their lines are missing: %1</source>
        <translation>Illisibles, leurs lignes manquent donc&#xa0;: %1</translation>
    </message>
    <message>
        <source>This looks like a compressed file. To read it: %1</source>
        <translation>Ceci ressemble à un fichier compressé. Pour le lire&#xa0;: %1</translation>
    </message>
    <message>
        <source>This looks like a binary file. Its bytes are shown as text.</source>
        <translation>Ceci ressemble à un fichier binaire. Ses octets sont affichés comme du texte.</translation>
    </message>
    <message>
        <source>Cannot read %1:
%2</source>
        <translation>Impossible de lire %1&#xa0;:
%2</translation>
    </message>
    <message>
        <source>%1 does not exist.
It is shown here as soon as it is created.</source>
        <translation>%1 n’existe pas.
Il sera affiché ici dès qu’il sera créé.</translation>
    </message>
    <message>
        <source>No lines match the filter.
Clear it with Ctrl+Shift+F.</source>
        <translation>Aucune ligne ne correspond au filtre.
Ctrl+Maj+F l’efface.</translation>
    </message>
    <message>
        <source>The log is empty.
New lines appear here as they are written.</source>
        <translation>Le journal est vide.
Les nouvelles lignes apparaissent ici dès qu’elles sont écrites.</translation>
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
        <translation>Fichier introuvable</translation>
    </message>
    <message>
        <source>Not a regular file</source>
        <translation>N’est pas un fichier ordinaire</translation>
    </message>
    <message>
        <source>A compressed file. To read it: %1 FILE | velocor-log -</source>
        <translation>Un fichier compressé. Pour le lire&#xa0;: %1 FICHIER | velocor-log -</translation>
    </message>
    <message>
        <source>%1 at character %2</source>
        <translation>%1 au caractère %2</translation>
    </message>
    <message>
        <source>No file has so many lines.</source>
        <translation>Aucun fichier n’a autant de lignes.</translation>
    </message>
    <message>
        <source>The first line is 1.</source>
        <translation>La première ligne est 1.</translation>
    </message>
    <message>
        <source>Add a unit: %1s, %1m, %1h or %1d.</source>
        <translation>Ajoutez une unité&#xa0;: %1s, %1m, %1h ou %1d.</translation>
    </message>
    <message>
        <source>The interval is too long.</source>
        <translation>L’intervalle est trop long.</translation>
    </message>
    <message>
        <source>The hours go up to 23.</source>
        <translation>Les heures vont jusqu’à 23.</translation>
    </message>
    <message>
        <source>The minutes go up to 59.</source>
        <translation>Les minutes vont jusqu’à 59.</translation>
    </message>
    <message>
        <source>The seconds go up to 59.</source>
        <translation>Les secondes vont jusqu’à 59.</translation>
    </message>
    <message>
        <source>There is no such day.</source>
        <translation>Ce jour n’existe pas.</translation>
    </message>
    <message>
        <source>Neither a line number nor a time.</source>
        <translation>Ni un numéro de ligne ni une heure.</translation>
    </message>
    <message>
        <source>words</source>
        <translation>mots</translation>
    </message>
    <message>
        <source>home folders</source>
        <translation>dossiers personnels</translation>
    </message>
    <message>
        <source>names of users</source>
        <translation>noms d’utilisateurs</translation>
    </message>
    <message>
        <source>full names</source>
        <translation>noms complets</translation>
    </message>
    <message>
        <source>names of computers</source>
        <translation>noms d’ordinateurs</translation>
    </message>
    <message>
        <source>mail addresses</source>
        <translation>adresses électroniques</translation>
    </message>
    <message>
        <source>network addresses</source>
        <translation>adresses réseau</translation>
    </message>
    <message>
        <source>hardware addresses</source>
        <translation>adresses matérielles</translation>
    </message>
    <message>
        <source>private keys</source>
        <translation>clés privées</translation>
    </message>
    <message>
        <source>tokens</source>
        <translation>jetons</translation>
    </message>
    <message>
        <source>passwords</source>
        <translation>mots de passe</translation>
    </message>
    <message>
        <source>Only a part could be written</source>
        <translation>Seule une partie a pu être écrite</translation>
    </message>
    <message>
        <source># Report

Created %1
</source>
        <translation># Rapport

Créé le %1
</translation>
    </message>
    <message>
        <source>
## Replaced by placeholders

</source>
        <translation>
## Remplacé par des marques substitutives

</translation>
    </message>
    <message>
        <source>Nothing.
</source>
        <translation>Rien.
</translation>
    </message>
    <message>
        <source>| what | different | places |
</source>
        <translation>| quoi | différents | endroits |
</translation>
    </message>
    <message>
        <source>It exists</source>
        <translation>Il existe déjà</translation>
    </message>
    <message>
        <source>The folder cannot be created</source>
        <translation>Le dossier ne peut pas être créé</translation>
    </message>
    <message>
        <source> (does not exist)</source>
        <translation> (n’existe pas)</translation>
    </message>
    <message>
        <source>it ended normally</source>
        <translation>terminée normalement</translation>
    </message>
    <message>
        <source>it was killed or crashed</source>
        <translation>arrêtée de force ou plantée</translation>
    </message>
    <message>
        <source>it is running</source>
        <translation>en cours</translation>
    </message>
    <message>
        <source>nothing tells how it ended</source>
        <translation>rien ne dit comment elle s’est terminée</translation>
    </message>
    <message>
        <source>unknown</source>
        <translation>inconnu</translation>
    </message>
    <message>
        <source>from %1 to %2, %3 lines, problems: %4; %5</source>
        <translation>de %1 à %2, %3 lignes, problèmes&#xa0;: %4&#x202f;; %5</translation>
    </message>
    <message>
        <source>This run and the one before</source>
        <translation>Cette exécution et la précédente</translation>
    </message>
    <message>
        <source>The log is empty.
</source>
        <translation>Le journal est vide.
</translation>
    </message>
    <message>
        <source>The last run</source>
        <translation>La dernière exécution</translation>
    </message>
    <message>
        <source>The run before</source>
        <translation>L’exécution précédente</translation>
    </message>
    <message>
        <source>None.
</source>
        <translation>Aucun.
</translation>
    </message>
    <message>
        <source>Program</source>
        <translation>Programme</translation>
    </message>
    <message>
        <source>Built with Qt</source>
        <translation>Compilé avec Qt</translation>
    </message>
    <message>
        <source>Running with Qt</source>
        <translation>Exécuté avec Qt</translation>
    </message>
    <message>
        <source>Build ABI</source>
        <translation>ABI de compilation</translation>
    </message>
    <message>
        <source>System</source>
        <translation>Système</translation>
    </message>
    <message>
        <source>Kernel</source>
        <translation>Noyau</translation>
    </message>
    <message>
        <source>Processor</source>
        <translation>Processeur</translation>
    </message>
    <message>
        <source>Locale</source>
        <translation>Paramètres régionaux</translation>
    </message>
    <message>
        <source>Organization</source>
        <translation>Organisation</translation>
    </message>
    <message>
        <source>Product</source>
        <translation>Produit</translation>
    </message>
    <message>
        <source>Installation</source>
        <translation>Installation</translation>
    </message>
    <message>
        <source>Data</source>
        <translation>Données</translation>
    </message>
    <message>
        <source>Documents</source>
        <translation>Documents</translation>
    </message>
    <message>
        <source>%1 bytes</source>
        <translation>%1 octets</translation>
    </message>
    <message>
        <source>There are none.
</source>
        <translation>Il n’y en a pas.
</translation>
    </message>
    <message>
        <source>Problems</source>
        <translation>Problèmes</translation>
    </message>
    <message>
        <source>There is no log</source>
        <translation>Il n’y a pas de journal</translation>
    </message>
    <message>
        <source>Logging is off</source>
        <translation>Le journal est désactivé</translation>
    </message>
    <message>
        <source>Cannot write the log: %1</source>
        <translation>Impossible d’écrire le journal&#xa0;: %1</translation>
    </message>
    <message>
        <source>Cannot write the log: %1 is not writable</source>
        <translation>Impossible d’écrire le journal&#xa0;: %1 n’est pas accessible en écriture</translation>
    </message>
    <message>
        <source>Cannot write the log: the disk is full</source>
        <translation>Impossible d’écrire le journal&#xa0;: le disque est plein</translation>
    </message>
    <message>
        <source>Another running program writes to the same log (process %1)</source>
        <translation>Un autre programme en cours écrit dans le même journal (processus %1)</translation>
    </message>
    <message>
        <source>Other running programs write to the same log (processes %1)</source>
        <translation>D’autres programmes en cours écrivent dans le même journal (processus %1)</translation>
    </message>
    <message>
        <source>There is no log.</source>
        <translation>Il n’y a pas de journal.</translation>
    </message>
    <message>
        <source>The settings file %1 is incomplete after saving.</source>
        <translation>Le fichier de réglages %1 est incomplet après l’enregistrement.</translation>
    </message>
    <message>
        <source>Cannot create the folder %1</source>
        <translation>Impossible de créer le dossier %1</translation>
    </message>
    <message>
        <source>Cannot protect the folder %1</source>
        <translation>Impossible de protéger le dossier %1</translation>
    </message>
    <message>
        <source>it is larger than 1 MiB</source>
        <translation>il dépasse 1 Mio</translation>
    </message>
    <message>
        <source>Line %1: everything from there on (%2)</source>
        <translation>Ligne %1&#xa0;: tout à partir de là (%2)</translation>
    </message>
    <message>
        <source>Is a folder</source>
        <translation>Est un dossier</translation>
    </message>
    <message>
        <source>Line 1: the XML declaration</source>
        <translation>Ligne 1&#xa0;: la déclaration XML</translation>
    </message>
    <message>
        <source>Line %1: %2</source>
        <translation>Ligne %1&#xa0;: %2</translation>
    </message>
    <message>
        <source>the attribute &quot;%1&quot; of &quot;%2&quot;</source>
        <translation>l’attribut «&#xa0;%1&#xa0;» de «&#xa0;%2&#xa0;»</translation>
    </message>
    <message>
        <source>the element &quot;%1&quot;, which has the same name as the root element</source>
        <translation>l’élément «&#xa0;%1&#xa0;», qui porte le nom de l’élément racine</translation>
    </message>
    <message>
        <source>a second section &quot;%1&quot;, merged with the first</source>
        <translation>une deuxième section «&#xa0;%1&#xa0;», fusionnée avec la première</translation>
    </message>
    <message>
        <source>the nesting of the element &quot;%1&quot;</source>
        <translation>l’imbrication de l’élément «&#xa0;%1&#xa0;»</translation>
    </message>
    <message>
        <source>the name of the section &quot;%1&quot;</source>
        <translation>le nom de la section «&#xa0;%1&#xa0;»</translation>
    </message>
    <message>
        <source>the empty item &quot;%1&quot;</source>
        <translation>l’élément vide «&#xa0;%1&#xa0;»</translation>
    </message>
    <message>
        <source>&quot;%1&quot;, which is outside any section</source>
        <translation>«&#xa0;%1&#xa0;», hors de toute section</translation>
    </message>
    <message>
        <source>the first value of &quot;%1&quot;, replaced by a second one</source>
        <translation>la première valeur de «&#xa0;%1&#xa0;», remplacée par une seconde</translation>
    </message>
    <message>
        <source>the value of &quot;%1&quot;, starting at &quot;%2&quot;</source>
        <translation>la valeur de «&#xa0;%1&#xa0;», à partir de «&#xa0;%2&#xa0;»</translation>
    </message>
    <message>
        <source>the text &quot;%1&quot; outside any value</source>
        <translation>le texte «&#xa0;%1&#xa0;» hors de toute valeur</translation>
    </message>
    <message>
        <source>the processing instruction &quot;%1&quot;</source>
        <translation>l’instruction de traitement «&#xa0;%1&#xa0;»</translation>
    </message>
    <message>
        <source>the comment &quot;%1&quot;</source>
        <translation>le commentaire «&#xa0;%1&#xa0;»</translation>
    </message>
    <message>
        <source>the document type &quot;%1&quot;</source>
        <translation>le type de document «&#xa0;%1&#xa0;»</translation>
    </message>
    <message>
        <source>a value with &quot;]]&gt;&quot; makes the file unreadable</source>
        <translation>une valeur avec «&#xa0;]]&gt;&#xa0;» rend le fichier illisible</translation>
    </message>
    <message>
        <source>characters outside Latin-1 become &quot;?&quot;</source>
        <translation>les caractères hors de Latin-1 deviennent «&#x202f;?&#xa0;»</translation>
    </message>
    <message>
        <source>empty values are not saved</source>
        <translation>les valeurs vides ne sont pas enregistrées</translation>
    </message>
    <message>
        <source>the value would change when read back</source>
        <translation>la valeur changerait à la relecture</translation>
    </message>
    <message>
        <source>the key is not a valid name</source>
        <translation>la clé n’est pas un nom valide</translation>
    </message>
    <message>
        <source>the section name is not valid</source>
        <translation>le nom de la section n’est pas valide</translation>
    </message>
    <message>
        <source>the section has the same name as the root element</source>
        <translation>la section porte le nom de l’élément racine</translation>
    </message>
    <message>
        <source>The file was written, but does not read back completely. The disk may be full.</source>
        <translation>Le fichier a été écrit, mais ne se relit pas entièrement. Le disque est peut-être plein.</translation>
    </message>
    <message>
        <source>Cannot replace the file %1.</source>
        <translation>Impossible de remplacer le fichier %1.</translation>
    </message>
    <message>
        <source>%1 is damaged, so marks and encodings are not saved</source>
        <translation>%1 est endommagé, les marques et les encodages ne sont donc pas enregistrés</translation>
    </message>
    <message>
        <source>Screen %1</source>
        <translation>Écran %1</translation>
    </message>
    <message>
        <source>does not exist</source>
        <translation>n’existe pas</translation>
    </message>
    <message>
        <source>writable</source>
        <translation>accessible en écriture</translation>
    </message>
    <message>
        <source>not writable</source>
        <translation>non accessible en écriture</translation>
    </message>
    <message>
        <source>not a regular file</source>
        <translation>n’est pas un fichier ordinaire</translation>
    </message>
    <message>
        <source>none</source>
        <translation>aucun</translation>
    </message>
    <message>
        <source>on</source>
        <translation>activé</translation>
    </message>
    <message>
        <source>off</source>
        <translation>désactivé</translation>
    </message>
    <message>
        <source>, limit %1 per file, </source>
        <translation>, limite de %1 par fichier, </translation>
    </message>
    <message numerus="yes">
        <source>%Ln older file(s)</source>
        <translation>
            <numerusform>%Ln ancien fichier</numerusform>
            <numerusform>%Ln anciens fichiers</numerusform>
        </translation>
    </message>
    <message>
        <source>, last error: %1</source>
        <translation>, dernière erreur&#xa0;: %1</translation>
    </message>
    <message numerus="yes">
        <source>%Ln file(s)</source>
        <translation>
            <numerusform>%Ln fichier</numerusform>
            <numerusform>%Ln fichiers</numerusform>
        </translation>
    </message>
    <message>
        <source>%1, %2 in total</source>
        <translation>%1, %2 au total</translation>
    </message>
    <message>
        <source>Compiler</source>
        <translation>Compilateur</translation>
    </message>
    <message>
        <source>Platform</source>
        <translation>Plateforme</translation>
    </message>
    <message>
        <source>Style</source>
        <translation>Style</translation>
    </message>
    <message>
        <source>Font</source>
        <translation>Police</translation>
    </message>
    <message>
        <source>Settings file</source>
        <translation>Fichier de réglages</translation>
    </message>
    <message>
        <source>Log settings</source>
        <translation>Réglages du journal</translation>
    </message>
    <message>
        <source>Log file</source>
        <translation>Fichier journal</translation>
    </message>
    <message>
        <source>Log files</source>
        <translation>Fichiers journaux</translation>
    </message>
    <message>
        <source>Log</source>
        <translation>Journal</translation>
    </message>
    <message>
        <source>Free space for data</source>
        <translation>Espace libre pour les données</translation>
    </message>
    <message>
        <source>Cannot read the settings file %1 (%2). It is left unchanged.</source>
        <translation>Impossible de lire le fichier de réglages %1 (%2). Il reste inchangé.</translation>
    </message>
    <message>
        <source>%1 cannot be renamed</source>
        <translation>%1 ne peut pas être renommé</translation>
    </message>
    <message>
        <source>The settings file was damaged, so default settings are used. The damaged file was kept as %1.</source>
        <translation>Le fichier de réglages était endommagé, les réglages par défaut sont donc utilisés. Le fichier endommagé a été gardé sous %1.</translation>
    </message>
    <message>
        <source>The settings file %1 is damaged and cannot be renamed. It is left unchanged, and window settings will not be saved.</source>
        <translation>Le fichier de réglages %1 est endommagé et ne peut pas être renommé. Il reste inchangé, et les réglages de la fenêtre ne seront pas enregistrés.</translation>
    </message>
    <message>
        <source>The settings file %1 is not a regular file</source>
        <translation>Le fichier de réglages %1 n’est pas un fichier ordinaire</translation>
    </message>
    <message>
        <source>and %1 more</source>
        <translation>et %1 de plus</translation>
    </message>
    <message>
        <source>What Will Be Written to %1</source>
        <translation>Ce qui sera écrit dans %1</translation>
    </message>
    <message>
        <source>The file now</source>
        <translation>Le fichier actuel</translation>
    </message>
    <message>
        <source>After saving</source>
        <translation>Après l’enregistrement</translation>
    </message>
    <message>
        <source>Cannot compare with %1.
%2</source>
        <translation>Impossible de comparer avec %1.
%2</translation>
    </message>
    <message>
        <source>Compare With %1</source>
        <translation>Comparer avec %1</translation>
    </message>
    <message>
        <source>In the editor</source>
        <translation>Dans l’éditeur</translation>
    </message>
    <message>
        <source>Take Over</source>
        <translation>Reprendre</translation>
    </message>
    <message>
        <source>Saving %1 would lose:</source>
        <translation>Enregistrer %1 ferait perdre&#xa0;:</translation>
    </message>
    <message>
        <source>Save Anyway</source>
        <translation>Enregistrer quand même</translation>
    </message>
    <message>
        <source>%1 was changed by another program.</source>
        <translation>%1 a été modifié par un autre programme.</translation>
    </message>
    <message>
        <source>Saving would overwrite those changes.</source>
        <translation>L’enregistrement écraserait ces modifications.</translation>
    </message>
    <message>
        <source>Cannot back up %1.</source>
        <translation>Impossible de faire une copie de sauvegarde de %1.</translation>
    </message>
    <message>
        <source>Save Without Backup</source>
        <translation>Enregistrer sans sauvegarde</translation>
    </message>
    <message>
        <source>Programs cannot read all of %1 yet.</source>
        <translation>Les programmes ne peuvent pas encore lire tout %1.</translation>
    </message>
    <message>
        <source>Line %1, column %2: %3</source>
        <translation>Ligne %1, colonne %2&#xa0;: %3</translation>
    </message>
    <message>
        <source>Could not save %1.
%2</source>
        <translation>%1 n’a pas pu être enregistré.
%2</translation>
    </message>
    <message>
        <source>Edit Value</source>
        <translation>Modifier la valeur</translation>
    </message>
    <message>
        <source>Long lines are split for display; only %1 marks a line break.</source>
        <translation>Les longues lignes sont coupées à l’affichage&#x202f;; seul %1 marque un saut de ligne.</translation>
    </message>
    <message>
        <source>This value contains carriage returns or Unicode line separators, so it cannot be edited here.</source>
        <translation>Cette valeur contient des retours chariot ou des séparateurs de ligne Unicode et ne peut donc pas être modifiée ici.</translation>
    </message>
    <message>
        <source>Value</source>
        <translation>Valeur</translation>
    </message>
    <message>
        <source>Color of %1</source>
        <translation>Couleur de %1</translation>
    </message>
    <message>
        <source>Font of %1</source>
        <translation>Police de %1</translation>
    </message>
    <message>
        <source>1 byte</source>
        <translation>1 octet</translation>
    </message>
    <message>
        <source>It has more than %L1 keys</source>
        <translation>Il a plus de %L1 clés</translation>
    </message>
    <message>
        <source>It is larger than %L1 MiB</source>
        <translation>Il dépasse %L1&#xa0;Mio</translation>
    </message>
    <message>
        <source>%1 cannot be read any more.</source>
        <translation>%1 ne peut plus être lu.</translation>
    </message>
    <message>
        <source>the namespace &quot;%1&quot; of &quot;%2&quot;</source>
        <translation>l’espace de noms «&#xa0;%1&#xa0;» de «&#xa0;%2&#xa0;»</translation>
    </message>
    <message>
        <source>the prefix of &quot;%1&quot;</source>
        <translation>le préfixe de «&#xa0;%1&#xa0;»</translation>
    </message>
</context>
<context>
    <name>RunText</name>
    <message>
        <source>%1 to %2</source>
        <translation>%1 à %2</translation>
    </message>
    <message>
        <source>ended normally</source>
        <translation>terminée normalement</translation>
    </message>
    <message>
        <source>killed or crashed</source>
        <translation>arrêtée de force ou plantée</translation>
    </message>
    <message>
        <source>still running</source>
        <translation>toujours en cours</translation>
    </message>
    <message>
        <source>1 warning</source>
        <translation>1 avertissement</translation>
    </message>
    <message>
        <source>%1 warnings</source>
        <translation>%1 avertissements</translation>
    </message>
    <message>
        <source>1 error</source>
        <translation>1 erreur</translation>
    </message>
    <message>
        <source>%1 errors</source>
        <translation>%1 erreurs</translation>
    </message>
</context>
<context>
    <name>ShortcutList</name>
    <message>
        <source>Settings files
</source>
        <translation>Fichiers de réglages
</translation>
    </message>
    <message>
        <source>Tabs
</source>
        <translation>Onglets
</translation>
    </message>
    <message>
        <source>Buttons
</source>
        <translation>Boutons
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
        <translation>1 minute</translation>
    </message>
    <message>
        <source>%1 minutes</source>
        <translation>%1 minutes</translation>
    </message>
    <message>
        <source>1 hour</source>
        <translation>1 heure</translation>
    </message>
    <message>
        <source>%1 hours</source>
        <translation>%1 heures</translation>
    </message>
    <message>
        <source>1 day</source>
        <translation>1 jour</translation>
    </message>
    <message>
        <source>%1 days</source>
        <translation>%1 jours</translation>
    </message>
    <message>
        <source>1 second</source>
        <translation>1 seconde</translation>
    </message>
    <message>
        <source>%1 seconds</source>
        <translation>%1 secondes</translation>
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
        <translation>%1 j %2 h</translation>
    </message>
    <message>
        <source>1 millisecond</source>
        <translation>1 milliseconde</translation>
    </message>
    <message>
        <source>%1 milliseconds</source>
        <translation>%1 millisecondes</translation>
    </message>
</context>
<context>
    <name>ValueKind</name>
    <message>
        <source>Yes or no</source>
        <translation>Oui ou non</translation>
    </message>
    <message>
        <source>Number</source>
        <translation>Nombre</translation>
    </message>
    <message>
        <source>Color</source>
        <translation>Couleur</translation>
    </message>
    <message>
        <source>Size</source>
        <translation>Taille</translation>
    </message>
    <message>
        <source>Font</source>
        <translation>Police</translation>
    </message>
    <message>
        <source>Window place</source>
        <translation>Place de la fenêtre</translation>
    </message>
    <message>
        <source>File list</source>
        <translation>Liste de fichiers</translation>
    </message>
    <message>
        <source>Text</source>
        <translation>Texte</translation>
    </message>
</context>
<context>
    <name>Velocor::ActivityStrip</name>
    <message>
        <source>Activity</source>
        <translation>Activité</translation>
    </message>
    <message>
        <source>%1 to %2: %L3 entries, %L4 problems</source>
        <translation>%1 à %2&#xa0;: %L3 entrées, %L4 problèmes</translation>
    </message>
    <message>
        <source>The times in this log have no dates</source>
        <translation>Les heures de ce journal n’ont pas de date</translation>
    </message>
    <message>
        <source>No times</source>
        <translation>Pas d’heures</translation>
    </message>
    <message>
        <source>%1: %L2 entries, %L3 problems</source>
        <translation>%1&#xa0;: %L2 entrées, %L3 problèmes</translation>
    </message>
    <message>
        <source>%1 to %2</source>
        <translation>%1 à %2</translation>
    </message>
</context>
<context>
    <name>Velocor::CurrentLine</name>
    <message>
        <source>Note on the current line</source>
        <translation>Annotation de la ligne courante</translation>
    </message>
    <message>
        <source>Full text of the current line</source>
        <translation>Texte entier de la ligne courante</translation>
    </message>
    <message>
        <source>Select a line to see its full text here</source>
        <translation>Sélectionnez une ligne pour voir ici son texte entier</translation>
    </message>
    <message>
        <source>Note: %1</source>
        <translation>Annotation&#xa0;: %1</translation>
    </message>
    <message>
        <source>&amp;Filter by This</source>
        <translation>&amp;Filtrer par cela</translation>
    </message>
    <message>
        <source>&amp;Hide This</source>
        <translation>&amp;Masquer cela</translation>
    </message>
    <message>
        <source>Hi&amp;ghlight This</source>
        <translation>&amp;Surligner cela</translation>
    </message>
</context>
<context>
    <name>Velocor::CurrentTab</name>
    <message>
        <source>&amp;Undo %1</source>
        <translation>Ann&amp;uler&#xa0;: %1</translation>
    </message>
    <message>
        <source>&amp;Redo %1</source>
        <translation>&amp;Rétablir&#xa0;: %1</translation>
    </message>
    <message>
        <source>%1 – %2</source>
        <translation>%1 – %2</translation>
    </message>
    <message numerus="yes">
        <source>%Ln new problem(s): %1</source>
        <translation>
            <numerusform>%Ln nouveau problème&#xa0;: %1</numerusform>
            <numerusform>%Ln nouveaux problèmes&#xa0;: %1</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::DifferenceDialog</name>
    <message>
        <source>&amp;Differences only</source>
        <translation>&amp;Différences seulement</translation>
    </message>
    <message>
        <source>&amp;Take Over</source>
        <translation>Re&amp;prendre</translation>
    </message>
    <message>
        <source>&amp;Undo</source>
        <translation>Ann&amp;uler</translation>
    </message>
    <message>
        <source>Summary</source>
        <translation>Résumé</translation>
    </message>
    <message>
        <source>&amp;Lines</source>
        <translation>&amp;Lignes</translation>
    </message>
    <message>
        <source>Show the lines of the files; those that the other file does not have are marked</source>
        <translation>Afficher les lignes des fichiers&#x202f;; celles que l’autre fichier n’a pas sont marquées</translation>
    </message>
    <message>
        <source>&amp;Close</source>
        <translation>&amp;Fermer</translation>
    </message>
    <message>
        <source>Change the selected rows in the editor to what is on the right</source>
        <translation>Donner aux lignes choisies dans l’éditeur ce qui est à droite</translation>
    </message>
    <message>
        <source>Take back the last change in the editor (Ctrl+Z)</source>
        <translation>Annuler la dernière modification dans l’éditeur (Ctrl+Z)</translation>
    </message>
    <message numerus="yes">
        <source>%Ln difference(s)</source>
        <translation>
            <numerusform>%Ln différence</numerusform>
            <numerusform>%Ln différences</numerusform>
        </translation>
    </message>
    <message>
        <source>No differences</source>
        <translation>Aucune différence</translation>
    </message>
    <message>
        <source>; saving would lose what the last column names</source>
        <translation>&#x202f;; l’enregistrement ferait perdre ce que nomme la dernière colonne</translation>
    </message>
    <message>
        <source>Lines: %1</source>
        <translation>Lignes&#xa0;: %1</translation>
    </message>
</context>
<context>
    <name>Velocor::DifferenceTree</name>
    <message>
        <source>Differences</source>
        <translation>Différences</translation>
    </message>
    <message>
        <source>Columns of the differences</source>
        <translation>Colonnes des différences</translation>
    </message>
    <message>
        <source>Section / key</source>
        <translation>Section / clé</translation>
    </message>
    <message>
        <source>Difference</source>
        <translation>Différence</translation>
    </message>
    <message>
        <source>Lost in saving</source>
        <translation>Perdu à l’enregistrement</translation>
    </message>
    <message>
        <source>(whole file)</source>
        <translation>(fichier entier)</translation>
    </message>
    <message>
        <source>Other root element</source>
        <translation>Autre élément racine</translation>
    </message>
    <message>
        <source>Moved</source>
        <translation>Déplacé</translation>
    </message>
    <message>
        <source>Only left</source>
        <translation>Seulement à gauche</translation>
    </message>
    <message>
        <source>Only right</source>
        <translation>Seulement à droite</translation>
    </message>
    <message>
        <source>Changed, moved</source>
        <translation>Modifié, déplacé</translation>
    </message>
    <message>
        <source>Changed</source>
        <translation>Modifié</translation>
    </message>
</context>
<context>
    <name>Velocor::FieldHint</name>
    <message>
        <source>Problem with what is typed</source>
        <translation>Problème de saisie</translation>
    </message>
</context>
<context>
    <name>Velocor::FileListDialog</name>
    <message>
        <source>Edit File List</source>
        <translation>Modifier la liste de fichiers</translation>
    </message>
    <message>
        <source>Files</source>
        <translation>Fichiers</translation>
    </message>
    <message>
        <source>Problem with the files</source>
        <translation>Problème avec les fichiers</translation>
    </message>
    <message>
        <source>&amp;Add</source>
        <translation>A&amp;jouter</translation>
    </message>
    <message>
        <source>&amp;Remove</source>
        <translation>Supp&amp;rimer</translation>
    </message>
    <message>
        <source>Move &amp;Up</source>
        <translation>Vers le &amp;haut</translation>
    </message>
    <message>
        <source>Move &amp;Down</source>
        <translation>Vers le &amp;bas</translation>
    </message>
    <message>
        <source>&quot;|&quot; separates the files, so no name can have it</source>
        <translation>«&#xa0;|&#xa0;» sépare les fichiers, aucun nom ne peut donc le contenir</translation>
    </message>
</context>
<context>
    <name>Velocor::FileNotice</name>
    <message>
        <source>State of the file</source>
        <translation>État du fichier</translation>
    </message>
    <message>
        <source>Reload</source>
        <translation>Recharger</translation>
    </message>
    <message>
        <source>Show what is in the file now; can be undone</source>
        <translation>Afficher le contenu actuel du fichier&#x202f;; peut être annulé</translation>
    </message>
    <message>
        <source>Compare...</source>
        <translation>Comparer...</translation>
    </message>
    <message>
        <source>Show what differs, and take over single values</source>
        <translation>Afficher les différences et reprendre certaines valeurs</translation>
    </message>
    <message>
        <source>Keep Mine</source>
        <translation>Garder les miens</translation>
    </message>
    <message>
        <source>Leave the editor as it is; saving replaces the file</source>
        <translation>Laisser l’éditeur tel quel&#x202f;; l’enregistrement remplace le fichier</translation>
    </message>
    <message>
        <source>Save As...</source>
        <translation>Enregistrer sous...</translation>
    </message>
    <message>
        <source>Save to another file</source>
        <translation>Enregistrer dans un autre fichier</translation>
    </message>
    <message>
        <source>The folder of %1 is gone.</source>
        <translation>Le dossier de %1 n’existe plus.</translation>
    </message>
    <message>
        <source>%1 was removed. Saving changes creates it again.</source>
        <translation>%1 a été supprimé. Enregistrer des modifications le recrée.</translation>
    </message>
    <message>
        <source>%1 is a folder now, not a file.</source>
        <translation>%1 est maintenant un dossier, pas un fichier.</translation>
    </message>
    <message>
        <source>%1 is not a regular file any more.</source>
        <translation>%1 n’est plus un fichier ordinaire.</translation>
    </message>
    <message>
        <source>%1 was changed by another program.</source>
        <translation>%1 a été modifié par un autre programme.</translation>
    </message>
    <message>
        <source>%1 is read-only. Changes can only be saved to another file.</source>
        <translation>%1 est en lecture seule. Les modifications ne peuvent être enregistrées que dans un autre fichier.</translation>
    </message>
</context>
<context>
    <name>Velocor::FileOpener</name>
    <message>
        <source>Open</source>
        <translation>Ouvrir</translation>
    </message>
    <message>
        <source>Logs (*.log *.log.* *.txt);;Settings files (*.cfg *.xml);;All files (*)</source>
        <translation>Journaux (*.log *.log.* *.txt);;Fichiers de réglages (*.cfg *.xml);;Tous les fichiers (*)</translation>
    </message>
    <message>
        <source>%1 does not exist</source>
        <translation>%1 n’existe pas</translation>
    </message>
    <message>
        <source>%1 is a folder</source>
        <translation>%1 est un dossier</translation>
    </message>
    <message>
        <source>%1 is not a regular file</source>
        <translation>%1 n’est pas un fichier ordinaire</translation>
    </message>
    <message>
        <source>Only the first %1 of %2 files were opened</source>
        <translation>Seuls les %1 premiers des %2 fichiers ont été ouverts</translation>
    </message>
    <message>
        <source>Standard input cannot be shown, because no file can be created in %1</source>
        <translation>L’entrée standard ne peut pas être affichée, car aucun fichier ne peut être créé dans %1</translation>
    </message>
    <message>
        <source>%1 no longer exists.
Remove it from the list of recent files?</source>
        <translation>%1 n’existe plus.
Le retirer de la liste des fichiers récents&#x202f;?</translation>
    </message>
</context>
<context>
    <name>Velocor::FileTabs</name>
    <message>
        <source>Open files</source>
        <translation>Fichiers ouverts</translation>
    </message>
    <message>
        <source>Log</source>
        <translation>Journal</translation>
    </message>
    <message>
        <source>Next Tab</source>
        <translation>Onglet suivant</translation>
    </message>
    <message>
        <source>Ctrl+PgDown</source>
        <translation>Ctrl+PgDown</translation>
    </message>
    <message>
        <source>Previous Tab</source>
        <translation>Onglet précédent</translation>
    </message>
    <message>
        <source>Ctrl+PgUp</source>
        <translation>Ctrl+PgUp</translation>
    </message>
    <message>
        <source>Close %1</source>
        <translation>Fermer %1</translation>
    </message>
    <message>
        <source>Close the file (Ctrl+W)</source>
        <translation>Fermer le fichier (Ctrl+W)</translation>
    </message>
</context>
<context>
    <name>Velocor::FindControl</name>
    <message>
        <source>Not found</source>
        <translation>Introuvable</translation>
    </message>
    <message>
        <source>Continued from the top</source>
        <translation>Reprise depuis le début</translation>
    </message>
    <message>
        <source>Continued from the bottom</source>
        <translation>Reprise depuis la fin</translation>
    </message>
    <message>
        <source>Searching: %1%</source>
        <translation>Recherche&#xa0;: %1&#xa0;%</translation>
    </message>
    <message>
        <source>%L1 of %L2</source>
        <translation>%L1 sur %L2</translation>
    </message>
    <message numerus="yes">
        <source>%Ln line(s)</source>
        <translation>
            <numerusform>%Ln ligne</numerusform>
            <numerusform>%Ln lignes</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::GoToDialog</name>
    <message>
        <source>Go To</source>
        <translation>Aller à</translation>
    </message>
    <message>
        <source>&amp;Line or time:</source>
        <translation>&amp;Ligne ou heure&#xa0;:</translation>
    </message>
    <message>
        <source>Line or time</source>
        <translation>Ligne ou heure</translation>
    </message>
    <message>
        <source>Problem</source>
        <translation>Problème</translation>
    </message>
    <message numerus="yes">
        <source>The file has only %Ln line(s).</source>
        <translation>
            <numerusform>Le fichier n’a que %Ln ligne.</numerusform>
            <numerusform>Le fichier n’a que %Ln lignes.</numerusform>
        </translation>
    </message>
    <message>
        <source>Select an entry first, from which to count.</source>
        <translation>Sélectionnez d’abord une entrée à partir de laquelle compter.</translation>
    </message>
    <message>
        <source>line 214 of the file</source>
        <translation>ligne 214 du fichier</translation>
    </message>
    <message>
        <source>time, on the day of the current entry</source>
        <translation>heure, le jour de l’entrée courante</translation>
    </message>
    <message>
        <source>date and time</source>
        <translation>date et heure</translation>
    </message>
    <message>
        <source>from the current entry</source>
        <translation>à partir de l’entrée courante</translation>
    </message>
</context>
<context>
    <name>Velocor::HighlightDialog</name>
    <message>
        <source>&amp;Match case</source>
        <translation>Respecter la &amp;casse</translation>
    </message>
    <message>
        <source>Regular &amp;expression</source>
        <translation>E&amp;xpression régulière</translation>
    </message>
    <message>
        <source>Highlight Rules</source>
        <translation>Règles de surlignage</translation>
    </message>
    <message>
        <source>Rules look at the first %1 bytes of a line.</source>
        <translation>Les règles regardent les %1 premiers octets d’une ligne.</translation>
    </message>
    <message>
        <source>Highlight rules</source>
        <translation>Règles de surlignage</translation>
    </message>
    <message>
        <source>&amp;Add</source>
        <translation>A&amp;jouter</translation>
    </message>
    <message>
        <source>&amp;Remove</source>
        <translation>Supp&amp;rimer</translation>
    </message>
    <message>
        <source>Move &amp;Up</source>
        <translation>Vers le &amp;haut</translation>
    </message>
    <message>
        <source>Move &amp;Down</source>
        <translation>Vers le &amp;bas</translation>
    </message>
    <message>
        <source>Text to highlight</source>
        <translation>Texte à surligner</translation>
    </message>
    <message>
        <source>Lines with this text get the color</source>
        <translation>Les lignes avec ce texte prennent la couleur</translation>
    </message>
    <message>
        <source>Match case</source>
        <translation>Respecter la casse</translation>
    </message>
    <message>
        <source>Regular expression</source>
        <translation>Expression régulière</translation>
    </message>
    <message>
        <source>Color</source>
        <translation>Couleur</translation>
    </message>
    <message>
        <source>Problem of the rule</source>
        <translation>Problème de la règle</translation>
    </message>
    <message>
        <source>&amp;Text:</source>
        <translation>&amp;Texte&#xa0;:</translation>
    </message>
    <message>
        <source>C&amp;olor:</source>
        <translation>C&amp;ouleur&#xa0;:</translation>
    </message>
    <message>
        <source>(no text)</source>
        <translation>(pas de texte)</translation>
    </message>
    <message>
        <source>Invalid regular expression: %1</source>
        <translation>Expression régulière invalide&#xa0;: %1</translation>
    </message>
</context>
<context>
    <name>Velocor::HighlightRules</name>
    <message>
        <source>There are %1 highlight rules already</source>
        <translation>Il y a déjà %1 règles de surlignage</translation>
    </message>
    <message>
        <source>Highlighted; Ctrl+Shift+H changes the rules</source>
        <translation>Surligné&#x202f;; Ctrl+Maj+H modifie les règles</translation>
    </message>
    <message>
        <source>The highlight rule &quot;%1&quot; takes too long and is not applied</source>
        <translation>La règle de surlignage «&#xa0;%1&#xa0;» prend trop de temps et n’est pas appliquée</translation>
    </message>
</context>
<context>
    <name>Velocor::LineCommands</name>
    <message>
        <source>Save Lines</source>
        <translation>Enregistrer les lignes</translation>
    </message>
    <message>
        <source>-lines.log</source>
        <translation>-lignes.log</translation>
    </message>
    <message>
        <source>Logs (*.log);;All files (*)</source>
        <translation>Journaux (*.log);;Tous les fichiers (*)</translation>
    </message>
    <message>
        <source>Saving lines: %1%</source>
        <translation>Enregistrement des lignes&#xa0;: %1&#xa0;%</translation>
    </message>
    <message>
        <source>Could not save lines to %1: %2</source>
        <translation>Les lignes n’ont pas pu être enregistrées dans %1&#xa0;: %2</translation>
    </message>
    <message numerus="yes">
        <source>%Ln line(s) saved to %1</source>
        <translation>
            <numerusform>%Ln ligne enregistrée dans %1</numerusform>
            <numerusform>%Ln lignes enregistrées dans %1</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::LineCopier</name>
    <message>
        <source>No lines selected</source>
        <translation>Aucune ligne sélectionnée</translation>
    </message>
    <message>
        <source>Copied only the first %L1 selected lines</source>
        <translation>Seules les %L1 premières lignes sélectionnées ont été copiées</translation>
    </message>
    <message numerus="yes">
        <source>%Ln line(s) copied</source>
        <translation>
            <numerusform>%Ln ligne copiée</numerusform>
            <numerusform>%Ln lignes copiées</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::LineDialog</name>
    <message>
        <source>Go to Line</source>
        <translation>Aller à la ligne</translation>
    </message>
    <message>
        <source>Line</source>
        <translation>Ligne</translation>
    </message>
    <message>
        <source>&amp;Line, 1 to %L1</source>
        <translation>&amp;Ligne, 1 à %L1</translation>
    </message>
</context>
<context>
    <name>Velocor::LineNumberMargin</name>
    <message>
        <source>Line numbers</source>
        <translation>Numéros de ligne</translation>
    </message>
</context>
<context>
    <name>Velocor::LineSaver</name>
    <message>
        <source>The log has changed in the meantime</source>
        <translation>Le journal a changé entre-temps</translation>
    </message>
    <message>
        <source>Only a part could be written</source>
        <translation>Seule une partie a pu être écrite</translation>
    </message>
    <message>
        <source>Not a regular file</source>
        <translation>N’est pas un fichier ordinaire</translation>
    </message>
    <message>
        <source>This is the log itself</source>
        <translation>C’est le journal lui-même</translation>
    </message>
    <message>
        <source>The log no longer exists</source>
        <translation>Le journal n’existe plus</translation>
    </message>
    <message>
        <source>Canceled</source>
        <translation>Annulé</translation>
    </message>
</context>
<context>
    <name>Velocor::LogFileBox</name>
    <message>
        <source>Log file</source>
        <translation>Fichier journal</translation>
    </message>
    <message>
        <source>The current log file and older log files</source>
        <translation>Le fichier journal courant et les anciens</translation>
    </message>
    <message>
        <source>does not exist</source>
        <translation>n’existe pas</translation>
    </message>
    <message>
        <source>%1 (%2)</source>
        <translation>%1 (%2)</translation>
    </message>
    <message>
        <source>All files, by time</source>
        <translation>Tous les fichiers, par date</translation>
    </message>
    <message>
        <source>Every run that the files still have, oldest first</source>
        <translation>Chaque exécution que les fichiers contiennent encore, la plus ancienne d’abord</translation>
    </message>
    <message>
        <source>Whole family, by time</source>
        <translation>Journaux de la famille, par date</translation>
    </message>
    <message>
        <source>The logs of all programs of the family as one</source>
        <translation>Les journaux de tous les programmes de la famille en un seul</translation>
    </message>
</context>
<context>
    <name>Velocor::LogFilterBar</name>
    <message>
        <source>Filter</source>
        <translation>Filtre</translation>
    </message>
    <message>
        <source>Filter by text</source>
        <translation>Filtrer par texte</translation>
    </message>
    <message>
        <source>Show only lines that contain this text (Ctrl+L)</source>
        <translation>N’afficher que les lignes qui contiennent ce texte (Ctrl+L)</translation>
    </message>
    <message>
        <source>Filter error</source>
        <translation>Erreur du filtre</translation>
    </message>
    <message>
        <source>Earlier filters</source>
        <translation>Filtres précédents</translation>
    </message>
    <message>
        <source>Earlier filters (Down)</source>
        <translation>Filtres précédents (flèche bas)</translation>
    </message>
    <message>
        <source>Aa</source>
        <translation>Aa</translation>
    </message>
    <message>
        <source>Match case</source>
        <translation>Respecter la casse</translation>
    </message>
    <message>
        <source>.*</source>
        <translation>.*</translation>
    </message>
    <message>
        <source>Regular expression</source>
        <translation>Expression régulière</translation>
    </message>
    <message>
        <source>Search each line with a regular expression</source>
        <translation>Chercher dans chaque ligne avec une expression régulière</translation>
    </message>
    <message>
        <source>More</source>
        <translation>Plus</translation>
    </message>
    <message>
        <source>More filters</source>
        <translation>Autres filtres</translation>
    </message>
    <message>
        <source>Terms</source>
        <translation>Termes</translation>
    </message>
    <message>
        <source>Terms that lines also contain</source>
        <translation>Termes que les lignes contiennent aussi</translation>
    </message>
    <message>
        <source>Show only lines that contain all of these terms, too. Blanks separate terms; &quot;two words&quot; are one.</source>
        <translation>N’afficher que les lignes qui contiennent aussi tous ces termes. Les espaces séparent les termes&#x202f;; &quot;deux mots&quot; n’en font qu’un.</translation>
    </message>
    <message>
        <source>Terms of lines to hide</source>
        <translation>Termes des lignes à masquer</translation>
    </message>
    <message>
        <source>Hide lines that contain any of these terms. Blanks separate terms; &quot;two words&quot; are one.</source>
        <translation>Masquer les lignes qui contiennent l’un de ces termes. Les espaces séparent les termes&#x202f;; &quot;deux mots&quot; n’en font qu’un.</translation>
    </message>
    <message>
        <source>Also:</source>
        <translation>Aussi&#xa0;:</translation>
    </message>
    <message>
        <source>Hide:</source>
        <translation>Masquer&#xa0;:</translation>
    </message>
    <message>
        <source>Least severity</source>
        <translation>Gravité minimale</translation>
    </message>
    <message>
        <source>All severities</source>
        <translation>Toutes les gravités</translation>
    </message>
    <message>
        <source>At least %1</source>
        <translation>Au moins %1</translation>
    </message>
    <message>
        <source>Only %1</source>
        <translation>Seulement %1</translation>
    </message>
    <message>
        <source>Some severities</source>
        <translation>Certaines gravités</translation>
    </message>
    <message>
        <source>Lines of context</source>
        <translation>Lignes de contexte</translation>
    </message>
    <message>
        <source>Lines to show before and after each one that matches</source>
        <translation>Lignes à afficher avant et après chaque ligne trouvée</translation>
    </message>
    <message>
        <source>No context</source>
        <translation>Sans contexte</translation>
    </message>
    <message>
        <source>%1 around</source>
        <translation>%1 autour</translation>
    </message>
    <message>
        <source>More (%1)</source>
        <translation>Plus (%1)</translation>
    </message>
    <message>
        <source>No earlier filters</source>
        <translation>Aucun filtre précédent</translation>
    </message>
    <message>
        <source>Invalid regular expression, nothing is filtered: %1</source>
        <translation>Expression régulière invalide, rien n’est filtré&#xa0;: %1</translation>
    </message>
    <message>
        <source>The regular expression takes too long at line %L1, nothing is filtered.</source>
        <translation>L’expression régulière prend trop de temps à la ligne %L1, rien n’est filtré.</translation>
    </message>
    <message>
        <source>More terms, terms to hide, times, least severity, context</source>
        <translation>Autres termes, termes à masquer, heures, gravité minimale, contexte</translation>
    </message>
    <message>
        <source>A date, a time or both (2026-11-20, 14:03, 2026-11-20 14:03), or an interval until now such as -2h, -30m or -1d.</source>
        <translation>Une date, une heure ou les deux (2026-11-20, 14:03, 2026-11-20 14:03), ou une durée jusqu’à maintenant, comme -2h, -30m ou -1d.</translation>
    </message>
    <message>
        <source>Times shown</source>
        <translation>Heures affichées</translation>
    </message>
    <message>
        <source>Show all times</source>
        <translation>Afficher toutes les heures</translation>
    </message>
    <message>
        <source>Only from %1 to %2</source>
        <translation>Seulement de %1 à %2</translation>
    </message>
    <message>
        <source>Only from %1 on</source>
        <translation>Seulement à partir de %1</translation>
    </message>
    <message>
        <source>Only until %1</source>
        <translation>Seulement jusqu’à %1</translation>
    </message>
    <message>
        <source>From</source>
        <translation>De</translation>
    </message>
    <message>
        <source>Show only entries from this time on.</source>
        <translation>Afficher seulement les entrées à partir de cette heure.</translation>
    </message>
    <message>
        <source>Until</source>
        <translation>Jusqu’à</translation>
    </message>
    <message>
        <source>Show only entries up to this time.</source>
        <translation>Afficher seulement les entrées jusqu’à cette heure.</translation>
    </message>
    <message>
        <source>Not a time, which is not filtered: %1</source>
        <translation>Ce n’est pas une heure, rien n’est filtré : %1</translation>
    </message>
</context>
<context>
    <name>Velocor::LogFindBar</name>
    <message>
        <source>Find</source>
        <translation>Rechercher</translation>
    </message>
    <message>
        <source>Find text</source>
        <translation>Rechercher un texte</translation>
    </message>
    <message>
        <source>Go to lines that contain this text, among the others (Ctrl+F)</source>
        <translation>Aller aux lignes qui contiennent ce texte, parmi les autres (Ctrl+F)</translation>
    </message>
    <message>
        <source>Lines found</source>
        <translation>Lignes trouvées</translation>
    </message>
    <message>
        <source>Find error</source>
        <translation>Erreur de recherche</translation>
    </message>
    <message>
        <source>Aa</source>
        <translation>Aa</translation>
    </message>
    <message>
        <source>Match case when finding</source>
        <translation>Respecter la casse pour la recherche</translation>
    </message>
    <message>
        <source>.*</source>
        <translation>.*</translation>
    </message>
    <message>
        <source>Find a regular expression</source>
        <translation>Rechercher une expression régulière</translation>
    </message>
    <message>
        <source>Next</source>
        <translation>Suivant</translation>
    </message>
    <message>
        <source>Find next</source>
        <translation>Rechercher le suivant</translation>
    </message>
    <message>
        <source>Next line found (F3)</source>
        <translation>Ligne trouvée suivante (F3)</translation>
    </message>
    <message>
        <source>Previous</source>
        <translation>Précédent</translation>
    </message>
    <message>
        <source>Find previous</source>
        <translation>Rechercher le précédent</translation>
    </message>
    <message>
        <source>Previous line found (Shift+F3)</source>
        <translation>Ligne trouvée précédente (Maj+F3)</translation>
    </message>
    <message>
        <source>Close find bar</source>
        <translation>Fermer la barre de recherche</translation>
    </message>
    <message>
        <source>Close (Esc)</source>
        <translation>Fermer (Échap)</translation>
    </message>
    <message>
        <source>Invalid regular expression: %1</source>
        <translation>Expression régulière invalide&#xa0;: %1</translation>
    </message>
    <message>
        <source>The regular expression takes too long at line %L1.</source>
        <translation>L’expression régulière prend trop de temps à la ligne %L1.</translation>
    </message>
</context>
<context>
    <name>Velocor::LogGoTo</name>
    <message>
        <source>The line is not shown; this is the nearest one</source>
        <translation>La ligne n’est pas affichée&#x202f;; voici la plus proche</translation>
    </message>
    <message>
        <source>The lines shown end before that</source>
        <translation>Les lignes affichées s’arrêtent avant</translation>
    </message>
    <message>
        <source>The lines have no times</source>
        <translation>Les lignes n’ont pas d’heures</translation>
    </message>
    <message>
        <source>The times in this log have no dates</source>
        <translation>Les heures de ce journal n’ont pas de date</translation>
    </message>
    <message>
        <source>The file does not have so many lines</source>
        <translation>Le fichier n’a pas autant de lignes</translation>
    </message>
    <message>
        <source>Looking for that time... %1%</source>
        <translation>Recherche de cette heure... %1&#xa0;%</translation>
    </message>
    <message>
        <source>Looking for that time...</source>
        <translation>Recherche de cette heure...</translation>
    </message>
    <message>
        <source>Found</source>
        <translation>Trouvé</translation>
    </message>
</context>
<context>
    <name>Velocor::LogMarks</name>
    <message>
        <source>Select a line first</source>
        <translation>Sélectionnez d’abord une ligne</translation>
    </message>
    <message>
        <source>A file can have %1 marks</source>
        <translation>Un fichier peut avoir %1 marques</translation>
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
        <translation> (plus de %1)</translation>
    </message>
    <message>
        <source>This line is no longer in the file</source>
        <translation>Cette ligne n’est plus dans le fichier</translation>
    </message>
    <message>
        <source>(only the first %1 are shown)</source>
        <translation>(seuls les %1 premiers sont affichés)</translation>
    </message>
    <message>
        <source>Earlier</source>
        <translation>Avant</translation>
    </message>
    <message>
        <source>This run</source>
        <translation>Cette exécution</translation>
    </message>
    <message>
        <source>Latest run in this file</source>
        <translation>Dernière exécution dans ce fichier</translation>
    </message>
    <message>
        <source>%1 ms</source>
        <translation>%1 ms</translation>
    </message>
    <message>
        <source>Note: %1</source>
        <translation>Annotation&#xa0;: %1</translation>
    </message>
    <message>
        <source>Remainder of an entry that a later run overwrote</source>
        <translation>Reste d’une entrée qu’une exécution ultérieure a écrasée</translation>
    </message>
    <message>
        <source>%1, folded</source>
        <translation>%1, repliée</translation>
    </message>
    <message>
        <source>Marked: %1</source>
        <translation>Marquée&#xa0;: %1</translation>
    </message>
    <message>
        <source>%1 after the entry above</source>
        <translation>%1 après l’entrée du dessus</translation>
    </message>
    <message>
        <source>Time since the entry above</source>
        <translation>Temps depuis l’entrée du dessus</translation>
    </message>
    <message>
        <source>Time since %1</source>
        <translation>Temps depuis %1</translation>
    </message>
    <message>
        <source>Time</source>
        <translation>Heure</translation>
    </message>
    <message>
        <source>Severity</source>
        <translation>Gravité</translation>
    </message>
    <message>
        <source>Elapsed</source>
        <translation>Écoulé</translation>
    </message>
    <message>
        <source>Since</source>
        <translation>Depuis</translation>
    </message>
    <message>
        <source>Since Chosen</source>
        <translation>Depuis le choix</translation>
    </message>
    <message>
        <source>Message</source>
        <translation>Message</translation>
    </message>
    <message>
        <source>Program</source>
        <translation>Programme</translation>
    </message>
    <message numerus="yes">
        <source>%Ln time(s)</source>
        <translation>
            <numerusform>%Ln fois</numerusform>
            <numerusform>%Ln fois</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>%Ln time(s), %1</source>
        <translation>
            <numerusform>%Ln fois, %1</numerusform>
            <numerusform>%Ln fois, %1</numerusform>
        </translation>
    </message>
</context>
<context>
    <name>Velocor::LogOverview</name>
    <message>
        <source>Overview</source>
        <translation>Vue d’ensemble</translation>
    </message>
    <message>
        <source>Where problems, lines found and marks are among all lines shown</source>
        <translation>Où se trouvent problèmes, lignes trouvées et marques parmi les lignes affichées</translation>
    </message>
    <message>
        <source>%1: %2</source>
        <translation>%1&#xa0;: %2</translation>
    </message>
    <message>
        <source>Found</source>
        <translation>Trouvé</translation>
    </message>
    <message>
        <source>Marked</source>
        <translation>Marqué</translation>
    </message>
</context>
<context>
    <name>Velocor::LogPanel</name>
    <message>
        <source>&amp;File:</source>
        <translation>Fic&amp;hier&#xa0;:</translation>
    </message>
    <message>
        <source>Log entries and current line</source>
        <translation>Entrées du journal et ligne courante</translation>
    </message>
    <message>
        <source>This line has no time</source>
        <translation>Cette ligne n’a pas d’heure</translation>
    </message>
    <message>
        <source>No warnings or errors</source>
        <translation>Ni avertissement ni erreur</translation>
    </message>
    <message>
        <source>Continued from the top</source>
        <translation>Reprise depuis le début</translation>
    </message>
    <message>
        <source>Continued from the bottom</source>
        <translation>Reprise depuis la fin</translation>
    </message>
    <message>
        <source>Kind of file</source>
        <translation>Type de fichier</translation>
    </message>
    <message>
        <source>Add Logs</source>
        <translation>Ajouter des journaux</translation>
    </message>
</context>
<context>
    <name>Velocor::LogSettingsDialog</name>
    <message>
        <source>&amp;Enable logging</source>
        <translation>&amp;Activer le journal</translation>
    </message>
    <message>
        <source>&amp;Log time since the previous entry</source>
        <translation>&amp;Noter le temps depuis l’entrée précédente</translation>
    </message>
    <message>
        <source>Echo entries &amp;to the console</source>
        <translation>Afficher aussi les entrées dans la &amp;console</translation>
    </message>
    <message>
        <source>Log Settings</source>
        <translation>Réglages du journal</translation>
    </message>
    <message>
        <source>Older files to keep</source>
        <translation>Anciens fichiers à garder</translation>
    </message>
    <message>
        <source>Sample entry</source>
        <translation>Exemple d’entrée</translation>
    </message>
    <message>
        <source>Settings problem</source>
        <translation>Problème de réglage</translation>
    </message>
    <message>
        <source>Immediately</source>
        <translation>Immédiatement</translation>
    </message>
    <message>
        <source>&amp;Older files to keep:</source>
        <translation>Anciens &amp;fichiers à garder&#xa0;:</translation>
    </message>
    <message>
        <source>After restart</source>
        <translation>Après redémarrage</translation>
    </message>
    <message>
        <source>&amp;Date format:</source>
        <translation>Format de la &amp;date&#xa0;:</translation>
    </message>
    <message>
        <source>Elapsed time &amp;prefix:</source>
        <translation>&amp;Préfixe du temps écoulé&#xa0;:</translation>
    </message>
    <message>
        <source>Log file &amp;name:</source>
        <translation>Nom du fichier &amp;journal&#xa0;:</translation>
    </message>
    <message>
        <source>Sample:</source>
        <translation>Exemple&#xa0;:</translation>
    </message>
    <message>
        <source>This date format cannot be saved.</source>
        <translation>Ce format de date ne peut pas être enregistré.</translation>
    </message>
    <message>
        <source>This elapsed time prefix cannot be saved.</source>
        <translation>Ce préfixe ne peut pas être enregistré.</translation>
    </message>
    <message>
        <source>Not a valid log file name.</source>
        <translation>Nom de fichier journal non valide.</translation>
    </message>
    <message>
        <source>message</source>
        <translation>message</translation>
    </message>
</context>
<context>
    <name>Velocor::LogSeverities</name>
    <message>
        <source>Trace</source>
        <translation>Trace</translation>
    </message>
    <message>
        <source>Notification</source>
        <translation>Notification</translation>
    </message>
    <message>
        <source>Warning</source>
        <translation>Avertissement</translation>
    </message>
    <message>
        <source>Error</source>
        <translation>Erreur</translation>
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
        <translation>&amp;Copier</translation>
    </message>
    <message>
        <source>Copy as Mar&amp;kdown</source>
        <translation>Copier en Mar&amp;kdown</translation>
    </message>
    <message>
        <source>Copy as CS&amp;V</source>
        <translation>Copier en CS&amp;V</translation>
    </message>
    <message>
        <source>&amp;Filter by This</source>
        <translation>&amp;Filtrer par cela</translation>
    </message>
    <message>
        <source>&amp;Hide This</source>
        <translation>&amp;Masquer cela</translation>
    </message>
    <message>
        <source>Hi&amp;ghlight This</source>
        <translation>&amp;Surligner cela</translation>
    </message>
    <message>
        <source>Remove &amp;Mark</source>
        <translation>&amp;Retirer la marque</translation>
    </message>
    <message>
        <source>&amp;Mark</source>
        <translation>Mar&amp;quer</translation>
    </message>
    <message>
        <source>&amp;Note...</source>
        <translation>&amp;Annotation...</translation>
    </message>
    <message>
        <source>Measure From He&amp;re</source>
        <translation>Mesurer à partir d’&amp;ici</translation>
    </message>
    <message>
        <source>Measure From &amp;Above</source>
        <translation>Mesurer à partir du &amp;dessus</translation>
    </message>
</context>
<context>
    <name>Velocor::LogView</name>
    <message>
        <source>Log entries</source>
        <translation>Entrées du journal</translation>
    </message>
    <message>
        <source>Log columns</source>
        <translation>Colonnes du journal</translation>
    </message>
    <message>
        <source>Log rows</source>
        <translation>Lignes du journal</translation>
    </message>
    <message>
        <source>Select all rows</source>
        <translation>Sélectionner toutes les lignes</translation>
    </message>
</context>
<context>
    <name>Velocor::MainMenus</name>
    <message>
        <source>&amp;Open...</source>
        <translation>&amp;Ouvrir...</translation>
    </message>
    <message>
        <source>Open a log file or a settings file</source>
        <translation>Ouvrir un fichier journal ou de réglages</translation>
    </message>
    <message>
        <source>Open &amp;Recent</source>
        <translation>Fichiers &amp;récents</translation>
    </message>
    <message>
        <source>&amp;Save</source>
        <translation>&amp;Enregistrer</translation>
    </message>
    <message>
        <source>Save the current settings file</source>
        <translation>Enregistrer le fichier de réglages courant</translation>
    </message>
    <message>
        <source>&amp;What Will Be Written...</source>
        <translation>&amp;Ce qui sera écrit...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+W</source>
        <translation>Ctrl+Shift+W</translation>
    </message>
    <message>
        <source>Compare the settings file with what saving would make of it</source>
        <translation>Comparer le fichier de réglages avec ce qu’en ferait l’enregistrement</translation>
    </message>
    <message>
        <source>Compare Wit&amp;h...</source>
        <translation>Comparer &amp;avec...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+D</source>
        <translation>Ctrl+Shift+D</translation>
    </message>
    <message>
        <source>Compare the settings with another file, and take over values</source>
        <translation>Comparer les réglages avec un autre fichier et reprendre des valeurs</translation>
    </message>
    <message>
        <source>&amp;Close Tab</source>
        <translation>&amp;Fermer l’onglet</translation>
    </message>
    <message>
        <source>Close the current file</source>
        <translation>Fermer le fichier courant</translation>
    </message>
    <message>
        <source>Save &amp;Lines As...</source>
        <translation>Enregistrer les &amp;lignes sous...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+S</source>
        <translation>Ctrl+Shift+S</translation>
    </message>
    <message>
        <source>Save the lines that the filter shows to a file</source>
        <translation>Enregistrer dans un fichier les lignes que montre le filtre</translation>
    </message>
    <message>
        <source>Open Log &amp;Folder</source>
        <translation>Ouvrir le &amp;dossier des journaux</translation>
    </message>
    <message>
        <source>Ctrl+Shift+O</source>
        <translation>Ctrl+Shift+O</translation>
    </message>
    <message>
        <source>Show the log files in the file manager</source>
        <translation>Afficher les fichiers journaux dans le gestionnaire de fichiers</translation>
    </message>
    <message>
        <source>Save Re&amp;port...</source>
        <translation>Enregistrer un ra&amp;pport...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+R</source>
        <translation>Ctrl+Shift+R</translation>
    </message>
    <message>
        <source>Review and save the information for a bug report</source>
        <translation>Relire et enregistrer les informations d’un rapport de bogue</translation>
    </message>
    <message>
        <source>&amp;Quit</source>
        <translation>&amp;Quitter</translation>
    </message>
    <message>
        <source>Ctrl+Q</source>
        <translation>Ctrl+Q</translation>
    </message>
    <message>
        <source>Close the program</source>
        <translation>Fermer le programme</translation>
    </message>
    <message>
        <source>F&amp;ilter</source>
        <translation>F&amp;iltrer</translation>
    </message>
    <message>
        <source>Ctrl+L</source>
        <translation>Ctrl+L</translation>
    </message>
    <message>
        <source>Show only lines that contain the filter text</source>
        <translation>N’afficher que les lignes qui contiennent le texte du filtre</translation>
    </message>
    <message>
        <source>Als&amp;o Filter</source>
        <translation>Filtrer &amp;aussi</translation>
    </message>
    <message>
        <source>Ctrl+Shift+L</source>
        <translation>Ctrl+Shift+L</translation>
    </message>
    <message>
        <source>Show only lines that contain further terms, too</source>
        <translation>N’afficher que les lignes qui contiennent aussi d’autres termes</translation>
    </message>
    <message>
        <source>&amp;Hide Lines</source>
        <translation>&amp;Masquer des lignes</translation>
    </message>
    <message>
        <source>Ctrl+Shift+K</source>
        <translation>Ctrl+Shift+K</translation>
    </message>
    <message>
        <source>Hide lines that contain certain terms</source>
        <translation>Masquer les lignes qui contiennent certains termes</translation>
    </message>
    <message>
        <source>Clear Fi&amp;lter</source>
        <translation>&amp;Effacer le filtre</translation>
    </message>
    <message>
        <source>Ctrl+Shift+F</source>
        <translation>Ctrl+Shift+F</translation>
    </message>
    <message>
        <source>Show all lines again</source>
        <translation>Afficher à nouveau toutes les lignes</translation>
    </message>
    <message>
        <source>Log Se&amp;ttings...</source>
        <translation>Réglages du &amp;journal...</translation>
    </message>
    <message>
        <source>Ctrl+,</source>
        <translation>Ctrl+,</translation>
    </message>
    <message>
        <source>Change what is logged and how many log files are kept</source>
        <translation>Changer ce qui est journalisé et combien de fichiers sont gardés</translation>
    </message>
    <message>
        <source>&amp;Undo</source>
        <translation>Ann&amp;uler</translation>
    </message>
    <message>
        <source>Take back the last change of the settings file</source>
        <translation>Annuler la dernière modification du fichier de réglages</translation>
    </message>
    <message>
        <source>&amp;Redo</source>
        <translation>&amp;Rétablir</translation>
    </message>
    <message>
        <source>Make the last change again</source>
        <translation>Refaire la modification annulée</translation>
    </message>
    <message>
        <source>S&amp;ettings File</source>
        <translation>Fichier de ré&amp;glages</translation>
    </message>
    <message>
        <source>&amp;Copy</source>
        <translation>&amp;Copier</translation>
    </message>
    <message>
        <source>Copy the selected lines</source>
        <translation>Copier les lignes sélectionnées</translation>
    </message>
    <message>
        <source>Copy A&amp;s</source>
        <translation>Co&amp;pier comme</translation>
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
        <translation>Copier les lignes sélectionnées en bloc de code Markdown</translation>
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
        <translation>Copier les lignes sélectionnées en valeurs séparées par des virgules</translation>
    </message>
    <message>
        <source>Select &amp;All</source>
        <translation>Tout &amp;sélectionner</translation>
    </message>
    <message>
        <source>Select all lines</source>
        <translation>Sélectionner toutes les lignes</translation>
    </message>
    <message>
        <source>&amp;Find</source>
        <translation>Rec&amp;hercher</translation>
    </message>
    <message>
        <source>Go to lines that contain a text, among the others</source>
        <translation>Aller aux lignes qui contiennent un texte, parmi les autres</translation>
    </message>
    <message>
        <source>Find &amp;Next</source>
        <translation>Rechercher le suiva&amp;nt</translation>
    </message>
    <message>
        <source>F3</source>
        <translation>F3</translation>
    </message>
    <message>
        <source>Go to the next line found</source>
        <translation>Aller à la ligne trouvée suivante</translation>
    </message>
    <message>
        <source>Find Pre&amp;vious</source>
        <translation>Rechercher le précé&amp;dent</translation>
    </message>
    <message>
        <source>Shift+F3</source>
        <translation>Shift+F3</translation>
    </message>
    <message>
        <source>Go to the previous line found</source>
        <translation>Aller à la ligne trouvée précédente</translation>
    </message>
    <message>
        <source>&amp;Go To...</source>
        <translation>A&amp;ller à...</translation>
    </message>
    <message>
        <source>Ctrl+G</source>
        <translation>Ctrl+G</translation>
    </message>
    <message>
        <source>Go to a line or to a time</source>
        <translation>Aller à une ligne ou à une heure</translation>
    </message>
    <message>
        <source>&amp;Places</source>
        <translation>E&amp;mplacements</translation>
    </message>
    <message>
        <source>F9</source>
        <translation>F9</translation>
    </message>
    <message>
        <source>Show program identity and file locations</source>
        <translation>Afficher l’identité du programme et l’emplacement des fichiers</translation>
    </message>
    <message>
        <source>&amp;Tool Bar</source>
        <translation>&amp;Barre d’outils</translation>
    </message>
    <message>
        <source>Ctrl+Alt+B</source>
        <translation>Ctrl+Alt+B</translation>
    </message>
    <message>
        <source>Show the tool bar</source>
        <translation>Afficher la barre d’outils</translation>
    </message>
    <message>
        <source>&amp;Go to Next Pane</source>
        <translation>Aller au volet sui&amp;vant</translation>
    </message>
    <message>
        <source>F6</source>
        <translation>F6</translation>
    </message>
    <message>
        <source>Go from the filter to the lines, to the full text, ...</source>
        <translation>Aller du filtre aux lignes, au texte entier, ...</translation>
    </message>
    <message>
        <source>Go to Prev&amp;ious Pane</source>
        <translation>Aller au volet précé&amp;dent</translation>
    </message>
    <message>
        <source>Shift+F6</source>
        <translation>Shift+F6</translation>
    </message>
    <message>
        <source>Go to the pane before</source>
        <translation>Aller au volet précédent</translation>
    </message>
    <message>
        <source>&amp;Reload</source>
        <translation>Rec&amp;harger</translation>
    </message>
    <message>
        <source>F5</source>
        <translation>F5</translation>
    </message>
    <message>
        <source>Reload the file</source>
        <translation>Recharger le fichier</translation>
    </message>
    <message>
        <source>En&amp;coding</source>
        <translation>En&amp;codage</translation>
    </message>
    <message>
        <source>Te&amp;xt</source>
        <translation>Te&amp;xte</translation>
    </message>
    <message>
        <source>Anal&amp;yze</source>
        <translation>Anal&amp;yse</translation>
    </message>
    <message>
        <source>&amp;Highlight Rules...</source>
        <translation>&amp;Règles de surlignage...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+H</source>
        <translation>Ctrl+Shift+H</translation>
    </message>
    <message>
        <source>Give lines with certain texts a color</source>
        <translation>Donner une couleur aux lignes qui ont certains textes</translation>
    </message>
    <message>
        <source>Reopen Files at &amp;Start</source>
        <translation>R&amp;ouvrir les fichiers au démarrage</translation>
    </message>
    <message>
        <source>Ctrl+Alt+O</source>
        <translation>Ctrl+Alt+O</translation>
    </message>
    <message>
        <source>Open the files of these tabs again when the program starts</source>
        <translation>Rouvrir les fichiers de ces onglets au démarrage du programme</translation>
    </message>
    <message>
        <source>All Files, &amp;by Time</source>
        <translation>&amp;Tous les fichiers, par date</translation>
    </message>
    <message>
        <source>Ctrl+Shift+A</source>
        <translation>Ctrl+Shift+A</translation>
    </message>
    <message>
        <source>Show the older files of the log, too, as one, each run with a heading</source>
        <translation>Afficher aussi les anciens fichiers du journal, en un seul, chaque exécution avec un titre</translation>
    </message>
    <message>
        <source>&amp;Earlier Runs</source>
        <translation>Exécutions antéri&amp;eures</translation>
    </message>
    <message>
        <source>Ctrl+Shift+E</source>
        <translation>Ctrl+Shift+E</translation>
    </message>
    <message>
        <source>Show entries from earlier runs</source>
        <translation>Afficher les entrées des exécutions antérieures</translation>
    </message>
    <message>
        <source>P&amp;ause</source>
        <translation>&amp;Pause</translation>
    </message>
    <message>
        <source>Ctrl+Shift+P</source>
        <translation>Ctrl+Shift+P</translation>
    </message>
    <message>
        <source>Stop updating the view while logging continues</source>
        <translation>Ne plus mettre à jour la vue tandis que la journalisation continue</translation>
    </message>
    <message>
        <source>&amp;Follow Newest</source>
        <translation>&amp;Suivre les nouveautés</translation>
    </message>
    <message>
        <source>Ctrl+Shift+N</source>
        <translation>Ctrl+Shift+N</translation>
    </message>
    <message>
        <source>Scroll to new entries as they arrive</source>
        <translation>Défiler vers les nouvelles entrées dès leur arrivée</translation>
    </message>
    <message>
        <source>&amp;Next Problem</source>
        <translation>Problème suiva&amp;nt</translation>
    </message>
    <message>
        <source>F8</source>
        <translation>F8</translation>
    </message>
    <message>
        <source>Go to the next warning or error</source>
        <translation>Aller à l’avertissement ou à l’erreur suivante</translation>
    </message>
    <message>
        <source>Pre&amp;vious Problem</source>
        <translation>Prob&amp;lème précédent</translation>
    </message>
    <message>
        <source>Shift+F8</source>
        <translation>Shift+F8</translation>
    </message>
    <message>
        <source>Go to the previous warning or error</source>
        <translation>Aller à l’avertissement ou à l’erreur précédente</translation>
    </message>
    <message>
        <source>&amp;Mark</source>
        <translation>Mar&amp;quer</translation>
    </message>
    <message>
        <source>Ctrl+M</source>
        <translation>Ctrl+M</translation>
    </message>
    <message>
        <source>Mark the current line, or remove its mark</source>
        <translation>Marquer la ligne courante, ou retirer sa marque</translation>
    </message>
    <message>
        <source>N&amp;ote...</source>
        <translation>&amp;Annotation...</translation>
    </message>
    <message>
        <source>Ctrl+Shift+M</source>
        <translation>Ctrl+Shift+M</translation>
    </message>
    <message>
        <source>Write a note on the current line</source>
        <translation>Écrire une annotation sur la ligne courante</translation>
    </message>
    <message>
        <source>Next Mar&amp;k</source>
        <translation>Marque s&amp;uivante</translation>
    </message>
    <message>
        <source>F2</source>
        <translation>F2</translation>
    </message>
    <message>
        <source>Go to the next marked line</source>
        <translation>Aller à la ligne marquée suivante</translation>
    </message>
    <message>
        <source>Previo&amp;us Mark</source>
        <translation>Reven&amp;ir à la marque précédente</translation>
    </message>
    <message>
        <source>Shift+F2</source>
        <translation>Shift+F2</translation>
    </message>
    <message>
        <source>Go to the previous marked line</source>
        <translation>Aller à la ligne marquée précédente</translation>
    </message>
    <message>
        <source>A&amp;ll Marks...</source>
        <translation>A&amp;fficher les marques...</translation>
    </message>
    <message>
        <source>Ctrl+F2</source>
        <translation>Ctrl+F2</translation>
    </message>
    <message>
        <source>List the marked lines and their notes</source>
        <translation>Lister les lignes marquées et leurs annotations</translation>
    </message>
    <message>
        <source>&amp;Automatic</source>
        <translation>&amp;Automatique</translation>
    </message>
    <message>
        <source>Find out how the file is encoded</source>
        <translation>Déterminer l’encodage du fichier</translation>
    </message>
    <message>
        <source>Read the file as %1</source>
        <translation>Lire le fichier comme %1</translation>
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
        <translation>Plus &amp;grand</translation>
    </message>
    <message>
        <source>Ctrl++</source>
        <translation>Ctrl++</translation>
    </message>
    <message>
        <source>Show logs in larger text</source>
        <translation>Afficher les journaux en plus grand</translation>
    </message>
    <message>
        <source>Ctrl+=</source>
        <translation>Ctrl+=</translation>
    </message>
    <message>
        <source>&amp;Smaller</source>
        <translation>Plus &amp;petit</translation>
    </message>
    <message>
        <source>Ctrl+-</source>
        <translation>Ctrl+-</translation>
    </message>
    <message>
        <source>Show logs in smaller text</source>
        <translation>Afficher les journaux en plus petit</translation>
    </message>
    <message>
        <source>&amp;Normal Size</source>
        <translation>Taille &amp;normale</translation>
    </message>
    <message>
        <source>Ctrl+0</source>
        <translation>Ctrl+0</translation>
    </message>
    <message>
        <source>Show logs in the text size of the desktop</source>
        <translation>Afficher les journaux dans la taille de texte du bureau</translation>
    </message>
    <message>
        <source>&amp;Monospaced Font</source>
        <translation>Police à &amp;chasse fixe</translation>
    </message>
    <message>
        <source>Ctrl+Alt+M</source>
        <translation>Ctrl+Alt+M</translation>
    </message>
    <message>
        <source>Show logs in a font whose characters are equally wide</source>
        <translation>Afficher les journaux dans une police à caractères de même largeur</translation>
    </message>
    <message>
        <source>Line &amp;Wrap</source>
        <translation>&amp;Retour à la ligne</translation>
    </message>
    <message>
        <source>Ctrl+Alt+W</source>
        <translation>Ctrl+Alt+W</translation>
    </message>
    <message>
        <source>Show long messages of logs in several lines</source>
        <translation>Afficher les longs messages des journaux sur plusieurs lignes</translation>
    </message>
    <message>
        <source>Line N&amp;umbers</source>
        <translation>N&amp;uméros de ligne</translation>
    </message>
    <message>
        <source>Ctrl+Alt+N</source>
        <translation>Ctrl+Alt+N</translation>
    </message>
    <message>
        <source>Show the numbers of the lines in the file beside logs</source>
        <translation>Afficher à côté des journaux les numéros des lignes du fichier</translation>
    </message>
    <message>
        <source>&amp;Activity</source>
        <translation>&amp;Activité</translation>
    </message>
    <message>
        <source>Ctrl+Alt+A</source>
        <translation>Ctrl+Alt+A</translation>
    </message>
    <message>
        <source>Show how many entries and problems there are by time, above logs</source>
        <translation>Afficher au-dessus des journaux le nombre d’entrées et de problèmes au fil du temps</translation>
    </message>
    <message>
        <source>&amp;Time Since</source>
        <translation>&amp;Temps écoulé</translation>
    </message>
    <message>
        <source>Ctrl+Alt+S</source>
        <translation>Ctrl+Alt+S</translation>
    </message>
    <message>
        <source>Show the time since the entry above or since a chosen one</source>
        <translation>Afficher le temps depuis l’entrée du dessus ou depuis une entrée choisie</translation>
    </message>
    <message>
        <source>&amp;Gaps</source>
        <translation>&amp;Interruptions</translation>
    </message>
    <message>
        <source>Show where no entry follows for %1</source>
        <translation>Montrer où aucune entrée ne suit pendant %1</translation>
    </message>
    <message>
        <source>&amp;None</source>
        <translation>&amp;Aucune</translation>
    </message>
    <message>
        <source>Do not show gaps between entries</source>
        <translation>Ne pas montrer les interruptions entre entrées</translation>
    </message>
    <message>
        <source>&amp;1 Second</source>
        <translation>&amp;1 seconde</translation>
    </message>
    <message>
        <source>10 &amp;Seconds</source>
        <translation>10 &amp;secondes</translation>
    </message>
    <message>
        <source>1 &amp;Minute</source>
        <translation>1 &amp;minute</translation>
    </message>
    <message>
        <source>10 M&amp;inutes</source>
        <translation>10 m&amp;inutes</translation>
    </message>
    <message>
        <source>1 &amp;Hour</source>
        <translation>1 &amp;heure</translation>
    </message>
    <message>
        <source>&amp;System Language</source>
        <translation>&amp;Langue du système</translation>
    </message>
    <message>
        <source>Use the language of the system from the next start on</source>
        <translation>Utiliser la langue du système dès le prochain démarrage</translation>
    </message>
    <message>
        <source>Use %1 from the next start on</source>
        <translation>Utiliser %1 dès le prochain démarrage</translation>
    </message>
    <message>
        <source>&amp;Manual</source>
        <translation>&amp;Manuel</translation>
    </message>
    <message>
        <source>F1</source>
        <translation>F1</translation>
    </message>
    <message>
        <source>Open the manual</source>
        <translation>Ouvrir le manuel</translation>
    </message>
    <message>
        <source>&amp;Keyboard Shortcuts</source>
        <translation>&amp;Raccourcis clavier</translation>
    </message>
    <message>
        <source>Ctrl+F1</source>
        <translation>Ctrl+F1</translation>
    </message>
    <message>
        <source>List all keyboard shortcuts</source>
        <translation>Lister tous les raccourcis clavier</translation>
    </message>
    <message>
        <source>&amp;About %1</source>
        <translation>À &amp;propos de %1</translation>
    </message>
    <message>
        <source>Shift+F1</source>
        <translation>Shift+F1</translation>
    </message>
    <message>
        <source>Show version, license, system and directories</source>
        <translation>Afficher version, licence, système et dossiers</translation>
    </message>
    <message>
        <source>&amp;Display Language</source>
        <translation>Lan&amp;gue d’affichage</translation>
    </message>
    <message>
        <source>&amp;Patterns...</source>
        <translation>&amp;Modèles...</translation>
    </message>
    <message>
        <source>Ctrl+Alt+P</source>
        <translation>Ctrl+Alt+P</translation>
    </message>
    <message>
        <source>List what messages have in common, and how often</source>
        <translation>Lister ce que les messages ont en commun, et combien de fois</translation>
    </message>
    <message>
        <source>&amp;Whole Family, by Time</source>
        <translation>&amp;Journaux de la famille, par date</translation>
    </message>
    <message>
        <source>Ctrl+Alt+F</source>
        <translation>Ctrl+Alt+F</translation>
    </message>
    <message>
        <source>Show the logs of all programs of the family as one</source>
        <translation>Afficher les journaux de tous les programmes de la famille en un seul</translation>
    </message>
    <message>
        <source>Fold &amp;Repeats</source>
        <translation>&amp;Replier les répétitions</translation>
    </message>
    <message>
        <source>Ctrl+Alt+R</source>
        <translation>Ctrl+Alt+R</translation>
    </message>
    <message>
        <source>Show entries that differ from the one above only in numbers and quoted names as one row</source>
        <translation>Montrer en une seule ligne les entrées qui ne diffèrent de la précédente que par des nombres et des noms entre guillemets</translation>
    </message>
</context>
<context>
    <name>Velocor::MainToolBar</name>
    <message>
        <source>Tools</source>
        <translation>Outils</translation>
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
        <translation>Menus</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <translation>&amp;Fichier</translation>
    </message>
    <message>
        <source>&amp;Edit</source>
        <translation>É&amp;dition</translation>
    </message>
    <message>
        <source>&amp;View</source>
        <translation>&amp;Affichage</translation>
    </message>
    <message>
        <source>&amp;Help</source>
        <translation>A&amp;ide</translation>
    </message>
    <message>
        <source>Places and files</source>
        <translation>Emplacements et fichiers</translation>
    </message>
    <message>
        <source>State of the log</source>
        <translation>État du journal</translation>
    </message>
    <message>
        <source>These are the settings of this window. It takes over what you save here: your changes take effect at the next start, and everything else is written when the window closes.</source>
        <translation>Ce sont les réglages de cette fenêtre. Elle reprend ce que vous enregistrez ici&#xa0;: vos modifications prennent effet au prochain démarrage, et tout le reste est écrit à la fermeture de la fenêtre.</translation>
    </message>
    <message>
        <source>These are the settings of this program&apos;s log. It reads them at the next start, and replaces them only when you change something in Log Settings.</source>
        <translation>Ce sont les réglages du journal de ce programme. Il les lit au prochain démarrage et ne les remplace que si vous changez quelque chose dans Réglages du journal.</translation>
    </message>
    <message>
        <source>Lines shown</source>
        <translation>Lignes affichées</translation>
    </message>
    <message>
        <source>Status</source>
        <translation>État</translation>
    </message>
    <message>
        <source>The language changes when the program starts again.</source>
        <translation>La langue changera au prochain démarrage du programme.</translation>
    </message>
    <message>
        <source>How the last run ended</source>
        <translation>Fin de la dernière exécution</translation>
    </message>
    <message>
        <source>Show</source>
        <translation>Afficher</translation>
    </message>
    <message>
        <source>Show the last entries of that run</source>
        <translation>Afficher les dernières entrées de cette exécution</translation>
    </message>
    <message>
        <source>Report...</source>
        <translation>Rapport...</translation>
    </message>
    <message>
        <source>Report how the last run ended</source>
        <translation>Rapporter la fin de la dernière exécution</translation>
    </message>
    <message>
        <source>The program that was started at %1 did not end normally.</source>
        <translation>Le programme démarré à %1 ne s’est pas terminé normalement.</translation>
    </message>
    <message>
        <source>It ended within ten seconds at least three times in a row. If that is because of its settings, set them aside: %1</source>
        <translation>Il s’est terminé en moins de dix secondes au moins trois fois de suite. Si ses réglages en sont la cause, mettez-les de côté&#xa0;: %1</translation>
    </message>
    <message>
        <source>Set Aside</source>
        <translation>Mettre de côté</translation>
    </message>
    <message>
        <source>Set the settings of this window aside</source>
        <translation>Mettre de côté les réglages de cette fenêtre</translation>
    </message>
    <message>
        <source>The next start uses default settings. These are now in %1</source>
        <translation>Le prochain démarrage utilisera les réglages par défaut. Ceux-ci sont maintenant dans %1</translation>
    </message>
</context>
<context>
    <name>Velocor::MarkControl</name>
    <message>
        <source>Select a line first</source>
        <translation>Sélectionnez d’abord une ligne</translation>
    </message>
    <message>
        <source>No marks in the lines shown</source>
        <translation>Aucune marque dans les lignes affichées</translation>
    </message>
    <message>
        <source>Continued from the top</source>
        <translation>Reprise depuis le début</translation>
    </message>
    <message>
        <source>Continued from the bottom</source>
        <translation>Reprise depuis la fin</translation>
    </message>
</context>
<context>
    <name>Velocor::MarkListDialog</name>
    <message>
        <source>Marks</source>
        <translation>Marques</translation>
    </message>
    <message>
        <source>Marked lines</source>
        <translation>Lignes marquées</translation>
    </message>
    <message>
        <source>Line</source>
        <translation>Ligne</translation>
    </message>
    <message>
        <source>Time</source>
        <translation>Heure</translation>
    </message>
    <message>
        <source>Note</source>
        <translation>Annotation</translation>
    </message>
    <message>
        <source>Text</source>
        <translation>Texte</translation>
    </message>
    <message>
        <source>&amp;Go There</source>
        <translation>&amp;Y aller</translation>
    </message>
</context>
<context>
    <name>Velocor::NoteDialog</name>
    <message>
        <source>Note</source>
        <translation>Annotation</translation>
    </message>
    <message>
        <source>&amp;Note on the current line:</source>
        <translation>&amp;Annotation de la ligne courante&#xa0;:</translation>
    </message>
</context>
<context>
    <name>Velocor::NoticeBar</name>
    <message>
        <source>%1 icon</source>
        <translation>Icône&#xa0;: %1</translation>
    </message>
    <message>
        <source>Dismiss</source>
        <translation>Masquer</translation>
    </message>
    <message>
        <source>Dismiss %1</source>
        <translation>Masquer %1</translation>
    </message>
    <message>
        <source>Notice</source>
        <translation>Avis</translation>
    </message>
</context>
<context>
    <name>Velocor::PatternDialog</name>
    <message>
        <source>Message Patterns</source>
        <translation>Modèles de messages</translation>
    </message>
    <message>
        <source>What has been counted</source>
        <translation>Ce qui a été compté</translation>
    </message>
    <message>
        <source>Message patterns</source>
        <translation>Modèles de messages</translation>
    </message>
    <message>
        <source>Go to &amp;First</source>
        <translation>Aller au &amp;premier</translation>
    </message>
    <message>
        <source>Go to &amp;Last</source>
        <translation>Aller au &amp;dernier</translation>
    </message>
    <message>
        <source>F&amp;ilter</source>
        <translation>F&amp;iltrer</translation>
    </message>
    <message>
        <source>&amp;Stop Counting</source>
        <translation>&amp;Arrêter le comptage</translation>
    </message>
    <message>
        <source>Counting…</source>
        <translation>Comptage…</translation>
    </message>
    <message>
        <source>%L1 patterns in %L2 entries</source>
        <translation>%L1 modèles dans %L2 entrées</translation>
    </message>
    <message>
        <source>%1; stopped at %2%</source>
        <translation>%1&#x202f;; arrêté à %2&#xa0;%</translation>
    </message>
    <message>
        <source>%1; counting, %2%</source>
        <translation>%1&#x202f;; comptage, %2&#xa0;%</translation>
    </message>
</context>
<context>
    <name>Velocor::PatternModel</name>
    <message>
        <source>… (other messages)</source>
        <translation>… (autres messages)</translation>
    </message>
    <message>
        <source>Count</source>
        <translation>Nombre</translation>
    </message>
    <message>
        <source>Severity</source>
        <translation>Gravité</translation>
    </message>
    <message>
        <source>First</source>
        <translation>Premier</translation>
    </message>
    <message>
        <source>Last</source>
        <translation>Dernier</translation>
    </message>
    <message>
        <source>Pattern</source>
        <translation>Modèle</translation>
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
        <translation>Produit</translation>
    </message>
    <message>
        <source>Installation</source>
        <translation>Installation</translation>
    </message>
    <message>
        <source>Data</source>
        <translation>Données</translation>
    </message>
    <message>
        <source>Documents</source>
        <translation>Documents</translation>
    </message>
    <message>
        <source>Log file</source>
        <translation>Fichier journal</translation>
    </message>
    <message>
        <source>Settings file</source>
        <translation>Fichier de réglages</translation>
    </message>
    <message>
        <source>Identity and places</source>
        <translation>Identité et emplacements</translation>
    </message>
    <message>
        <source>Open</source>
        <translation>Ouvrir</translation>
    </message>
    <message>
        <source>Open: %1</source>
        <translation>Ouvrir&#xa0;: %1</translation>
    </message>
    <message>
        <source>Show in the file manager</source>
        <translation>Afficher dans le gestionnaire de fichiers</translation>
    </message>
    <message>
        <source>Copy</source>
        <translation>Copier</translation>
    </message>
    <message>
        <source>Copy: %1</source>
        <translation>Copier&#xa0;: %1</translation>
    </message>
    <message>
        <source>Copy to the clipboard</source>
        <translation>Copier dans le presse-papiers</translation>
    </message>
    <message>
        <source>Cannot open %1: it does not exist, or there is no file manager</source>
        <translation>Impossible d’ouvrir %1&#xa0;: il n’existe pas, ou il n’y a pas de gestionnaire de fichiers</translation>
    </message>
    <message>
        <source>Copied: %1</source>
        <translation>Copié&#xa0;: %1</translation>
    </message>
</context>
<context>
    <name>Velocor::ProblemReportDialog</name>
    <message>
        <source>Save Report</source>
        <translation>Enregistrer le rapport</translation>
    </message>
    <message>
        <source>&amp;Copy File</source>
        <translation>&amp;Copier le fichier</translation>
    </message>
    <message>
        <source>&amp;Save...</source>
        <translation>&amp;Enregistrer...</translation>
    </message>
    <message>
        <source>This is what will be saved. Placeholders, which are marked, replace what may give somebody away. Not everything can be recognized: look at it before you share it.</source>
        <translation>Voici ce qui sera enregistré. Des marques substitutives, mises en évidence, remplacent ce qui peut trahir quelqu’un. Tout ne peut pas être reconnu&#xa0;: relisez-le avant de le partager.</translation>
    </message>
    <message>
        <source>&amp;Also replace (separated by commas):</source>
        <translation>Remplacer &amp;aussi (séparés par des virgules)&#xa0;:</translation>
    </message>
    <message>
        <source>Also replace</source>
        <translation>Remplacer aussi</translation>
    </message>
    <message>
        <source>&amp;Replaced; untick to keep:</source>
        <translation>&amp;Remplacé&#x202f;; décocher pour garder&#xa0;:</translation>
    </message>
    <message>
        <source>Replaced by placeholders</source>
        <translation>Remplacé par des marques substitutives</translation>
    </message>
    <message>
        <source>&amp;File:</source>
        <translation>Fic&amp;hier&#xa0;:</translation>
    </message>
    <message>
        <source>File of the report</source>
        <translation>Fichier du rapport</translation>
    </message>
    <message>
        <source>Report</source>
        <translation>Rapport</translation>
    </message>
    <message>
        <source>velocor-report.zip</source>
        <translation>velocor-rapport.zip</translation>
    </message>
    <message>
        <source>Archives (*.zip);;New folder (*)</source>
        <translation>Archives (*.zip);;Nouveau dossier (*)</translation>
    </message>
    <message>
        <source>Could not save %1.
%2</source>
        <translation>%1 n’a pas pu être enregistré.
%2</translation>
    </message>
</context>
<context>
    <name>Velocor::ProgramsButton</name>
    <message>
        <source>Which programs&apos; lines are shown</source>
        <translation>De quels programmes les lignes sont affichées</translation>
    </message>
    <message>
        <source>&amp;Show All</source>
        <translation>&amp;Tout afficher</translation>
    </message>
    <message>
        <source>&amp;Add Logs...</source>
        <translation>&amp;Ajouter des journaux...</translation>
    </message>
    <message>
        <source>&amp;Programs: %1 of %2</source>
        <translation>&amp;Programmes : %1 sur %2</translation>
    </message>
</context>
<context>
    <name>Velocor::ReachableStyle</name>
    <message>
        <source>Clear</source>
        <translation>Effacer</translation>
    </message>
    <message>
        <source>More tools</source>
        <translation>Autres outils</translation>
    </message>
</context>
<context>
    <name>Velocor::RecentFiles</name>
    <message>
        <source>&amp;Clear</source>
        <translation>&amp;Effacer</translation>
    </message>
    <message>
        <source>Clear the list of recent files</source>
        <translation>Effacer la liste des fichiers récents</translation>
    </message>
</context>
<context>
    <name>Velocor::ReportDialog</name>
    <message>
        <source>Program icon</source>
        <translation>Icône du programme</translation>
    </message>
    <message>
        <source>&amp;Copy</source>
        <translation>&amp;Copier</translation>
    </message>
</context>
<context>
    <name>Velocor::SavedStatesDialog</name>
    <message>
        <source>Damaged: %1</source>
        <translation>Endommagé&#xa0;: %1</translation>
    </message>
    <message>
        <source>Mended</source>
        <translation>Réparé</translation>
    </message>
    <message>
        <source>Only text that is no value</source>
        <translation>Seulement du texte qui n’est pas une valeur</translation>
    </message>
    <message>
        <source> and %1 more</source>
        <translation> et %1 de plus</translation>
    </message>
    <message>
        <source>&amp;Compare...</source>
        <translation>&amp;Comparer...</translation>
    </message>
    <message>
        <source>Show what differs from the editor</source>
        <translation>Afficher ce qui diffère de l’éditeur</translation>
    </message>
    <message>
        <source>&amp;Bring Back</source>
        <translation>&amp;Rétablir</translation>
    </message>
    <message>
        <source>Show this state in the editor; can be undone</source>
        <translation>Afficher cet état dans l’éditeur&#x202f;; peut être annulé</translation>
    </message>
    <message>
        <source>&amp;Remove All...</source>
        <translation>Tout &amp;supprimer...</translation>
    </message>
    <message>
        <source>Remove all saved states of this file</source>
        <translation>Supprimer tous les états enregistrés de ce fichier</translation>
    </message>
    <message>
        <source>Saved States of %1</source>
        <translation>États enregistrés de %1</translation>
    </message>
    <message>
        <source>Summary</source>
        <translation>Résumé</translation>
    </message>
    <message>
        <source>Saved states</source>
        <translation>États enregistrés</translation>
    </message>
    <message>
        <source>Columns of the saved states</source>
        <translation>Colonnes des états enregistrés</translation>
    </message>
    <message>
        <source>Time</source>
        <translation>Heure</translation>
    </message>
    <message>
        <source>Size</source>
        <translation>Taille</translation>
    </message>
    <message>
        <source>What changed</source>
        <translation>Ce qui a changé</translation>
    </message>
    <message>
        <source>C&amp;lose</source>
        <translation>&amp;Fermer</translation>
    </message>
    <message>
        <source>No state is kept yet: the last %1 are kept when the file is saved here.</source>
        <translation>Aucun état n’est encore gardé&#xa0;: les %1 derniers le sont quand le fichier est enregistré ici.</translation>
    </message>
    <message>
        <source>The last %1 states of the file, newest first.</source>
        <translation>Les %1 derniers états du fichier, le plus récent d’abord.</translation>
    </message>
    <message>
        <source>Oldest one kept</source>
        <translation>Le plus ancien gardé</translation>
    </message>
    <message>
        <source>Remove all saved states of %1?</source>
        <translation>Supprimer tous les états enregistrés de %1&#x202f;?</translation>
    </message>
    <message>
        <source>The file itself and its .bak stay as they are.</source>
        <translation>Le fichier lui-même et son .bak restent tels quels.</translation>
    </message>
    <message>
        <source>Remove All</source>
        <translation>Tout supprimer</translation>
    </message>
    <message>
        <source>Not all could be removed.</source>
        <translation>Tous n’ont pas pu être supprimés.</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsCommands</name>
    <message>
        <source>Add Section</source>
        <translation>Ajouter une section</translation>
    </message>
    <message>
        <source>Add Key</source>
        <translation>Ajouter une clé</translation>
    </message>
    <message>
        <source>Duplicate Section</source>
        <translation>Dupliquer la section</translation>
    </message>
    <message>
        <source>Duplicate Key</source>
        <translation>Dupliquer la clé</translation>
    </message>
    <message>
        <source>Remove %1 Items</source>
        <translation>Supprimer %1 éléments</translation>
    </message>
    <message>
        <source>Remove Section</source>
        <translation>Supprimer la section</translation>
    </message>
    <message>
        <source>Remove Key</source>
        <translation>Supprimer la clé</translation>
    </message>
    <message>
        <source>and %1 more</source>
        <translation>et %1 de plus</translation>
    </message>
    <message numerus="yes">
        <source>Removed %Ln key(s): </source>
        <translation>
            <numerusform>%Ln clé supprimée&#xa0;: </numerusform>
            <numerusform>%Ln clés supprimées&#xa0;: </numerusform>
        </translation>
    </message>
    <message>
        <source>section </source>
        <translation>section </translation>
    </message>
    <message numerus="yes">
        <source>%Ln section(s)</source>
        <translation>
            <numerusform>%Ln section</numerusform>
            <numerusform>%Ln sections</numerusform>
        </translation>
    </message>
    <message>
        <source>Removed </source>
        <translation>Supprimé&#xa0;: </translation>
    </message>
    <message numerus="yes">
        <source>, with %Ln key(s): </source>
        <translation>
            <numerusform>, avec %Ln clé&#xa0;: </numerusform>
            <numerusform>, avec %Ln clés&#xa0;: </numerusform>
        </translation>
    </message>
    <message>
        <source>Back to Default</source>
        <translation>Valeur par défaut</translation>
    </message>
    <message>
        <source>Move Section</source>
        <translation>Déplacer la section</translation>
    </message>
    <message>
        <source>Move Key</source>
        <translation>Déplacer la clé</translation>
    </message>
    <message>
        <source>&quot;%1&quot; is not a valid section or key name</source>
        <translation>«&#xa0;%1&#xa0;» n’est pas un nom valide de section ou de clé</translation>
    </message>
    <message>
        <source>Use letters, digits, &quot;_&quot;, &quot;-&quot; and &quot;.&quot;; start with a letter or &quot;_&quot;</source>
        <translation>Utilisez lettres, chiffres, «&#xa0;_&#xa0;», «&#xa0;-&#xa0;» et «&#xa0;.&#xa0;»&#x202f;; commencez par une lettre ou «&#xa0;_&#xa0;»</translation>
    </message>
    <message>
        <source>&quot;%1&quot; is the name of the root element</source>
        <translation>«&#xa0;%1&#xa0;» est le nom de l’élément racine</translation>
    </message>
    <message>
        <source>There is already a &quot;%1&quot; here</source>
        <translation>Il y a déjà un «&#xa0;%1&#xa0;» ici</translation>
    </message>
    <message>
        <source>Change Value</source>
        <translation>Modifier la valeur</translation>
    </message>
    <message>
        <source>, so &quot;%1&quot; is kept. </source>
        <translation>, donc «&#xa0;%1&#xa0;» est gardé. </translation>
    </message>
    <message>
        <source>Rename Section</source>
        <translation>Renommer la section</translation>
    </message>
    <message>
        <source>Rename Key</source>
        <translation>Renommer la clé</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsDelegate</name>
    <message>
        <source>Not a number from %1 to %2</source>
        <translation>Pas un nombre de %1 à %2</translation>
    </message>
    <message>
        <source>Value</source>
        <translation>Valeur</translation>
    </message>
    <message>
        <source>Name</source>
        <translation>Nom</translation>
    </message>
    <message>
        <source>; the value becomes a text</source>
        <translation>&#x202f;; la valeur devient un texte</translation>
    </message>
    <message>
        <source>, so &quot;%1&quot; is kept.</source>
        <translation>, donc «&#xa0;%1&#xa0;» est gardé.</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsEditor</name>
    <message>
        <source>Removal</source>
        <translation>Suppression</translation>
    </message>
    <message>
        <source>Undo</source>
        <translation>Annuler</translation>
    </message>
    <message>
        <source>Bring back what was removed (Ctrl+Z)</source>
        <translation>Rétablir ce qui a été supprimé (Ctrl+Z)</translation>
    </message>
    <message>
        <source>Add &amp;Section</source>
        <translation>Ajouter une &amp;section</translation>
    </message>
    <message>
        <source>Add an empty section (Alt+Ins)</source>
        <translation>Ajouter une section vide (Alt+Inser)</translation>
    </message>
    <message>
        <source>Add &amp;Key</source>
        <translation>Ajouter une &amp;clé</translation>
    </message>
    <message>
        <source>Add a key to the selected section (Ins)</source>
        <translation>Ajouter une clé à la section sélectionnée (Inser)</translation>
    </message>
    <message>
        <source>&amp;Remove</source>
        <translation>Supp&amp;rimer</translation>
    </message>
    <message>
        <source>Remove the selected sections and keys (Del)</source>
        <translation>Supprimer les sections et clés sélectionnées (Suppr)</translation>
    </message>
    <message>
        <source>Sa&amp;ve</source>
        <translation>E&amp;nregistrer</translation>
    </message>
    <message>
        <source>Save the file (Ctrl+S)</source>
        <translation>Enregistrer le fichier (Ctrl+S)</translation>
    </message>
    <message>
        <source>Reload</source>
        <translation>Recharger</translation>
    </message>
    <message>
        <source>In the file</source>
        <translation>Dans le fichier</translation>
    </message>
    <message>
        <source>Compare With</source>
        <translation>Comparer avec</translation>
    </message>
    <message>
        <source>Settings (*.cfg *.xml *.bak);;All files (*)</source>
        <translation>Réglages (*.cfg *.xml *.bak);;Tous les fichiers (*)</translation>
    </message>
    <message>
        <source>Save Settings As</source>
        <translation>Enregistrer les réglages sous</translation>
    </message>
    <message>
        <source>Settings (*.cfg *.xml);;All files (*)</source>
        <translation>Réglages (*.cfg *.xml);;Tous les fichiers (*)</translation>
    </message>
    <message>
        <source>Saved %1</source>
        <translation>%1 enregistré</translation>
    </message>
    <message>
        <source>, but its state is not kept: %1</source>
        <translation>, mais son état n’est pas gardé&#xa0;: %1</translation>
    </message>
    <message numerus="yes">
        <source>Saving would lose %Ln item(s) in this file.</source>
        <translation>
            <numerusform>L’enregistrement ferait perdre %Ln élément de ce fichier.</numerusform>
            <numerusform>L’enregistrement ferait perdre %Ln éléments de ce fichier.</numerusform>
        </translation>
    </message>
    <message>
        <source>Cannot show %1 as a tree: %2</source>
        <translation>Impossible d’afficher %1 en arbre&#xa0;: %2</translation>
    </message>
    <message>
        <source> (line %1, column %2)</source>
        <translation> (ligne %1, colonne %2)</translation>
    </message>
    <message>
        <source>This file cannot be edited as text: save the changes first</source>
        <translation>Ce fichier ne peut pas être modifié comme texte&#xa0;: enregistrez d’abord les modifications</translation>
    </message>
    <message>
        <source>Edit as Text</source>
        <translation>Modifier comme texte</translation>
    </message>
    <message>
        <source>%1 / %2</source>
        <translation>%1 / %2</translation>
    </message>
    <message>
        <source>The state of %1 is gone</source>
        <translation>L’état du %1 n’existe plus</translation>
    </message>
    <message>
        <source>Bring Back</source>
        <translation>Rétablir</translation>
    </message>
    <message>
        <source>Brought back the state of %1; save to keep it</source>
        <translation>L’état du %1 est rétabli&#x202f;; enregistrez pour le garder</translation>
    </message>
    <message>
        <source>Save changes to %1?</source>
        <translation>Enregistrer les modifications de %1&#x202f;?</translation>
    </message>
    <message>
        <source>This file is too large to be shown as settings</source>
        <translation>Ce fichier est trop volumineux pour être affiché comme réglages</translation>
    </message>
    <message>
        <source>Edit Text</source>
        <translation>Modifier le texte</translation>
    </message>
    <message>
        <source>%1 cannot be read</source>
        <translation>%1 ne peut pas être lu</translation>
    </message>
    <message>
        <source>The file is shown as text, where Undo brings your changes back.</source>
        <translation>Le fichier est affiché comme texte&#x202f;; «&#xa0;Annuler&#xa0;» y rétablit vos modifications.</translation>
    </message>
    <message>
        <source>Discard your changes to %1?</source>
        <translation>Abandonner vos modifications de %1&#x202f;?</translation>
    </message>
    <message>
        <source>They cannot be brought back after reloading this file.</source>
        <translation>Elles ne pourront pas être rétablies après le rechargement de ce fichier.</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsFindBar</name>
    <message>
        <source>&amp;Only Matches</source>
        <translation>&amp;Seulement les résultats</translation>
    </message>
    <message>
        <source>Show only the sections and keys that match (Alt+O)</source>
        <translation>N’afficher que les sections et clés trouvées (Alt+S)</translation>
    </message>
    <message>
        <source>&amp;Changed</source>
        <translation>&amp;Modifiés</translation>
    </message>
    <message>
        <source>Show only values that are not yet saved like that (Alt+C)</source>
        <translation>N’afficher que les valeurs pas encore enregistrées ainsi (Alt+M)</translation>
    </message>
    <message>
        <source>Not &amp;Default</source>
        <translation>Pas par défa&amp;ut</translation>
    </message>
    <message>
        <source>Show only values that differ from their default (Alt+D)</source>
        <translation>N’afficher que les valeurs autres que par défaut (Alt+U)</translation>
    </message>
    <message>
        <source>Find in names and values</source>
        <translation>Rechercher dans les noms et valeurs</translation>
    </message>
    <message>
        <source>Result of the search</source>
        <translation>Résultat de la recherche</translation>
    </message>
    <message>
        <source>Find previous</source>
        <translation>Rechercher le précédent</translation>
    </message>
    <message>
        <source>Go to the previous match (Shift+F3)</source>
        <translation>Aller au résultat précédent (Maj+F3)</translation>
    </message>
    <message>
        <source>Find next</source>
        <translation>Rechercher le suivant</translation>
    </message>
    <message>
        <source>Go to the next match (F3)</source>
        <translation>Aller au résultat suivant (F3)</translation>
    </message>
    <message>
        <source>Close the find bar</source>
        <translation>Fermer la barre de recherche</translation>
    </message>
    <message>
        <source>Close (Esc)</source>
        <translation>Fermer (Échap)</translation>
    </message>
    <message>
        <source>No match</source>
        <translation>Aucun résultat</translation>
    </message>
    <message numerus="yes">
        <source>%Ln key(s)</source>
        <translation>
            <numerusform>%Ln clé</numerusform>
            <numerusform>%Ln clés</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>%Ln match(es)</source>
        <translation>
            <numerusform>%Ln résultat</numerusform>
            <numerusform>%Ln résultats</numerusform>
        </translation>
    </message>
    <message>
        <source>%L1 of %L2</source>
        <translation>%L1 sur %L2</translation>
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
        <translation>Par défaut&#xa0;: %1</translation>
    </message>
    <message>
        <source>Section / key</source>
        <translation>Section / clé</translation>
    </message>
    <message>
        <source>Value</source>
        <translation>Valeur</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsTextPage</name>
    <message>
        <source>%1 with %2</source>
        <translation>%1 avec %2</translation>
    </message>
    <message>
        <source>1 section</source>
        <translation>1 section</translation>
    </message>
    <message>
        <source>%1 sections</source>
        <translation>%1 sections</translation>
    </message>
    <message>
        <source>1 key</source>
        <translation>1 clé</translation>
    </message>
    <message>
        <source>%1 keys</source>
        <translation>%1 clés</translation>
    </message>
    <message>
        <source>Sa&amp;ve</source>
        <translation>E&amp;nregistrer</translation>
    </message>
    <message>
        <source>File text</source>
        <translation>Texte du fichier</translation>
    </message>
    <message>
        <source>State of the text</source>
        <translation>État du texte</translation>
    </message>
    <message>
        <source>Save the file (Ctrl+S)</source>
        <translation>Enregistrer le fichier (Ctrl+S)</translation>
    </message>
    <message>
        <source>Go to &amp;Error</source>
        <translation>Aller à l’e&amp;rreur</translation>
    </message>
    <message>
        <source>Go to where the text cannot be read</source>
        <translation>Aller là où le texte ne peut pas être lu</translation>
    </message>
    <message>
        <source>Show as Se&amp;ttings</source>
        <translation>Afficher comme ré&amp;glages</translation>
    </message>
    <message>
        <source>Show what can be read of the text as sections, keys and values</source>
        <translation>Afficher ce qui peut être lu du texte comme sections, clés et valeurs</translation>
    </message>
    <message>
        <source>Sa&amp;ved States...</source>
        <translation>États enregi&amp;strés...</translation>
    </message>
    <message>
        <source>Bring back an earlier state of the file</source>
        <translation>Rétablir un état antérieur du fichier</translation>
    </message>
    <message>
        <source>the file is in Latin-1, which lacks this character</source>
        <translation>le fichier est en Latin-1, qui n’a pas ce caractère</translation>
    </message>
    <message>
        <source>This text can be read: %1.</source>
        <translation>Ce texte peut être lu&#xa0;: %1.</translation>
    </message>
    <message>
        <source>Line %1, column %2: %3. Programs get what is before it: %4.</source>
        <translation>Ligne %1, colonne %2&#xa0;: %3. Les programmes reçoivent ce qui précède&#xa0;: %4.</translation>
    </message>
    <message>
        <source> Only the start of the file is shown, and it cannot be edited as text.</source>
        <translation> Seul le début du fichier est affiché, et il ne peut pas être modifié comme texte.</translation>
    </message>
    <message>
        <source> This file cannot be edited as text.</source>
        <translation> Ce fichier ne peut pas être modifié comme texte.</translation>
    </message>
    <message>
        <source>&amp;Find</source>
        <translation>Rec&amp;hercher</translation>
    </message>
    <message>
        <source>Find a text in the file</source>
        <translation>Rechercher un texte dans le fichier</translation>
    </message>
    <message>
        <source>Find Ne&amp;xt</source>
        <translation>Rechercher le s&amp;uivant</translation>
    </message>
    <message>
        <source>Go to the next match in the text</source>
        <translation>Aller au résultat suivant dans le texte</translation>
    </message>
    <message>
        <source>Find &amp;Previous</source>
        <translation>Rechercher le &amp;précédent</translation>
    </message>
    <message>
        <source>Go to the previous match in the text</source>
        <translation>Aller au résultat précédent dans le texte</translation>
    </message>
    <message>
        <source>&amp;Go to Line...</source>
        <translation>A&amp;ller à la ligne...</translation>
    </message>
    <message>
        <source>Go to a line of the text by its number</source>
        <translation>Aller à une ligne du texte par son numéro</translation>
    </message>
    <message>
        <source>This file is too large to be shown as settings.</source>
        <translation>Ce fichier est trop volumineux pour être affiché comme réglages.</translation>
    </message>
</context>
<context>
    <name>Velocor::SettingsTree</name>
    <message>
        <source>Settings</source>
        <translation>Réglages</translation>
    </message>
    <message>
        <source>Settings columns</source>
        <translation>Colonnes des réglages</translation>
    </message>
    <message>
        <source>&amp;Edit Value</source>
        <translation>&amp;Modifier la valeur</translation>
    </message>
    <message>
        <source>Edit the value</source>
        <translation>Modifier la valeur</translation>
    </message>
    <message>
        <source>Edit in &amp;Large Field</source>
        <translation>Modifier dans un &amp;grand champ</translation>
    </message>
    <message>
        <source>Edit the value as a text of several lines</source>
        <translation>Modifier la valeur comme texte de plusieurs lignes</translation>
    </message>
    <message>
        <source>&amp;Toggle</source>
        <translation>&amp;Inverser</translation>
    </message>
    <message>
        <source>Change yes to no, and no to yes</source>
        <translation>Changer oui en non, et non en oui</translation>
    </message>
    <message>
        <source>C&amp;hoose Kind</source>
        <translation>Choisir le t&amp;ype</translation>
    </message>
    <message>
        <source>Choose what kind of value this is</source>
        <translation>Choisir le type de cette valeur</translation>
    </message>
    <message>
        <source>Re&amp;name</source>
        <translation>Re&amp;nommer</translation>
    </message>
    <message>
        <source>Edit the name of the section or key</source>
        <translation>Modifier le nom de la section ou de la clé</translation>
    </message>
    <message>
        <source>Add &amp;Key</source>
        <translation>Ajouter une &amp;clé</translation>
    </message>
    <message>
        <source>Add a key to the section</source>
        <translation>Ajouter une clé à la section</translation>
    </message>
    <message>
        <source>Add &amp;Section</source>
        <translation>Ajouter une &amp;section</translation>
    </message>
    <message>
        <source>Add an empty section</source>
        <translation>Ajouter une section vide</translation>
    </message>
    <message>
        <source>Dupl&amp;icate</source>
        <translation>&amp;Dupliquer</translation>
    </message>
    <message>
        <source>Add a copy of the section or key</source>
        <translation>Ajouter une copie de la section ou de la clé</translation>
    </message>
    <message>
        <source>Re&amp;move</source>
        <translation>Supp&amp;rimer</translation>
    </message>
    <message>
        <source>Remove the selected sections and keys</source>
        <translation>Supprimer les sections et clés sélectionnées</translation>
    </message>
    <message>
        <source>Move &amp;Up</source>
        <translation>Vers le &amp;haut</translation>
    </message>
    <message>
        <source>Move the section or key up</source>
        <translation>Déplacer la section ou la clé vers le haut</translation>
    </message>
    <message>
        <source>Move &amp;Down</source>
        <translation>Vers le &amp;bas</translation>
    </message>
    <message>
        <source>Move the section or key down</source>
        <translation>Déplacer la section ou la clé vers le bas</translation>
    </message>
    <message>
        <source>&amp;Back to Default</source>
        <translation>&amp;Valeur par défaut</translation>
    </message>
    <message>
        <source>Give the selected keys their default values</source>
        <translation>Donner aux clés sélectionnées leurs valeurs par défaut</translation>
    </message>
    <message>
        <source>All Back t&amp;o Default</source>
        <translation>&amp;Tout par défaut</translation>
    </message>
    <message>
        <source>Give all keys of the file their default values</source>
        <translation>Donner à toutes les clés du fichier leurs valeurs par défaut</translation>
    </message>
    <message>
        <source>&amp;Find</source>
        <translation>Rech&amp;ercher</translation>
    </message>
    <message>
        <source>Find a text in names and values</source>
        <translation>Rechercher un texte dans les noms et valeurs</translation>
    </message>
    <message>
        <source>Find Ne&amp;xt</source>
        <translation>Rechercher le s&amp;uivant</translation>
    </message>
    <message>
        <source>Go to the next match</source>
        <translation>Aller au résultat suivant</translation>
    </message>
    <message>
        <source>Find &amp;Previous</source>
        <translation>Rechercher le &amp;précédent</translation>
    </message>
    <message>
        <source>Go to the previous match</source>
        <translation>Aller au résultat précédent</translation>
    </message>
    <message>
        <source>Edit &amp;as Text</source>
        <translation>Modifier comme te&amp;xte</translation>
    </message>
    <message>
        <source>Edit the file as text</source>
        <translation>Modifier le fichier comme texte</translation>
    </message>
    <message>
        <source>Sa&amp;ved States...</source>
        <translation>Ét&amp;ats enregistrés...</translation>
    </message>
    <message>
        <source>Compare with earlier states of the file, and bring one back</source>
        <translation>Comparer avec des états antérieurs du fichier et en rétablir un</translation>
    </message>
    <message>
        <source>Kind of value</source>
        <translation>Type de valeur</translation>
    </message>
    <message>
        <source>&amp;Guess: %1</source>
        <translation>&amp;Supposé&#xa0;: %1</translation>
    </message>
</context>
<context>
    <name>Velocor::SeveritySwitches</name>
    <message>
        <source>Other</source>
        <translation>Autres</translation>
    </message>
    <message>
        <source>Show %1</source>
        <translation>Afficher %1</translation>
    </message>
    <message>
        <source>lines without a severity</source>
        <translation>lignes sans gravité</translation>
    </message>
    <message>
        <source>%1 entries</source>
        <translation>entrées %1</translation>
    </message>
    <message>
        <source>%1 in this file</source>
        <translation>%1 dans ce fichier</translation>
    </message>
    <message>
        <source>Show or hide %1 (Ctrl+%2): %3</source>
        <translation>Afficher ou masquer %1 (Ctrl+%2)&#xa0;: %3</translation>
    </message>
</context>
<context>
    <name>Velocor::SizeDialog</name>
    <message>
        <source>Width</source>
        <translation>Largeur</translation>
    </message>
    <message>
        <source>Height</source>
        <translation>Hauteur</translation>
    </message>
    <message>
        <source>Edit Size</source>
        <translation>Modifier la taille</translation>
    </message>
    <message>
        <source>&amp;Width</source>
        <translation>&amp;Largeur</translation>
    </message>
    <message>
        <source>&amp;Height</source>
        <translation>&amp;Hauteur</translation>
    </message>
</context>
<context>
    <name>Velocor::StandardInput</name>
    <message>
        <source>Standard input</source>
        <translation>Entrée standard</translation>
    </message>
    <message>
        <source>Pipe %1</source>
        <translation>Tube %1</translation>
    </message>
    <message>
        <source>Standard input cannot be read: %1</source>
        <translation>L’entrée standard ne peut pas être lue&#xa0;: %1</translation>
    </message>
    <message>
        <source>Standard input is cut off, because %1 cannot be written: %2</source>
        <translation>L’entrée standard est coupée, car %1 ne peut pas être écrit&#xa0;: %2</translation>
    </message>
</context>
<context>
    <name>Velocor::TextFindBar</name>
    <message>
        <source>Find in the text</source>
        <translation>Rechercher dans le texte</translation>
    </message>
    <message>
        <source>Result of the search in the text</source>
        <translation>Résultat de la recherche dans le texte</translation>
    </message>
    <message>
        <source>Find previous in the text</source>
        <translation>Rechercher le précédent dans le texte</translation>
    </message>
    <message>
        <source>Go to the previous match (Shift+F3)</source>
        <translation>Aller au résultat précédent (Maj+F3)</translation>
    </message>
    <message>
        <source>Find next in the text</source>
        <translation>Rechercher le suivant dans le texte</translation>
    </message>
    <message>
        <source>Go to the next match (F3)</source>
        <translation>Aller au résultat suivant (F3)</translation>
    </message>
    <message>
        <source>Close the find bar of the text</source>
        <translation>Fermer la barre de recherche du texte</translation>
    </message>
    <message>
        <source>Close (Esc)</source>
        <translation>Fermer (Échap)</translation>
    </message>
    <message>
        <source>No match</source>
        <translation>Aucun résultat</translation>
    </message>
    <message numerus="yes">
        <source>%Ln match(es)</source>
        <translation>
            <numerusform>%Ln résultat</numerusform>
            <numerusform>%Ln résultats</numerusform>
        </translation>
    </message>
    <message>
        <source>%L1 of %L2</source>
        <translation>%L1 sur %L2</translation>
    </message>
    <message>
        <source>%L1 of %L2, continued from the bottom</source>
        <translation>%L1 sur %L2, repris depuis la fin</translation>
    </message>
    <message>
        <source>%L1 of %L2, continued from the top</source>
        <translation>%L1 sur %L2, repris depuis le début</translation>
    </message>
</context>
<context>
    <name>Velocor::TextFont</name>
    <message>
        <source>Text size: %1%</source>
        <translation>Taille du texte&#xa0;: %1&#xa0;%</translation>
    </message>
</context>
<context>
    <name>Velocor::WindowDialogs</name>
    <message>
        <source>About %1</source>
        <translation>À propos de %1</translation>
    </message>
    <message>
        <source>The startup program of the Tork family. MIT license.</source>
        <translation>Le programme de démarrage de la famille Tork. Licence MIT.</translation>
    </message>
    <message>
        <source>Keyboard Shortcuts</source>
        <translation>Raccourcis clavier</translation>
    </message>
    <message>
        <source>Alt and the underlined letter open a menu; Tab goes from one control to the next.</source>
        <translation>Alt et la lettre soulignée ouvrent un menu&#x202f;; Tab va d’un élément à l’autre.</translation>
    </message>
    <message>
        <source>The manual is not installed, or there is no program to show it</source>
        <translation>Le manuel n’est pas installé, ou il n’y a pas de programme pour l’afficher</translation>
    </message>
    <message>
        <source>Versions and system</source>
        <translation>Versions et système</translation>
    </message>
    <message>
        <source>Identity and places</source>
        <translation>Identité et emplacements</translation>
    </message>
    <message>
        <source>Log settings</source>
        <translation>Réglages du journal</translation>
    </message>
    <message>
        <source>Settings files</source>
        <translation>Fichiers de réglages</translation>
    </message>
    <message>
        <source>Last Entries</source>
        <translation>Dernières entrées</translation>
    </message>
    <message>
        <source>The log no longer has the entries of that run.</source>
        <translation>Le journal n’a plus les entrées de cette exécution.</translation>
    </message>
    <message>
        <source>The last entries before the program ended:</source>
        <translation>Les dernières entrées avant la fin du programme&#xa0;:</translation>
    </message>
    <message>
        <source>Log settings saved</source>
        <translation>Réglages du journal enregistrés</translation>
    </message>
    <message>
        <source>Cannot open the log folder: it does not exist, or there is no file manager</source>
        <translation>Impossible d’ouvrir le dossier des journaux&#xa0;: il n’existe pas, ou il n’y a pas de gestionnaire de fichiers</translation>
    </message>
</context>
<context>
    <name>Velocor::WindowPicture</name>
    <message>
        <source>Picture of the desktop</source>
        <translation>Image du bureau</translation>
    </message>
</context>
<context>
    <name>Velocor::WindowPlaceDialog</name>
    <message>
        <source>From the left</source>
        <translation>Depuis la gauche</translation>
    </message>
    <message>
        <source>From the top</source>
        <translation>Depuis le haut</translation>
    </message>
    <message>
        <source>Width</source>
        <translation>Largeur</translation>
    </message>
    <message>
        <source>Height</source>
        <translation>Hauteur</translation>
    </message>
    <message>
        <source>Edit Window Place</source>
        <translation>Modifier la place de la fenêtre</translation>
    </message>
    <message>
        <source>Where the window opens</source>
        <translation>Où la fenêtre s’ouvre</translation>
    </message>
    <message>
        <source>From the &amp;left</source>
        <translation>Depuis la &amp;gauche</translation>
    </message>
    <message>
        <source>From the &amp;top</source>
        <translation>Depuis le ha&amp;ut</translation>
    </message>
    <message>
        <source>&amp;Width</source>
        <translation>&amp;Largeur</translation>
    </message>
    <message>
        <source>&amp;Height</source>
        <translation>&amp;Hauteur</translation>
    </message>
    <message>
        <source>On this desktop, the window opens at %1, %2 with %3 by %4 pixels</source>
        <translation>Sur ce bureau, la fenêtre s’ouvre en %1, %2 avec %3 sur %4 pixels</translation>
    </message>
</context>
</TS>

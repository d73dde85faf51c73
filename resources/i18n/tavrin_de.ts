<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="de_DE" sourcelanguage="en_US">
<context>
    <name>tavrin</name>
    <message numerus="yes">
        <source>.DICT.BYTES.%d</source>
        <translation>
            <numerusform>%n Byte</numerusform>
            <numerusform>%n Byte</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.ITEMS.%d</source>
        <translation>
            <numerusform>%n Objekt</numerusform>
            <numerusform>%n Objekte</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.ITEMS_SELECTED.%d</source>
        <translation>
            <numerusform>%n Objekt ausgewählt</numerusform>
            <numerusform>%n Objekte ausgewählt</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.MOVE_ITEMS.%d</source>
        <translation>
            <numerusform>%n Objekt verschieben</numerusform>
            <numerusform>%n Objekte verschieben</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.CANNOT_MOVE_ITEMS.%d</source>
        <translation>
            <numerusform>%n Objekt konnte nicht verschoben werden.</numerusform>
            <numerusform>%n Objekte konnten nicht verschoben werden.</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.CANNOT_DELETE_ITEMS.%d</source>
        <translation>
            <numerusform>%n Objekt konnte nicht gelöscht werden.</numerusform>
            <numerusform>%n Objekte konnten nicht gelöscht werden.</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.SENDING.%d</source>
        <translation>
            <numerusform>%n Dokument wird gesendet</numerusform>
            <numerusform>%n Dokumente werden gesendet</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.RECEIVING.%d</source>
        <translation>
            <numerusform>%n Dokument wird empfangen</numerusform>
            <numerusform>%n Dokumente werden empfangen</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.MORE.%d</source>
        <translation>
            <numerusform>und %n weiteres</numerusform>
            <numerusform>und %n weitere</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.WAITING.%d</source>
        <translation>
            <numerusform>%n Dokument wartet</numerusform>
            <numerusform>%n Dokumente warten</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.AVAILABLE.%g</source>
        <translation>
            <numerusform>%@ frei</numerusform>
            <numerusform>%@ frei</numerusform>
        </translation>
    </message>
    <!-- Names, sizes, places -->
    <message>
        <source>%@ KB</source>
        <translation>%@&#xa0;KB</translation>
    </message>
    <message>
        <source>%@ MB</source>
        <translation>%@&#xa0;MB</translation>
    </message>
    <message>
        <source>%@ GB</source>
        <translation>%@&#xa0;GB</translation>
    </message>
    <message>
        <source>%@ TB</source>
        <translation>%@&#xa0;TB</translation>
    </message>
    <message>
        <source>%@ PB</source>
        <translation>%@&#xa0;PB</translation>
    </message>
    <message>
        <source>%@ EB</source>
        <translation>%@&#xa0;EB</translation>
    </message>
    <message>
        <source>%1$@ of %2$@</source>
        <translation>%1$@ von %2$@</translation>
    </message>
    <message>
        <source>%1$@, %2$@</source>
        <translation>%1$@, %2$@</translation>
    </message>
    <message>
        <source>Documents</source>
        <translation>Dokumente</translation>
    </message>
    <message>
        <source>Kind</source>
        <translation>Art</translation>
    </message>
    <message>
        <source>Size</source>
        <translation>Größe</translation>
    </message>
    <message>
        <source>Where</source>
        <translation>Ort</translation>
    </message>
    <message>
        <source>Created</source>
        <translation>Erstellt</translation>
    </message>
    <message>
        <source>Modified</source>
        <translation>Geändert</translation>
    </message>
    <message>
        <source>Tags</source>
        <translation>Tags</translation>
    </message>
    <message>
        <source>Shared</source>
        <translation>Freigegeben</translation>
    </message>
    <!-- Kinds of documents -->
    <message>
        <source>Document</source>
        <translation>Dokument</translation>
    </message>
    <message>
        <source>Folder</source>
        <translation>Ordner</translation>
    </message>
    <message>
        <source>Package</source>
        <translation>Paket</translation>
    </message>
    <message>
        <source>Rich text document with attachments</source>
        <translation>Formatierter Text mit Anhängen</translation>
    </message>
    <message>
        <source>Document package</source>
        <translation>Dokumentpaket</translation>
    </message>
    <message>
        <source>Text</source>
        <translation>Text</translation>
    </message>
    <message>
        <source>Source code</source>
        <translation>Quelltext</translation>
    </message>
    <message>
        <source>Image</source>
        <translation>Bild</translation>
    </message>
    <message>
        <source>Movie</source>
        <translation>Film</translation>
    </message>
    <message>
        <source>Audio</source>
        <translation>Audio</translation>
    </message>
    <message>
        <source>Audio or video</source>
        <translation>Audio oder Video</translation>
    </message>
    <message>
        <source>Archive</source>
        <translation>Archiv</translation>
    </message>
    <message>
        <source>Font</source>
        <translation>Schrift</translation>
    </message>
    <!-- Buttons and actions -->
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Cancel</source>
        <translation>Abbrechen</translation>
    </message>
    <message>
        <source>Done</source>
        <translation>Fertig</translation>
    </message>
    <message>
        <source>Create</source>
        <translation>Erstellen</translation>
    </message>
    <message>
        <source>Back</source>
        <translation>Zurück</translation>
    </message>
    <message>
        <source>More</source>
        <translation>Mehr</translation>
    </message>
    <message>
        <source>Info</source>
        <translation>Infos</translation>
    </message>
    <message>
        <source>Select</source>
        <translation>Auswählen</translation>
    </message>
    <message>
        <source>Select Items</source>
        <translation>Objekte auswählen</translation>
    </message>
    <message>
        <source>Move</source>
        <translation>Verschieben</translation>
    </message>
    <message>
        <source>Move Here</source>
        <translation>Hierher verschieben</translation>
    </message>
    <message>
        <source>Move to Folder…</source>
        <translation>In Ordner verschieben…</translation>
    </message>
    <message>
        <source>Move “%1$@”</source>
        <translation>„%1$@“ verschieben</translation>
    </message>
    <message>
        <source>Delete</source>
        <translation>Löschen</translation>
    </message>
    <message>
        <source>Delete from Tavrin</source>
        <translation>Aus Tavrin löschen</translation>
    </message>
    <message>
        <source>Rename</source>
        <translation>Umbenennen</translation>
    </message>
    <message>
        <source>Rename Item</source>
        <translation>Objekt umbenennen</translation>
    </message>
    <message>
        <source>Rename Item…</source>
        <translation>Objekt umbenennen…</translation>
    </message>
    <message>
        <source>Share</source>
        <translation>Teilen</translation>
    </message>
    <message>
        <source>Share Item…</source>
        <translation>Objekt teilen…</translation>
    </message>
    <message>
        <source>Copy</source>
        <translation>Kopieren</translation>
    </message>
    <message>
        <source>Copy Path</source>
        <translation>Pfad kopieren</translation>
    </message>
    <message>
        <source>Send by Mail</source>
        <translation>Per E-Mail senden</translation>
    </message>
    <message>
        <source>Open in “%@”</source>
        <translation>In „%@“ öffnen</translation>
    </message>
    <message>
        <source>Open in “%1$@”</source>
        <translation>In „%1$@“ öffnen</translation>
    </message>
    <message>
        <source>Search</source>
        <translation>Suchen</translation>
    </message>
    <message>
        <source>Try Again</source>
        <translation>Erneut versuchen</translation>
    </message>
    <message>
        <source>Clear text</source>
        <translation>Text löschen</translation>
    </message>
    <message>
        <source>Zoom in</source>
        <translation>Vergrößern</translation>
    </message>
    <message>
        <source>Zoom out</source>
        <translation>Verkleinern</translation>
    </message>
    <!-- New folders and names -->
    <message>
        <source>New Folder</source>
        <translation>Neuer Ordner</translation>
    </message>
    <message>
        <source>Folder Name</source>
        <translation>Ordnername</translation>
    </message>
    <message>
        <source>Enter a name for this folder.</source>
        <translation>Geben Sie einen Namen für diesen Ordner ein.</translation>
    </message>
    <message>
        <source>Enter a new name for this item.</source>
        <translation>Geben Sie einen neuen Namen für dieses Objekt ein.</translation>
    </message>
    <message>
        <source>Character not allowed in filename</source>
        <translation>Zeichen im Dateinamen nicht erlaubt</translation>
    </message>
    <message>
        <source>Choose a different name.</source>
        <translation>Wählen Sie einen anderen Namen.</translation>
    </message>
    <message>
        <source>The name “%@” is already taken.</source>
        <translation>Der Name „%@“ wird bereits verwendet.</translation>
    </message>
    <message>
        <source>The name “%1$@” with extension “.%2$@” is already taken.</source>
        <translation>Der Name „%1$@“ mit der Endung „.%2$@“ wird bereits verwendet.</translation>
    </message>
    <message>
        <source>The name “%@” can’t be used. Try using a name with fewer characters, or with no punctuation marks.</source>
        <translation>Der Name „%@“ kann nicht verwendet werden. Versuchen Sie es mit einem Namen mit weniger Zeichen oder ohne Satzzeichen.</translation>
    </message>
    <message>
        <source>The folder could not be made.</source>
        <translation>Der Ordner konnte nicht erstellt werden.</translation>
    </message>
    <!-- Deleting -->
    <message>
        <source>%@ will be permanently deleted from Tavrin on all your devices. This action cannot be undone.</source>
        <translation>%@ werden endgültig aus Tavrin auf all Ihren Geräten gelöscht. Dieser Vorgang kann nicht rückgängig gemacht werden.</translation>
    </message>
    <message>
        <source>&quot;%@&quot; will be permanently deleted from Tavrin on all your devices. This action cannot be undone.</source>
        <translation>„%@“ wird endgültig aus Tavrin auf all Ihren Geräten gelöscht. Dieser Vorgang kann nicht rückgängig gemacht werden.</translation>
    </message>
    <message>
        <source>The %@ app library, and all its documents, will be permanently deleted from Tavrin on all your devices. This action cannot be undone.</source>
        <translation>Die App-Bibliothek „%@“ und alle ihre Dokumente werden endgültig aus Tavrin auf all Ihren Geräten gelöscht. Dieser Vorgang kann nicht rückgängig gemacht werden.</translation>
    </message>
    <!-- Lists and the search -->
    <message>
        <source>No documents here</source>
        <translation>Keine Dokumente</translation>
    </message>
    <message>
        <source>What applications keep in the cloud appears here.</source>
        <translation>Hier erscheint, was Apps in der Cloud aufbewahren.</translation>
    </message>
    <message>
        <source>Documents that are added to this folder, here or on another device, appear here.</source>
        <translation>Dokumente, die diesem Ordner hier oder auf einem anderen Gerät hinzugefügt werden, erscheinen hier.</translation>
    </message>
    <message>
        <source>This folder is no longer here</source>
        <translation>Dieser Ordner ist nicht mehr da</translation>
    </message>
    <message>
        <source>This folder cannot be shown</source>
        <translation>Dieser Ordner kann nicht angezeigt werden</translation>
    </message>
    <message>
        <source>Search all documents</source>
        <translation>Alle Dokumente durchsuchen</translation>
    </message>
    <message>
        <source>Type a part of a name</source>
        <translation>Geben Sie einen Teil eines Namens ein</translation>
    </message>
    <message>
        <source>Documents and folders of the whole store are found, also those that are not downloaded.</source>
        <translation>Gefunden werden Dokumente und Ordner der gesamten Ablage, auch nicht geladene.</translation>
    </message>
    <message>
        <source>Nothing found</source>
        <translation>Nichts gefunden</translation>
    </message>
    <message>
        <source>No name in the store contains “%1$@”.</source>
        <translation>Kein Name in der Ablage enthält „%1$@“.</translation>
    </message>
    <message>
        <source>Downloading</source>
        <translation>Wird geladen</translation>
    </message>
    <message>
        <source>Not downloaded</source>
        <translation>Nicht geladen</translation>
    </message>
    <!-- Choosing where to move -->
    <message>
        <source>Nothing here yet</source>
        <translation>Noch nichts vorhanden</translation>
    </message>
    <message>
        <source>An item with this name is here already.</source>
        <translation>Ein Objekt mit diesem Namen ist bereits hier.</translation>
    </message>
    <message>
        <source>Items with these names are here already.</source>
        <translation>Objekte mit diesen Namen sind bereits hier.</translation>
    </message>
    <message>
        <source>Open the folder into which to move.</source>
        <translation>Öffnen Sie den Ordner, in den verschoben werden soll.</translation>
    </message>
    <message>
        <source>This folder does not take documents.</source>
        <translation>Dieser Ordner nimmt keine Dokumente auf.</translation>
    </message>
    <message>
        <source>A folder cannot be moved into itself.</source>
        <translation>Ein Ordner kann nicht in sich selbst verschoben werden.</translation>
    </message>
    <message>
        <source>“%1$@” is here already.</source>
        <translation>„%1$@“ ist bereits hier.</translation>
    </message>
    <message>
        <source>These items are here already.</source>
        <translation>Diese Objekte sind bereits hier.</translation>
    </message>
    <message>
        <source>“%1$@” does not take folders.</source>
        <translation>„%1$@“ nimmt keine Ordner auf.</translation>
    </message>
    <message>
        <source>“%1$@” does not take folders within folders.</source>
        <translation>„%1$@“ nimmt keine Ordner in Ordnern auf.</translation>
    </message>
    <message>
        <source>“%1$@” does not take documents of this kind.</source>
        <translation>„%1$@“ nimmt keine Dokumente dieser Art auf.</translation>
    </message>
    <message>
        <source>“%1$@” does not take all of these documents.</source>
        <translation>„%1$@“ nimmt nicht alle diese Dokumente auf.</translation>
    </message>
    <!-- Showing and downloading -->
    <message>
        <source>Loading…</source>
        <translation>Wird geladen…</translation>
    </message>
    <message>
        <source>Waiting…</source>
        <translation>Bitte warten…</translation>
    </message>
    <message>
        <source>Download</source>
        <translation>Laden</translation>
    </message>
    <message>
        <source>Download to View</source>
        <translation>Zum Ansehen laden</translation>
    </message>
    <message>
        <source>Cancel Download</source>
        <translation>Laden abbrechen</translation>
    </message>
    <message>
        <source>Downloading “%1$@”</source>
        <translation>„%1$@“ wird geladen</translation>
    </message>
    <message>
        <source>This item is over %@.</source>
        <translation>Dieses Objekt ist größer als %@.</translation>
    </message>
    <message>
        <source>“%@” will not download until you connect to Wi-Fi.</source>
        <translation>„%@“ wird erst geladen, wenn Sie mit einem WLAN verbunden sind.</translation>
    </message>
    <message>
        <source>Unable to download file. You are no longer connected to the Internet.</source>
        <translation>Die Datei kann nicht geladen werden. Sie sind nicht mehr mit dem Internet verbunden.</translation>
    </message>
    <message>
        <source>Picture “%1$@”</source>
        <translation>Bild „%1$@“</translation>
    </message>
    <message>
        <source>There is no document to show</source>
        <translation>Kein Dokument zum Anzeigen</translation>
    </message>
    <message>
        <source>This kind of document cannot be shown here.</source>
        <translation>Dokumente dieser Art können hier nicht angezeigt werden.</translation>
    </message>
    <message>
        <source>“%1$@” is too large to be shown here.</source>
        <translation>„%1$@“ ist zu groß, um hier angezeigt zu werden.</translation>
    </message>
    <message>
        <source>There is no application for it on this device.</source>
        <translation>Auf diesem Gerät gibt es dafür kein Programm.</translation>
    </message>
    <message>
        <source>This document cannot be shown.</source>
        <translation>Dieses Dokument kann nicht angezeigt werden.</translation>
    </message>
    <message>
        <source>This document is protected by a password. It can be read in an application that asks for it.</source>
        <translation>Dieses Dokument ist mit einem Passwort geschützt. Öffnen Sie es in einer App, die danach fragt.</translation>
    </message>
    <message>
        <source>This is a folder, not a document.</source>
        <translation>Dies ist ein Ordner, kein Dokument.</translation>
    </message>
    <message>
        <source>There is nothing in this document.</source>
        <translation>Dieses Dokument ist leer.</translation>
    </message>
    <message>
        <source>Open With…</source>
        <translation>Öffnen mit…</translation>
    </message>
    <message>
        <source>“%1$@” cannot be played. It may be damaged, or of a kind for which there is no decoder here.</source>
        <translation>„%1$@“ lässt sich nicht abspielen. Die Datei ist vielleicht beschädigt oder von einer Art, für die hier kein Decoder da ist.</translation>
    </message>
    <message>
        <source>Sound and films cannot be played: a part of this program is missing. Install it again.</source>
        <translation>Ton und Filme lassen sich nicht abspielen: Ein Teil dieses Programms fehlt. Bitte installieren Sie es neu.</translation>
    </message>
    <message>
        <source>There is no device here to hear the sound from.</source>
        <translation>Hier ist kein Gerät, auf dem der Ton zu hören wäre.</translation>
    </message>
    <message>
        <source>Play</source>
        <translation>Abspielen</translation>
    </message>
    <message>
        <source>Pause</source>
        <translation>Anhalten</translation>
    </message>
    <message>
        <source>Mute</source>
        <translation>Ton aus</translation>
    </message>
    <message>
        <source>Unmute</source>
        <translation>Ton ein</translation>
    </message>
    <message>
        <source>Position</source>
        <translation>Stelle</translation>
    </message>
    <message>
        <source>Volume</source>
        <translation>Lautstärke</translation>
    </message>
    <message>
        <source>“%1$@” cannot be shown. It may be damaged, or need a password.</source>
        <translation>„%1$@“ lässt sich nicht anzeigen. Das Dokument ist vielleicht beschädigt oder braucht ein Passwort.</translation>
    </message>
    <message>
        <source>This document is too large to be shown here.</source>
        <translation>Dieses Dokument ist zu groß, um hier angezeigt zu werden.</translation>
    </message>
    <message>
        <source>It takes too long to show this document here.</source>
        <translation>Dieses Dokument hier anzuzeigen dauert zu lange.</translation>
    </message>
    <message>
        <source>This document consists of several files. A program that knows its kind shows them as one.</source>
        <translation>Dieses Dokument besteht aus mehreren Dateien. Ein Programm, das seine Art kennt, zeigt sie als eines.</translation>
    </message>
    <message>
        <source>There is more in this document than is listed here.</source>
        <translation>In diesem Dokument ist mehr, als hier steht.</translation>
    </message>
    <message>
        <source>%1$@, %2$@ unpacked</source>
        <translation>%1$@, entpackt %2$@</translation>
    </message>
    <message>
        <source>Still being read. This is what there is so far.</source>
        <translation>Wird noch gelesen. Bisher ist dies da.</translation>
    </message>
    <message>
        <source>The archive is damaged. This is what could be read before the damage.</source>
        <translation>Das Archiv ist beschädigt. Dies war vor dem Schaden zu lesen.</translation>
    </message>
    <message>
        <source>There is more in this archive than is listed here.</source>
        <translation>In diesem Archiv ist mehr, als hier steht.</translation>
    </message>
    <message>
        <source>Unpacking it takes a password.</source>
        <translation>Zum Entpacken ist ein Passwort nötig.</translation>
    </message>
    <message>
        <source>What is in this archive can only be seen with its password.</source>
        <translation>Was in diesem Archiv ist, lässt sich nur mit seinem Passwort sehen.</translation>
    </message>
    <message>
        <source>There is nothing in this archive.</source>
        <translation>Dieses Archiv ist leer.</translation>
    </message>
    <message>
        <source>A part of this program is missing: archives cannot be listed. Install it again.</source>
        <translation>Ein Teil dieses Programms fehlt: Archive lassen sich nicht auflisten. Bitte installieren Sie es neu.</translation>
    </message>
    <message>
        <source>A part of this program is missing: drawings cannot be shown. Install it again.</source>
        <translation>Ein Teil dieses Programms fehlt: Zeichnungen lassen sich nicht zeigen. Bitte installieren Sie es neu.</translation>
    </message>
    <message>
        <source>Encrypted</source>
        <translation>Verschlüsselt</translation>
    </message>
    <message>
        <source>Link</source>
        <translation>Verknüpfung</translation>
    </message>
    <message>
        <source>This document is not on this device. Download it first.</source>
        <translation>Dieses Dokument ist nicht auf diesem Gerät. Laden Sie es zuerst.</translation>
    </message>
    <message>
        <source>“%1$@” is damaged, or not what its name says.</source>
        <translation>„%1$@“ ist beschädigt oder nicht das, was der Name sagt.</translation>
    </message>
    <message>
        <source>“%1$@” could not be opened</source>
        <translation>„%1$@“ konnte nicht geöffnet werden</translation>
    </message>
    <message>
        <source>“%1$@” could not be copied</source>
        <translation>„%1$@“ konnte nicht kopiert werden</translation>
    </message>
    <message>
        <source>“%1$@” could not be sent</source>
        <translation>„%1$@“ konnte nicht gesendet werden</translation>
    </message>
    <message>
        <source>“%1$@” could not be started. %2$@</source>
        <translation>„%1$@“ konnte nicht gestartet werden. %2$@</translation>
    </message>
    <message>
        <source>“%1$@” ended as soon as it had been started (exit status %2$@).</source>
        <translation>„%1$@“ wurde sofort nach dem Start beendet (Exit-Status %2$@).</translation>
    </message>
    <!-- The account and the network -->
    <message>
        <source>Offline</source>
        <translation>Offline</translation>
    </message>
    <message>
        <source>Cellular</source>
        <translation>Mobilfunk</translation>
    </message>
    <message>
        <source>Wi-Fi</source>
        <translation>WLAN</translation>
    </message>
    <message>
        <source>Network activity</source>
        <translation>Netzwerkaktivität</translation>
    </message>
    <message>
        <source>Not signed in</source>
        <translation>Nicht angemeldet</translation>
    </message>
    <message>
        <source>Pelmora is not enabled</source>
        <translation>Pelmora ist nicht aktiviert</translation>
    </message>
    <message>
        <source>Sign in to a folder that holds your documents, such as a disk or a network folder. In a terminal, type:</source>
        <translation>Melden Sie sich bei einem Ordner an, der Ihre Dokumente enthält, etwa auf einer Festplatte oder im Netzwerk. Geben Sie in einem Terminal ein:</translation>
    </message>
    <message>
        <source>PATH is that folder. The documents appear here as soon as you are signed in.</source>
        <translation>PATH ist dieser Ordner. Die Dokumente erscheinen hier, sobald Sie angemeldet sind.</translation>
    </message>
    <message>
        <source>No Pelmora account is signed in.</source>
        <translation>Kein Pelmora-Konto ist angemeldet.</translation>
    </message>
    <message>
        <source>No Pelmora account is signed in. Sign in with the command “pelmora sign-in”.</source>
        <translation>Kein Pelmora-Konto ist angemeldet. Melden Sie sich mit dem Befehl „pelmora sign-in“ an.</translation>
    </message>
    <message>
        <source>The account is of the kind “%1$@”, which this version does not know. Update the program or sign in again.</source>
        <translation>Das Konto ist von der Art „%1$@“, die diese Version nicht kennt. Aktualisieren Sie das Programm oder melden Sie sich neu an.</translation>
    </message>
    <message>
        <source>This version cannot use accounts of the kind “%1$@” yet. Update the program or sign in to a folder.</source>
        <translation>Diese Version kann Konten der Art „%1$@“ noch nicht verwenden. Aktualisieren Sie das Programm oder melden Sie sich bei einem Ordner an.</translation>
    </message>
    <message>
        <source>The account's folder “%1$@” is not an absolute path. Sign in again with the whole path.</source>
        <translation>Der Ordner „%1$@“ des Kontos ist kein absoluter Pfad. Melden Sie sich mit dem ganzen Pfad neu an.</translation>
    </message>
    <message>
        <source>The account file “%1$@” does not say who is signed in. Sign in again.</source>
        <translation>Die Kontodatei „%1$@“ sagt nicht, wer angemeldet ist. Melden Sie sich neu an.</translation>
    </message>
    <message>
        <source>The account file “%1$@” cannot be read. Check its permissions.</source>
        <translation>Die Kontodatei „%1$@“ kann nicht gelesen werden. Prüfen Sie ihre Zugriffsrechte.</translation>
    </message>
    <message>
        <source>The account file “%1$@” is damaged. Sign in again.</source>
        <translation>Die Kontodatei „%1$@“ ist beschädigt. Melden Sie sich neu an.</translation>
    </message>
    <message>
        <source>The folder “%1$@” of your Pelmora account is not there. Connect its disk, or sign in again if it has moved.</source>
        <translation>Der Ordner „%1$@“ Ihres Pelmora-Kontos ist nicht da. Schließen Sie sein Laufwerk an oder melden Sie sich neu an, wenn er verschoben wurde.</translation>
    </message>
    <message>
        <source>What is at “%1$@” now is not what this account was linked with. Connect the right disk, or sign in to another folder.</source>
        <translation>Was jetzt unter „%1$@“ liegt, ist nicht das, womit dieses Konto verknüpft wurde. Schließen Sie das richtige Laufwerk an oder melden Sie sich bei einem anderen Ordner an.</translation>
    </message>
    <message>
        <source>The file “%1$@” of the account is damaged. Repair or remove it.</source>
        <translation>Die Datei „%1$@“ des Kontos ist beschädigt. Reparieren oder entfernen Sie sie.</translation>
    </message>
    <message>
        <source>The account does not tell how much room is left.</source>
        <translation>Das Konto teilt nicht mit, wie viel Platz noch frei ist.</translation>
    </message>
    <message>
        <source>The Pelmora server cannot be reached. Check the connection and try again.</source>
        <translation>Der Pelmora-Server ist nicht erreichbar. Prüfen Sie die Verbindung und versuchen Sie es erneut.</translation>
    </message>
    <message>
        <source>The Pelmora server did not accept the user name or the password.</source>
        <translation>Der Pelmora-Server hat den Benutzernamen oder das Passwort nicht akzeptiert.</translation>
    </message>
    <message>
        <source>The Pelmora server refused the request for “%1$@”.</source>
        <translation>Der Pelmora-Server hat die Anfrage für „%1$@“ abgelehnt.</translation>
    </message>
    <message>
        <source>The Pelmora server cannot store an item named “%1$@”. Choose a different name.</source>
        <translation>Der Pelmora-Server kann kein Objekt mit dem Namen „%1$@“ speichern. Wählen Sie einen anderen Namen.</translation>
    </message>
    <message>
        <source>There is no space left in your Pelmora account. Delete something to make room.</source>
        <translation>In Ihrem Pelmora-Konto ist kein Platz mehr. Löschen Sie etwas, um Platz zu schaffen.</translation>
    </message>
    <message>
        <source>The file of passwords “%1$@” is damaged. Move it away and sign in again.</source>
        <translation>Die Datei mit den Passwörtern „%1$@“ ist beschädigt. Verschieben Sie sie und melden Sie sich erneut an.</translation>
    </message>
    <message>
        <source>The keyring does not answer. Unlock it, or restart its service, and try again.</source>
        <translation>Der Schlüsselbund antwortet nicht. Entsperren Sie ihn oder starten Sie seinen Dienst neu, und versuchen Sie es noch einmal.</translation>
    </message>
    <message>
        <source>The keyring refused (%1$@). Unlock it and try again.</source>
        <translation>Der Schlüsselbund hat abgelehnt (%1$@). Entsperren Sie ihn und versuchen Sie es noch einmal.</translation>
    </message>
    <message>
        <source>There is no keyring on this desk that could keep the password.</source>
        <translation>Hier gibt es keinen Schlüsselbund, der das Passwort aufbewahren könnte.</translation>
    </message>
    <message>
        <source>The store has work in it that was interrupted. Use it once more, so that it comes to its end, and sign out then.</source>
        <translation>Im Speicher liegt noch unterbrochene Arbeit. Benutzen Sie ihn noch einmal, damit sie zu Ende kommt, und melden Sie sich dann ab.</translation>
    </message>
    <message>
        <source>Waits for a network that is not metered. “Sync Now” does not wait.</source>
        <translation>Wartet auf ein Netz ohne Volumenbegrenzung. „Jetzt abgleichen“ wartet nicht.</translation>
    </message>
    <message>
        <source>Your documents can be on a server, or in a folder such as a disk or a network folder.</source>
        <translation>Ihre Dokumente können auf einem Server liegen oder in einem Ordner, etwa auf einem Laufwerk oder im Netz.</translation>
    </message>
    <message>
        <source>Sending “%1$@”</source>
        <translation>„%1$@“ wird gesendet</translation>
    </message>
    <message>
        <source>Receiving “%1$@”</source>
        <translation>„%1$@“ wird empfangen</translation>
    </message>
    <message>
        <source>“%1$@”: %2$@</source>
        <translation>„%1$@“: %2$@</translation>
    </message>
    <message>
        <source>%1$@ at %2$@</source>
        <translation>%1$@ auf %2$@</translation>
    </message>
    <message>
        <source>Account</source>
        <translation>Account</translation>
    </message>
    <message>
        <source>On Its Way</source>
        <translation>Unterwegs</translation>
    </message>
    <message>
        <source>Waiting</source>
        <translation>Wartet</translation>
    </message>
    <message>
        <source>Sync Now</source>
        <translation>Jetzt abgleichen</translation>
    </message>
    <message>
        <source>Sign In to Another Account…</source>
        <translation>Bei einem anderen Account anmelden …</translation>
    </message>
    <message>
        <source>Sign Out…</source>
        <translation>Abmelden …</translation>
    </message>
    <message>
        <source>The Password Is Wanted</source>
        <translation>Das Passwort wird gebraucht</translation>
    </message>
    <message>
        <source>Enter Password…</source>
        <translation>Passwort eingeben …</translation>
    </message>
    <message>
        <source>Delete on Both Sides</source>
        <translation>Auf beiden Seiten löschen</translation>
    </message>
    <message>
        <source>Changed on Both Sides</source>
        <translation>Auf beiden Seiten geändert</translation>
    </message>
    <message>
        <source>Show the First</source>
        <translation>Das erste zeigen</translation>
    </message>
    <message>
        <source>Names That Cannot Be Kept</source>
        <translation>Namen, die nicht möglich sind</translation>
    </message>
    <message>
        <source>Use “%1$@”</source>
        <translation>„%1$@“ verwenden</translation>
    </message>
    <message>
        <source>The server does not accept the password that is kept here. Nothing is sent or received before it has the right one.</source>
        <translation>Der Server nimmt das hier aufbewahrte Passwort nicht an. Nichts wird gesendet oder empfangen, bevor er das richtige hat.</translation>
    </message>
    <message>
        <source>Both versions are kept side by side. Compare them and delete the one that you do not want.</source>
        <translation>Beide Fassungen liegen nebeneinander. Vergleichen Sie sie und löschen Sie die, die Sie nicht wollen.</translation>
    </message>
    <message>
        <source>Comparing both sides…</source>
        <translation>Beide Seiten werden verglichen …</translation>
    </message>
    <message>
        <source>Something waits. It is tried again by itself.</source>
        <translation>Etwas wartet. Es wird von selbst erneut versucht.</translation>
    </message>
    <message>
        <source>Everything is on both sides.</source>
        <translation>Alles ist auf beiden Seiten.</translation>
    </message>
    <message>
        <source>Sign In to a Server…</source>
        <translation>Bei einem Server anmelden …</translation>
    </message>
    <message>
        <source>Use a Folder…</source>
        <translation>Einen Ordner verwenden …</translation>
    </message>
    <message>
        <source>Sign Out of “%1$@”?</source>
        <translation>Von „%1$@“ abmelden?</translation>
    </message>
    <message>
        <source>The account keeps its documents. Those on this device can stay in their folder or be removed.</source>
        <translation>Der Account behält seine Dokumente. Die auf diesem Gerät können in ihrem Ordner bleiben oder entfernt werden.</translation>
    </message>
    <message>
        <source>Keep Files on This Device</source>
        <translation>Dateien auf dem Gerät behalten</translation>
    </message>
    <message>
        <source>Remove Files from This Device</source>
        <translation>Dateien vom Gerät entfernen</translation>
    </message>
    <message>
        <source>Some Documents Stayed on This Device</source>
        <translation>Einige Dokumente blieben auf diesem Gerät</translation>
    </message>
    <message>
        <source>Not Everything Has Been Sent</source>
        <translation>Nicht alles wurde gesendet</translation>
    </message>
    <message>
        <source>These are on this device alone, so nothing was removed:</source>
        <translation>Diese sind nur auf diesem Gerät, daher wurde nichts entfernt:</translation>
    </message>
    <message>
        <source>Keep Files and Sign Out</source>
        <translation>Dateien behalten und abmelden</translation>
    </message>
    <message>
        <source>Stay Signed In</source>
        <translation>Angemeldet bleiben</translation>
    </message>
    <message>
        <source>Keep the Password in a File?</source>
        <translation>Passwort in einer Datei aufbewahren?</translation>
    </message>
    <message>
        <source>It can lie in a file that you alone may read. The file is not encrypted: whoever has this disk in his hands can read it.</source>
        <translation>Es kann in einer Datei liegen, die nur Sie lesen dürfen. Die Datei ist nicht verschlüsselt: Wer diesen Datenträger in Händen hat, kann sie lesen.</translation>
    </message>
    <message>
        <source>Keep It in a File</source>
        <translation>In einer Datei aufbewahren</translation>
    </message>
    <message>
        <source>Password for “%1$@”</source>
        <translation>Passwort für „%1$@“</translation>
    </message>
    <message>
        <source>Password</source>
        <translation>Passwort</translation>
    </message>
    <message>
        <source>Sign In</source>
        <translation>Anmelden</translation>
    </message>
    <message>
        <source>Not Now</source>
        <translation>Nicht jetzt</translation>
    </message>
    <message>
        <source>Server</source>
        <translation>Server</translation>
    </message>
    <message>
        <source>Your documents stay on a WebDAV server, such as one of your own or your company's.</source>
        <translation>Ihre Dokumente bleiben auf einem WebDAV-Server, etwa einem eigenen oder dem Ihrer Firma.</translation>
    </message>
    <message>
        <source>Your documents stay in a folder of this machine, of a disk, or of a network.</source>
        <translation>Ihre Dokumente bleiben in einem Ordner dieses Rechners, eines Laufwerks oder im Netz.</translation>
    </message>
    <message>
        <source>Address</source>
        <translation>Adresse</translation>
    </message>
    <message>
        <source>Path of the Folder</source>
        <translation>Pfad des Ordners</translation>
    </message>
    <message>
        <source>User</source>
        <translation>Benutzer</translation>
    </message>
    <message>
        <source>File of Certificates to Trust</source>
        <translation>Datei mit vertrauenswürdigen Zertifikaten</translation>
    </message>
    <message>
        <source>Give the address of the server.</source>
        <translation>Geben Sie die Adresse des Servers an.</translation>
    </message>
    <message>
        <source>Give the folder of the account.</source>
        <translation>Geben Sie den Ordner des Accounts an.</translation>
    </message>
    <message>
        <source>Give the name of the user.</source>
        <translation>Geben Sie den Benutzernamen an.</translation>
    </message>
    <message>
        <source>The Way to This Server Is Not Encrypted</source>
        <translation>Der Weg zu diesem Server ist nicht verschlüsselt</translation>
    </message>
    <message>
        <source>Everybody on the way can read the password and the documents. Use an address that begins with “https://” if the server has one.</source>
        <translation>Jeder auf dem Weg kann das Passwort und die Dokumente lesen. Verwenden Sie eine Adresse, die mit „https://“ beginnt, wenn der Server eine hat.</translation>
    </message>
    <message>
        <source>Sign In Anyway</source>
        <translation>Trotzdem anmelden</translation>
    </message>
    <message>
        <source>Looking at the server…</source>
        <translation>Der Server wird geprüft …</translation>
    </message>
    <message>
        <source>Looking at the folder…</source>
        <translation>Der Ordner wird geprüft …</translation>
    </message>
    <message>
        <source>Signing in…</source>
        <translation>Anmeldung läuft …</translation>
    </message>
    <message>
        <source>“%1$@” is not a folder. Make it first, or connect its disk.</source>
        <translation>„%1$@“ ist kein Ordner. Legen Sie ihn zuerst an oder schließen Sie das Laufwerk an.</translation>
    </message>
    <message>
        <source>The name of that folder is not UTF-8 text. Choose another folder.</source>
        <translation>Der Name dieses Ordners ist kein UTF-8-Text. Wählen Sie einen anderen Ordner.</translation>
    </message>
    <message>
        <source>“%1$@” holds the stores of accounts themselves. Choose another folder.</source>
        <translation>„%1$@“ enthält die Speicher der Accounts selbst. Wählen Sie einen anderen Ordner.</translation>
    </message>
    <message>
        <source>“%1$@” lies in the store of an account. Choose another folder.</source>
        <translation>„%1$@“ liegt im Speicher eines Accounts. Wählen Sie einen anderen Ordner.</translation>
    </message>
    <message>
        <source>There is no file of certificates at “%1$@”.</source>
        <translation>Unter „%1$@“ liegt keine Datei mit Zertifikaten.</translation>
    </message>
    <message>
        <source>The server lets you read here, and change nothing.</source>
        <translation>Der Server lässt Sie hier lesen, aber nichts ändern.</translation>
    </message>
    <message>
        <source>No password is kept here for this account.</source>
        <translation>Für diesen Account wird hier kein Passwort aufbewahrt.</translation>
    </message>
    <!-- The store and its documents -->
    <message>
        <source>The store has not been set up yet.</source>
        <translation>Die Ablage wurde noch nicht eingerichtet.</translation>
    </message>
    <message>
        <source>The store cannot be changed now.</source>
        <translation>Die Ablage kann derzeit nicht geändert werden.</translation>
    </message>
    <message>
        <source>The store is in use by another program (process %1$@). Wait until it has finished, or close it.</source>
        <translation>Die Ablage wird von einem anderen Programm verwendet (Prozess %1$@). Warten Sie, bis es fertig ist, oder beenden Sie es.</translation>
    </message>
    <message>
        <source>The store was used by a later version of this program. Update the program to open it.</source>
        <translation>Die Ablage wurde von einer neueren Version dieses Programms verwendet. Aktualisieren Sie das Programm, um sie zu öffnen.</translation>
    </message>
    <message>
        <source>The store's records cannot be opened.</source>
        <translation>Die Daten der Ablage können nicht geöffnet werden.</translation>
    </message>
    <message>
        <source>The store's records were damaged. They were set aside as “%1$@” and are made anew from the disk and the account.</source>
        <translation>Die Daten der Ablage waren beschädigt. Sie wurden als „%1$@“ beiseitegelegt und werden aus dem Laufwerk und dem Konto neu erstellt.</translation>
    </message>
    <message>
        <source>The folder “%1$@” is not the one that this store was made with. Put it back, or move “%2$@” away to begin anew; nothing was changed.</source>
        <translation>Der Ordner „%1$@“ ist nicht der, mit dem diese Ablage eingerichtet wurde. Legen Sie ihn zurück oder verschieben Sie „%2$@“ an einen anderen Ort, um neu zu beginnen; nichts wurde geändert.</translation>
    </message>
    <message>
        <source>“%1$@” belongs to the store itself and cannot be moved.</source>
        <translation>„%1$@“ gehört zur Ablage selbst und kann nicht verschoben werden.</translation>
    </message>
    <message>
        <source>“%1$@” belongs to the store itself and cannot be deleted.</source>
        <translation>„%1$@“ gehört zur Ablage selbst und kann nicht gelöscht werden.</translation>
    </message>
    <message>
        <source>“%1$@” has to be downloaded before it can leave your documents.</source>
        <translation>„%1$@“ muss geladen werden, bevor es Ihre Dokumente verlassen kann.</translation>
    </message>
    <message>
        <source>“%1$@” stays on this device: your account does not have this version yet.</source>
        <translation>„%1$@“ bleibt auf diesem Gerät: Ihr Konto hat diese Version noch nicht.</translation>
    </message>
    <message>
        <source>“%1$@” is no document that could be fetched again.</source>
        <translation>„%1$@“ ist kein Dokument, das erneut geladen werden könnte.</translation>
    </message>
    <message>
        <source>“%1$@” has not been uploaded yet, so its copy on this device is kept.</source>
        <translation>„%1$@“ wurde noch nicht hochgeladen, daher bleibt die Kopie auf diesem Gerät erhalten.</translation>
    </message>
    <message>
        <source>“%1$@” was changed on another device. Both versions are kept.</source>
        <translation>„%1$@“ wurde auf einem anderen Gerät geändert. Beide Versionen bleiben erhalten.</translation>
    </message>
    <!-- Why an item is left out -->
    <message>
        <source>It is a symbolic link.</source>
        <translation>Es ist ein symbolischer Link.</translation>
    </message>
    <message>
        <source>It is neither a file nor a folder.</source>
        <translation>Es ist weder eine Datei noch ein Ordner.</translation>
    </message>
    <message>
        <source>It lies on another disk than the account's folder.</source>
        <translation>Es liegt auf einem anderen Laufwerk als der Ordner des Kontos.</translation>
    </message>
    <message>
        <source>It lies on another disk than the store.</source>
        <translation>Es liegt auf einem anderen Datenträger als die Ablage.</translation>
    </message>
    <message>
        <source>Delete or Bring Back?</source>
        <translation>Löschen oder zurückholen?</translation>
    </message>
    <message>
        <source>Bring Them Back</source>
        <translation>Zurückholen</translation>
    </message>
    <message>
        <source>Delete on the Account Too</source>
        <translation>Auch im Konto löschen</translation>
    </message>
    <message>
        <source>Delete on This Device Too</source>
        <translation>Auch auf diesem Gerät löschen</translation>
    </message>
    <message>
        <source>Decide Later</source>
        <translation>Später entscheiden</translation>
    </message>
    <message>
        <source>%1$@ items have vanished from this device. Nothing is deleted on your account until you say so.</source>
        <translation>%1$@ Objekte sind von diesem Gerät verschwunden. Im Konto wird nichts gelöscht, bis Sie es sagen.</translation>
    </message>
    <message>
        <source>%1$@ items have vanished from your account. Nothing is deleted on this device until you say so.</source>
        <translation>%1$@ Objekte sind aus Ihrem Konto verschwunden. Auf diesem Gerät wird nichts gelöscht, bis Sie es sagen.</translation>
    </message>
    <message>
        <source>“%1$@” is being written to without a pause. It will be on your account some moments after that has ended.</source>
        <translation>„%1$@“ wird ununterbrochen beschrieben. Das Dokument ist im Konto, kurz nachdem das geendet hat.</translation>
    </message>
    <message>
        <source>Documents are being changed without a pause. What is new will be on your account some moments after that has ended.</source>
        <translation>Dokumente werden ununterbrochen geändert. Was neu ist, ist im Konto, kurz nachdem das geendet hat.</translation>
    </message>
    <message>
        <source>%1$@ items have vanished from your account. Nothing is deleted on this device until you say so. %2$@ of them have no copy on this device and cannot be brought back.</source>
        <translation>%1$@ Objekte sind aus Ihrem Konto verschwunden. Auf diesem Gerät wird nichts gelöscht, bis Sie es sagen. %2$@ davon haben keine Kopie auf diesem Gerät und können nicht zurückgebracht werden.</translation>
    </message>
    <message>
        <source>The folder “%1$@” is not there. Connect its disk; nothing was changed.</source>
        <translation>Der Ordner „%1$@“ ist nicht da. Schließen Sie seinen Datenträger an; es wurde nichts geändert.</translation>
    </message>
    <message>
        <source>The disk cannot have an item of that name.</source>
        <translation>Das Laufwerk kann kein Objekt mit diesem Namen aufnehmen.</translation>
    </message>
    <message>
        <source>The name is too long for the disk.</source>
        <translation>Der Name ist zu lang für das Laufwerk.</translation>
    </message>
    <message>
        <source>The name is one that the store uses itself.</source>
        <translation>Die Ablage verwendet diesen Namen selbst.</translation>
    </message>
    <message>
        <source>The name is one that the account uses itself.</source>
        <translation>Das Konto verwendet diesen Namen selbst.</translation>
    </message>
    <message>
        <source>Names that begin with “.” and end in “.promise” are kept for promises.</source>
        <translation>Namen, die mit „.“ beginnen und auf „.promise“ enden, sind für Platzhalter reserviert.</translation>
    </message>
    <message>
        <source>Files on the device have the names that its promise would need.</source>
        <translation>Dateien auf dem Gerät haben bereits die Namen, die der Platzhalter bräuchte.</translation>
    </message>
    <message>
        <source>Something else has that name on the device.</source>
        <translation>Etwas anderes auf dem Gerät hat diesen Namen.</translation>
    </message>
    <message>
        <source>A folder on the device has that name.</source>
        <translation>Ein Ordner auf dem Gerät hat diesen Namen.</translation>
    </message>
    <message>
        <source>A file on the device has that name.</source>
        <translation>Eine Datei auf dem Gerät hat diesen Namen.</translation>
    </message>
    <!-- What can go wrong with a file -->
    <message>
        <source>“%1$@” is no longer there. It may have been moved or deleted.</source>
        <translation>„%1$@“ ist nicht mehr da. Vielleicht wurde es verschoben oder gelöscht.</translation>
    </message>
    <message>
        <source>“%1$@” cannot be used here.</source>
        <translation>„%1$@“ kann hier nicht verwendet werden.</translation>
    </message>
    <message>
        <source>You do not have permission to read “%1$@”.</source>
        <translation>Sie haben keine Berechtigung, „%1$@“ zu lesen.</translation>
    </message>
    <message>
        <source>“%1$@” is damaged and cannot be read.</source>
        <translation>„%1$@“ ist beschädigt und kann nicht gelesen werden.</translation>
    </message>
    <message>
        <source>“%1$@” could not be read or written because of a disk error.</source>
        <translation>„%1$@“ konnte wegen eines Laufwerksfehlers nicht gelesen oder geschrieben werden.</translation>
    </message>
    <message>
        <source>You do not have permission to change “%1$@”.</source>
        <translation>Sie haben keine Berechtigung, „%1$@“ zu ändern.</translation>
    </message>
    <message>
        <source>The name “%1$@” cannot be used. Choose a different name.</source>
        <translation>Der Name „%1$@“ kann nicht verwendet werden. Wählen Sie einen anderen Namen.</translation>
    </message>
    <message>
        <source>An item named “%1$@” already exists. Choose a different name.</source>
        <translation>Ein Objekt mit dem Namen „%1$@“ ist bereits vorhanden. Wählen Sie einen anderen Namen.</translation>
    </message>
    <message>
        <source>The name “%1$@” is too long. Choose a shorter one.</source>
        <translation>Der Name „%1$@“ ist zu lang. Wählen Sie einen kürzeren.</translation>
    </message>
    <message>
        <source>The folder “%1$@” is not empty.</source>
        <translation>Der Ordner „%1$@“ ist nicht leer.</translation>
    </message>
    <message>
        <source>There is not enough free space on the disk for “%1$@”. Free some space and try again.</source>
        <translation>Auf dem Laufwerk ist nicht genug Platz für „%1$@“. Geben Sie Platz frei und versuchen Sie es erneut.</translation>
    </message>
    <message>
        <source>“%1$@” cannot be changed because its disk is read-only.</source>
        <translation>„%1$@“ kann nicht geändert werden, weil das Laufwerk schreibgeschützt ist.</translation>
    </message>
    <message>
        <source>The operation was cancelled.</source>
        <translation>Der Vorgang wurde abgebrochen.</translation>
    </message>
    <message>
        <source>A file cannot take the place of a folder, nor a folder that of a file.</source>
        <translation>Eine Datei kann keinen Ordner ersetzen und ein Ordner keine Datei.</translation>
    </message>
    <message>
        <source>The operation on “%1$@” took too long. Try again.</source>
        <translation>Der Vorgang mit „%1$@“ hat zu lange gedauert. Versuchen Sie es erneut.</translation>
    </message>
    <message>
        <source>“%1$@” is in use. Close it elsewhere and try again.</source>
        <translation>„%1$@“ wird verwendet. Schließen Sie es anderswo und versuchen Sie es erneut.</translation>
    </message>
    <message>
        <source>“%1$@” was changed while it was being read. Try again.</source>
        <translation>„%1$@“ wurde während des Lesens geändert. Versuchen Sie es erneut.</translation>
    </message>
    <message>
        <source>“%1$@” lies on another disk and has to be copied there.</source>
        <translation>„%1$@“ liegt auf einem anderen Laufwerk und muss dorthin kopiert werden.</translation>
    </message>
    <message>
        <source>The disk cannot swap “%1$@” and “%2$@”.</source>
        <translation>Das Laufwerk kann „%1$@“ und „%2$@“ nicht vertauschen.</translation>
    </message>
    <message>
        <source>The disk that holds “%1$@” cannot keep this information.</source>
        <translation>Das Laufwerk mit „%1$@“ kann diese Information nicht speichern.</translation>
    </message>
    <!-- Starting, and being asked to open something -->
    <message>
        <source>Tavrin runs already and was asked to come forward.</source>
        <translation>Tavrin läuft bereits und wurde in den Vordergrund gebeten.</translation>
    </message>
    <message>
        <source>Tavrin runs already, but did not take the request: %1$@</source>
        <translation>Tavrin läuft bereits, hat die Anfrage aber nicht angenommen: %1$@</translation>
    </message>
    <message>
        <source>Tavrin runs already, but does not answer. Close its window or end it, and try again.</source>
        <translation>Tavrin läuft bereits, antwortet aber nicht. Schließen Sie das Fenster oder beenden Sie Tavrin, und versuchen Sie es erneut.</translation>
    </message>
    <message>
        <source>Tavrin is busy with other requests. Try again.</source>
        <translation>Tavrin ist mit anderen Anfragen beschäftigt. Versuchen Sie es erneut.</translation>
    </message>
    <message>
        <source>Tavrin was started but does not answer.</source>
        <translation>Tavrin wurde gestartet, antwortet aber nicht.</translation>
    </message>
    <message>
        <source>Tavrin could not start (exit status %1$@).</source>
        <translation>Tavrin konnte nicht starten (Exit-Status %1$@).</translation>
    </message>
    <message>
        <source>“%1$@” could not be started (%2$@). Install Tavrin again.</source>
        <translation>„%1$@“ konnte nicht gestartet werden (%2$@). Installieren Sie Tavrin neu.</translation>
    </message>
    <message>
        <source>“%1$@” is no address of the kind tavrinapp:…</source>
        <translation>„%1$@“ ist keine Adresse der Art tavrinapp:…</translation>
    </message>
    <message>
        <source>More than %@ addresses at once are not taken.</source>
        <translation>Mehr als %@ Adressen auf einmal werden nicht angenommen.</translation>
    </message>
    <message>
        <source>An address of more than %@ characters names no document.</source>
        <translation>Eine Adresse mit mehr als %@ Zeichen bezeichnet kein Dokument.</translation>
    </message>
    <message>
        <source>The request is damaged and was not taken.</source>
        <translation>Die Anfrage ist beschädigt und wurde nicht angenommen.</translation>
    </message>
    <message>
        <source>The folder “%1$@” belongs to somebody else. Remove it, or have it removed, and start again.</source>
        <translation>Der Ordner „%1$@“ gehört jemand anderem. Entfernen Sie ihn oder lassen Sie ihn entfernen, und starten Sie erneut.</translation>
    </message>
    <!-- A WebDAV server -->
    <message>
        <source>This is not the address of a server. It begins with “https://”.</source>
        <translation>Das ist keine Adresse eines Servers. Sie beginnt mit „https://“.</translation>
    </message>
    <message>
        <source>The address of a WebDAV server begins with “https://” or “http://”.</source>
        <translation>Die Adresse eines WebDAV-Servers beginnt mit „https://“ oder „http://“.</translation>
    </message>
    <message>
        <source>Give the user and the password apart from the address.</source>
        <translation>Geben Sie Benutzer und Passwort getrennt von der Adresse an.</translation>
    </message>
    <message>
        <source>The address of a WebDAV folder has neither a “?” nor a “#” in it.</source>
        <translation>Die Adresse eines WebDAV-Ordners enthält weder „?“ noch „#“.</translation>
    </message>
    <message>
        <source>The path in the address is not well-formed.</source>
        <translation>Der Pfad in der Adresse ist nicht wohlgeformt.</translation>
    </message>
    <message>
        <source>The name is not valid UTF-8, and a WebDAV server takes no other.</source>
        <translation>Der Name ist kein gültiges UTF-8, und ein WebDAV-Server nimmt keinen anderen.</translation>
    </message>
    <message>
        <source>The server does not list names that begin with a dot, so that the item would look deleted.</source>
        <translation>Der Server zeigt Namen nicht, die mit einem Punkt beginnen; das Objekt sähe wie gelöscht aus.</translation>
    </message>
    <message>
        <source>The account on the server takes no changes; “%1$@” stays as it is there.</source>
        <translation>Das Konto auf dem Server nimmt keine Änderungen an; „%1$@“ bleibt dort, wie es ist.</translation>
    </message>
    <message>
        <source>The server replaces what stands at a name without being asked to. Nothing is changed on it.</source>
        <translation>Der Server ersetzt ungefragt, was unter einem Namen steht. Auf ihm wird nichts geändert.</translation>
    </message>
    <message>
        <source>“%1$@” was changed while it was being replaced. What was there lies at “%2$@” on the server.</source>
        <translation>„%1$@“ wurde geändert, während es ersetzt wurde. Was dort war, liegt unter „%2$@“ auf dem Server.</translation>
    </message>
    <message>
        <source>The server's list of “%1$@” makes no sense. Nothing is concluded from it; it is asked again later.</source>
        <translation>Die Liste des Servers von „%1$@“ ergibt keinen Sinn. Daraus wird nichts geschlossen; er wird später wieder gefragt.</translation>
    </message>
    <message>
        <source>The server's list of a folder is not whole or not well-formed. Nothing is concluded from it; it is asked again later.</source>
        <translation>Die Liste eines Ordners vom Server ist nicht vollständig oder nicht wohlgeformt. Daraus wird nichts geschlossen; er wird später wieder gefragt.</translation>
    </message>
    <message>
        <source>Its name is not valid UTF-8.</source>
        <translation>Sein Name ist kein gültiges UTF-8.</translation>
    </message>
    <message>
        <source>The server does not allow it to be read.</source>
        <translation>Der Server erlaubt nicht, es zu lesen.</translation>
    </message>
    <message>
        <source>The server does not tell its size.</source>
        <translation>Der Server nennt seine Größe nicht.</translation>
    </message>
    <message>
        <source>The server “%1$@” cannot be reached. Check the network and the address.</source>
        <translation>Der Server „%1$@“ ist nicht zu erreichen. Prüfen Sie Netz und Adresse.</translation>
    </message>
    <message>
        <source>The server “%1$@” cannot prove who it is: its certificate is not valid or not known here. Nothing was sent to it.</source>
        <translation>Der Server „%1$@“ kann nicht beweisen, wer er ist: Sein Zertifikat ist ungültig oder hier nicht bekannt. Ihm wurde nichts gesendet.</translation>
    </message>
    <message>
        <source>The server “%1$@” does not answer any more. It is tried again.</source>
        <translation>Der Server „%1$@“ antwortet nicht mehr. Es wird wieder versucht.</translation>
    </message>
    <message>
        <source>The connection to the server “%1$@” broke off. It is tried again.</source>
        <translation>Die Verbindung zum Server „%1$@“ ist abgerissen. Es wird wieder versucht.</translation>
    </message>
    <message>
        <source>The server does not accept the user or the password. Sign in again.</source>
        <translation>Der Server nimmt Benutzer oder Passwort nicht an. Melden Sie sich neu an.</translation>
    </message>
    <message>
        <source>The server sends on to “%1$@”, which is not followed. Sign in with that address if it is the right one.</source>
        <translation>Der Server verweist auf „%1$@“; dem wird nicht gefolgt. Melden Sie sich mit dieser Adresse an, wenn sie die richtige ist.</translation>
    </message>
    <message>
        <source>The server is busy and asks to be left alone for %1$@ seconds. Everything waits until then.</source>
        <translation>Der Server ist beschäftigt und will %1$@ Sekunden in Ruhe gelassen werden. Bis dahin wartet alles.</translation>
    </message>
    <message>
        <source>The server does not allow “%1$@” to be changed.</source>
        <translation>Der Server erlaubt nicht, „%1$@“ zu ändern.</translation>
    </message>
    <message>
        <source>The server does not allow “%1$@” to be read.</source>
        <translation>Der Server erlaubt nicht, „%1$@“ zu lesen.</translation>
    </message>
    <message>
        <source>The server takes no file as large as “%1$@”.</source>
        <translation>Der Server nimmt keine so große Datei wie „%1$@“ an.</translation>
    </message>
    <message>
        <source>“%1$@” is locked on the server by another program. It is tried again.</source>
        <translation>„%1$@“ ist auf dem Server von einem anderen Programm gesperrt. Es wird wieder versucht.</translation>
    </message>
    <message>
        <source>The server does not reach what stands behind it. It is tried again.</source>
        <translation>Der Server erreicht nicht, was hinter ihm steht. Es wird wieder versucht.</translation>
    </message>
    <message>
        <source>The server refused a request for “%1$@” (%2$@). It is tried again.</source>
        <translation>Der Server hat eine Anfrage nach „%1$@“ abgelehnt (%2$@). Es wird wieder versucht.</translation>
    </message>
    <message>
        <source>The server sends “%1$@” in an encoding that was not asked for.</source>
        <translation>Der Server sendet „%1$@“ in einer Kodierung, nach der nicht gefragt war.</translation>
    </message>
    <message>
        <source>What the server sent of “%1$@” does not have the checksum that the server gives. It is tried again.</source>
        <translation>Was der Server von „%1$@“ gesendet hat, hat nicht die Prüfsumme, die er nennt. Es wird wieder versucht.</translation>
    </message>
    <message>
        <source>What is at “%1$@” now is not what this account was linked with. Nothing is changed until it is back.</source>
        <translation>Was jetzt unter „%1$@“ liegt, ist nicht das, womit dieses Konto verbunden wurde. Nichts wird geändert, bis es wieder da ist.</translation>
    </message>
    <message>
        <source>The name is too long for the server.</source>
        <translation>Der Name ist zu lang für den Server.</translation>
    </message>
    <message>
        <source>The server answers for “%1$@”, and not as a WebDAV server does. Check the address: it is that of a folder, and often longer than that of the site.</source>
        <translation>Der Server antwortet für „%1$@“, aber nicht wie ein WebDAV-Server. Prüfen Sie die Adresse: Sie ist die eines Ordners und oft länger als die der Site.</translation>
    </message>
    <message>
        <source>There is nothing at “%1$@” on the server. Check the address.</source>
        <translation>Unter „%1$@“ ist auf dem Server nichts. Prüfen Sie die Adresse.</translation>
    </message>
    <message>
        <source>The server does not allow the folder “%1$@” to be read.</source>
        <translation>Der Server erlaubt nicht, den Ordner „%1$@“ zu lesen.</translation>
    </message>
    <message>
        <source>The server has a fault of its own and does not answer for “%1$@”. It is tried again.</source>
        <translation>Der Server hat einen eigenen Fehler und antwortet nicht für „%1$@“. Es wird wieder versucht.</translation>
    </message>
</context>
<!-- The menu of a text field is the toolkit's own. -->
<context>
    <name>QLineEdit</name>
    <message>
        <source>&amp;Undo</source>
        <translation>&amp;Rückgängig</translation>
    </message>
    <message>
        <source>&amp;Redo</source>
        <translation>&amp;Wiederherstellen</translation>
    </message>
    <message>
        <source>Cu&amp;t</source>
        <translation>&amp;Ausschneiden</translation>
    </message>
    <message>
        <source>&amp;Copy</source>
        <translation>&amp;Kopieren</translation>
    </message>
    <message>
        <source>&amp;Paste</source>
        <translation>&amp;Einfügen</translation>
    </message>
    <message>
        <source>Delete</source>
        <translation>Löschen</translation>
    </message>
    <message>
        <source>Select All</source>
        <translation>Alles auswählen</translation>
    </message>
</context>
</TS>

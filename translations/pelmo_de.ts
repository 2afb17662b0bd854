<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="de_DE">
<context>
    <name>LocalizedStrings</name>
    <message>
        <source>The data folder for the address book cannot be created.</source>
        <translation>Der Datenordner für das Adressbuch kann nicht angelegt werden.</translation>
    </message>
    <message>
        <source>A name cannot hold a line break or another control character.</source>
        <translation>Ein Name darf keinen Zeilenumbruch und kein anderes Steuerzeichen enthalten.</translation>
    </message>
    <message>
        <source>A person needs a first or a last name.</source>
        <translation>Eine Person braucht einen Vor- oder Nachnamen.</translation>
    </message>
    <message>
        <source>&quot;%1&quot; is not an e-mail address.</source>
        <translation>„%1“ ist keine E-Mail-Adresse.</translation>
    </message>
    <message>
        <source>One of the person&apos;s addresses must be the primary one.</source>
        <translation>Eine der Adressen der Person muss die Hauptadresse sein.</translation>
    </message>
    <message>
        <source>The address book &quot;%1&quot; cannot be used: %2</source>
        <translation>Das Adressbuch „%1“ kann nicht verwendet werden: %2</translation>
    </message>
    <message>
        <source>The address book has no group named &quot;%1&quot;.</source>
        <translation>Das Adressbuch hat keine Gruppe namens „%1“.</translation>
    </message>
    <message>
        <source>The file &quot;%1&quot; cannot be written: %2</source>
        <translation>Die Datei „%1“ kann nicht geschrieben werden: %2</translation>
    </message>
    <message>
        <source>The address book has no person numbered %1.</source>
        <translation>Das Adressbuch hat keine Person mit der Nummer %1.</translation>
    </message>
    <message>
        <source>The address book has no group numbered %1.</source>
        <translation>Das Adressbuch hat keine Gruppe mit der Nummer %1.</translation>
    </message>
    <message>
        <source>A group needs a name.</source>
        <translation>Eine Gruppe braucht einen Namen.</translation>
    </message>
    <message>
        <source>There is already a group named &quot;%1&quot;.</source>
        <translation>Es gibt bereits eine Gruppe namens „%1“.</translation>
    </message>
    <message>
        <source>the file cannot be read: %1</source>
        <translation>die Datei kann nicht gelesen werden: %1</translation>
    </message>
    <message>
        <source>the quoted field that opens here is not closed</source>
        <translation>das hier beginnende Feld in Anführungszeichen wird nicht geschlossen</translation>
    </message>
    <message>
        <source>the header row names no e-mail column (expected &quot;first name&quot;, &quot;last name&quot;, &quot;e-mail&quot; and &quot;groups&quot;, or the columns of a Google, Outlook or Thunderbird export)</source>
        <translation>die Kopfzeile nennt keine E-Mail-Spalte (erwartet werden „first name“, „last name“, „e-mail“ und „groups“ oder die Spalten eines Google-, Outlook- oder Thunderbird-Exports)</translation>
    </message>
    <message>
        <source>a name cannot hold a control character</source>
        <translation>ein Name darf kein Steuerzeichen enthalten</translation>
    </message>
    <message>
        <source>&quot;%1&quot; is not an e-mail address</source>
        <translation>„%1“ ist keine E-Mail-Adresse</translation>
    </message>
    <message>
        <source>a group name cannot hold a control character</source>
        <translation>ein Gruppenname darf kein Steuerzeichen enthalten</translation>
    </message>
    <message>
        <source>the file is empty</source>
        <translation>die Datei ist leer</translation>
    </message>
    <message>
        <source>this row has %1 fields but the header has %2</source>
        <translation>diese Zeile hat %1 Felder, die Kopfzeile aber %2</translation>
    </message>
    <message>
        <source>line %1: %2</source>
        <translation>Zeile %1: %2</translation>
    </message>
    <message>
        <source>Imported %1: %2 added, %3 updated, %4 skipped; %5.</source>
        <translation>%1 importiert: %2 hinzugefügt, %3 aktualisiert, %4 übersprungen; %5.</translation>
    </message>
    <message>
        <source>%1 already in the address book as in the file.</source>
        <translation>%1 bereits so im Adressbuch wie in der Datei.</translation>
    </message>
    <message>
        <source>line %1: %2 (skipped)</source>
        <translation>Zeile %1: %2 (übersprungen)</translation>
    </message>
    <message>
        <source>the character set &quot;%1&quot; is not known</source>
        <translation>der Zeichensatz „%1“ ist unbekannt</translation>
    </message>
    <message>
        <source>vCard version &quot;%1&quot; is not supported (2.1, 3.0 and 4.0 are)</source>
        <translation>vCard-Version „%1“ wird nicht unterstützt (unterstützt werden 2.1, 3.0 und 4.0)</translation>
    </message>
    <message>
        <source>the file holds no vCard</source>
        <translation>die Datei enthält keine vCard</translation>
    </message>
    <message>
        <source>this line has no &quot;:&quot; between a property and its value</source>
        <translation>diese Zeile hat kein „:“ zwischen Eigenschaft und Wert</translation>
    </message>
    <message>
        <source>&quot;%1&quot; stands outside BEGIN:VCARD and END:VCARD</source>
        <translation>„%1“ steht außerhalb von BEGIN:VCARD und END:VCARD</translation>
    </message>
    <message>
        <source>a carriage return stands inside the %1 property</source>
        <translation>in der Eigenschaft %1 steht ein Wagenrücklauf</translation>
    </message>
    <message>
        <source>&quot;BEGIN:%1&quot; does not begin a vCard</source>
        <translation>„BEGIN:%1“ beginnt keine vCard</translation>
    </message>
    <message>
        <source>this card has no END:VCARD</source>
        <translation>dieser Karte fehlt END:VCARD</translation>
    </message>
    <message>
        <source>Send</source>
        <translation>Senden</translation>
    </message>
    <message>
        <source>the address book has no group &quot;%1&quot;; it has no groups yet.</source>
        <translation>das Adressbuch hat keine Gruppe „%1“; es hat noch gar keine Gruppen.</translation>
    </message>
    <message>
        <source>the address book has no group &quot;%1&quot;; its groups are: %2.</source>
        <translation>das Adressbuch hat keine Gruppe „%1“; seine Gruppen sind: %2.</translation>
    </message>
    <message>
        <source>Exported %1 to %2.</source>
        <translation>%1 nach %2 exportiert.</translation>
    </message>
    <message>
        <source>Pelmo cannot start</source>
        <translation>Pelmo kann nicht starten</translation>
    </message>
    <message>
        <source>Stop</source>
        <translation>Anhalten</translation>
    </message>
    <message>
        <source>Sending mail.</source>
        <translation>E-Mails werden gesendet.</translation>
    </message>
    <message>
        <source>No e-mail address.</source>
        <translation>Keine E-Mail-Adresse.</translation>
    </message>
    <message>
        <source>[Mailing started at </source>
        <translation>[Versand begonnen am </translation>
    </message>
    <message>
        <source>]</source>
        <translation>]</translation>
    </message>
    <message>
        <source> Mail to: </source>
        <translation> E-Mail an: </translation>
    </message>
    <message>
        <source>The connection closed before the message was accepted.</source>
        <translation>Die Verbindung wurde geschlossen, bevor die Nachricht angenommen war.</translation>
    </message>
    <message>
        <source>[Mailing completed at </source>
        <translation>[Versand abgeschlossen am </translation>
    </message>
    <message>
        <source>Name</source>
        <translation>Name</translation>
    </message>
    <message>
        <source>Email Address</source>
        <translation>E-Mail-Adresse</translation>
    </message>
    <message>
        <source>Reason</source>
        <translation>Grund</translation>
    </message>
    <message>
        <source>Time</source>
        <translation>Zeit</translation>
    </message>
    <message>
        <source>Ready.</source>
        <translation>Bereit.</translation>
    </message>
    <message>
        <source>1 recipient put back, to be mailed first.</source>
        <translation>1 Empfänger zurückgestellt; er wird zuerst angeschrieben.</translation>
    </message>
    <message>
        <source>%1 recipients put back, to be mailed first.</source>
        <translation>%1 Empfänger zurückgestellt; sie werden zuerst angeschrieben.</translation>
    </message>
    <message>
        <source>1 recipient to mail</source>
        <translation>1 Empfänger ausstehend</translation>
    </message>
    <message>
        <source>%1 recipients to mail</source>
        <translation>%1 Empfänger ausstehend</translation>
    </message>
    <message>
        <source>1 member</source>
        <translation>1 Mitglied</translation>
    </message>
    <message>
        <source>%1 members</source>
        <translation>%1 Mitglieder</translation>
    </message>
    <message>
        <source>Group %1: %2, %3 already mailed</source>
        <translation>Gruppe %1: %2, %3 bereits angeschrieben</translation>
    </message>
    <message>
        <source>not available</source>
        <translation>nicht verfügbar</translation>
    </message>
    <message>
        <source> (built with %1)</source>
        <translation> (erstellt mit %1)</translation>
    </message>
    <message>
        <source>OpenSSL not available</source>
        <translation>OpenSSL nicht verfügbar</translation>
    </message>
    <message>
        <source>About Pelmo</source>
        <translation>Über Pelmo</translation>
    </message>
    <message>
        <source>Mails one message to many people, each their own copy.</source>
        <translation>Schickt eine Nachricht an viele Menschen, jedem seine eigene Ausfertigung.</translation>
    </message>
    <message>
        <source>Pelmo is free software under the &lt;a href=&quot;https://www.gnu.org/licenses/gpl-3.0.html&quot;&gt;GNU General Public License&lt;/a&gt;, version 3 or later. It comes with no warranty.</source>
        <translation>Pelmo ist freie Software unter der &lt;a href=&quot;https://www.gnu.org/licenses/gpl-3.0.html&quot;&gt;GNU General Public License&lt;/a&gt;, Version 3 oder später. Es gibt keinerlei Gewährleistung.</translation>
    </message>
    <message>
        <source>Runs with:</source>
        <translation>Läuft mit:</translation>
    </message>
    <message>
        <source>File</source>
        <translation>Datei</translation>
    </message>
    <message>
        <source>Attachments</source>
        <translation>Anhänge</translation>
    </message>
    <message>
        <source>Drop files here from the file manager; drag a row to change the order. Every message carries these files.</source>
        <translation>Ziehen Sie Dateien aus der Dateiverwaltung hierher; ziehen Sie eine Zeile, um die Reihenfolge zu ändern. Jede Nachricht enthält diese Dateien.</translation>
    </message>
    <message>
        <source>Add Files...</source>
        <translation>Dateien hinzufügen...</translation>
    </message>
    <message>
        <source>Remove</source>
        <translation>Entfernen</translation>
    </message>
    <message>
        <source>Remove the selected files; with none selected, remove every file</source>
        <translation>Die ausgewählten Dateien entfernen; ist keine ausgewählt, alle Dateien entfernen</translation>
    </message>
    <message>
        <source>Add Files</source>
        <translation>Dateien hinzufügen</translation>
    </message>
    <message>
        <source>The file could not be opened.</source>
        <translation>Die Datei konnte nicht geöffnet werden.</translation>
    </message>
    <message>
        <source>No application on this desktop took &quot;%1&quot;.</source>
        <translation>Keine Anwendung dieser Arbeitsumgebung hat „%1“ übernommen.</translation>
    </message>
    <message>
        <source>Import Contacts</source>
        <translation>Kontakte importieren</translation>
    </message>
    <message>
        <source>Contacts (*.vcf *.vcard *.csv)</source>
        <translation>Kontakte (*.vcf *.vcard *.csv)</translation>
    </message>
    <message>
        <source>All files (*)</source>
        <translation>Alle Dateien (*)</translation>
    </message>
    <message>
        <source>%1 was not imported: %2</source>
        <translation>%1 wurde nicht importiert: %2</translation>
    </message>
    <message>
        <source>1 value was left out; see Show Details.</source>
        <translation>1 Wert wurde ausgelassen; siehe Details anzeigen.</translation>
    </message>
    <message>
        <source>%1 values were left out; see Show Details.</source>
        <translation>%1 Werte wurden ausgelassen; siehe Details anzeigen.</translation>
    </message>
    <message>
        <source>Export All Contacts</source>
        <translation>Alle Kontakte exportieren</translation>
    </message>
    <message>
        <source>Export %1</source>
        <translation>%1 exportieren</translation>
    </message>
    <message>
        <source>vCard (*.vcf)</source>
        <translation>vCard (*.vcf)</translation>
    </message>
    <message>
        <source>Contacts</source>
        <translation>Kontakte</translation>
    </message>
    <message>
        <source>The contacts were not exported.</source>
        <translation>Die Kontakte wurden nicht exportiert.</translation>
    </message>
    <message>
        <source>Format</source>
        <translation>Format</translation>
    </message>
    <message>
        <source>Font</source>
        <translation>Schriftart</translation>
    </message>
    <message>
        <source>Size</source>
        <translation>Größe</translation>
    </message>
    <message>
        <source>Text Color</source>
        <translation>Textfarbe</translation>
    </message>
    <message>
        <source>Pelmo&apos;s help is not installed here.</source>
        <translation>Die Hilfe von Pelmo ist hier nicht installiert.</translation>
    </message>
    <message>
        <source>It is the file README.md of Pelmo&apos;s sources, which the Debian package installs as %1.</source>
        <translation>Es ist die Datei README.md aus den Quellen von Pelmo, die das Debian-Paket als %1 installiert.</translation>
    </message>
    <message>
        <source>No application could open Pelmo&apos;s help.</source>
        <translation>Keine Anwendung konnte die Hilfe von Pelmo öffnen.</translation>
    </message>
    <message>
        <source>It is the file %1.</source>
        <translation>Es ist die Datei %1.</translation>
    </message>
    <message>
        <source>Activity Log</source>
        <translation>Aktivitätsprotokoll</translation>
    </message>
    <message>
        <source>Find</source>
        <translation>Suchen</translation>
    </message>
    <message>
        <source>Open in Editor</source>
        <translation>Im Editor öffnen</translation>
    </message>
    <message>
        <source>Pelmo</source>
        <translation>Pelmo</translation>
    </message>
    <message>
        <source>Recipient Address:</source>
        <translation>Empfängeradresse:</translation>
    </message>
    <message>
        <source>Recipients Name:</source>
        <translation>Name des Empfängers:</translation>
    </message>
    <message>
        <source>Subject:</source>
        <translation>Betreff:</translation>
    </message>
    <message>
        <source>Web Page</source>
        <translation>Webseite</translation>
    </message>
    <message>
        <source>Take the address and title of the page your web browser shows</source>
        <translation>Adresse und Titel der Seite übernehmen, die Ihr Webbrowser anzeigt</translation>
    </message>
    <message>
        <source>Web Page:</source>
        <translation>Webseite:</translation>
    </message>
    <message>
        <source>Write the message here. {toName}, {to}, {fromName}, {from} and {subject} become each copy&apos;s own values.</source>
        <translation>Schreiben Sie die Nachricht hier. {toName}, {to}, {fromName}, {from} und {subject} werden in jeder Ausfertigung durch deren eigene Werte ersetzt.</translation>
    </message>
    <message>
        <source>Send the message (Ctrl+Return)</source>
        <translation>Die Nachricht senden (Strg+Eingabe)</translation>
    </message>
    <message>
        <source>Preferences</source>
        <translation>Einstellungen</translation>
    </message>
    <message>
        <source>Addresses</source>
        <translation>Adressen</translation>
    </message>
    <message>
        <source>Console</source>
        <translation>Konsole</translation>
    </message>
    <message>
        <source>Show the activity log</source>
        <translation>Das Aktivitätsprotokoll anzeigen</translation>
    </message>
    <message>
        <source>Sent Recipients</source>
        <translation>Angeschriebene Empfänger</translation>
    </message>
    <message>
        <source>Make Pelmo the Default Mail Client</source>
        <translation>Pelmo zum Standard-E-Mail-Programm machen</translation>
    </message>
    <message>
        <source>Quit</source>
        <translation>Beenden</translation>
    </message>
    <message>
        <source>Tools</source>
        <translation>Werkzeuge</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <translation>&amp;Datei</translation>
    </message>
    <message>
        <source>Import Contacts…</source>
        <translation>Kontakte importieren…</translation>
    </message>
    <message>
        <source>Export Contacts…</source>
        <translation>Kontakte exportieren…</translation>
    </message>
    <message>
        <source>&amp;Message</source>
        <translation>&amp;Nachricht</translation>
    </message>
    <message>
        <source>&amp;Window</source>
        <translation>&amp;Fenster</translation>
    </message>
    <message>
        <source>&amp;Help</source>
        <translation>&amp;Hilfe</translation>
    </message>
    <message>
        <source>Pelmo Help</source>
        <translation>Pelmo-Hilfe</translation>
    </message>
    <message>
        <source>About Qt</source>
        <translation>Über Qt</translation>
    </message>
    <message>
        <source>Discard this message?</source>
        <translation>Diese Nachricht verwerfen?</translation>
    </message>
    <message>
        <source>Discard</source>
        <translation>Verwerfen</translation>
    </message>
    <message>
        <source>The recipient address is not an e-mail address</source>
        <translation>Die Empfängeradresse ist keine E-Mail-Adresse</translation>
    </message>
    <message>
        <source>&quot;%1&quot; cannot be mailed. Type an address such as name@example.org, or choose a person or a group in Addresses.</source>
        <translation>An „%1“ kann nicht geschrieben werden. Geben Sie eine Adresse wie name@example.org ein oder wählen Sie unter Adressen eine Person oder eine Gruppe.</translation>
    </message>
    <message>
        <source>Send without a subject?</source>
        <translation>Ohne Betreff senden?</translation>
    </message>
    <message>
        <source>%1 was already mailed in this session. Send again?</source>
        <translation>%1 wurde in dieser Sitzung bereits angeschrieben. Erneut senden?</translation>
    </message>
    <message>
        <source>Send Again</source>
        <translation>Erneut senden</translation>
    </message>
    <message>
        <source>Software Update…</source>
        <translation>Softwareaktualisierung…</translation>
    </message>
    <message>
        <source>(no name)</source>
        <translation>(kein Name)</translation>
    </message>
    <message>
        <source>Choose a group to mail each of its members, or a person to mail one message.</source>
        <translation>Wählen Sie eine Gruppe, um jedem ihrer Mitglieder zu schreiben, oder eine Person für eine einzelne Nachricht.</translation>
    </message>
    <message>
        <source>Search names and addresses</source>
        <translation>Namen und Adressen durchsuchen</translation>
    </message>
    <message>
        <source>Groups</source>
        <translation>Gruppen</translation>
    </message>
    <message>
        <source>Add the selected persons to a group, or remove them from the group shown</source>
        <translation>Die ausgewählten Personen einer Gruppe hinzufügen oder aus der angezeigten Gruppe entfernen</translation>
    </message>
    <message>
        <source>All</source>
        <translation>Alle</translation>
    </message>
    <message>
        <source>Primary address</source>
        <translation>Hauptadresse</translation>
    </message>
    <message>
        <source>The address book was not changed.</source>
        <translation>Das Adressbuch wurde nicht geändert.</translation>
    </message>
    <message>
        <source>Group name:</source>
        <translation>Gruppenname:</translation>
    </message>
    <message>
        <source>New Group</source>
        <translation>Neue Gruppe</translation>
    </message>
    <message>
        <source>Rename Group</source>
        <translation>Gruppe umbenennen</translation>
    </message>
    <message>
        <source>Delete the group &quot;%1&quot;?</source>
        <translation>Die Gruppe „%1“ löschen?</translation>
    </message>
    <message>
        <source>Its members stay in the address book.</source>
        <translation>Ihre Mitglieder bleiben im Adressbuch.</translation>
    </message>
    <message>
        <source>Delete Group</source>
        <translation>Gruppe löschen</translation>
    </message>
    <message>
        <source>Delete &quot;%1&quot; from the address book?</source>
        <translation>„%1“ aus dem Adressbuch löschen?</translation>
    </message>
    <message>
        <source>Delete %1 persons from the address book?</source>
        <translation>%1 Personen aus dem Adressbuch löschen?</translation>
    </message>
    <message>
        <source>They are taken out of every group too.</source>
        <translation>Sie werden auch aus allen Gruppen entfernt.</translation>
    </message>
    <message>
        <source>Delete</source>
        <translation>Löschen</translation>
    </message>
    <message>
        <source>Add to &quot;%1&quot;</source>
        <translation>Zu „%1“ hinzufügen</translation>
    </message>
    <message>
        <source>Remove from &quot;%1&quot;</source>
        <translation>Aus „%1“ entfernen</translation>
    </message>
    <message>
        <source>New Person</source>
        <translation>Neue Person</translation>
    </message>
    <message>
        <source>Edit Person</source>
        <translation>Person bearbeiten</translation>
    </message>
    <message>
        <source>First name:</source>
        <translation>Vorname:</translation>
    </message>
    <message>
        <source>Last name:</source>
        <translation>Nachname:</translation>
    </message>
    <message>
        <source>Email addresses:</source>
        <translation>E-Mail-Adressen:</translation>
    </message>
    <message>
        <source>Groups:</source>
        <translation>Gruppen:</translation>
    </message>
    <message>
        <source>Primary</source>
        <translation>Hauptadresse</translation>
    </message>
    <message>
        <source>Address</source>
        <translation>Adresse</translation>
    </message>
    <message>
        <source>Add Address</source>
        <translation>Adresse hinzufügen</translation>
    </message>
    <message>
        <source>Remove Address</source>
        <translation>Adresse entfernen</translation>
    </message>
    <message>
        <source>Mail this address</source>
        <translation>An diese Adresse schreiben</translation>
    </message>
    <message>
        <source>The person was not saved.</source>
        <translation>Die Person wurde nicht gespeichert.</translation>
    </message>
    <message>
        <source>25 or 587 for STARTTLS, 465 for SSL from the start</source>
        <translation>25 oder 587 für STARTTLS, 465 für SSL von Beginn an</translation>
    </message>
    <message>
        <source>Port:</source>
        <translation>Port:</translation>
    </message>
    <message>
        <source>Use SSL</source>
        <translation>SSL verwenden</translation>
    </message>
    <message>
        <source>Password:</source>
        <translation>Passwort:</translation>
    </message>
    <message>
        <source>Check for software updates at start-up</source>
        <translation>Beim Start nach Softwareaktualisierungen suchen</translation>
    </message>
    <message>
        <source>Pelmo is your default mail client.</source>
        <translation>Pelmo ist Ihr Standard-E-Mail-Programm.</translation>
    </message>
    <message>
        <source>No application handles links to e-mail addresses.</source>
        <translation>Keine Anwendung öffnet Links auf E-Mail-Adressen.</translation>
    </message>
    <message>
        <source>Links to e-mail addresses open in %1.</source>
        <translation>Links auf E-Mail-Adressen öffnen sich in %1.</translation>
    </message>
    <message>
        <source>The password is kept in the system keyring.</source>
        <translation>Das Passwort wird im Schlüsselbund des Systems aufbewahrt.</translation>
    </message>
    <message>
        <source>The password is kept in the settings file %1.</source>
        <translation>Das Passwort wird in der Einstellungsdatei %1 aufbewahrt.</translation>
    </message>
    <message>
        <source>No keyring answered: the password is kept in the settings file %1.</source>
        <translation>Kein Schlüsselbund hat geantwortet: Das Passwort wird in der Einstellungsdatei %1 aufbewahrt.</translation>
    </message>
    <message>
        <source>A password entered here will be kept in the system keyring.</source>
        <translation>Ein hier eingegebenes Passwort wird im Schlüsselbund des Systems aufbewahrt.</translation>
    </message>
    <message>
        <source>No keyring answered: a password entered here will be kept in the settings file %1.</source>
        <translation>Kein Schlüsselbund hat geantwortet: Ein hier eingegebenes Passwort wird in der Einstellungsdatei %1 aufbewahrt.</translation>
    </message>
    <message>
        <source>Reset</source>
        <translation>Zurücksetzen</translation>
    </message>
    <message>
        <source>Forget who was mailed, so that they can be mailed again</source>
        <translation>Vergessen, wer angeschrieben wurde, damit erneut an sie geschrieben werden kann</translation>
    </message>
    <message>
        <source>Forget the 1 sent recipient? They may be mailed again.</source>
        <translation>Den 1 angeschriebenen Empfänger vergessen? Er kann dann erneut angeschrieben werden.</translation>
    </message>
    <message>
        <source>Forget the %1 sent recipients? They may be mailed again.</source>
        <translation>Die %1 angeschriebenen Empfänger vergessen? Sie können dann erneut angeschrieben werden.</translation>
    </message>
    <message>
        <source>Forget</source>
        <translation>Vergessen</translation>
    </message>
    <message>
        <source>&amp;Mailed</source>
        <translation>&amp;Angeschrieben</translation>
    </message>
    <message>
        <source>Put Back</source>
        <translation>Zurückstellen</translation>
    </message>
    <message>
        <source>Mail the selected persons, or all of them when none is selected, first at the next Send</source>
        <translation>Beim nächsten Senden zuerst an die ausgewählten Personen schreiben, oder an alle, wenn keine ausgewählt ist</translation>
    </message>
    <message>
        <source>&amp;Not mailed</source>
        <translation>&amp;Nicht angeschrieben</translation>
    </message>
    <message>
        <source>Not checked yet</source>
        <translation>Noch nicht geprüft</translation>
    </message>
    <message>
        <source>Check Now</source>
        <translation>Jetzt prüfen</translation>
    </message>
    <message>
        <source>Download</source>
        <translation>Herunterladen</translation>
    </message>
    <message>
        <source>Software Update</source>
        <translation>Softwareaktualisierung</translation>
    </message>
    <message>
        <source>Your version:</source>
        <translation>Ihre Version:</translation>
    </message>
    <message>
        <source>Published version:</source>
        <translation>Veröffentlichte Version:</translation>
    </message>
    <message>
        <source>The %1 holds a line break or a null character, which cannot go into a mail header.</source>
        <translation>%1 enthält einen Zeilenumbruch oder ein Nullzeichen, was in einer E-Mail-Kopfzeile nicht stehen darf.</translation>
    </message>
    <message>
        <source>name of the attachment &quot;%1&quot;</source>
        <translation>Der Name des Anhangs „%1“</translation>
    </message>
    <message>
        <source>The %1 is empty.</source>
        <translation>%1 ist leer.</translation>
    </message>
    <message>
        <source>subject</source>
        <translation>Der Betreff</translation>
    </message>
    <message>
        <source>sender&apos;s name</source>
        <translation>Der Name des Absenders</translation>
    </message>
    <message>
        <source>sender&apos;s address</source>
        <translation>Die Adresse des Absenders</translation>
    </message>
    <message>
        <source>recipient&apos;s name</source>
        <translation>Der Name des Empfängers</translation>
    </message>
    <message>
        <source>recipient&apos;s address</source>
        <translation>Die Adresse des Empfängers</translation>
    </message>
    <message>
        <source>content type</source>
        <translation>Der Inhaltstyp</translation>
    </message>
    <message>
        <source>The message has no sender or no recipient.</source>
        <translation>Die Nachricht hat keinen Absender oder keinen Empfänger.</translation>
    </message>
    <message>
        <source>Connection lost.</source>
        <translation>Verbindung verloren.</translation>
    </message>
    <message>
        <source>Starting SSL.</source>
        <translation>SSL wird gestartet.</translation>
    </message>
    <message>
        <source>SSL handshaking...</source>
        <translation>SSL-Handshake...</translation>
    </message>
    <message>
        <source>Sending the message.</source>
        <translation>Die Nachricht wird gesendet.</translation>
    </message>
    <message>
        <source>The login method chosen in Preferences is unknown.</source>
        <translation>Die in den Einstellungen gewählte Anmeldemethode ist unbekannt.</translation>
    </message>
    <message>
        <source>Authentication completed. Sending the message.</source>
        <translation>Anmeldung abgeschlossen. Die Nachricht wird gesendet.</translation>
    </message>
    <message>
        <source>Authentication failed. Closing the connection.</source>
        <translation>Anmeldung fehlgeschlagen. Die Verbindung wird geschlossen.</translation>
    </message>
    <message>
        <source>Authentication failed.</source>
        <translation>Anmeldung fehlgeschlagen.</translation>
    </message>
    <message>
        <source>Message sent. Closing the connection.</source>
        <translation>Nachricht gesendet. Die Verbindung wird geschlossen.</translation>
    </message>
    <message>
        <source>The server refused the message.</source>
        <translation>Der Server hat die Nachricht abgelehnt.</translation>
    </message>
    <message>
        <source>Connection closed. Done.</source>
        <translation>Verbindung geschlossen. Fertig.</translation>
    </message>
    <message>
        <source>(You can turn off automatic software update checks in Preferences.)</source>
        <translation>(Die automatische Suche nach Softwareaktualisierungen können Sie in den Einstellungen abschalten.)</translation>
    </message>
    <message>
        <source>Checking for a software update...</source>
        <translation>Suche nach einer Softwareaktualisierung...</translation>
    </message>
    <message>
        <source>Pelmo could not check for a software update at this time.</source>
        <translation>Pelmo konnte gerade nicht nach einer Softwareaktualisierung suchen.</translation>
    </message>
    <message>
        <source>Loaded the version information...</source>
        <translation>Versionsinformationen geladen...</translation>
    </message>
    <message>
        <source>The current version information could not be read.</source>
        <translation>Die aktuellen Versionsinformationen konnten nicht gelesen werden.</translation>
    </message>
    <message>
        <source>An update is available for Pelmo.</source>
        <translation>Für Pelmo ist eine Aktualisierung verfügbar.</translation>
    </message>
    <message>
        <source>Your software is up to date.</source>
        <translation>Ihre Software ist auf dem neuesten Stand.</translation>
    </message>
    <message>
        <source>The download could not start.</source>
        <translation>Das Herunterladen konnte nicht beginnen.</translation>
    </message>
    <message>
        <source>The download was redirected too many times.</source>
        <translation>Das Herunterladen wurde zu oft umgeleitet.</translation>
    </message>
    <message>
        <source>The download was redirected to another host without HTTPS.</source>
        <translation>Das Herunterladen wurde ohne HTTPS auf einen anderen Server umgeleitet.</translation>
    </message>
    <message>
        <source>Pelmo update</source>
        <translation>Pelmo-Aktualisierung</translation>
    </message>
    <message>
        <source>Bytes received : %d</source>
        <translation>Empfangene Bytes: %d</translation>
    </message>
    <message>
        <source>Percent complete : %f</source>
        <translation>Prozent abgeschlossen: %f</translation>
    </message>
    <message>
        <source>The server did not send the file.</source>
        <translation>Der Server hat die Datei nicht gesendet.</translation>
    </message>
    <message>
        <source>The server sent less than it announced.</source>
        <translation>Der Server hat weniger gesendet als angekündigt.</translation>
    </message>
    <message>
        <source>The download has completed.</source>
        <translation>Das Herunterladen ist abgeschlossen.</translation>
    </message>
    <message>
        <source>a double quote stands inside a field that does not begin with one</source>
        <translation>ein doppeltes Anführungszeichen steht in einem Feld, das nicht mit einem beginnt</translation>
    </message>
    <message>
        <source>text follows the closing quote of a field</source>
        <translation>auf das schließende Anführungszeichen eines Feldes folgt Text</translation>
    </message>
    <message>
        <source>person</source>
        <translation>Person</translation>
    </message>
    <message>
        <source>persons</source>
        <translation>Personen</translation>
    </message>
    <message>
        <source>new group</source>
        <translation>neue Gruppe</translation>
    </message>
    <message>
        <source>new groups</source>
        <translation>neue Gruppen</translation>
    </message>
    <message>
        <source>was</source>
        <translation>war</translation>
    </message>
    <message>
        <source>were</source>
        <translation>waren</translation>
    </message>
    <message>
        <source>Could not download &quot;%1&quot;</source>
        <translation>„%1“ konnte nicht heruntergeladen werden</translation>
    </message>
    <message>
        <source>Relinking web page...</source>
        <translation>Links der Webseite werden angepasst...</translation>
    </message>
    <message>
        <source>The sender &apos;Email Address:&apos; preference value has not been specified.</source>
        <translation>Die Einstellung „E-Mail-Adresse:“ des Absenders ist nicht angegeben.</translation>
    </message>
    <message>
        <source>The sender &apos;Name:&apos; preference value has not been specified.</source>
        <translation>Die Einstellung „Name:“ des Absenders ist nicht angegeben.</translation>
    </message>
    <message>
        <source>The outgoing SMTP server &apos;Address:&apos; preference value has not been specified.</source>
        <translation>Die Einstellung „Adresse:“ des SMTP-Postausgangsservers ist nicht angegeben.</translation>
    </message>
    <message>
        <source>The outgoing SMTP server &apos;Port:&apos; preference value is out of range.</source>
        <translation>Die Einstellung „Port:“ des SMTP-Postausgangsservers liegt außerhalb des gültigen Bereichs.</translation>
    </message>
    <message>
        <source>The outgoing SMTP server &apos;Username:&apos; preference value has not been specified.</source>
        <translation>Die Einstellung „Benutzername:“ des SMTP-Postausgangsservers ist nicht angegeben.</translation>
    </message>
    <message>
        <source>The outgoing SMTP server &apos;Password:&apos; preference value has not been specified.</source>
        <translation>Die Einstellung „Passwort:“ des SMTP-Postausgangsservers ist nicht angegeben.</translation>
    </message>
    <message>
        <source>The &apos;Recipient Address:&apos; value has not been specified.</source>
        <translation>Das Feld „Empfängeradresse:“ ist nicht ausgefüllt.</translation>
    </message>
    <message>
        <source>The &apos;Recipients Name:&apos; value has not been specified.</source>
        <translation>Das Feld „Name des Empfängers:“ ist nicht ausgefüllt.</translation>
    </message>
    <message>
        <source>Filtering people by sent recipients...</source>
        <translation>Bereits angeschriebene Personen werden herausgefiltert...</translation>
    </message>
    <message>
        <source>Align Left</source>
        <translation>Linksbündig</translation>
    </message>
    <message>
        <source>Center</source>
        <translation>Zentriert</translation>
    </message>
    <message>
        <source>Align Right</source>
        <translation>Rechtsbündig</translation>
    </message>
    <message>
        <source>Justify</source>
        <translation>Blocksatz</translation>
    </message>
    <message>
        <source>Bold</source>
        <translation>Fett</translation>
    </message>
    <message>
        <source>Italic</source>
        <translation>Kursiv</translation>
    </message>
    <message>
        <source>Underline</source>
        <translation>Unterstrichen</translation>
    </message>
    <message>
        <source>Bulleted List</source>
        <translation>Aufzählung</translation>
    </message>
    <message>
        <source>someone@example.org</source>
        <translation>jemand@example.org</translation>
    </message>
    <message>
        <source>First Last</source>
        <translation>Vorname Nachname</translation>
    </message>
    <message>
        <source>What the message is about</source>
        <translation>Worum es in der Nachricht geht</translation>
    </message>
    <message>
        <source>https://... (a page to mail with every copy)</source>
        <translation>https://... (eine Seite, die jeder Ausfertigung beiliegt)</translation>
    </message>
    <message>
        <source>Rename...</source>
        <translation>Umbenennen...</translation>
    </message>
    <message>
        <source>Rename the group</source>
        <translation>Die Gruppe umbenennen</translation>
    </message>
    <message>
        <source>Delete the group</source>
        <translation>Die Gruppe löschen</translation>
    </message>
    <message>
        <source>&amp;Group</source>
        <translation>&amp;Gruppe</translation>
    </message>
    <message>
        <source>New group</source>
        <translation>Neue Gruppe</translation>
    </message>
    <message>
        <source>Edit...</source>
        <translation>Bearbeiten...</translation>
    </message>
    <message>
        <source>Edit the person&apos;s names, addresses and groups</source>
        <translation>Namen, Adressen und Gruppen der Person bearbeiten</translation>
    </message>
    <message>
        <source>Delete the selected persons from the address book</source>
        <translation>Die ausgewählten Personen aus dem Adressbuch löschen</translation>
    </message>
    <message>
        <source>&amp;Name</source>
        <translation>&amp;Name</translation>
    </message>
    <message>
        <source>New person</source>
        <translation>Neue Person</translation>
    </message>
    <message>
        <source>&amp;Email</source>
        <translation>&amp;E-Mail</translation>
    </message>
    <message>
        <source>Sender</source>
        <translation>Absender</translation>
    </message>
    <message>
        <source>Name:</source>
        <translation>Name:</translation>
    </message>
    <message>
        <source>Email Address:</source>
        <translation>E-Mail-Adresse:</translation>
    </message>
    <message>
        <source>Default Recipient</source>
        <translation>Standardempfänger</translation>
    </message>
    <message>
        <source>Outgoing SMTP Server</source>
        <translation>SMTP-Postausgangsserver</translation>
    </message>
    <message>
        <source>Address:</source>
        <translation>Adresse:</translation>
    </message>
    <message>
        <source>Authentication:</source>
        <translation>Anmeldung:</translation>
    </message>
    <message>
        <source>None</source>
        <translation>Keine</translation>
    </message>
    <message>
        <source>Username:</source>
        <translation>Benutzername:</translation>
    </message>
    <message>
        <source>Message</source>
        <translation>Nachricht</translation>
    </message>
    <message>
        <source>Format:</source>
        <translation>Format:</translation>
    </message>
    <message>
        <source>Rich text (HTML)</source>
        <translation>Formatierter Text (HTML)</translation>
    </message>
    <message>
        <source>Plain text</source>
        <translation>Reiner Text</translation>
    </message>
    <message>
        <source>No typed text</source>
        <translation>Kein getippter Text</translation>
    </message>
    <message>
        <source>Character set:</source>
        <translation>Zeichensatz:</translation>
    </message>
    <message>
        <source>Unicode (UTF-8)</source>
        <translation>Unicode (UTF-8)</translation>
    </message>
    <message>
        <source>Western (ISO-8859-1)</source>
        <translation>Westlich (ISO-8859-1)</translation>
    </message>
    <message>
        <source>Japanese (Shift_JIS)</source>
        <translation>Japanisch (Shift_JIS)</translation>
    </message>
    <message>
        <source>When Mailing Completes</source>
        <translation>Nach dem Versand</translation>
    </message>
    <message>
        <source>Then:</source>
        <translation>Danach:</translation>
    </message>
    <message>
        <source>Do nothing</source>
        <translation>Nichts tun</translation>
    </message>
    <message>
        <source>Quit Pelmo</source>
        <translation>Pelmo beenden</translation>
    </message>
    <message>
        <source>Clear the message</source>
        <translation>Die Nachricht leeren</translation>
    </message>
    <message>
        <source>Links to E-mail Addresses</source>
        <translation>Links auf E-Mail-Adressen</translation>
    </message>
    <message>
        <source>Message not sent: %1</source>
        <translation>Nachricht nicht gesendet: %1</translation>
    </message>
    <message>
        <source>[Logging starting at </source>
        <translation>[Protokoll beginnt am </translation>
    </message>
    <message>
        <source>[Logging stopping at </source>
        <translation>[Protokoll endet am </translation>
    </message>
    <message>
        <source>Error (%@): %@</source>
        <translation>Fehler (%@): %@</translation>
    </message>
    <message>
        <source>Connecting to the %@ server.</source>
        <translation>Verbindung zum Server %@ wird hergestellt.</translation>
    </message>
    <message>
        <source>Connected to the %@ server.</source>
        <translation>Mit dem Server %@ verbunden.</translation>
    </message>
    <message>
        <source>Available authentication mechanisms: %@</source>
        <translation>Verfügbare Anmeldeverfahren: %@</translation>
    </message>
    <message>
        <source>An update is available for Pelmo (version %@.) Use Software Update in the Pelmo menu to download it.</source>
        <translation>Für Pelmo ist eine Aktualisierung verfügbar (Version %@). Laden Sie sie über „Softwareaktualisierung“ im Pelmo-Menü herunter.</translation>
    </message>
    <message>
        <source>Connection failed with error: %@ %@</source>
        <translation>Verbindung mit Fehler gescheitert: %@ %@</translation>
    </message>
    <message>
        <source>Final file destination: %@</source>
        <translation>Endgültiger Speicherort der Datei: %@</translation>
    </message>
    <message>
        <source>Download failed! Error - %@ %@</source>
        <translation>Herunterladen fehlgeschlagen! Fehler – %@ %@</translation>
    </message>
    <message>
        <source>To let Pelmo read %1&apos;s page, start it with --remote-debugging-port=9222.</source>
        <translation>Damit Pelmo die Seite von %1 lesen kann, starten Sie %1 mit --remote-debugging-port=9222.</translation>
    </message>
    <message>
        <source>Message sent.</source>
        <translation>Nachricht gesendet.</translation>
    </message>
    <message>
        <source>Send up to 50 messages per connection</source>
        <translation>Bis zu 50 Nachrichten je Verbindung senden</translation>
    </message>
    <message>
        <source>Faster for a group; some servers limit what one connection may send</source>
        <translation>Schneller bei einer Gruppe; manche Server begrenzen, was eine Verbindung senden darf</translation>
    </message>
    <message>
        <source>Add a plain-text version to rich-text messages</source>
        <translation>Formatierten Nachrichten eine Nur-Text-Fassung beifügen</translation>
    </message>
    <message>
        <source>Unsubscribe address:</source>
        <translation>Abmeldeadresse:</translation>
    </message>
    <message>
        <source>mailto: or https: address (optional)</source>
        <translation>mailto:- oder https:-Adresse (freiwillig)</translation>
    </message>
    <message>
        <source>Waiting %1 before the next message: %2 of %3 left, about %4 to go.</source>
        <translation>Warten von %1 bis zur nächsten Nachricht: %2 von %3 übrig, noch etwa %4.</translation>
    </message>
    <message>
        <source>The server refused the message for now: trying again in %1 (retry %2 of %3).</source>
        <translation>Der Server hat die Nachricht vorerst abgelehnt: neuer Versuch in %1 (Versuch %2 von %3).</translation>
    </message>
    <message>
        <source>The &apos;Delay between messages:&apos; preference value is not a number of seconds from 0 to 86400.</source>
        <translation>Die Einstellung „Pause zwischen Nachrichten:“ ist keine Zahl von Sekunden zwischen 0 und 86400.</translation>
    </message>
    <message>
        <source>The &apos;At most per hour:&apos; preference value is not a whole number from 0 (no limit) to 100000.</source>
        <translation>Die Einstellung „Höchstens pro Stunde:“ ist keine ganze Zahl zwischen 0 (keine Grenze) und 100000.</translation>
    </message>
    <message>
        <source>Restored 1 recipient mailed before Pelmo stopped unexpectedly; it is not mailed again.</source>
        <translation>1 Empfänger wiederhergestellt, der angeschrieben wurde, bevor Pelmo unerwartet beendet wurde; er wird nicht erneut angeschrieben.</translation>
    </message>
    <message>
        <source>Restored %1 recipients mailed before Pelmo stopped unexpectedly; they are not mailed again.</source>
        <translation>%1 Empfänger wiederhergestellt, die angeschrieben wurden, bevor Pelmo unerwartet beendet wurde; sie werden nicht erneut angeschrieben.</translation>
    </message>
    <message>
        <source>Not delivered %1</source>
        <translation>Nicht zugestellt %1</translation>
    </message>
    <message>
        <source>Not delivered to %1 &lt;%2&gt;: %3</source>
        <translation>Nicht zugestellt an %1 &lt;%2&gt;: %3</translation>
    </message>
    <message>
        <source>The group &quot;%1&quot; could not be made: %2</source>
        <translation>Die Gruppe „%1“ konnte nicht angelegt werden: %2</translation>
    </message>
    <message>
        <source>1 recipient refused is in the group &quot;%1&quot;: send to it to try again.</source>
        <translation>1 abgelehnter Empfänger ist in der Gruppe „%1“: an sie senden, um es erneut zu versuchen.</translation>
    </message>
    <message>
        <source>%1 recipients refused are in the group &quot;%2&quot;: send to it to try again.</source>
        <translation>%1 abgelehnte Empfänger sind in der Gruppe „%2“: an sie senden, um es erneut zu versuchen.</translation>
    </message>
    <message>
        <source>%1 s</source>
        <translation>%1 s</translation>
    </message>
    <message>
        <source>%1 min</source>
        <translation>%1 min</translation>
    </message>
    <message>
        <source>%1 h</source>
        <translation>%1 h</translation>
    </message>
    <message>
        <source>%1 h %2 min</source>
        <translation>%1 h %2 min</translation>
    </message>
    <message>
        <source>The sent ledger cannot be written (%1): mailing goes on, but if Pelmo stops unexpectedly it will not know who was mailed.</source>
        <translation>Das Versandprotokoll kann nicht geschrieben werden (%1): Der Versand geht weiter, aber wenn Pelmo unerwartet beendet wird, weiß es nicht, wer angeschrieben wurde.</translation>
    </message>
    <message>
        <source>Pelmo stopped unexpectedly during a mailing run.</source>
        <translation>Pelmo wurde während eines Versands unerwartet beendet.</translation>
    </message>
    <message>
        <source>1 recipient of that run was mailed already.</source>
        <translation>1 Empfänger dieses Versands wurde bereits angeschrieben.</translation>
    </message>
    <message>
        <source>%1 recipients of that run were mailed already.</source>
        <translation>%1 Empfänger dieses Versands wurden bereits angeschrieben.</translation>
    </message>
    <message>
        <source>Restore them to the Sent Recipients list, so that Send mails only those not yet mailed?</source>
        <translation>Sollen sie in die Liste der angeschriebenen Empfänger zurückgeholt werden, damit Senden nur an die noch nicht Angeschriebenen geht?</translation>
    </message>
    <message>
        <source>Restore</source>
        <translation>Wiederherstellen</translation>
    </message>
    <message>
        <source>Pace</source>
        <translation>Tempo</translation>
    </message>
    <message>
        <source> s</source>
        <translation> s</translation>
    </message>
    <message>
        <source>Delay between messages:</source>
        <translation>Pause zwischen Nachrichten:</translation>
    </message>
    <message>
        <source>No limit</source>
        <translation>Keine Grenze</translation>
    </message>
    <message>
        <source>Messages in any hour, for servers that limit it</source>
        <translation>Nachrichten innerhalb einer Stunde, für Server, die das begrenzen</translation>
    </message>
    <message>
        <source>At most per hour:</source>
        <translation>Höchstens pro Stunde:</translation>
    </message>
    <message>
        <source>There is no copy %1: %2 members are to be mailed.</source>
        <translation>Es gibt keine Ausfertigung %1: %2 Mitglieder sind anzuschreiben.</translation>
    </message>
    <message>
        <source>There is no copy %1: one copy goes to the Recipient Address.</source>
        <translation>Es gibt keine Ausfertigung %1: eine Ausfertigung geht an die Empfängeradresse.</translation>
    </message>
    <message>
        <source>Test copy for %1 &lt;%2&gt;, to %3.</source>
        <translation>Testausfertigung für %1 &lt;%2&gt;, an %3.</translation>
    </message>
    <message>
        <source>The subject is empty.</source>
        <translation>Der Betreff ist leer.</translation>
    </message>
    <message>
        <source>&quot;%1&quot; is not a tag and goes out as written; the tags are {to}, {toName}, {from}, {fromName} and {subject}.</source>
        <translation>„%1“ ist kein Platzhalter und wird so verschickt, wie es dasteht; die Platzhalter sind {to}, {toName}, {from}, {fromName} und {subject}.</translation>
    </message>
    <message>
        <source>The attachment &quot;%1&quot; is missing.</source>
        <translation>Der Anhang „%1“ fehlt.</translation>
    </message>
    <message>
        <source>The attachment &quot;%1&quot; cannot be read.</source>
        <translation>Der Anhang „%1“ kann nicht gelesen werden.</translation>
    </message>
    <message>
        <source>Each copy is %1 MB, more than the %2 MB that %3 accepts.</source>
        <translation>Jede Ausfertigung ist %1 MB groß, mehr als die %2 MB, die %3 annimmt.</translation>
    </message>
    <message>
        <source>Each copy is %1 MB, more than the 25 MB that many mail servers accept.</source>
        <translation>Jede Ausfertigung ist %1 MB groß, mehr als die 25 MB, die viele Mailserver annehmen.</translation>
    </message>
    <message>
        <source>The web page %1 does not answer: %2</source>
        <translation>Die Webseite %1 antwortet nicht: %2</translation>
    </message>
    <message>
        <source>Send Test</source>
        <translation>Test senden</translation>
    </message>
    <message>
        <source>Preview…</source>
        <translation>Vorschau…</translation>
    </message>
    <message>
        <source>Before Sending</source>
        <translation>Vor dem Senden</translation>
    </message>
    <message>
        <source>Look at these before the group is mailed:</source>
        <translation>Bitte prüfen Sie dies, bevor die Gruppe angeschrieben wird:</translation>
    </message>
    <message>
        <source>Send Anyway</source>
        <translation>Trotzdem senden</translation>
    </message>
    <message>
        <source>Preview</source>
        <translation>Vorschau</translation>
    </message>
    <message>
        <source>Copy for:</source>
        <translation>Ausfertigung für:</translation>
    </message>
    <message>
        <source>Mail this copy to your own address</source>
        <translation>Diese Ausfertigung an Ihre eigene Adresse schicken</translation>
    </message>
    <message>
        <source>No attachments.</source>
        <translation>Keine Anhänge.</translation>
    </message>
    <message>
        <source>%1 (%2)</source>
        <translation>%1 (%2)</translation>
    </message>
    <message>
        <source>%1 (cannot be read: left out)</source>
        <translation>%1 (nicht lesbar: ausgelassen)</translation>
    </message>
    <message>
        <source>Skip a recipient the server refuses</source>
        <translation>Empfänger überspringen, die der Server ablehnt</translation>
    </message>
    <message>
        <source>The run goes on, and those refused are put in a new group to send to again later</source>
        <translation>Der Versand geht weiter; die Abgelehnten kommen in eine neue Gruppe, an die später erneut gesendet werden kann</translation>
    </message>
    <message>
        <source>Try again when the server is busy</source>
        <translation>Erneut versuchen, wenn der Server ausgelastet ist</translation>
    </message>
    <message>
        <source>After 30 s, 2 min and 8 min; then the run stops as for any refusal</source>
        <translation>Nach 30 s, 2 min und 8 min; danach hält der Versand an wie bei jeder Ablehnung</translation>
    </message>
</context>
<context>
    <name>SmtpClient</name>
    <message>
        <source>The user name, password or mechanism contains a line break or NUL character.</source>
        <translation>Benutzername, Passwort oder Verfahren enthält einen Zeilenumbruch oder ein NUL-Zeichen.</translation>
    </message>
    <message>
        <source>Unknown authentication mechanism &quot;%1&quot;.</source>
        <translation>Unbekanntes Anmeldeverfahren „%1“.</translation>
    </message>
    <message>
        <source>The message (%1 bytes) is larger than the %2 bytes the server accepts.</source>
        <translation>Die Nachricht (%1 Bytes) ist größer als die %2 Bytes, die der Server annimmt.</translation>
    </message>
    <message>
        <source>Could not connect to %1:%2: %3</source>
        <translation>Keine Verbindung zu %1:%2 möglich: %3</translation>
    </message>
    <message>
        <source>Connection to %1 lost: %2</source>
        <translation>Verbindung zu %1 verloren: %2</translation>
    </message>
    <message>
        <source>The server %1 closed the connection.</source>
        <translation>Der Server %1 hat die Verbindung geschlossen.</translation>
    </message>
    <message>
        <source>Could not connect to %1:%2 within %3 s.</source>
        <translation>Keine Verbindung zu %1:%2 innerhalb von %3 s möglich.</translation>
    </message>
    <message>
        <source>The server %1 did not answer within %2 s.</source>
        <translation>Der Server %1 hat nicht innerhalb von %2 s geantwortet.</translation>
    </message>
    <message>
        <source>TLS handshake with %1 failed: %2</source>
        <translation>TLS-Handshake mit %1 fehlgeschlagen: %2</translation>
    </message>
    <message>
        <source>The server %1 sent a malformed reply: %2</source>
        <translation>Der Server %1 hat eine fehlerhafte Antwort gesendet: %2</translation>
    </message>
    <message>
        <source>The server %1 sent an overlong reply.</source>
        <translation>Der Server %1 hat eine zu lange Antwort gesendet.</translation>
    </message>
    <message>
        <source>The server %1 refused the session: %2</source>
        <translation>Der Server %1 hat die Sitzung abgelehnt: %2</translation>
    </message>
    <message>
        <source>The server %1 refused EHLO: %2</source>
        <translation>Der Server %1 hat EHLO abgelehnt: %2</translation>
    </message>
    <message>
        <source>The server %1 refused HELO: %2</source>
        <translation>Der Server %1 hat HELO abgelehnt: %2</translation>
    </message>
    <message>
        <source>The server %1 refused STARTTLS: %2</source>
        <translation>Der Server %1 hat STARTTLS abgelehnt: %2</translation>
    </message>
    <message>
        <source>The server %1 refused the authentication: %2</source>
        <translation>Der Server %1 hat die Anmeldung abgelehnt: %2</translation>
    </message>
    <message>
        <source>The message has no recipient.</source>
        <translation>Die Nachricht hat keinen Empfänger.</translation>
    </message>
    <message>
        <source>The sender address &quot;%1&quot; contains a control character or an angle bracket.</source>
        <translation>Die Absenderadresse „%1“ enthält ein Steuerzeichen oder eine spitze Klammer.</translation>
    </message>
    <message>
        <source>The recipient address &quot;%1&quot; contains a control character or an angle bracket.</source>
        <translation>Die Empfängeradresse „%1“ enthält ein Steuerzeichen oder eine spitze Klammer.</translation>
    </message>
    <message>
        <source>The address &quot;%1&quot; has a name before the @ that is not ASCII, which the server %2 does not accept (it does not offer SMTPUTF8).</source>
        <translation>Die Adresse „%1“ hat vor dem @ einen Namen, der nicht ASCII ist, was der Server %2 nicht annimmt (er bietet kein SMTPUTF8 an).</translation>
    </message>
    <message>
        <source>The server %1 refused the message: %2</source>
        <translation>Der Server %1 hat die Nachricht abgelehnt: %2</translation>
    </message>
    <message>
        <source>The server %1 refused RSET: %2</source>
        <translation>Der Server %1 hat RSET abgelehnt: %2</translation>
    </message>
    <message>
        <source>TLS is not available on this connection to %1.</source>
        <translation>TLS ist für diese Verbindung zu %1 nicht verfügbar.</translation>
    </message>
</context>
</TS>

<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="fr_FR">
<context>
    <name>LocalizedStrings</name>
    <message>
        <source>The data folder for the address book cannot be created.</source>
        <translation>Le dossier de données du carnet d&apos;adresses ne peut pas être créé.</translation>
    </message>
    <message>
        <source>A name cannot hold a line break or another control character.</source>
        <translation>Un nom ne peut contenir ni saut de ligne ni autre caractère de contrôle.</translation>
    </message>
    <message>
        <source>A person needs a first or a last name.</source>
        <translation>Une personne doit avoir un prénom ou un nom.</translation>
    </message>
    <message>
        <source>&quot;%1&quot; is not an e-mail address.</source>
        <translation>« %1 » n’est pas une adresse électronique.</translation>
    </message>
    <message>
        <source>One of the person&apos;s addresses must be the primary one.</source>
        <translation>L’une des adresses de la personne doit être l’adresse principale.</translation>
    </message>
    <message>
        <source>The address book &quot;%1&quot; cannot be used: %2</source>
        <translation>Le carnet d’adresses « %1 » est inutilisable : %2</translation>
    </message>
    <message>
        <source>The address book has no group named &quot;%1&quot;.</source>
        <translation>Le carnet d’adresses n’a pas de groupe nommé « %1 ».</translation>
    </message>
    <message>
        <source>The file &quot;%1&quot; cannot be written: %2</source>
        <translation>Le fichier « %1 » ne peut pas être écrit : %2</translation>
    </message>
    <message>
        <source>The address book has no person numbered %1.</source>
        <translation>Le carnet d’adresses n’a pas de personne numéro %1.</translation>
    </message>
    <message>
        <source>The address book has no group numbered %1.</source>
        <translation>Le carnet d’adresses n’a pas de groupe numéro %1.</translation>
    </message>
    <message>
        <source>A group needs a name.</source>
        <translation>Un groupe doit avoir un nom.</translation>
    </message>
    <message>
        <source>There is already a group named &quot;%1&quot;.</source>
        <translation>Il existe déjà un groupe nommé « %1 ».</translation>
    </message>
    <message>
        <source>the file cannot be read: %1</source>
        <translation>le fichier ne peut pas être lu : %1</translation>
    </message>
    <message>
        <source>the quoted field that opens here is not closed</source>
        <translation>le champ entre guillemets qui commence ici n’est pas fermé</translation>
    </message>
    <message>
        <source>the header row names no e-mail column (expected &quot;first name&quot;, &quot;last name&quot;, &quot;e-mail&quot; and &quot;groups&quot;, or the columns of a Google, Outlook or Thunderbird export)</source>
        <translation>la ligne d’en-tête ne nomme aucune colonne d’adresse électronique (attendu : « first name », « last name », « e-mail » et « groups », ou les colonnes d’un export Google, Outlook ou Thunderbird)</translation>
    </message>
    <message>
        <source>a name cannot hold a control character</source>
        <translation>un nom ne peut pas contenir de caractère de contrôle</translation>
    </message>
    <message>
        <source>&quot;%1&quot; is not an e-mail address</source>
        <translation>« %1 » n’est pas une adresse électronique</translation>
    </message>
    <message>
        <source>a group name cannot hold a control character</source>
        <translation>un nom de groupe ne peut pas contenir de caractère de contrôle</translation>
    </message>
    <message>
        <source>the file is empty</source>
        <translation>le fichier est vide</translation>
    </message>
    <message>
        <source>this row has %1 fields but the header has %2</source>
        <translation>cette ligne a %1 champs mais l’en-tête en a %2</translation>
    </message>
    <message>
        <source>line %1: %2</source>
        <translation>ligne %1 : %2</translation>
    </message>
    <message>
        <source>Imported %1: %2 added, %3 updated, %4 skipped; %5.</source>
        <translation>Import de %1 : ajout de %2, %3 mise(s) à jour, %4 ignorée(s) ; %5.</translation>
    </message>
    <message>
        <source>%1 already in the address book as in the file.</source>
        <translation>%1 déjà dans le carnet d’adresses, tel(s) que dans le fichier.</translation>
    </message>
    <message>
        <source>line %1: %2 (skipped)</source>
        <translation>ligne %1 : %2 (ignorée)</translation>
    </message>
    <message>
        <source>the character set &quot;%1&quot; is not known</source>
        <translation>le jeu de caractères « %1 » est inconnu</translation>
    </message>
    <message>
        <source>vCard version &quot;%1&quot; is not supported (2.1, 3.0 and 4.0 are)</source>
        <translation>la version de vCard « %1 » n’est pas prise en charge (2.1, 3.0 et 4.0 le sont)</translation>
    </message>
    <message>
        <source>the file holds no vCard</source>
        <translation>le fichier ne contient aucune vCard</translation>
    </message>
    <message>
        <source>this line has no &quot;:&quot; between a property and its value</source>
        <translation>cette ligne n’a pas de « : » entre une propriété et sa valeur</translation>
    </message>
    <message>
        <source>&quot;%1&quot; stands outside BEGIN:VCARD and END:VCARD</source>
        <translation>« %1 » se trouve hors de BEGIN:VCARD et END:VCARD</translation>
    </message>
    <message>
        <source>a carriage return stands inside the %1 property</source>
        <translation>un retour chariot se trouve dans la propriété %1</translation>
    </message>
    <message>
        <source>&quot;BEGIN:%1&quot; does not begin a vCard</source>
        <translation>« BEGIN:%1 » ne commence pas une vCard</translation>
    </message>
    <message>
        <source>this card has no END:VCARD</source>
        <translation>cette carte n’a pas de END:VCARD</translation>
    </message>
    <message>
        <source>Send</source>
        <translation>Envoyer</translation>
    </message>
    <message>
        <source>the address book has no group &quot;%1&quot;; it has no groups yet.</source>
        <translation>le carnet d’adresses n’a pas de groupe « %1 » ; il n’a encore aucun groupe.</translation>
    </message>
    <message>
        <source>the address book has no group &quot;%1&quot;; its groups are: %2.</source>
        <translation>le carnet d’adresses n’a pas de groupe « %1 » ; ses groupes sont : %2.</translation>
    </message>
    <message>
        <source>Exported %1 to %2.</source>
        <translation>Exporté vers %2 : %1.</translation>
    </message>
    <message>
        <source>Pelmo cannot start</source>
        <translation>Pelmo ne peut pas démarrer</translation>
    </message>
    <message>
        <source>Stop</source>
        <translation>Arrêter</translation>
    </message>
    <message>
        <source>Sending mail.</source>
        <translation>Envoi du courrier.</translation>
    </message>
    <message>
        <source>No e-mail address.</source>
        <translation>Pas d’adresse électronique.</translation>
    </message>
    <message>
        <source>[Mailing started at </source>
        <translation>[Envoi commencé le </translation>
    </message>
    <message>
        <source>]</source>
        <translation>]</translation>
    </message>
    <message>
        <source> Mail to: </source>
        <translation> Courriel à : </translation>
    </message>
    <message>
        <source>The connection closed before the message was accepted.</source>
        <translation>La connexion a été fermée avant que le message soit accepté.</translation>
    </message>
    <message>
        <source>[Mailing completed at </source>
        <translation>[Envoi terminé le </translation>
    </message>
    <message>
        <source>Name</source>
        <translation>Nom</translation>
    </message>
    <message>
        <source>Email Address</source>
        <translation>Adresse électronique</translation>
    </message>
    <message>
        <source>Reason</source>
        <translation>Raison</translation>
    </message>
    <message>
        <source>Time</source>
        <translation>Heure</translation>
    </message>
    <message>
        <source>Ready.</source>
        <translation>Prêt.</translation>
    </message>
    <message>
        <source>1 recipient put back, to be mailed first.</source>
        <translation>1 destinataire remis en attente, à qui l’on écrira en premier.</translation>
    </message>
    <message>
        <source>%1 recipients put back, to be mailed first.</source>
        <translation>%1 destinataires remis en attente, à qui l’on écrira en premier.</translation>
    </message>
    <message>
        <source>1 recipient to mail</source>
        <translation>1 destinataire à contacter</translation>
    </message>
    <message>
        <source>%1 recipients to mail</source>
        <translation>%1 destinataires à contacter</translation>
    </message>
    <message>
        <source>1 member</source>
        <translation>1 membre</translation>
    </message>
    <message>
        <source>%1 members</source>
        <translation>%1 membres</translation>
    </message>
    <message>
        <source>Group %1: %2, %3 already mailed</source>
        <translation>Groupe %1 : %2, %3 déjà contacté(s)</translation>
    </message>
    <message>
        <source>not available</source>
        <translation>non disponible</translation>
    </message>
    <message>
        <source> (built with %1)</source>
        <translation> (compilé avec %1)</translation>
    </message>
    <message>
        <source>OpenSSL not available</source>
        <translation>OpenSSL non disponible</translation>
    </message>
    <message>
        <source>About Pelmo</source>
        <translation>À propos de Pelmo</translation>
    </message>
    <message>
        <source>Mails one message to many people, each their own copy.</source>
        <translation>Envoie un message à de nombreuses personnes, chacune recevant son propre exemplaire.</translation>
    </message>
    <message>
        <source>Pelmo is free software under the &lt;a href=&quot;https://www.gnu.org/licenses/gpl-3.0.html&quot;&gt;GNU General Public License&lt;/a&gt;, version 3 or later. It comes with no warranty.</source>
        <translation>Pelmo est un logiciel libre sous la &lt;a href=&quot;https://www.gnu.org/licenses/gpl-3.0.html&quot;&gt;licence publique générale GNU&lt;/a&gt;, version 3 ou ultérieure. Il est fourni sans aucune garantie.</translation>
    </message>
    <message>
        <source>Runs with:</source>
        <translation>Fonctionne avec :</translation>
    </message>
    <message>
        <source>File</source>
        <translation>Fichier</translation>
    </message>
    <message>
        <source>Attachments</source>
        <translation>Pièces jointes</translation>
    </message>
    <message>
        <source>Drop files here from the file manager; drag a row to change the order. Every message carries these files.</source>
        <translation>Déposez ici des fichiers depuis le gestionnaire de fichiers ; faites glisser une ligne pour changer l’ordre. Chaque message contient ces fichiers.</translation>
    </message>
    <message>
        <source>Add Files...</source>
        <translation>Ajouter des fichiers...</translation>
    </message>
    <message>
        <source>Remove</source>
        <translation>Retirer</translation>
    </message>
    <message>
        <source>Remove the selected files; with none selected, remove every file</source>
        <translation>Retirer les fichiers sélectionnés ; si aucun n’est sélectionné, retirer tous les fichiers</translation>
    </message>
    <message>
        <source>Add Files</source>
        <translation>Ajouter des fichiers</translation>
    </message>
    <message>
        <source>The file could not be opened.</source>
        <translation>Le fichier n’a pas pu être ouvert.</translation>
    </message>
    <message>
        <source>No application on this desktop took &quot;%1&quot;.</source>
        <translation>Aucune application de ce bureau n’a pris en charge « %1 ».</translation>
    </message>
    <message>
        <source>Import Contacts</source>
        <translation>Importer des contacts</translation>
    </message>
    <message>
        <source>Contacts (*.vcf *.vcard *.csv)</source>
        <translation>Contacts (*.vcf *.vcard *.csv)</translation>
    </message>
    <message>
        <source>All files (*)</source>
        <translation>Tous les fichiers (*)</translation>
    </message>
    <message>
        <source>%1 was not imported: %2</source>
        <translation>%1 n’a pas été importé : %2</translation>
    </message>
    <message>
        <source>1 value was left out; see Show Details.</source>
        <translation>1 valeur a été laissée de côté ; voir Afficher les détails.</translation>
    </message>
    <message>
        <source>%1 values were left out; see Show Details.</source>
        <translation>%1 valeurs ont été laissées de côté ; voir Afficher les détails.</translation>
    </message>
    <message>
        <source>Export All Contacts</source>
        <translation>Exporter tous les contacts</translation>
    </message>
    <message>
        <source>Export %1</source>
        <translation>Exporter %1</translation>
    </message>
    <message>
        <source>vCard (*.vcf)</source>
        <translation>vCard (*.vcf)</translation>
    </message>
    <message>
        <source>Contacts</source>
        <translation>Contacts</translation>
    </message>
    <message>
        <source>The contacts were not exported.</source>
        <translation>Les contacts n’ont pas été exportés.</translation>
    </message>
    <message>
        <source>Format</source>
        <translation>Format</translation>
    </message>
    <message>
        <source>Font</source>
        <translation>Police</translation>
    </message>
    <message>
        <source>Size</source>
        <translation>Taille</translation>
    </message>
    <message>
        <source>Text Color</source>
        <translation>Couleur du texte</translation>
    </message>
    <message>
        <source>Pelmo&apos;s help is not installed here.</source>
        <translation>L’aide de Pelmo n’est pas installée ici.</translation>
    </message>
    <message>
        <source>It is the file README.md of Pelmo&apos;s sources, which the Debian package installs as %1.</source>
        <translation>Il s’agit du fichier README.md des sources de Pelmo, que le paquet Debian installe sous %1.</translation>
    </message>
    <message>
        <source>No application could open Pelmo&apos;s help.</source>
        <translation>Aucune application n’a pu ouvrir l’aide de Pelmo.</translation>
    </message>
    <message>
        <source>It is the file %1.</source>
        <translation>Il s’agit du fichier %1.</translation>
    </message>
    <message>
        <source>Activity Log</source>
        <translation>Journal d’activité</translation>
    </message>
    <message>
        <source>Find</source>
        <translation>Rechercher</translation>
    </message>
    <message>
        <source>Open in Editor</source>
        <translation>Ouvrir dans l’éditeur</translation>
    </message>
    <message>
        <source>Pelmo</source>
        <translation>Pelmo</translation>
    </message>
    <message>
        <source>Recipient Address:</source>
        <translation>Adresse du destinataire :</translation>
    </message>
    <message>
        <source>Recipients Name:</source>
        <translation>Nom du destinataire :</translation>
    </message>
    <message>
        <source>Subject:</source>
        <translation>Objet :</translation>
    </message>
    <message>
        <source>Web Page</source>
        <translation>Page web</translation>
    </message>
    <message>
        <source>Take the address and title of the page your web browser shows</source>
        <translation>Reprendre l’adresse et le titre de la page affichée par votre navigateur web</translation>
    </message>
    <message>
        <source>Web Page:</source>
        <translation>Page web :</translation>
    </message>
    <message>
        <source>Write the message here. {toName}, {to}, {fromName}, {from} and {subject} become each copy&apos;s own values.</source>
        <translation>Écrivez le message ici. {toName}, {to}, {fromName}, {from} et {subject} prennent dans chaque exemplaire ses propres valeurs.</translation>
    </message>
    <message>
        <source>Send the message (Ctrl+Return)</source>
        <translation>Envoyer le message (Ctrl+Entrée)</translation>
    </message>
    <message>
        <source>Preferences</source>
        <translation>Préférences</translation>
    </message>
    <message>
        <source>Addresses</source>
        <translation>Adresses</translation>
    </message>
    <message>
        <source>Console</source>
        <translation>Console</translation>
    </message>
    <message>
        <source>Show the activity log</source>
        <translation>Afficher le journal d’activité</translation>
    </message>
    <message>
        <source>Sent Recipients</source>
        <translation>Destinataires contactés</translation>
    </message>
    <message>
        <source>Make Pelmo the Default Mail Client</source>
        <translation>Faire de Pelmo le client de messagerie par défaut</translation>
    </message>
    <message>
        <source>Quit</source>
        <translation>Quitter</translation>
    </message>
    <message>
        <source>Tools</source>
        <translation>Outils</translation>
    </message>
    <message>
        <source>&amp;File</source>
        <translation>&amp;Fichier</translation>
    </message>
    <message>
        <source>Import Contacts…</source>
        <translation>Importer des contacts…</translation>
    </message>
    <message>
        <source>Export Contacts…</source>
        <translation>Exporter les contacts…</translation>
    </message>
    <message>
        <source>&amp;Message</source>
        <translation>&amp;Message</translation>
    </message>
    <message>
        <source>&amp;Window</source>
        <translation>Fe&amp;nêtre</translation>
    </message>
    <message>
        <source>&amp;Help</source>
        <translation>&amp;Aide</translation>
    </message>
    <message>
        <source>Pelmo Help</source>
        <translation>Aide de Pelmo</translation>
    </message>
    <message>
        <source>About Qt</source>
        <translation>À propos de Qt</translation>
    </message>
    <message>
        <source>Discard this message?</source>
        <translation>Abandonner ce message ?</translation>
    </message>
    <message>
        <source>Discard</source>
        <translation>Abandonner</translation>
    </message>
    <message>
        <source>The recipient address is not an e-mail address</source>
        <translation>L’adresse du destinataire n’est pas une adresse électronique</translation>
    </message>
    <message>
        <source>&quot;%1&quot; cannot be mailed. Type an address such as name@example.org, or choose a person or a group in Addresses.</source>
        <translation>Impossible d’écrire à « %1 ». Saisissez une adresse telle que nom@example.org, ou choisissez une personne ou un groupe dans Adresses.</translation>
    </message>
    <message>
        <source>Send without a subject?</source>
        <translation>Envoyer sans objet ?</translation>
    </message>
    <message>
        <source>%1 was already mailed in this session. Send again?</source>
        <translation>%1 a déjà reçu ce message dans cette session. Envoyer à nouveau ?</translation>
    </message>
    <message>
        <source>Send Again</source>
        <translation>Envoyer à nouveau</translation>
    </message>
    <message>
        <source>Software Update…</source>
        <translation>Mise à jour du logiciel…</translation>
    </message>
    <message>
        <source>(no name)</source>
        <translation>(sans nom)</translation>
    </message>
    <message>
        <source>Choose a group to mail each of its members, or a person to mail one message.</source>
        <translation>Choisissez un groupe pour écrire à chacun de ses membres, ou une personne pour envoyer un seul message.</translation>
    </message>
    <message>
        <source>Search names and addresses</source>
        <translation>Rechercher parmi les noms et adresses</translation>
    </message>
    <message>
        <source>Groups</source>
        <translation>Groupes</translation>
    </message>
    <message>
        <source>Add the selected persons to a group, or remove them from the group shown</source>
        <translation>Ajouter les personnes sélectionnées à un groupe, ou les retirer du groupe affiché</translation>
    </message>
    <message>
        <source>All</source>
        <translation>Tous</translation>
    </message>
    <message>
        <source>Primary address</source>
        <translation>Adresse principale</translation>
    </message>
    <message>
        <source>The address book was not changed.</source>
        <translation>Le carnet d’adresses n’a pas été modifié.</translation>
    </message>
    <message>
        <source>Group name:</source>
        <translation>Nom du groupe :</translation>
    </message>
    <message>
        <source>New Group</source>
        <translation>Nouveau groupe</translation>
    </message>
    <message>
        <source>Rename Group</source>
        <translation>Renommer le groupe</translation>
    </message>
    <message>
        <source>Delete the group &quot;%1&quot;?</source>
        <translation>Supprimer le groupe « %1 » ?</translation>
    </message>
    <message>
        <source>Its members stay in the address book.</source>
        <translation>Ses membres restent dans le carnet d’adresses.</translation>
    </message>
    <message>
        <source>Delete Group</source>
        <translation>Supprimer le groupe</translation>
    </message>
    <message>
        <source>Delete &quot;%1&quot; from the address book?</source>
        <translation>Supprimer « %1 » du carnet d’adresses ?</translation>
    </message>
    <message>
        <source>Delete %1 persons from the address book?</source>
        <translation>Supprimer %1 personnes du carnet d’adresses ?</translation>
    </message>
    <message>
        <source>They are taken out of every group too.</source>
        <translation>Elles sont aussi retirées de tous les groupes.</translation>
    </message>
    <message>
        <source>Delete</source>
        <translation>Supprimer</translation>
    </message>
    <message>
        <source>Add to &quot;%1&quot;</source>
        <translation>Ajouter à « %1 »</translation>
    </message>
    <message>
        <source>Remove from &quot;%1&quot;</source>
        <translation>Retirer de « %1 »</translation>
    </message>
    <message>
        <source>New Person</source>
        <translation>Nouvelle personne</translation>
    </message>
    <message>
        <source>Edit Person</source>
        <translation>Modifier la personne</translation>
    </message>
    <message>
        <source>First name:</source>
        <translation>Prénom :</translation>
    </message>
    <message>
        <source>Last name:</source>
        <translation>Nom :</translation>
    </message>
    <message>
        <source>Email addresses:</source>
        <translation>Adresses électroniques :</translation>
    </message>
    <message>
        <source>Groups:</source>
        <translation>Groupes :</translation>
    </message>
    <message>
        <source>Primary</source>
        <translation>Principale</translation>
    </message>
    <message>
        <source>Address</source>
        <translation>Adresse</translation>
    </message>
    <message>
        <source>Add Address</source>
        <translation>Ajouter une adresse</translation>
    </message>
    <message>
        <source>Remove Address</source>
        <translation>Retirer l’adresse</translation>
    </message>
    <message>
        <source>Mail this address</source>
        <translation>Écrire à cette adresse</translation>
    </message>
    <message>
        <source>The person was not saved.</source>
        <translation>La personne n’a pas été enregistrée.</translation>
    </message>
    <message>
        <source>25 or 587 for STARTTLS, 465 for SSL from the start</source>
        <translation>25 ou 587 pour STARTTLS, 465 pour SSL dès le départ</translation>
    </message>
    <message>
        <source>Port:</source>
        <translation>Port :</translation>
    </message>
    <message>
        <source>Use SSL</source>
        <translation>Utiliser SSL</translation>
    </message>
    <message>
        <source>Password:</source>
        <translation>Mot de passe :</translation>
    </message>
    <message>
        <source>Check for software updates at start-up</source>
        <translation>Rechercher des mises à jour au démarrage</translation>
    </message>
    <message>
        <source>Pelmo is your default mail client.</source>
        <translation>Pelmo est votre client de messagerie par défaut.</translation>
    </message>
    <message>
        <source>No application handles links to e-mail addresses.</source>
        <translation>Aucune application ne gère les liens vers des adresses électroniques.</translation>
    </message>
    <message>
        <source>Links to e-mail addresses open in %1.</source>
        <translation>Les liens vers des adresses électroniques s’ouvrent dans %1.</translation>
    </message>
    <message>
        <source>The password is kept in the system keyring.</source>
        <translation>Le mot de passe est conservé dans le trousseau du système.</translation>
    </message>
    <message>
        <source>The password is kept in the settings file %1.</source>
        <translation>Le mot de passe est conservé dans le fichier de réglages %1.</translation>
    </message>
    <message>
        <source>No keyring answered: the password is kept in the settings file %1.</source>
        <translation>Aucun trousseau n’a répondu : le mot de passe est conservé dans le fichier de réglages %1.</translation>
    </message>
    <message>
        <source>A password entered here will be kept in the system keyring.</source>
        <translation>Un mot de passe saisi ici sera conservé dans le trousseau du système.</translation>
    </message>
    <message>
        <source>No keyring answered: a password entered here will be kept in the settings file %1.</source>
        <translation>Aucun trousseau n’a répondu : un mot de passe saisi ici sera conservé dans le fichier de réglages %1.</translation>
    </message>
    <message>
        <source>Reset</source>
        <translation>Réinitialiser</translation>
    </message>
    <message>
        <source>Forget who was mailed, so that they can be mailed again</source>
        <translation>Oublier à qui l’on a écrit, pour pouvoir leur écrire à nouveau</translation>
    </message>
    <message>
        <source>Forget the 1 sent recipient? They may be mailed again.</source>
        <translation>Oublier le destinataire déjà contacté ? Il pourra recevoir le message à nouveau.</translation>
    </message>
    <message>
        <source>Forget the %1 sent recipients? They may be mailed again.</source>
        <translation>Oublier les %1 destinataires déjà contactés ? Ils pourront recevoir le message à nouveau.</translation>
    </message>
    <message>
        <source>Forget</source>
        <translation>Oublier</translation>
    </message>
    <message>
        <source>&amp;Mailed</source>
        <translation>&amp;Contactés</translation>
    </message>
    <message>
        <source>Put Back</source>
        <translation>Remettre en attente</translation>
    </message>
    <message>
        <source>Mail the selected persons, or all of them when none is selected, first at the next Send</source>
        <translation>Écrire d’abord, au prochain envoi, aux personnes sélectionnées, ou à toutes si aucune n’est sélectionnée</translation>
    </message>
    <message>
        <source>&amp;Not mailed</source>
        <translation>&amp;Non contactés</translation>
    </message>
    <message>
        <source>Not checked yet</source>
        <translation>Pas encore vérifié</translation>
    </message>
    <message>
        <source>Check Now</source>
        <translation>Vérifier maintenant</translation>
    </message>
    <message>
        <source>Download</source>
        <translation>Télécharger</translation>
    </message>
    <message>
        <source>Software Update</source>
        <translation>Mise à jour du logiciel</translation>
    </message>
    <message>
        <source>Your version:</source>
        <translation>Votre version :</translation>
    </message>
    <message>
        <source>Published version:</source>
        <translation>Version publiée :</translation>
    </message>
    <message>
        <source>The %1 holds a line break or a null character, which cannot go into a mail header.</source>
        <translation>Le champ « %1 » contient un saut de ligne ou un caractère nul, qui ne peut pas figurer dans un en-tête de courriel.</translation>
    </message>
    <message>
        <source>name of the attachment &quot;%1&quot;</source>
        <translation>nom de la pièce jointe « %1 »</translation>
    </message>
    <message>
        <source>The %1 is empty.</source>
        <translation>Le champ « %1 » est vide.</translation>
    </message>
    <message>
        <source>subject</source>
        <translation>objet</translation>
    </message>
    <message>
        <source>sender&apos;s name</source>
        <translation>nom de l’expéditeur</translation>
    </message>
    <message>
        <source>sender&apos;s address</source>
        <translation>adresse de l’expéditeur</translation>
    </message>
    <message>
        <source>recipient&apos;s name</source>
        <translation>nom du destinataire</translation>
    </message>
    <message>
        <source>recipient&apos;s address</source>
        <translation>adresse du destinataire</translation>
    </message>
    <message>
        <source>content type</source>
        <translation>type de contenu</translation>
    </message>
    <message>
        <source>The message has no sender or no recipient.</source>
        <translation>Le message n’a pas d’expéditeur ou pas de destinataire.</translation>
    </message>
    <message>
        <source>Connection lost.</source>
        <translation>Connexion perdue.</translation>
    </message>
    <message>
        <source>Starting SSL.</source>
        <translation>Démarrage de SSL.</translation>
    </message>
    <message>
        <source>SSL handshaking...</source>
        <translation>Négociation SSL...</translation>
    </message>
    <message>
        <source>Sending the message.</source>
        <translation>Envoi du message.</translation>
    </message>
    <message>
        <source>The login method chosen in Preferences is unknown.</source>
        <translation>La méthode d’authentification choisie dans les Préférences est inconnue.</translation>
    </message>
    <message>
        <source>Authentication completed. Sending the message.</source>
        <translation>Authentification réussie. Envoi du message.</translation>
    </message>
    <message>
        <source>Authentication failed. Closing the connection.</source>
        <translation>Échec de l’authentification. Fermeture de la connexion.</translation>
    </message>
    <message>
        <source>Authentication failed.</source>
        <translation>Échec de l’authentification.</translation>
    </message>
    <message>
        <source>Message sent. Closing the connection.</source>
        <translation>Message envoyé. Fermeture de la connexion.</translation>
    </message>
    <message>
        <source>The server refused the message.</source>
        <translation>Le serveur a refusé le message.</translation>
    </message>
    <message>
        <source>Connection closed. Done.</source>
        <translation>Connexion fermée. Terminé.</translation>
    </message>
    <message>
        <source>(You can turn off automatic software update checks in Preferences.)</source>
        <translation>(Vous pouvez désactiver la recherche automatique de mises à jour dans les Préférences.)</translation>
    </message>
    <message>
        <source>Checking for a software update...</source>
        <translation>Recherche d’une mise à jour...</translation>
    </message>
    <message>
        <source>Pelmo could not check for a software update at this time.</source>
        <translation>Pelmo n’a pas pu rechercher de mise à jour pour le moment.</translation>
    </message>
    <message>
        <source>Loaded the version information...</source>
        <translation>Informations de version chargées...</translation>
    </message>
    <message>
        <source>The current version information could not be read.</source>
        <translation>Les informations sur la version actuelle n’ont pas pu être lues.</translation>
    </message>
    <message>
        <source>An update is available for Pelmo.</source>
        <translation>Une mise à jour de Pelmo est disponible.</translation>
    </message>
    <message>
        <source>Your software is up to date.</source>
        <translation>Votre logiciel est à jour.</translation>
    </message>
    <message>
        <source>The download could not start.</source>
        <translation>Le téléchargement n’a pas pu démarrer.</translation>
    </message>
    <message>
        <source>The download was redirected too many times.</source>
        <translation>Le téléchargement a été redirigé trop de fois.</translation>
    </message>
    <message>
        <source>The download was redirected to another host without HTTPS.</source>
        <translation>Le téléchargement a été redirigé vers un autre hôte sans HTTPS.</translation>
    </message>
    <message>
        <source>Pelmo update</source>
        <translation>Mise à jour de Pelmo</translation>
    </message>
    <message>
        <source>Bytes received : %d</source>
        <translation>Octets reçus : %d</translation>
    </message>
    <message>
        <source>Percent complete : %f</source>
        <translation>Pourcentage effectué : %f</translation>
    </message>
    <message>
        <source>The server did not send the file.</source>
        <translation>Le serveur n’a pas envoyé le fichier.</translation>
    </message>
    <message>
        <source>The server sent less than it announced.</source>
        <translation>Le serveur a envoyé moins que ce qu’il avait annoncé.</translation>
    </message>
    <message>
        <source>The download has completed.</source>
        <translation>Le téléchargement est terminé.</translation>
    </message>
    <message>
        <source>a double quote stands inside a field that does not begin with one</source>
        <translation>un guillemet droit se trouve dans un champ qui ne commence pas par un guillemet</translation>
    </message>
    <message>
        <source>text follows the closing quote of a field</source>
        <translation>du texte suit le guillemet fermant d’un champ</translation>
    </message>
    <message>
        <source>person</source>
        <translation>personne</translation>
    </message>
    <message>
        <source>persons</source>
        <translation>personnes</translation>
    </message>
    <message>
        <source>new group</source>
        <translation>nouveau groupe</translation>
    </message>
    <message>
        <source>new groups</source>
        <translation>nouveaux groupes</translation>
    </message>
    <message>
        <source>was</source>
        <translation>était</translation>
    </message>
    <message>
        <source>were</source>
        <translation>étaient</translation>
    </message>
    <message>
        <source>Could not download &quot;%1&quot;</source>
        <translation>Impossible de télécharger « %1 »</translation>
    </message>
    <message>
        <source>Relinking web page...</source>
        <translation>Réécriture des liens de la page web...</translation>
    </message>
    <message>
        <source>The sender &apos;Email Address:&apos; preference value has not been specified.</source>
        <translation>Le réglage « Adresse électronique : » de l’expéditeur n’est pas renseigné.</translation>
    </message>
    <message>
        <source>The sender &apos;Name:&apos; preference value has not been specified.</source>
        <translation>Le réglage « Nom : » de l’expéditeur n’est pas renseigné.</translation>
    </message>
    <message>
        <source>The outgoing SMTP server &apos;Address:&apos; preference value has not been specified.</source>
        <translation>Le réglage « Adresse : » du serveur SMTP sortant n’est pas renseigné.</translation>
    </message>
    <message>
        <source>The outgoing SMTP server &apos;Port:&apos; preference value is out of range.</source>
        <translation>Le réglage « Port : » du serveur SMTP sortant est hors limites.</translation>
    </message>
    <message>
        <source>The outgoing SMTP server &apos;Username:&apos; preference value has not been specified.</source>
        <translation>Le réglage « Nom d’utilisateur : » du serveur SMTP sortant n’est pas renseigné.</translation>
    </message>
    <message>
        <source>The outgoing SMTP server &apos;Password:&apos; preference value has not been specified.</source>
        <translation>Le réglage « Mot de passe : » du serveur SMTP sortant n’est pas renseigné.</translation>
    </message>
    <message>
        <source>The &apos;Recipient Address:&apos; value has not been specified.</source>
        <translation>Le champ « Adresse du destinataire : » n’est pas renseigné.</translation>
    </message>
    <message>
        <source>The &apos;Recipients Name:&apos; value has not been specified.</source>
        <translation>Le champ « Nom du destinataire : » n’est pas renseigné.</translation>
    </message>
    <message>
        <source>Filtering people by sent recipients...</source>
        <translation>Filtrage des personnes déjà contactées...</translation>
    </message>
    <message>
        <source>Align Left</source>
        <translation>Aligner à gauche</translation>
    </message>
    <message>
        <source>Center</source>
        <translation>Centrer</translation>
    </message>
    <message>
        <source>Align Right</source>
        <translation>Aligner à droite</translation>
    </message>
    <message>
        <source>Justify</source>
        <translation>Justifier</translation>
    </message>
    <message>
        <source>Bold</source>
        <translation>Gras</translation>
    </message>
    <message>
        <source>Italic</source>
        <translation>Italique</translation>
    </message>
    <message>
        <source>Underline</source>
        <translation>Souligné</translation>
    </message>
    <message>
        <source>Bulleted List</source>
        <translation>Liste à puces</translation>
    </message>
    <message>
        <source>someone@example.org</source>
        <translation>nom@example.org</translation>
    </message>
    <message>
        <source>First Last</source>
        <translation>Prénom Nom</translation>
    </message>
    <message>
        <source>What the message is about</source>
        <translation>Le sujet du message</translation>
    </message>
    <message>
        <source>https://... (a page to mail with every copy)</source>
        <translation>https://... (une page à joindre à chaque exemplaire)</translation>
    </message>
    <message>
        <source>Rename...</source>
        <translation>Renommer...</translation>
    </message>
    <message>
        <source>Rename the group</source>
        <translation>Renommer le groupe</translation>
    </message>
    <message>
        <source>Delete the group</source>
        <translation>Supprimer le groupe</translation>
    </message>
    <message>
        <source>&amp;Group</source>
        <translation>&amp;Groupe</translation>
    </message>
    <message>
        <source>New group</source>
        <translation>Nouveau groupe</translation>
    </message>
    <message>
        <source>Edit...</source>
        <translation>Modifier...</translation>
    </message>
    <message>
        <source>Edit the person&apos;s names, addresses and groups</source>
        <translation>Modifier les noms, adresses et groupes de la personne</translation>
    </message>
    <message>
        <source>Delete the selected persons from the address book</source>
        <translation>Supprimer du carnet d’adresses les personnes sélectionnées</translation>
    </message>
    <message>
        <source>&amp;Name</source>
        <translation>&amp;Nom</translation>
    </message>
    <message>
        <source>New person</source>
        <translation>Nouvelle personne</translation>
    </message>
    <message>
        <source>&amp;Email</source>
        <translation>&amp;Courriel</translation>
    </message>
    <message>
        <source>Sender</source>
        <translation>Expéditeur</translation>
    </message>
    <message>
        <source>Name:</source>
        <translation>Nom :</translation>
    </message>
    <message>
        <source>Email Address:</source>
        <translation>Adresse électronique :</translation>
    </message>
    <message>
        <source>Default Recipient</source>
        <translation>Destinataire par défaut</translation>
    </message>
    <message>
        <source>Outgoing SMTP Server</source>
        <translation>Serveur SMTP sortant</translation>
    </message>
    <message>
        <source>Address:</source>
        <translation>Adresse :</translation>
    </message>
    <message>
        <source>Authentication:</source>
        <translation>Authentification :</translation>
    </message>
    <message>
        <source>None</source>
        <translation>Aucune</translation>
    </message>
    <message>
        <source>Username:</source>
        <translation>Nom d’utilisateur :</translation>
    </message>
    <message>
        <source>Message</source>
        <translation>Message</translation>
    </message>
    <message>
        <source>Format:</source>
        <translation>Format :</translation>
    </message>
    <message>
        <source>Rich text (HTML)</source>
        <translation>Texte enrichi (HTML)</translation>
    </message>
    <message>
        <source>Plain text</source>
        <translation>Texte brut</translation>
    </message>
    <message>
        <source>No typed text</source>
        <translation>Aucun texte saisi</translation>
    </message>
    <message>
        <source>Character set:</source>
        <translation>Jeu de caractères :</translation>
    </message>
    <message>
        <source>Unicode (UTF-8)</source>
        <translation>Unicode (UTF-8)</translation>
    </message>
    <message>
        <source>Western (ISO-8859-1)</source>
        <translation>Occidental (ISO-8859-1)</translation>
    </message>
    <message>
        <source>Japanese (Shift_JIS)</source>
        <translation>Japonais (Shift_JIS)</translation>
    </message>
    <message>
        <source>When Mailing Completes</source>
        <translation>À la fin de l’envoi</translation>
    </message>
    <message>
        <source>Then:</source>
        <translation>Ensuite :</translation>
    </message>
    <message>
        <source>Do nothing</source>
        <translation>Ne rien faire</translation>
    </message>
    <message>
        <source>Quit Pelmo</source>
        <translation>Quitter Pelmo</translation>
    </message>
    <message>
        <source>Clear the message</source>
        <translation>Effacer le message</translation>
    </message>
    <message>
        <source>Links to E-mail Addresses</source>
        <translation>Liens vers des adresses électroniques</translation>
    </message>
    <message>
        <source>Message not sent: %1</source>
        <translation>Message non envoyé : %1</translation>
    </message>
    <message>
        <source>[Logging starting at </source>
        <translation>[Début de la journalisation le </translation>
    </message>
    <message>
        <source>[Logging stopping at </source>
        <translation>[Fin de la journalisation le </translation>
    </message>
    <message>
        <source>Error (%@): %@</source>
        <translation>Erreur (%@) : %@</translation>
    </message>
    <message>
        <source>Connecting to the %@ server.</source>
        <translation>Connexion au serveur %@.</translation>
    </message>
    <message>
        <source>Connected to the %@ server.</source>
        <translation>Connecté au serveur %@.</translation>
    </message>
    <message>
        <source>Available authentication mechanisms: %@</source>
        <translation>Mécanismes d’authentification disponibles : %@</translation>
    </message>
    <message>
        <source>An update is available for Pelmo (version %@.) Use Software Update in the Pelmo menu to download it.</source>
        <translation>Une mise à jour de Pelmo est disponible (version %@). Utilisez « Mise à jour du logiciel » dans le menu Pelmo pour la télécharger.</translation>
    </message>
    <message>
        <source>Connection failed with error: %@ %@</source>
        <translation>La connexion a échoué avec l’erreur : %@ %@</translation>
    </message>
    <message>
        <source>Final file destination: %@</source>
        <translation>Destination finale du fichier : %@</translation>
    </message>
    <message>
        <source>Download failed! Error - %@ %@</source>
        <translation>Échec du téléchargement ! Erreur – %@ %@</translation>
    </message>
    <message>
        <source>To let Pelmo read %1&apos;s page, start it with --remote-debugging-port=9222.</source>
        <translation>Pour que Pelmo puisse lire la page de %1, lancez %1 avec --remote-debugging-port=9222.</translation>
    </message>
    <message>
        <source>Message sent.</source>
        <translation>Message envoyé.</translation>
    </message>
    <message>
        <source>Send up to 50 messages per connection</source>
        <translation>Envoyer jusqu’à 50 messages par connexion</translation>
    </message>
    <message>
        <source>Faster for a group; some servers limit what one connection may send</source>
        <translation>Plus rapide pour un groupe ; certains serveurs limitent ce qu’une connexion peut envoyer</translation>
    </message>
    <message>
        <source>Add a plain-text version to rich-text messages</source>
        <translation>Joindre une version texte brut aux messages en texte enrichi</translation>
    </message>
    <message>
        <source>Unsubscribe address:</source>
        <translation>Adresse de désinscription :</translation>
    </message>
    <message>
        <source>mailto: or https: address (optional)</source>
        <translation>adresse mailto: ou https: (facultative)</translation>
    </message>
    <message>
        <source>Waiting %1 before the next message: %2 of %3 left, about %4 to go.</source>
        <translation>Attente de %1 avant le message suivant : %2 sur %3 restants, environ %4 encore.</translation>
    </message>
    <message>
        <source>The server refused the message for now: trying again in %1 (retry %2 of %3).</source>
        <translation>Le serveur a refusé le message pour l’instant : nouvel essai dans %1 (essai %2 sur %3).</translation>
    </message>
    <message>
        <source>The &apos;Delay between messages:&apos; preference value is not a number of seconds from 0 to 86400.</source>
        <translation>Le réglage « Pause entre les messages : » n’est pas un nombre de secondes entre 0 et 86400.</translation>
    </message>
    <message>
        <source>The &apos;At most per hour:&apos; preference value is not a whole number from 0 (no limit) to 100000.</source>
        <translation>Le réglage « Au plus par heure : » n’est pas un nombre entier entre 0 (sans limite) et 100000.</translation>
    </message>
    <message>
        <source>Restored 1 recipient mailed before Pelmo stopped unexpectedly; it is not mailed again.</source>
        <translation>1 destinataire contacté avant l’arrêt inattendu de Pelmo a été rétabli ; il ne sera pas contacté à nouveau.</translation>
    </message>
    <message>
        <source>Restored %1 recipients mailed before Pelmo stopped unexpectedly; they are not mailed again.</source>
        <translation>%1 destinataires contactés avant l’arrêt inattendu de Pelmo ont été rétablis ; ils ne seront pas contactés à nouveau.</translation>
    </message>
    <message>
        <source>Not delivered %1</source>
        <translation>Non distribués %1</translation>
    </message>
    <message>
        <source>Not delivered to %1 &lt;%2&gt;: %3</source>
        <translation>Non distribué à %1 &lt;%2&gt; : %3</translation>
    </message>
    <message>
        <source>The group &quot;%1&quot; could not be made: %2</source>
        <translation>Le groupe « %1 » n’a pas pu être créé : %2</translation>
    </message>
    <message>
        <source>1 recipient refused is in the group &quot;%1&quot;: send to it to try again.</source>
        <translation>1 destinataire refusé est dans le groupe « %1 » : envoyez-lui le message pour réessayer.</translation>
    </message>
    <message>
        <source>%1 recipients refused are in the group &quot;%2&quot;: send to it to try again.</source>
        <translation>%1 destinataires refusés sont dans le groupe « %2 » : envoyez-leur le message pour réessayer.</translation>
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
        <translation>Le journal des envois ne peut pas être écrit (%1) : l’envoi continue, mais si Pelmo s’arrête de façon inattendue, il ne saura pas qui a été contacté.</translation>
    </message>
    <message>
        <source>Pelmo stopped unexpectedly during a mailing run.</source>
        <translation>Pelmo s’est arrêté de façon inattendue pendant un envoi.</translation>
    </message>
    <message>
        <source>1 recipient of that run was mailed already.</source>
        <translation>1 destinataire de cet envoi avait déjà été contacté.</translation>
    </message>
    <message>
        <source>%1 recipients of that run were mailed already.</source>
        <translation>%1 destinataires de cet envoi avaient déjà été contactés.</translation>
    </message>
    <message>
        <source>Restore them to the Sent Recipients list, so that Send mails only those not yet mailed?</source>
        <translation>Les remettre dans la liste des destinataires contactés, pour qu’Envoyer n’écrive qu’à ceux qui ne l’ont pas encore été ?</translation>
    </message>
    <message>
        <source>Restore</source>
        <translation>Rétablir</translation>
    </message>
    <message>
        <source>Pace</source>
        <translation>Rythme</translation>
    </message>
    <message>
        <source> s</source>
        <translation> s</translation>
    </message>
    <message>
        <source>Delay between messages:</source>
        <translation>Pause entre les messages :</translation>
    </message>
    <message>
        <source>No limit</source>
        <translation>Sans limite</translation>
    </message>
    <message>
        <source>Messages in any hour, for servers that limit it</source>
        <translation>Messages sur une heure quelconque, pour les serveurs qui les limitent</translation>
    </message>
    <message>
        <source>At most per hour:</source>
        <translation>Au plus par heure :</translation>
    </message>
    <message>
        <source>There is no copy %1: %2 members are to be mailed.</source>
        <translation>Il n’y a pas d’exemplaire %1 : %2 membres sont à contacter.</translation>
    </message>
    <message>
        <source>There is no copy %1: one copy goes to the Recipient Address.</source>
        <translation>Il n’y a pas d’exemplaire %1 : un seul exemplaire part vers l’adresse du destinataire.</translation>
    </message>
    <message>
        <source>Test copy for %1 &lt;%2&gt;, to %3.</source>
        <translation>Exemplaire de test pour %1 &lt;%2&gt;, envoyé à %3.</translation>
    </message>
    <message>
        <source>The subject is empty.</source>
        <translation>Le sujet est vide.</translation>
    </message>
    <message>
        <source>&quot;%1&quot; is not a tag and goes out as written; the tags are {to}, {toName}, {from}, {fromName} and {subject}.</source>
        <translation>« %1 » n’est pas une balise et part tel quel ; les balises sont {to}, {toName}, {from}, {fromName} et {subject}.</translation>
    </message>
    <message>
        <source>The attachment &quot;%1&quot; is missing.</source>
        <translation>La pièce jointe « %1 » est introuvable.</translation>
    </message>
    <message>
        <source>The attachment &quot;%1&quot; cannot be read.</source>
        <translation>La pièce jointe « %1 » ne peut pas être lue.</translation>
    </message>
    <message>
        <source>Each copy is %1 MB, more than the %2 MB that %3 accepts.</source>
        <translation>Chaque exemplaire fait %1 Mo, plus que les %2 Mo qu’accepte %3.</translation>
    </message>
    <message>
        <source>Each copy is %1 MB, more than the 25 MB that many mail servers accept.</source>
        <translation>Chaque exemplaire fait %1 Mo, plus que les 25 Mo qu’acceptent beaucoup de serveurs de messagerie.</translation>
    </message>
    <message>
        <source>The web page %1 does not answer: %2</source>
        <translation>La page web %1 ne répond pas : %2</translation>
    </message>
    <message>
        <source>Send Test</source>
        <translation>Envoyer un test</translation>
    </message>
    <message>
        <source>Preview…</source>
        <translation>Aperçu…</translation>
    </message>
    <message>
        <source>Before Sending</source>
        <translation>Avant l’envoi</translation>
    </message>
    <message>
        <source>Look at these before the group is mailed:</source>
        <translation>Vérifiez ces points avant d’écrire au groupe :</translation>
    </message>
    <message>
        <source>Send Anyway</source>
        <translation>Envoyer quand même</translation>
    </message>
    <message>
        <source>Preview</source>
        <translation>Aperçu</translation>
    </message>
    <message>
        <source>Copy for:</source>
        <translation>Exemplaire pour :</translation>
    </message>
    <message>
        <source>Mail this copy to your own address</source>
        <translation>Envoyer cet exemplaire à votre propre adresse</translation>
    </message>
    <message>
        <source>No attachments.</source>
        <translation>Aucune pièce jointe.</translation>
    </message>
    <message>
        <source>%1 (%2)</source>
        <translation>%1 (%2)</translation>
    </message>
    <message>
        <source>%1 (cannot be read: left out)</source>
        <translation>%1 (illisible : laissé de côté)</translation>
    </message>
    <message>
        <source>Skip a recipient the server refuses</source>
        <translation>Passer un destinataire que le serveur refuse</translation>
    </message>
    <message>
        <source>The run goes on, and those refused are put in a new group to send to again later</source>
        <translation>L’envoi continue, et les destinataires refusés sont placés dans un nouveau groupe auquel écrire plus tard</translation>
    </message>
    <message>
        <source>Try again when the server is busy</source>
        <translation>Réessayer quand le serveur est occupé</translation>
    </message>
    <message>
        <source>After 30 s, 2 min and 8 min; then the run stops as for any refusal</source>
        <translation>Après 30 s, 2 min et 8 min ; ensuite l’envoi s’arrête comme pour tout refus</translation>
    </message>
</context>
<context>
    <name>SmtpClient</name>
    <message>
        <source>The user name, password or mechanism contains a line break or NUL character.</source>
        <translation>Le nom d’utilisateur, le mot de passe ou le mécanisme contient un saut de ligne ou un caractère NUL.</translation>
    </message>
    <message>
        <source>Unknown authentication mechanism &quot;%1&quot;.</source>
        <translation>Mécanisme d’authentification « %1 » inconnu.</translation>
    </message>
    <message>
        <source>The message (%1 bytes) is larger than the %2 bytes the server accepts.</source>
        <translation>Le message (%1 octets) dépasse les %2 octets acceptés par le serveur.</translation>
    </message>
    <message>
        <source>Could not connect to %1:%2: %3</source>
        <translation>Impossible de se connecter à %1:%2 : %3</translation>
    </message>
    <message>
        <source>Connection to %1 lost: %2</source>
        <translation>Connexion à %1 perdue : %2</translation>
    </message>
    <message>
        <source>The server %1 closed the connection.</source>
        <translation>Le serveur %1 a fermé la connexion.</translation>
    </message>
    <message>
        <source>Could not connect to %1:%2 within %3 s.</source>
        <translation>Impossible de se connecter à %1:%2 en %3 s.</translation>
    </message>
    <message>
        <source>The server %1 did not answer within %2 s.</source>
        <translation>Le serveur %1 n’a pas répondu en %2 s.</translation>
    </message>
    <message>
        <source>TLS handshake with %1 failed: %2</source>
        <translation>Échec de la négociation TLS avec %1 : %2</translation>
    </message>
    <message>
        <source>The server %1 sent a malformed reply: %2</source>
        <translation>Le serveur %1 a envoyé une réponse mal formée : %2</translation>
    </message>
    <message>
        <source>The server %1 sent an overlong reply.</source>
        <translation>Le serveur %1 a envoyé une réponse trop longue.</translation>
    </message>
    <message>
        <source>The server %1 refused the session: %2</source>
        <translation>Le serveur %1 a refusé la session : %2</translation>
    </message>
    <message>
        <source>The server %1 refused EHLO: %2</source>
        <translation>Le serveur %1 a refusé EHLO : %2</translation>
    </message>
    <message>
        <source>The server %1 refused HELO: %2</source>
        <translation>Le serveur %1 a refusé HELO : %2</translation>
    </message>
    <message>
        <source>The server %1 refused STARTTLS: %2</source>
        <translation>Le serveur %1 a refusé STARTTLS : %2</translation>
    </message>
    <message>
        <source>The server %1 refused the authentication: %2</source>
        <translation>Le serveur %1 a refusé l’authentification : %2</translation>
    </message>
    <message>
        <source>The message has no recipient.</source>
        <translation>Le message n’a pas de destinataire.</translation>
    </message>
    <message>
        <source>The sender address &quot;%1&quot; contains a control character or an angle bracket.</source>
        <translation>L’adresse de l’expéditeur « %1 » contient un caractère de contrôle ou un chevron.</translation>
    </message>
    <message>
        <source>The recipient address &quot;%1&quot; contains a control character or an angle bracket.</source>
        <translation>L’adresse du destinataire « %1 » contient un caractère de contrôle ou un chevron.</translation>
    </message>
    <message>
        <source>The address &quot;%1&quot; has a name before the @ that is not ASCII, which the server %2 does not accept (it does not offer SMTPUTF8).</source>
        <translation>L’adresse « %1 » a avant le @ un nom qui n’est pas en ASCII, ce que le serveur %2 n’accepte pas (il ne propose pas SMTPUTF8).</translation>
    </message>
    <message>
        <source>The server %1 refused the message: %2</source>
        <translation>Le serveur %1 a refusé le message : %2</translation>
    </message>
    <message>
        <source>The server %1 refused RSET: %2</source>
        <translation>Le serveur %1 a refusé RSET : %2</translation>
    </message>
    <message>
        <source>TLS is not available on this connection to %1.</source>
        <translation>TLS n’est pas disponible pour cette connexion à %1.</translation>
    </message>
</context>
</TS>

#pragma once

#include "addressbook/SkippedValue.h"

#include <QList>
#include <QString>
#include <QStringList>

/** What one import did to the address book. */
struct ImportSummary {
    /** Persons new to the book. */
    int personsAdded = 0;
    /**
     * Persons already in the book (the same primary address) who gained an address, a name
     * part or a group from the file.
     */
    int personsUpdated = 0;
    /** Persons already in the book to whom the file added nothing. */
    int personsUnchanged = 0;
    /** Contacts of the file left out whole because of a fault. */
    int personsSkipped = 0;
    /** Groups the import created. */
    int groupsAdded = 0;
    /** Every value left out, in the order of the file. */
    QList<SkippedValue> skipped;

    /**
     * The counts in one sentence for the user, the same in the window and on the command line:
     * "Imported friends.vcf: 4 persons added, 0 updated, 0 skipped; 2 new groups.", followed by
     * how many were already in the book when some were.
     */
    QString headline(const QString& fileName) const;
    /** One line for each value left out: "line 5: REASON (skipped)". */
    QStringList skippedLines() const;
};

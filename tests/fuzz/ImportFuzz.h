#pragma once

// The contacts-file importers on arbitrary bytes: a file is either refused with an ImportError
// that names one of its lines, or gives contacts the address book takes as they are and
// reports what it left out against lines of the file.

#include "FuzzSupport.h"

#include "addressbook/ImportError.h"
#include "addressbook/ImportText.h"
#include "addressbook/ParsedContacts.h"

#include <algorithm>

namespace fuzz {

// The address book's own rule for names: no control character (they end up in mail headers).
inline bool isCleanName(const QString& name) {
    return std::none_of(name.begin(), name.end(),
                        [](QChar c) { return c.category() == QChar::Other_Control; });
}

inline void checkImport(ParsedContacts (*parse)(const QByteArray&), const QByteArray& bytes) {
    // Every line break is one of these bytes in UTF-8, Windows-1252 and UTF-16 alike.
    const qsizetype lines = bytes.count('\n') + bytes.count('\r') + 1;
    ParsedContacts parsed;
    try {
        parsed = parse(bytes);
    } catch (const ImportError& error) {
        require(error.line() >= 0 && error.line() <= lines, "the fault's line is not in the file");
        require(!error.reason().isEmpty(), "a fault without a reason");
        return;
    }
    for (const SkippedValue& skipped : std::as_const(parsed.skipped)) {
        require(skipped.line >= 1 && skipped.line <= lines, "a skipped value's line is not in "
                                                            "the file");
        require(!skipped.reason.isEmpty(), "a value skipped without a reason");
    }
    require(parsed.contactsSkipped <= parsed.skipped.size(), "a contact left out unreported");
    for (const ImportedContact& contact : std::as_const(parsed.contacts)) {
        const Person& person = contact.person;
        require(!person.fullName().isEmpty() || !person.emails.isEmpty(),
                "a contact with neither a name nor an address");
        require(isCleanName(person.firstName) && isCleanName(person.lastName),
                "a name holds a control character");
        require(person.emails.isEmpty()
                    ? person.primary == -1
                    : person.primary >= 0 && person.primary < person.emails.size(),
                "the primary address is not one of the addresses");
        for (const QString& address : person.emails)
            require(ImportText::isPlausibleAddress(address), "an implausible address");
        for (const QString& group : contact.groups)
            require(!group.trimmed().isEmpty() && isCleanName(group), "a blank or unclean group");
    }
}

} // namespace fuzz

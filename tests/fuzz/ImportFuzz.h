#pragma once

// The contacts-file importers on arbitrary bytes: a file is either refused with an ImportError
// that names one of its lines, or gives contacts the address book takes as they are.

#include "FuzzSupport.h"

#include "addressbook/ImportError.h"
#include "addressbook/ImportText.h"
#include "addressbook/ImportedContact.h"

#include <algorithm>

namespace fuzz {

// The address book's own rule for names: no control character (they end up in mail headers).
inline bool isCleanName(const QString& name) {
    return std::none_of(name.begin(), name.end(),
                        [](QChar c) { return c.category() == QChar::Other_Control; });
}

inline void checkImport(QList<ImportedContact> (*parse)(const QByteArray&),
                        const QByteArray& bytes) {
    QList<ImportedContact> contacts;
    try {
        contacts = parse(bytes);
    } catch (const ImportError& error) {
        require(error.line() >= 0 && error.line() <= bytes.count('\n') + bytes.count('\r') + 1,
                "the fault's line is not in the file");
        require(!error.reason().isEmpty(), "a fault without a reason");
        return;
    }
    for (const ImportedContact& contact : std::as_const(contacts)) {
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

#pragma once

#include "addressbook/Person.h"

#include <QStringList>

/** A person read from a contacts file (its id not yet given) and the groups it belongs to. */
struct ImportedContact {
    Person person;
    QStringList groups;
};

#pragma once

#include <QString>
#include <QtGlobal>

/** A named group of the address book; its members are asked of the AddressBook by id. */
struct Group {
    qint64 id = 0;
    QString name;
};

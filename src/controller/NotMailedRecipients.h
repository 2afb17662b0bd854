#pragma once

#include "addressbook/Person.h"

#include <QAbstractTableModel>
#include <QDateTime>
#include <QList>

/**
 * The members of a group run whose copy was not accepted, with why and when, so that nobody
 * drops out of a run unseen: a table model (name, address, reason, time) the Sent Recipients
 * window shows. A member leaves the list when a copy to their address is accepted or when the
 * user puts them back in front of the pending members. Main thread only.
 */
class NotMailedRecipients : public QAbstractTableModel {
    Q_OBJECT

public:
    enum Column { Name, Address, Reason, Time, ColumnCount };

    using QAbstractTableModel::QAbstractTableModel;

    /** Records person as not mailed for reason, as the last row; a person already listed
     * moves there with the new reason. */
    void addPerson(const Person& person, const QString& reason);
    /** Forgets every row whose address is address, ignoring letter case. */
    void removeAddress(const QString& address);
    /** Removes the rows given (all when rows is empty) and answers their persons, in list
     * order. */
    QList<Person> takePersons(QList<int> rows);
    void clear();

    int rowCount(const QModelIndex& parent = {}) const override;
    int columnCount(const QModelIndex& parent = {}) const override;
    QVariant data(const QModelIndex& index, int role = Qt::DisplayRole) const override;
    QVariant headerData(int section, Qt::Orientation orientation,
                        int role = Qt::DisplayRole) const override;

private:
    struct Entry {
        Person person;
        QString reason;
        QDateTime time;
    };
    void removeRow(int row);

    QList<Entry> entries;
};

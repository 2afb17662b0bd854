#pragma once

#include <QAbstractListModel>
#include <QSet>
#include <QStringList>

/**
 * Every address a copy was accepted for since Pelmo started, in the order mailed, as a list
 * model the Sent Recipients window shows directly (row n is the address, its vertical header
 * the number n + 1). Nobody in it is mailed again until it is reset. Main thread only.
 */
class SentRecipients : public QAbstractListModel {
    Q_OBJECT

public:
    using QAbstractListModel::QAbstractListModel;

    /** True when address was mailed, ignoring letter case only (nothing is trimmed). */
    bool recipientsContains(const QString& address) const;
    /** Records address as mailed, as the last row. */
    void addRecipient(const QString& address);
    /** Forgets every mailed address. */
    void resetRecipients();
    const QStringList& addresses() const { return recipients; }

    int rowCount(const QModelIndex& parent = {}) const override;
    QVariant data(const QModelIndex& index, int role = Qt::DisplayRole) const override;
    QVariant headerData(int section, Qt::Orientation orientation,
                        int role = Qt::DisplayRole) const override;

private:
    QStringList recipients;
    /** recipients case-folded, so that a lookup need not walk the list. */
    QSet<QString> folded;
};

#include "controller/SentRecipients.h"

#include "util/LocalizedStrings.h"

bool SentRecipients::recipientsContains(const QString& address) const {
    return folded.contains(address.toCaseFolded());
}

void SentRecipients::addRecipient(const QString& address) {
    const int row = static_cast<int>(recipients.size());
    beginInsertRows({}, row, row);
    recipients.append(address);
    folded.insert(address.toCaseFolded());
    endInsertRows();
}

void SentRecipients::resetRecipients() {
    beginResetModel();
    recipients.clear();
    folded.clear();
    endResetModel();
}

int SentRecipients::rowCount(const QModelIndex& parent) const {
    return parent.isValid() ? 0 : static_cast<int>(recipients.size());
}

QVariant SentRecipients::data(const QModelIndex& index, int role) const {
    if (!checkIndex(index, CheckIndexOption::IndexIsValid) || role != Qt::DisplayRole)
        return {};
    return recipients.at(index.row());
}

QVariant SentRecipients::headerData(int section, Qt::Orientation orientation, int role) const {
    if (orientation == Qt::Horizontal && role == Qt::DisplayRole)
        return LocalizedStringNS("Email Address");
    return QAbstractListModel::headerData(section, orientation, role);
}

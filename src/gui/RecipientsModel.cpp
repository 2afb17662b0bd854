#include "gui/RecipientsModel.h"

#include "controller/PelmoController.h"
#include "util/LocalizedStrings.h"

RecipientsModel::RecipientsModel(PelmoController& controller, QObject* parent)
    : QAbstractTableModel(parent), m_controller(controller) {}

QStringList RecipientsModel::columnIdentifiers() {
    return {QStringLiteral("index"), QStringLiteral("email")};
}

int RecipientsModel::rowCount(const QModelIndex& parent) const {
    return parent.isValid() ? 0 : m_controller.numberOfRows();
}

int RecipientsModel::columnCount(const QModelIndex& parent) const {
    return parent.isValid() ? 0 : static_cast<int>(columnIdentifiers().size());
}

QVariant RecipientsModel::data(const QModelIndex& index, int role) const {
    if (!index.isValid() || role != Qt::DisplayRole)
        return {};
    return m_controller.valueFor(columnIdentifiers().value(index.column()), index.row());
}

QVariant RecipientsModel::headerData(int section, Qt::Orientation orientation, int role) const {
    if (orientation != Qt::Horizontal || role != Qt::DisplayRole)
        return {};
    return section == 0 ? LocalizedStringNS("No.") : LocalizedStringNS("Email Address");
}

void RecipientsModel::reload() {
    beginResetModel();
    endResetModel();
}

#pragma once

#include <QAbstractTableModel>

class PelmoController;

/**
 * The sent-recipients list as a table model: columns "index" and "email", every value asked of
 * the controller (numberOfRows, valueFor). The controller is not owned.
 */
class RecipientsModel : public QAbstractTableModel {
    Q_OBJECT

public:
    explicit RecipientsModel(PelmoController& controller, QObject* parent = nullptr);

    /** The column identifiers the controller answers to, in display order. */
    static QStringList columnIdentifiers();

    int rowCount(const QModelIndex& parent = {}) const override;
    int columnCount(const QModelIndex& parent = {}) const override;
    QVariant data(const QModelIndex& index, int role = Qt::DisplayRole) const override;
    QVariant headerData(int section, Qt::Orientation orientation,
                        int role = Qt::DisplayRole) const override;

    /** The controller's list changed: every row is asked again. */
    void reload();

private:
    PelmoController& m_controller;
};

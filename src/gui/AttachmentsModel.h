#pragma once

#include <QAbstractListModel>

class AttachmentsController;

/**
 * The attachments list as the table's model: one full path a row, and the table's drag and
 * drop, each decision asked of the AttachmentsController (rowDragData, readDrag, validateDrop,
 * acceptDrop). The controller is not owned.
 */
class AttachmentsModel : public QAbstractListModel {
    Q_OBJECT

public:
    explicit AttachmentsModel(AttachmentsController& controller, QObject* parent = nullptr);

    int rowCount(const QModelIndex& parent = {}) const override;
    QVariant data(const QModelIndex& index, int role = Qt::DisplayRole) const override;
    QVariant headerData(int section, Qt::Orientation orientation,
                        int role = Qt::DisplayRole) const override;
    Qt::ItemFlags flags(const QModelIndex& index) const override;

    /** The private row type first, then the file manager's list of files. */
    QStringList mimeTypes() const override;
    /** The dragged rows in the private row type. */
    QMimeData* mimeData(const QModelIndexList& indexes) const override;
    Qt::DropActions supportedDropActions() const override;
    Qt::DropActions supportedDragActions() const override;
    /** Whether the controller takes the drag between rows; parent valid means onto a row. */
    bool canDropMimeData(const QMimeData* data, Qt::DropAction action, int row, int column,
                         const QModelIndex& parent) const override;
    bool dropMimeData(const QMimeData* data, Qt::DropAction action, int row, int column,
                      const QModelIndex& parent) override;

private:
    AttachmentsController& m_controller;
};

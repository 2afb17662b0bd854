#include "gui/AttachmentsModel.h"

#include "attachments/AttachmentsController.h"
#include "util/LocalizedStrings.h"

#include <QFileIconProvider>
#include <QFileInfo>
#include <QMimeData>

AttachmentsModel::AttachmentsModel(AttachmentsController& controller, QObject* parent)
    : QAbstractListModel(parent), m_controller(controller) {
    // The controller's list is the one truth: any change, from here or elsewhere, is shown.
    connect(&controller, &AttachmentsController::attachmentsChanged, this, [this] {
        beginResetModel();
        endResetModel();
    });
}

int AttachmentsModel::rowCount(const QModelIndex& parent) const {
    return parent.isValid() ? 0 : static_cast<int>(m_controller.getAttachments().size());
}

QVariant AttachmentsModel::data(const QModelIndex& index, int role) const {
    const QStringList& paths = m_controller.getAttachments();
    if (!index.isValid() || index.row() >= paths.size())
        return {};
    const QString& path = paths.at(index.row());
    switch (role) {
    case Qt::DisplayRole:
    case Qt::ToolTipRole:
        return path;
    case Qt::DecorationRole:
        return QFileIconProvider().icon(QFileInfo(path));
    default:
        return {};
    }
}

QVariant AttachmentsModel::headerData(int section, Qt::Orientation orientation, int role) const {
    if (section != 0 || orientation != Qt::Horizontal || role != Qt::DisplayRole)
        return {};
    return LocalizedStringNS("File");
}

// Rows are dragged, never dropped onto: a drop lands between rows.
Qt::ItemFlags AttachmentsModel::flags(const QModelIndex& index) const {
    if (!index.isValid())
        return Qt::ItemIsDropEnabled;
    return Qt::ItemIsEnabled | Qt::ItemIsSelectable | Qt::ItemIsDragEnabled |
           Qt::ItemNeverHasChildren;
}

QStringList AttachmentsModel::mimeTypes() const {
    return {AttachmentsController::privateDragType, QStringLiteral("text/uri-list")};
}

QMimeData* AttachmentsModel::mimeData(const QModelIndexList& indexes) const {
    QList<int> rows;
    for (const QModelIndex& index : indexes)
        rows << index.row();
    // The drag takes the data over.
    return AttachmentsController::rowDragData(rows).release();
}

Qt::DropActions AttachmentsModel::supportedDropActions() const {
    return Qt::CopyAction | Qt::MoveAction | Qt::LinkAction;
}

// A row drag reports Move; the view then asks removeRows, which this model does not offer, so
// only the controller's own move changes the list.
Qt::DropActions AttachmentsModel::supportedDragActions() const {
    return Qt::MoveAction;
}

bool AttachmentsModel::canDropMimeData(const QMimeData* data, Qt::DropAction, int, int,
                                       const QModelIndex& parent) const {
    if (!data)
        return false;
    // The table takes its own rows and local files, the two kinds of drag it registers for; a
    // drag of its own type whose rows cannot be read is refused while it moves, not at the drop.
    const AttachmentsController::Drag drag = AttachmentsController::readDrag(*data);
    if (drag.isRowDrag ? drag.rows.isEmpty() : drag.files.isEmpty())
        return false;
    return AttachmentsController::validateDrop(drag.firstFile(), parent.isValid()) !=
           AttachmentsController::dragOperationNone;
}

bool AttachmentsModel::dropMimeData(const QMimeData* data, Qt::DropAction action, int row,
                                    int column, const QModelIndex& parent) {
    if (!canDropMimeData(data, action, row, column, parent))
        return false;
    return m_controller.acceptDrop(AttachmentsController::readDrag(*data), row);
}

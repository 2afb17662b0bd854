#include "attachments/AttachmentsController.h"

#include "util/TextUtilities.h"

#include <QDataStream>
#include <QDesktopServices>
#include <QFileInfo>
#include <QIODevice>
#include <QMimeData>
#include <QUrl>
#include <QtEndian>

#include <algorithm>

namespace {

// The row indexes travel as a QDataStream list, read back only by this program.
constexpr QDataStream::Version rowStreamVersion = QDataStream::Qt_6_4;

QList<int> readRows(const QByteArray& bytes) {
    // The count in front comes from whoever made the drag, and the stream would reserve room
    // for that many rows before reading one: believe it only if exactly that many follow.
    if (bytes.size() < 4 ||
        qFromBigEndian<quint32>(bytes.constData()) * 4ull != quint64(bytes.size()) - 4)
        return {};
    QDataStream stream(bytes);
    stream.setVersion(rowStreamVersion);
    QList<qint32> rows;
    stream >> rows;
    if (stream.status() != QDataStream::Ok)
        return {};
    return QList<int>(rows.begin(), rows.end());
}

} // namespace

const QString AttachmentsController::privateDragType = QStringLiteral("MyPrivateTableViewDataType");

std::optional<QString> AttachmentsController::Drag::firstFile() const {
    if (files.isEmpty())
        return std::nullopt;
    return files.first();
}

AttachmentsController::AttachmentsController(QObject* parent) : QObject(parent) {
    paths.reserve(50);
}

std::unique_ptr<QMimeData> AttachmentsController::rowDragData(const QList<int>& rows) {
    // An index set: ascending, each row once.
    QList<qint32> indexes(rows.begin(), rows.end());
    std::sort(indexes.begin(), indexes.end());
    indexes.erase(std::unique(indexes.begin(), indexes.end()), indexes.end());
    QByteArray bytes;
    QDataStream stream(&bytes, QIODevice::WriteOnly);
    stream.setVersion(rowStreamVersion);
    stream << indexes;
    auto data = std::make_unique<QMimeData>();
    data->setData(privateDragType, bytes);
    return data;
}

AttachmentsController::Drag AttachmentsController::readDrag(const QMimeData& data) {
    Drag drag;
    if (data.hasFormat(privateDragType)) {
        drag.isRowDrag = true;
        drag.rows = readRows(data.data(privateDragType));
        return drag;
    }
    for (const QUrl& url : data.urls()) {
        if (url.isLocalFile())
            drag.files += url.toLocalFile();
    }
    return drag;
}

unsigned AttachmentsController::validateDrop(const std::optional<QString>& firstDroppedPath,
                                             bool dropOnRow) {
    if (dropOnRow)
        return dragOperationNone;
    if (!firstDroppedPath)
        return dragOperationEvery;
    return QFileInfo(*firstDroppedPath).isDir() ? dragOperationNone : dragOperationEvery;
}

bool AttachmentsController::acceptDrop(const Drag& drag, int row) {
    // Qt reports a drop below the last row as -1.
    if (row < 0 || row > paths.size())
        row = static_cast<int>(paths.size());
    return drag.isRowDrag ? moveFirstRow(drag.rows, row) : insertFiles(drag.files, row);
}

bool AttachmentsController::moveFirstRow(const QList<int>& rows, int row) {
    if (rows.isEmpty())
        return false;
    const int source = rows.first();
    // Removing the source first shifts every later insertion point up by one.
    const int target = row > source ? row - 1 : row;
    const QStringList before = paths;
    MoveArrayItem(paths, source, target);
    if (paths != before)
        Q_EMIT attachmentsChanged();
    return true;
}

bool AttachmentsController::insertFiles(const QStringList& files, int row) {
    bool inserted = false;
    for (const QString& file : files) {
        if (file.isEmpty())
            continue;
        paths.insert(row, file);
        inserted = true;
    }
    if (inserted)
        Q_EMIT attachmentsChanged();
    return inserted;
}

void AttachmentsController::deleteButtonClicked(const QList<int>& selectedRows) {
    if (selectedRows.isEmpty()) {
        paths.clear();
        Q_EMIT attachmentsChanged();
        return;
    }
    QList<int> rows = selectedRows;
    // From the last row back, so that each removal leaves the indexes still to go in place.
    std::sort(rows.begin(), rows.end(), std::greater<>());
    rows.erase(std::unique(rows.begin(), rows.end()), rows.end());
    for (const int row : rows) {
        if (row >= 0 && row < paths.size())
            paths.removeAt(row);
    }
    Q_EMIT attachmentsChanged();
}

bool AttachmentsController::openAttachment(int row) const {
    if (row < 0 || row >= paths.size())
        return false;
    return QDesktopServices::openUrl(QUrl::fromLocalFile(paths.at(row)));
}

void AttachmentsController::addFiles(const QStringList& files) {
    if (files.isEmpty())
        return;
    paths.append(files);
    Q_EMIT attachmentsChanged();
}

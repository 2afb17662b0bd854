#pragma once

#include <QList>
#include <QObject>
#include <QString>
#include <QStringList>

#include <memory>
#include <optional>

class QMimeData;

/**
 * The attachments list: the ordered full paths of the files attached to every message, and
 * the rules of the table that shows it (one path a row): files dropped in, rows dragged to a
 * new place, rows deleted, a row opened. Holds no widget; the table calls these and reloads on
 * attachmentsChanged. Main thread only. The list is not kept between launches.
 */
class AttachmentsController : public QObject {
    Q_OBJECT

public:
    /** The drag type of rows dragged within the table; it carries their row indexes. */
    static const QString privateDragType;
    /** validateDrop's verdicts: no operation, and every operation (all bits set). */
    static constexpr unsigned dragOperationNone = 0;
    static constexpr unsigned dragOperationEvery = ~0u;

    /** What a drag over the table carries. */
    struct Drag {
        /** The private type is present: a row drag from the table itself. */
        bool isRowDrag = false;
        /** The dragged rows, ascending, each once (empty when the data was unreadable). */
        QList<int> rows;
        /** The local files of a file drag, in drag order; other URLs are left out. */
        QStringList files;

        std::optional<QString> firstFile() const;
    };

    explicit AttachmentsController(QObject* parent = nullptr);

    /** The list itself, in order; valid until the next change. */
    const QStringList& getAttachments() const { return paths; }

    /** Drag data for rows dragged out of the table; the caller (the drag) owns it. */
    static std::unique_ptr<QMimeData> rowDragData(const QList<int>& rows);
    /** Reads a drag's data: the private row type first, else its file URLs. */
    static Drag readDrag(const QMimeData& data);

    /**
     * The verdict on a drag hovering over the table: a drop onto a row is refused; a drag
     * without files (a row drag) is accepted; otherwise only the first file decides: a folder
     * is refused, anything else (a file that does not exist too) accepted.
     */
    static unsigned validateDrop(const std::optional<QString>& firstDroppedPath, bool dropOnRow);

    /**
     * Drops the drag at insertion row (0 to the row count; -1 or beyond appends). A row drag
     * moves only its first row; a file drag inserts each file at that same index, so several
     * files land in reverse order, and neither duplicates nor later folders are filtered.
     * Answers whether the drop was taken.
     */
    bool acceptDrop(const Drag& drag, int row);

    /** Removes the selected rows; with no selection, removes every path. */
    void deleteButtonClicked(const QList<int>& selectedRows);

    /**
     * Asks the desktop to open the file at row in its default application. A row outside the
     * list (-1: no selection) is ignored. Answers whether the desktop took the request.
     */
    bool openAttachment(int row) const;

Q_SIGNALS:
    /** The list changed: the table reloads. */
    void attachmentsChanged();

private:
    bool moveFirstRow(const QList<int>& rows, int row);
    bool insertFiles(const QStringList& files, int row);

    QStringList paths;
};

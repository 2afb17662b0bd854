#pragma once

#include <QWidget>

class AttachmentsController;
class AttachmentsModel;
class QTableView;

/**
 * The attachments window: the files attached to every message, one full path a row. Files
 * dropped from the file manager are inserted where they are dropped, rows are reordered by
 * dragging, Remove deletes the selected rows (all rows when none is selected), and a
 * double-click opens a file in its default application. Every rule is the
 * AttachmentsController's. A separate window owned by its parent; the controller is not owned.
 */
class AttachmentsWindow : public QWidget {
    Q_OBJECT

public:
    AttachmentsWindow(AttachmentsController& controller, QWidget* parent);

    AttachmentsModel& model() const { return *m_model; }

private:
    void removeClicked();
    void addFiles();
    void open(const QModelIndex& index);

    AttachmentsController& m_controller;
    AttachmentsModel* m_model;
    QTableView* m_table;
};

#pragma once

#include <QWidget>

class PelmoController;
class QTableView;

/**
 * The "sent recipients" window: every address mailed since Pelmo started, numbered, with a
 * Reset button that forgets them; below it, the group members whose copy was not accepted,
 * with why and when, and a Put Back button that queues them before the members still pending.
 * It shows the controller's models as they change. A separate window owned by its parent (the
 * main window); the controller is not owned and must outlive it.
 */
class RecipientsWindow : public QWidget {
    Q_OBJECT

public:
    RecipientsWindow(PelmoController& controller, QWidget* parent);

    QTableView& table() const { return *m_table; }
    QTableView& notMailedTable() const { return *m_notMailed; }

private:
    QWidget* createSentPane(PelmoController& controller);
    QWidget* createNotMailedPane(PelmoController& controller);

    QTableView* m_table;
    QTableView* m_notMailed;
};

#pragma once

#include <QWidget>

class QTableView;
class SentRecipients;

/**
 * The "sent recipients" window: every address mailed since Pelmo started, numbered, and a
 * Reset button that forgets them. It shows the controller's list model as it changes, scrolled
 * to the latest address. A separate window owned by its parent (the main window); the list
 * is not owned and must outlive it.
 */
class RecipientsWindow : public QWidget {
    Q_OBJECT

public:
    RecipientsWindow(SentRecipients& recipients, QWidget* parent);

    QTableView& table() const { return *m_table; }

private:
    QTableView* m_table;
};

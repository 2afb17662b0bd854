#pragma once

#include <QWidget>

class PelmoController;
class QTableView;
class RecipientsModel;

/**
 * The "sent recipients" window: every address mailed since Pelmo started, numbered, and a
 * Reset button that makes the controller forget them. A separate window owned by its parent
 * (the main window); the controller is not owned.
 */
class RecipientsWindow : public QWidget {
    Q_OBJECT

public:
    RecipientsWindow(PelmoController& controller, QWidget* parent);

    RecipientsModel& model() const { return *m_model; }
    /** Shows the controller's list as it now stands, scrolled to the latest address. */
    void reload();

private:
    RecipientsModel* m_model;
    QTableView* m_table;
};

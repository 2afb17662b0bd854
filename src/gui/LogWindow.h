#pragma once

#include <QWidget>

class PelmoController;
class QLineEdit;
class QPlainTextEdit;

/**
 * The activity log in a window of Pelmo's own, so that it shows on any desktop: read-only,
 * following the file as lines are added, with Find and Open in Editor (the desktop's default
 * application for the file). A separate window owned by its parent (the main window); the
 * controller is not owned and must outlive it.
 */
class LogWindow : public QWidget {
    Q_OBJECT

public:
    LogWindow(PelmoController& controller, QWidget* parent);

    /**
     * Reads what the log has gained and brings the window to the front; when line is given,
     * its latest occurrence is selected and scrolled to.
     */
    void showLog(const QString& line = QString());

private:
    void readMore();
    void findNext();

    QPlainTextEdit* m_text;
    QLineEdit* m_find;
    QString m_path;
    qint64 m_read = 0; ///< bytes of the file shown so far
};

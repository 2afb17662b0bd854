#pragma once

#include <QWidget>

class QLabel;
class QProgressBar;
class QPushButton;
class SoftwareUpdateController;

/**
 * The Software Update window: Pelmo's own version and the published one, Check Now with a
 * spinner while the check runs, the status line, and Download with its progress bar. It shows
 * what the update controller reports and forwards the two buttons to it. A separate window
 * owned by its parent (the main window); the controller is not owned and must outlive it.
 */
class SoftwareUpdateWindow : public QWidget {
    Q_OBJECT

public:
    SoftwareUpdateWindow(SoftwareUpdateController& updates, QWidget* parent);

private:
    QLabel* m_ourVersionField;
    QLabel* m_currentVersionField;
    QPushButton* m_checkVersionButton;
    QProgressBar* m_progressIndicator;
    QLabel* m_softwareUpdateField;
    QPushButton* m_softwareDownloadButton;
    QProgressBar* m_downloadProgressIndicator;
};

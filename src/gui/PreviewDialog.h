#pragma once

#include <QDialog>
#include <QPointer>

class CopyPreview;
class PelmoController;
class QComboBox;
class QLabel;
class QListWidget;
class QPlainTextEdit;
class QTextBrowser;

/**
 * Message ▸ Preview…: the copy a chosen member will receive, as it will be sent: its headers,
 * its text rendered (remote pictures are never fetched, so that nobody's server learns of a
 * preview), and its attachments listed. Send Test mails the chosen member's copy to the
 * sender. The controller is not owned and must outlive the dialog.
 */
class PreviewDialog : public QDialog {
    Q_OBJECT

public:
    PreviewDialog(PelmoController& controller, QWidget* parent);

    /** The choices again, from the group or the fields as they are now. */
    void reload();

private:
    void showCopy(int index);
    void copyReady();

    PelmoController& m_controller;
    QComboBox* m_member;
    QPlainTextEdit* m_headers;
    QTextBrowser* m_body;
    QListWidget* m_attachments;
    QPointer<CopyPreview> m_preview;
};

#pragma once

#include <QDialog>
#include <QStringList>

/**
 * The findings of the check before a group run, listed, with Send Anyway (accepted()) and
 * Cancel (rejected()). Shown without a nested event loop: show() it and act on the signals.
 * It deletes itself when closed.
 */
class PreflightDialog : public QDialog {
    Q_OBJECT

public:
    PreflightDialog(const QStringList& findings, QWidget* parent);
};

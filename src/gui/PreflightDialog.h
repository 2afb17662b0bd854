#pragma once

#include <QDialog>
#include <QStringList>

/**
 * The findings of the check before a group run, listed, with Send Anyway (accepted()) and
 * Cancel (rejected()). Window-modal without a nested event loop: open() it and act on the
 * signals.
 */
class PreflightDialog : public QDialog {
    Q_OBJECT

public:
    PreflightDialog(const QStringList& findings, QWidget* parent);
};

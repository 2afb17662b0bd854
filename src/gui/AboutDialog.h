#pragma once

#include <QDialog>

/**
 * Help ▸ About Pelmo: the version, what Pelmo is for, its licence, and the libraries it runs
 * with, each at the version loaded now where the library can tell (else the one Pelmo was
 * built against), which is what a bug report needs.
 */
class AboutDialog : public QDialog {
    Q_OBJECT

public:
    explicit AboutDialog(QWidget* parent);
};

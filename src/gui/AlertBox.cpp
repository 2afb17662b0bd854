#include "gui/AlertBox.h"

#include <QMessageBox>

QMessageBox* openAlert(QWidget* window, const QString& text, const QString& informativeText) {
    auto* box =
        new QMessageBox(QMessageBox::Warning, window->windowTitle(), text, QMessageBox::Ok, window);
    box->setInformativeText(informativeText);
    box->setWindowModality(Qt::WindowModal);
    box->setAttribute(Qt::WA_DeleteOnClose);
    box->open();
    return box;
}

#include "gui/AlertBox.h"

#include <QMessageBox>
#include <QPushButton>

QMessageBox* openAlert(QWidget* window, const QString& text, const QString& informativeText) {
    auto* box =
        new QMessageBox(QMessageBox::Warning, window->windowTitle(), text, QMessageBox::Ok, window);
    box->setInformativeText(informativeText);
    box->setWindowModality(Qt::WindowModal);
    box->setAttribute(Qt::WA_DeleteOnClose);
    box->open();
    return box;
}

void askThen(QWidget* window, const QString& question, const QString& yes,
             const std::function<void()>& then) {
    auto* box = new QMessageBox(QMessageBox::Question, window->windowTitle(), question,
                                QMessageBox::Cancel, window);
    QPushButton* action = box->addButton(yes, QMessageBox::AcceptRole);
    box->setDefaultButton(QMessageBox::Cancel);
    box->setWindowModality(Qt::WindowModal);
    box->setAttribute(Qt::WA_DeleteOnClose);
    QObject::connect(box, &QMessageBox::finished, box, [box, action, then] {
        if (box->clickedButton() == action)
            then();
    });
    box->open();
}

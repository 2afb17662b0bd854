#include "gui/ToolWindows.h"

#include <QKeySequence>
#include <QShortcut>
#include <QWidget>

void bringToFront(QWidget* window) {
    window->setWindowState(window->windowState() & ~Qt::WindowMinimized);
    window->show();
    window->raise();
    window->activateWindow();
}

void closeOnEscape(QWidget* window) {
    for (const QKeySequence& key :
         {QKeySequence(Qt::Key_Escape), QKeySequence(QKeySequence::Close)})
        QObject::connect(new QShortcut(key, window), &QShortcut::activated, window,
                         &QWidget::close);
}

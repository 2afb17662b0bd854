#pragma once

#include <QString>

#include <functional>

class QMessageBox;
class QWidget;

/**
 * Shows a warning with one OK button as a window-modal box on window (the sheet of a desktop
 * that has sheets) and returns at once; the box deletes itself when closed.
 */
QMessageBox* openAlert(QWidget* window, const QString& text, const QString& informativeText);

/**
 * Asks question on window, window-modal, and returns at once: the yes button (the action, as
 * "Send Again") calls then; Cancel, the default button, and closing the box do nothing.
 */
void askThen(QWidget* window, const QString& question, const QString& yes,
             const std::function<void()>& then);

#pragma once

#include <QString>

class QMessageBox;
class QWidget;

/**
 * Shows a warning with one OK button as a window-modal box on window (the sheet of a desktop
 * that has sheets) and returns at once; the box deletes itself when closed.
 */
QMessageBox* openAlert(QWidget* window, const QString& text, const QString& informativeText);

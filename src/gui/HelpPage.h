#pragma once

class QWidget;

/**
 * Help ▸ Pelmo Help: opens the README installed beside the program in the desktop's viewer for
 * it, or says in an alert on window where the help is when it is not installed (a build run
 * from its build folder).
 */
void openHelp(QWidget* window);

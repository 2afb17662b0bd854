#pragma once

#include <QString>

class MainWindow;
class PelmoController;
class SingleInstance;

/** Names the application (organisation, name, version) for its settings and data folders. */
void nameApplication();

/** Links handed to instance go to the controller and bring window to the front. */
void acceptHandOvers(SingleInstance& instance, MainWindow& window, PelmoController& controller);

/**
 * `pelmo` without arguments, or with a link: opens the window (handing link to the controller)
 * and runs until the user quits. The links later starts hand to instance reach the controller
 * too, and bring the window to the front. Needs the QApplication to exist. Answers the process
 * exit status.
 */
int runWindow(const QString& link, SingleInstance& instance);

/**
 * The start of the window mode: hands link to the Pelmo already running on this display
 * (answering 0), else opens the window. argc and argv are main()'s.
 */
int startWindow(int argc, char** argv, const QString& link);

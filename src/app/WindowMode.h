#pragma once

/**
 * `pelmo` without arguments: opens the window and runs until the user quits. Needs the
 * QApplication to exist. Answers the process exit status.
 */
int runWindow();

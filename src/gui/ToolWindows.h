#pragma once

class QWidget;

/** Shows window, un-minimised, above the others, with the keyboard's focus. */
void bringToFront(QWidget* window);
/** Lets Escape and Ctrl+W close window, as they close a dialog. */
void closeOnEscape(QWidget* window);

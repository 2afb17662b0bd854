#pragma once

#include <QIcon>

class QColor;
class QFont;

// Icons of the formatting tools: the desktop theme's where it has one, else drawn here, so
// that the tools look alike on a desktop without an icon theme.

/** A letter drawn in font: "B" in bold for bold, and so on. */
QIcon letterIcon(const char* themeName, const QString& letter, const QFont& font);
/** Four lines of text set with alignment. */
QIcon alignmentIcon(const char* themeName, Qt::Alignment alignment);
/** Three bulleted lines. */
QIcon bulletListIcon(const char* themeName);
/** An "A" over a bar of color. */
QIcon textColorIcon(const QColor& color);

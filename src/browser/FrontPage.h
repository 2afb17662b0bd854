#pragma once

#include <QString>

/** The page a browser shows in front: its address, and its title (null when unknown). */
struct FrontPage {
    QString url;
    QString title;
};

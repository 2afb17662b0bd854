#include "app/ConsoleView.h"

#include "util/LocalizedStrings.h"

#include <QTextStream>

#include <cstdio>

ConsoleView::ConsoleView() : m_button(LocalizedStringNS("Send")) {}

void ConsoleView::setStatus(const QString& text) {
    QTextStream out(stdout);
    out << text << '\n';
    out.flush();
}

void ConsoleView::alert(const QString& title, const QString& informativeText) {
    QTextStream(stderr) << "pelmo: " << title << ": " << informativeText << '\n';
}

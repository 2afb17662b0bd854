#include "app/ConsoleView.h"

#include "util/LocalizedStrings.h"

#include <QTextStream>

#include <cstdio>

ConsoleView::ConsoleView() : m_button(LocalizedStringNS("Send")) {}

// One UTF-8 line a write, as QTextStream writes it, without making a stream for each line.
void ConsoleView::setStatus(const QString& text) {
    const QByteArray line = (text + QLatin1Char('\n')).toUtf8();
    std::fwrite(line.constData(), 1, static_cast<size_t>(line.size()), stdout);
    std::fflush(stdout);
}

void ConsoleView::alert(const QString& title, const QString& informativeText) {
    QTextStream(stderr) << "pelmo: " << title << ": " << informativeText << '\n';
}

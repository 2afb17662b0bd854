#include "gui/LogWindow.h"

#include "controller/PelmoController.h"
#include "gui/ToolWindows.h"
#include "util/CLog.h"
#include "util/LocalizedStrings.h"

#include <QFile>
#include <QFileSystemWatcher>
#include <QHBoxLayout>
#include <QLineEdit>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QScrollBar>
#include <QTextCursor>
#include <QTextDocument>
#include <QVBoxLayout>

LogWindow::LogWindow(PelmoController& controller, QWidget* parent)
    : QWidget(parent, Qt::Window), m_text(new QPlainTextEdit), m_find(new QLineEdit) {
    setWindowTitle(LocalizedStringNS("Activity Log"));
    // Closing it while the main window stays open must not end the application.
    setAttribute(Qt::WA_QuitOnClose, false);
    m_text->setObjectName(QStringLiteral("logText"));
    m_text->setReadOnly(true);
    m_text->setLineWrapMode(QPlainTextEdit::NoWrap);
    m_find->setObjectName(QStringLiteral("logFind"));
    m_find->setPlaceholderText(LocalizedStringNS("Find"));
    m_find->setClearButtonEnabled(true);
    connect(m_find, &QLineEdit::returnPressed, this, &LogWindow::findNext);
    auto* editor = new QPushButton(LocalizedStringNS("Open in Editor"));
    connect(editor, &QPushButton::clicked, &controller, &PelmoController::openConsole);

    auto* bar = new QHBoxLayout;
    bar->addWidget(m_find, 1);
    bar->addWidget(editor);
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(bar);
    layout->addWidget(m_text, 1);
    resize(720, 480);
    closeOnEscape(this);

    // The log grows while Pelmo runs; the window follows it.
    auto* watcher = new QFileSystemWatcher(this);
    m_path = LogFilePath();
    if (!m_path.isNull() && QFile::exists(m_path))
        watcher->addPath(m_path);
    connect(watcher, &QFileSystemWatcher::fileChanged, this, &LogWindow::readMore);
}

void LogWindow::showLog(const QString& line) {
    readMore();
    if (!line.isEmpty()) {
        // The status line shows the latest line of the log that reads so; older ones may too.
        QTextCursor found = m_text->document()->find(line, m_text->document()->characterCount(),
                                                     QTextDocument::FindBackward);
        if (!found.isNull()) {
            found.movePosition(QTextCursor::StartOfBlock);
            found.movePosition(QTextCursor::EndOfBlock, QTextCursor::KeepAnchor);
            m_text->setTextCursor(found);
            m_text->centerCursor();
        }
    }
    bringToFront(this);
}

void LogWindow::readMore() {
    QFile file(m_path);
    if (m_path.isNull() || !file.open(QIODevice::ReadOnly))
        return;
    // A log that shrank was replaced: shown again from its start.
    if (file.size() < m_read) {
        m_text->clear();
        m_read = 0;
    }
    file.seek(m_read);
    const QByteArray added = file.readAll();
    m_read += added.size();
    QScrollBar* bar = m_text->verticalScrollBar();
    const bool atEnd = bar->value() == bar->maximum();
    QTextCursor end(m_text->document());
    end.movePosition(QTextCursor::End);
    // The log's lines end in a carriage return.
    end.insertText(QString::fromUtf8(added).replace(QLatin1Char('\r'), QLatin1Char('\n')));
    if (atEnd)
        bar->setValue(bar->maximum());
}

void LogWindow::findNext() {
    if (m_find->text().isEmpty() || m_text->find(m_find->text()))
        return;
    // From the top once the end is reached.
    m_text->moveCursor(QTextCursor::Start);
    m_text->find(m_find->text());
}

#pragma once

#include <QToolBar>

class QAction;
class QActionGroup;
class QComboBox;
class QFontComboBox;
class QTextCharFormat;
class QTextEdit;

/**
 * The message editor's formatting tools: font, size, bold, italic, underline, colour,
 * alignment and bulleted lists. They act on the editor's selection, or without one on what is
 * typed next, and follow the format at the cursor. The editor is not owned.
 */
class FormattingToolBar : public QToolBar {
    Q_OBJECT

public:
    explicit FormattingToolBar(QTextEdit* editor, QWidget* parent = nullptr);

private:
    QAction* addToggle(const QIcon& icon, const char* text, const QKeySequence& shortcut);
    void addFontTools();
    void addStyleTools();
    void addParagraphTools();
    void mergeFormat(const QTextCharFormat& format);
    void chooseColor();
    void toggleList(bool bulleted);
    void showCharFormat(const QTextCharFormat& format);
    void showParagraph();

    QTextEdit* m_editor;
    QFontComboBox* m_font = nullptr;
    QComboBox* m_size = nullptr;
    QAction* m_bold = nullptr;
    QAction* m_italic = nullptr;
    QAction* m_underline = nullptr;
    QAction* m_color = nullptr;
    QAction* m_list = nullptr;
    QActionGroup* m_alignment = nullptr;
};

#include "gui/FormattingToolBar.h"

#include "gui/FormatIcons.h"
#include "util/LocalizedStrings.h"

#include <QActionGroup>
#include <QApplication>
#include <QColorDialog>
#include <QComboBox>
#include <QFontComboBox>
#include <QFontDatabase>
#include <QTextBlock>
#include <QTextCursor>
#include <QTextEdit>
#include <QTextList>

namespace {

// The alignments in the order of their buttons.
struct AlignmentTool {
    Qt::Alignment alignment;
    const char* themeIcon;
    const char* text;
};

constexpr AlignmentTool kAlignments[] = {
    {Qt::AlignLeft | Qt::AlignAbsolute, "format-justify-left", LocalizedKey("Align Left")},
    {Qt::AlignHCenter, "format-justify-center", LocalizedKey("Center")},
    {Qt::AlignRight | Qt::AlignAbsolute, "format-justify-right", LocalizedKey("Align Right")},
    {Qt::AlignJustify, "format-justify-fill", LocalizedKey("Justify")},
};

QFont styled(bool bold, bool italic, bool underline) {
    QFont font = QApplication::font();
    font.setBold(bold);
    font.setItalic(italic);
    font.setUnderline(underline);
    return font;
}

} // namespace

FormattingToolBar::FormattingToolBar(QTextEdit* editor, QWidget* parent)
    : QToolBar(LocalizedStringNS("Format"), parent), m_editor(editor) {
    setObjectName(QStringLiteral("formatting"));
    setIconSize(QSize(16, 16));
    addFontTools();
    addSeparator();
    addStyleTools();
    addSeparator();
    addParagraphTools();
    connect(editor, &QTextEdit::currentCharFormatChanged, this, &FormattingToolBar::showCharFormat);
    connect(editor, &QTextEdit::cursorPositionChanged, this, &FormattingToolBar::showParagraph);
    showCharFormat(editor->currentCharFormat());
    showParagraph();
}

QAction* FormattingToolBar::addToggle(const QIcon& icon, const char* text,
                                      const QKeySequence& shortcut) {
    QAction* action = addAction(icon, LocalizedStringNS(text));
    action->setShortcut(shortcut);
    action->setCheckable(true);
    return action;
}

void FormattingToolBar::addFontTools() {
    m_font = new QFontComboBox;
    m_font->setToolTip(LocalizedStringNS("Font"));
    addWidget(m_font);
    connect(m_font, &QFontComboBox::currentFontChanged, this, [this](const QFont& font) {
        QTextCharFormat format;
        format.setFontFamilies({font.family()});
        mergeFormat(format);
    });
    m_size = new QComboBox;
    m_size->setEditable(true);
    m_size->setToolTip(LocalizedStringNS("Size"));
    for (const int size : QFontDatabase::standardSizes())
        m_size->addItem(QString::number(size));
    addWidget(m_size);
    connect(m_size, &QComboBox::textActivated, this, [this](const QString& text) {
        const qreal points = text.toDouble();
        if (points <= 0)
            return;
        QTextCharFormat format;
        format.setFontPointSize(points);
        mergeFormat(format);
    });
}

void FormattingToolBar::addStyleTools() {
    m_bold =
        addToggle(letterIcon("format-text-bold", QStringLiteral("B"), styled(true, false, false)),
                  LocalizedKey("Bold"), QKeySequence::Bold);
    connect(m_bold, &QAction::triggered, this, [this](bool on) {
        QTextCharFormat format;
        format.setFontWeight(on ? QFont::Bold : QFont::Normal);
        mergeFormat(format);
    });
    m_italic =
        addToggle(letterIcon("format-text-italic", QStringLiteral("I"), styled(false, true, false)),
                  LocalizedKey("Italic"), QKeySequence::Italic);
    connect(m_italic, &QAction::triggered, this, [this](bool on) {
        QTextCharFormat format;
        format.setFontItalic(on);
        mergeFormat(format);
    });
    m_underline = addToggle(
        letterIcon("format-text-underline", QStringLiteral("U"), styled(false, false, true)),
        LocalizedKey("Underline"), QKeySequence::Underline);
    connect(m_underline, &QAction::triggered, this, [this](bool on) {
        QTextCharFormat format;
        format.setFontUnderline(on);
        mergeFormat(format);
    });
    m_color = addAction(textColorIcon(m_editor->textColor()), LocalizedStringNS("Text Color"));
    connect(m_color, &QAction::triggered, this, &FormattingToolBar::chooseColor);
}

void FormattingToolBar::addParagraphTools() {
    m_alignment = new QActionGroup(this);
    for (const AlignmentTool& tool : kAlignments) {
        QAction* action =
            addToggle(alignmentIcon(tool.themeIcon, tool.alignment), tool.text, QKeySequence());
        action->setData(static_cast<int>(tool.alignment));
        m_alignment->addAction(action);
    }
    connect(m_alignment, &QActionGroup::triggered, this, [this](QAction* action) {
        m_editor->setAlignment(Qt::Alignment(action->data().toInt()));
    });
    addSeparator();
    m_list = addToggle(bulletListIcon("format-list-unordered"), LocalizedKey("Bulleted List"),
                       QKeySequence());
    connect(m_list, &QAction::triggered, this, &FormattingToolBar::toggleList);
}

// Applies to the selection, or without one to what is typed next: a word just typed keeps
// its format when a style is switched off after it.
void FormattingToolBar::mergeFormat(const QTextCharFormat& format) {
    m_editor->mergeCurrentCharFormat(format);
    m_editor->setFocus();
}

void FormattingToolBar::chooseColor() {
    const QColor chosen = QColorDialog::getColor(m_editor->textColor(), this);
    if (!chosen.isValid())
        return;
    QTextCharFormat format;
    format.setForeground(chosen);
    mergeFormat(format);
}

void FormattingToolBar::toggleList(bool bulleted) {
    QTextCursor cursor = m_editor->textCursor();
    if (bulleted) {
        cursor.createList(QTextListFormat::ListDisc);
        return;
    }
    QTextList* list = cursor.currentList();
    if (!list)
        return;
    // Taking the block out of its list and its indentation makes it a plain paragraph again.
    list->remove(cursor.block());
    QTextBlockFormat block = cursor.blockFormat();
    block.setIndent(0);
    cursor.setBlockFormat(block);
}

void FormattingToolBar::showCharFormat(const QTextCharFormat& format) {
    const QFont font = format.font();
    const QSignalBlocker fontBlocker(m_font);
    m_font->setCurrentFont(font);
    m_size->setEditText(QString::number(font.pointSizeF()));
    m_bold->setChecked(font.bold());
    m_italic->setChecked(font.italic());
    m_underline->setChecked(font.underline());
    m_color->setIcon(textColorIcon(m_editor->textColor()));
}

void FormattingToolBar::showParagraph() {
    const Qt::Alignment alignment = m_editor->alignment() & Qt::AlignHorizontal_Mask;
    for (QAction* action : m_alignment->actions()) {
        const Qt::Alignment own(action->data().toInt());
        action->setChecked((own & Qt::AlignHorizontal_Mask & ~Qt::AlignAbsolute) ==
                           (alignment & ~Qt::AlignAbsolute));
    }
    m_list->setChecked(m_editor->textCursor().currentList() != nullptr);
}

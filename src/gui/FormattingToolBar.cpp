#include "gui/FormattingToolBar.h"

#include "util/LocalizedStrings.h"

#include <QActionGroup>
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
    const char* fallbackText;
    const char* toolTip;
};

constexpr AlignmentTool kAlignments[] = {
    {Qt::AlignLeft | Qt::AlignAbsolute, "format-justify-left", "Left", "Align Left"},
    {Qt::AlignHCenter, "format-justify-center", "Center", "Center"},
    {Qt::AlignRight | Qt::AlignAbsolute, "format-justify-right", "Right", "Align Right"},
    {Qt::AlignJustify, "format-justify-fill", "Justify", "Justify"},
};

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

QAction* FormattingToolBar::addToggle(const char* themeIcon, const char* fallbackText,
                                      const char* toolTip, const QKeySequence& shortcut) {
    QAction* action =
        addAction(QIcon::fromTheme(QLatin1String(themeIcon)), LocalizedStringNS(fallbackText));
    action->setToolTip(LocalizedStringNS(toolTip));
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
    m_bold = addToggle("format-text-bold", "Bold", "Bold", QKeySequence::Bold);
    connect(m_bold, &QAction::triggered, this, [this](bool on) {
        QTextCharFormat format;
        format.setFontWeight(on ? QFont::Bold : QFont::Normal);
        mergeFormat(format);
    });
    m_italic = addToggle("format-text-italic", "Italic", "Italic", QKeySequence::Italic);
    connect(m_italic, &QAction::triggered, this, [this](bool on) {
        QTextCharFormat format;
        format.setFontItalic(on);
        mergeFormat(format);
    });
    m_underline =
        addToggle("format-text-underline", "Underline", "Underline", QKeySequence::Underline);
    connect(m_underline, &QAction::triggered, this, [this](bool on) {
        QTextCharFormat format;
        format.setFontUnderline(on);
        mergeFormat(format);
    });
    QAction* color = addAction(QIcon::fromTheme(QStringLiteral("format-text-color")),
                               LocalizedStringNS("Color"));
    color->setToolTip(LocalizedStringNS("Text Color"));
    connect(color, &QAction::triggered, this, &FormattingToolBar::chooseColor);
}

void FormattingToolBar::addParagraphTools() {
    m_alignment = new QActionGroup(this);
    for (const AlignmentTool& tool : kAlignments) {
        QAction* action =
            addToggle(tool.themeIcon, tool.fallbackText, tool.toolTip, QKeySequence());
        action->setData(static_cast<int>(tool.alignment));
        m_alignment->addAction(action);
    }
    connect(m_alignment, &QActionGroup::triggered, this, [this](QAction* action) {
        m_editor->setAlignment(Qt::Alignment(action->data().toInt()));
    });
    addSeparator();
    m_list = addToggle("format-list-unordered", "List", "Bulleted List", QKeySequence());
    connect(m_list, &QAction::triggered, this, &FormattingToolBar::toggleList);
}

void FormattingToolBar::mergeFormat(const QTextCharFormat& format) {
    QTextCursor cursor = m_editor->textCursor();
    if (!cursor.hasSelection())
        cursor.select(QTextCursor::WordUnderCursor);
    cursor.mergeCharFormat(format);
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

// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/DifferenceDialog.h"

#include "app/window/settings/DifferenceTree.h"
#include "app/window/widgets/BlendedColor.h"
#include "app/window/widgets/FlowLayout.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QCheckBox>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLabel>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QScrollBar>
#include <QStackedWidget>
#include <QTextBlock>

#include <algorithm>

namespace Velocor {

namespace {

constexpr qreal LineTint = 0.22; // of the color in the background

QPlainTextEdit* NewLines()
{
    auto* lines = new QPlainTextEdit;
    lines->setReadOnly(true);
    ShowUnwrapped(lines);
    lines->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    return lines;
}

QSet<QString> LinesOf(QPlainTextEdit const* text)
{
    QSet<QString> lines;
    for (QTextBlock block = text->document()->begin(); block.isValid(); block = block.next())
        lines.insert(block.text());
    return lines;
}

// Marks the lines that are not among those of the other side, and goes to the first one.
void MarkOthers(QPlainTextEdit* text, QSet<QString> const& others)
{
    const QColor color =
        Blended(text->palette().color(QPalette::Base), QColor(0xe0, 0x90, 0x00), LineTint);
    QList<QTextEdit::ExtraSelection> marks;
    for (QTextBlock block = text->document()->begin(); block.isValid(); block = block.next()) {
        if (others.contains(block.text()))
            continue;
        QTextEdit::ExtraSelection mark;
        mark.cursor = QTextCursor(block);
        mark.format.setProperty(QTextFormat::FullWidthSelection, true);
        mark.format.setBackground(color);
        marks.append(mark);
    }
    text->setExtraSelections(marks);
    if (!marks.isEmpty())
        text->setTextCursor(marks.first().cursor);
}

} // namespace

DifferenceDialog::DifferenceDialog(QString const& title, QWidget* parent)
    : FittingDialog(parent), m_summary(NewPlainLabel()), m_pages(new QStackedWidget),
      m_tree(new DifferenceTree), m_leftLines(NewLines()), m_rightLines(NewLines()),
      m_onlyDifferences(new QCheckBox(tr("&Differences only"))),
      m_takeOver(new QPushButton(tr("&Take Over"))), m_undo(new QPushButton(tr("&Undo")))
{
    setWindowTitle(title);
    m_summary->setWordWrap(true);
    m_summary->setAccessibleName(tr("Summary"));
    m_pages->addWidget(m_tree);
    m_pages->addWidget(makeLinesPage());
    m_onlyDifferences->setChecked(true);
    auto* lines = new QCheckBox(tr("&Lines"));
    lines->setToolTip(PlainToolTip(tr("Show the lines of the files; those that the other file "
                                      "does not have are marked")));
    auto* close = new QPushButton(tr("&Close"));
    close->setDefault(true);
    m_takeOver->setAutoDefault(false);
    m_takeOver->setToolTip(
        PlainToolTip(tr("Change the selected rows in the editor to what is on the right")));
    m_undo->setAutoDefault(false);
    m_undo->setShortcut(QKeySequence::Undo);
    m_undo->setToolTip(PlainToolTip(tr("Take back the last change in the editor (Ctrl+Z)")));
    m_takeOver->hide();
    m_undo->hide();
    connect(m_takeOver, &QPushButton::clicked, this, [this] {
        Q_EMIT takeOverRequested(m_tree->difference().TakeOver(m_left, m_tree->selectedRows()));
    });
    connect(m_undo, &QPushButton::clicked, this, &DifferenceDialog::undoRequested);
    connect(m_onlyDifferences, &QCheckBox::toggled, m_tree, &DifferenceTree::ShowOnlyDifferences);
    connect(lines, &QCheckBox::toggled, this, &DifferenceDialog::showLines);
    connect(close, &QPushButton::clicked, this, &QDialog::accept);
    connect(m_tree, &QTreeWidget::itemSelectionChanged, this, &DifferenceDialog::updateButtons);

    auto* buttons = new FlowLayout(6);
    buttons->addWidget(m_onlyDifferences);
    buttons->addWidget(lines);
    buttons->AddStretch();
    buttons->addWidget(m_takeOver);
    buttons->addWidget(m_undo);
    buttons->addWidget(close);
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(m_summary);
    layout->addWidget(m_pages, 1);
    layout->addLayout(buttons);
    m_tree->setFocus();
    resize(780, 480);
}

QWidget* DifferenceDialog::makeLinesPage()
{
    auto* page = new QWidget;
    auto* layout = new QHBoxLayout(page);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_leftLines);
    layout->addWidget(m_rightLines);
    return page;
}

void DifferenceDialog::SetSides(Side const& left, Side const& right,
                                QVector<SettingsDocument::Loss> const& losses)
{
    m_left = left.document;
    m_tree->SetTitles(left.title, right.title);
    m_tree->SetDifference(SettingsDifference::Between(left.document, right.document), losses);
    const int count = m_tree->difference().count();
    QString summary = tr("%Ln difference(s)", nullptr, count);
    if (m_tree->difference().isEmpty())
        summary = tr("No differences");
    if (!losses.isEmpty())
        summary += tr("; saving would lose what the last column names");
    m_summary->setText(summary);
    for (int i = 0; i < DifferenceTree::ColumnCount; ++i)
        m_tree->setColumnWidth(i, std::max(i == DifferenceTree::StateColumn ? 110 : 150,
                                           m_tree->header()->sectionSizeHint(i)));
    m_leftLines->setPlainText(QString::fromUtf8(left.bytes.left(ShownLimit)));
    m_rightLines->setPlainText(QString::fromUtf8(right.bytes.left(ShownLimit)));
    m_leftLines->setAccessibleName(tr("Lines: %1").arg(left.title));
    m_rightLines->setAccessibleName(tr("Lines: %1").arg(right.title));
    MarkOthers(m_leftLines, LinesOf(m_rightLines));
    MarkOthers(m_rightLines, LinesOf(m_leftLines));
    updateButtons();
}

void DifferenceDialog::AllowTakeOver()
{
    m_takeOver->show();
    m_undo->show();
}

void DifferenceDialog::SetCanUndo(bool canUndo)
{
    m_undo->setEnabled(canUndo);
}

void DifferenceDialog::showLines(bool on)
{
    m_pages->setCurrentIndex(on ? 1 : 0);
    m_onlyDifferences->setEnabled(!on);
    updateButtons();
}

void DifferenceDialog::updateButtons()
{
    m_takeOver->setEnabled(m_pages->currentIndex() == 0 && m_tree->hasSelectedValues());
}

} // namespace Velocor

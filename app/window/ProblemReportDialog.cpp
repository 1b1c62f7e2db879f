// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/ProblemReportDialog.h"

#include "app/window/PlaceholderMarks.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QCheckBox>
#include <QClipboard>
#include <QComboBox>
#include <QCoreApplication>
#include <QDialogButtonBox>
#include <QFileDialog>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QSignalBlocker>
#include <QVBoxLayout>
#include <QVariant>

#include <algorithm>
#include <set>

namespace Velocor {

namespace {

constexpr int TypingPause = 300;  // milliseconds
constexpr int ChoicesWidth = 250; // pixels
constexpr int LeastLines = 4;
constexpr int MaximumShownSecret = 100; // characters

} // namespace

ProblemReportDialog::ProblemReportDialog(QList<ReportPart> const& parts, Redactor const& redactor,
                                         QWidget* parent)
    : FittingDialog(parent), m_parts(parts), m_redactor(redactor), m_secrets(new QListWidget),
      m_words(new QLineEdit), m_files(new QComboBox), m_text(new QPlainTextEdit),
      m_marks(new PlaceholderMarks(m_text->document()))
{
    setWindowTitle(tr("Save Report"));
    auto* middle = new QBoxLayout(QBoxLayout::LeftToRight);
    middle->addLayout(newChoices());
    middle->addLayout(newPreview(), 1);

    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
    QPushButton* copyButton = buttons->addButton(tr("&Copy File"), QDialogButtonBox::ActionRole);
    connect(copyButton, &QPushButton::clicked, this, &ProblemReportDialog::Copy);
    QPushButton* save = buttons->addButton(tr("&Save..."), QDialogButtonBox::ActionRole);
    connect(save, &QPushButton::clicked, this, &ProblemReportDialog::chooseFile);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    RemoveButtonIcons(buttons);
    const QList<QAbstractButton*> all = buttons->buttons();
    for (QAbstractButton* button : all)
        static_cast<QPushButton*>(button)->setAutoDefault(false); // Enter ends the words

    auto* layout = new QVBoxLayout(this);
    layout->setSpacing(10);
    layout->addLayout(newHeading());
    layout->addLayout(middle, 1);
    layout->addWidget(buttons);
    m_wordsTimer.setSingleShot(true);
    m_wordsTimer.setInterval(TypingPause);
    connect(&m_wordsTimer, &QTimer::timeout, this, &ProblemReportDialog::update);
    update();
    if (layout->totalMinimumSize().width() > Room().width())
        middle->setDirection(QBoxLayout::TopToBottom);
    // With a wrapped label, Qt does not see to the least height.
    const int width = std::max(760, layout->sizeHint().width());
    resize(width, std::max(540, layout->heightForWidth(width)));
}

ProblemReportDialog::~ProblemReportDialog() = default;

QLayout* ProblemReportDialog::newHeading()
{
    QLabel* label = NewPlainLabel(
        tr("This is what will be saved. Placeholders, which are marked, replace what may give "
           "somebody away. Not everything can be recognized: look at it before you share it."));
    label->setWordWrap(true);
    auto* layout = new QVBoxLayout;
    layout->addWidget(label);
    return layout;
}

QLayout* ProblemReportDialog::newChoices()
{
    auto* layout = new QVBoxLayout;
    layout->setSpacing(4);
    for (ReportPart const& part : qAsConst(m_parts)) {
        auto* box = new QCheckBox(part.title);
        box->setChecked(true);
        connect(box, &QCheckBox::toggled, this, &ProblemReportDialog::update);
        layout->addWidget(box);
        m_boxes.append(box);
    }
    QLabel* wordsLabel = NewPlainLabel(tr("&Also replace (separated by commas):"));
    wordsLabel->setBuddy(m_words);
    m_words->setAccessibleName(tr("Also replace"));
    connect(m_words, &QLineEdit::textChanged, this, [this] { m_wordsTimer.start(); });
    QLabel* secretsLabel = NewPlainLabel(tr("&Replaced; untick to keep:"));
    secretsLabel->setBuddy(m_secrets);
    m_secrets->setAccessibleName(tr("Replaced by placeholders"));
    m_secrets->setMinimumWidth(ChoicesWidth);
    m_secrets->setMinimumHeight(LeastLines * m_secrets->fontMetrics().lineSpacing());
    m_secrets->setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Expanding);
    connect(m_secrets, &QListWidget::itemChanged, this, &ProblemReportDialog::choose);
    layout->addSpacing(6);
    layout->addWidget(secretsLabel);
    layout->addWidget(m_secrets, 1);
    layout->addWidget(wordsLabel);
    layout->addWidget(m_words);
    return layout;
}

QLayout* ProblemReportDialog::newPreview()
{
    QLabel* label = NewPlainLabel(tr("&File:"));
    label->setBuddy(m_files);
    m_files->setAccessibleName(tr("File of the report"));
    connect(m_files, QOverload<int>::of(&QComboBox::currentIndexChanged), this,
            &ProblemReportDialog::showFile);
    auto* row = new QHBoxLayout;
    row->addWidget(label);
    row->addWidget(m_files, 1);

    m_text->setReadOnly(true);
    m_text->setMinimumHeight(LeastLines * m_text->fontMetrics().lineSpacing());
    ShowUnwrapped(m_text);
    m_text->setAccessibleName(tr("Report"));
    m_text->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    auto* layout = new QVBoxLayout;
    layout->addLayout(row);
    layout->addWidget(m_text, 1);
    return layout;
}

void ProblemReportDialog::update()
{
    QList<ReportPart> chosen;
    for (int i = 0; i < m_parts.size(); ++i) {
        if (m_boxes.at(i)->isChecked())
            chosen.append(m_parts.at(i));
    }
    m_redactor.SetWords(m_words->text().split(QLatin1Char(',')));
    m_report = std::make_unique<Report>(chosen, m_redactor);
    listFiles();
    listSecrets();
    showFile();
}

void ProblemReportDialog::listFiles()
{
    const QSignalBlocker blocker(m_files);
    const QString current = m_files->currentText();
    m_files->clear();
    for (Report::File const& file : m_report->files())
        m_files->addItem(file.name);
    m_files->setCurrentIndex(qMax(0, m_files->findText(current)));
}

// Only those that are in the report. They keep their places while the user unticks them.
void ProblemReportDialog::listSecrets()
{
    const QSignalBlocker blocker(m_secrets);
    const int row = m_secrets->currentRow();
    std::set<int> present;
    for (Report::File const& file : m_report->files()) {
        for (Redactor::Place const& place : file.content.places)
            present.insert(place.secret);
    }
    m_secrets->clear();
    for (int secret : present) {
        const QString text = m_redactor.Original(secret).simplified();
        auto* item = new QListWidgetItem(
            LeftToRight(QStringLiteral("%1  %2").arg(m_redactor.Placeholder(secret),
                                                     Shortened(text, MaximumShownSecret))),
            m_secrets);
        item->setData(Qt::UserRole, secret);
        item->setFlags(item->flags() | Qt::ItemIsUserCheckable);
        item->setCheckState(m_redactor.isShown(secret) ? Qt::Unchecked : Qt::Checked);
    }
    m_secrets->setCurrentRow(row);
}

void ProblemReportDialog::showFile()
{
    const int index = qMax(0, m_files->currentIndex());
    Redactor::Text const& content = m_report->files()[static_cast<size_t>(index)].content;
    std::vector<Redactor::Place> replaced;
    for (Redactor::Place const& place : content.places) {
        if (!m_redactor.isShown(place.secret))
            replaced.push_back(place);
    }
    m_marks->SetPlaces(replaced);
    m_text->setPlainText(content.text);
}

void ProblemReportDialog::choose(QListWidgetItem const* item)
{
    m_redactor.SetShown(item->data(Qt::UserRole).toInt(), item->checkState() == Qt::Unchecked);
    // Not while the list is still working on the click.
    QTimer::singleShot(0, this, &ProblemReportDialog::update);
}

void ProblemReportDialog::Copy()
{
    QGuiApplication::clipboard()->setText(m_text->toPlainText());
}

void ProblemReportDialog::chooseFile()
{
    update(); // with words that were typed just now
    const QString folder = QCoreApplication::instance()->property("DocPath").toString();
    const QString path =
        QFileDialog::getSaveFileName(this, windowTitle(), folder + tr("velocor-report.zip"),
                                     tr("Archives (*.zip);;New folder (*)"));
    if (path.isEmpty())
        return;
    const QString error = m_report->Save(path);
    if (error.isEmpty())
        accept();
    else
        PlainMessageBox(QMessageBox::Critical, this,
                        tr("Could not save %1.\n%2").arg(LeftToRight(path), error))
            .exec();
}

} // namespace Velocor

#include "settings/CNavigatorNotesSettingsDlg.h"

#include "common/StringTable.h"
#include "libs/toolwell/Formats.h"
#include "ui/CColorButton.h"
#include "ui/ModalDialog.h"

#include <QComboBox>
#include <QFileDialog>
#include <QFontDatabase>
#include <QFormLayout>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>

const QList<int> CNavigatorNotesSettingsDlg::kFontSizes{10, 12, 18, 24, 36};

CNavigatorNotesSettingsDlg::CNavigatorNotesSettingsDlg(QWidget* parent)
    : QWidget(parent), m_font(new QComboBox(this)), m_fontSize(new QComboBox(this)),
      m_backgroundColor(new CColorButton(QStringLiteral("Background color"), this)),
      m_backgroundImage(new QLineEdit(this)),
      m_browse(new QPushButton(QStringLiteral("..."), this)) {
    m_font->addItems(QFontDatabase::families());
    for (const int size : kFontSizes)
        m_fontSize->addItem(QString::number(size));
    m_backgroundColor->setText(QStringLiteral("Color"));
    m_backgroundColor->setMinimumWidth(m_backgroundColor->fontMetrics().averageCharWidth() * 12);
    m_browse->setAccessibleName(QStringLiteral("Browse for background image"));
    m_browse->setFixedWidth(m_browse->fontMetrics().horizontalAdvance(QStringLiteral("....")) * 2);
    connect(m_browse, &QPushButton::clicked, this, &CNavigatorNotesSettingsDlg::BrowseForImage);

    auto* colorRow = new QHBoxLayout;
    colorRow->addWidget(m_backgroundColor);
    colorRow->addStretch();
    auto* imageRow = new QHBoxLayout;
    imageRow->addWidget(m_backgroundImage, 1);
    imageRow->addWidget(m_browse);

    auto* layout = new QFormLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setFieldGrowthPolicy(QFormLayout::AllNonFixedFieldsGrow);
    const auto addRow = [this, layout](const QString& text, QWidget* buddy, QLayout* field) {
        auto* label = new QLabel(text, this);
        label->setBuddy(buddy);
        if (field != nullptr)
            layout->addRow(label, field);
        else
            layout->addRow(label, buddy);
    };
    addRow(QStringLiteral("Default font for Notes"), m_font, nullptr);
    addRow(QStringLiteral("Default font size for Notes"), m_fontSize, nullptr);
    addRow(QStringLiteral("Background color:"), m_backgroundColor, colorRow);
    addRow(QStringLiteral("Background image:"), m_backgroundImage, imageRow);

    SetOptions({});
}

void CNavigatorNotesSettingsDlg::SetOptions(const Options& options) {
    m_initial = options;
    // A value the list lacks shows as the box's placeholder: there, but not one of the choices.
    m_font->setCurrentIndex(m_font->findText(options.font, Qt::MatchExactly));
    m_font->setPlaceholderText(options.font);
    const QString size = QString::number(options.fontSize);
    m_fontSize->setCurrentIndex(m_fontSize->findText(size, Qt::MatchExactly));
    m_fontSize->setPlaceholderText(size);
    m_backgroundImage->setText(options.backgroundImage);
    m_backgroundColor->SetColor(options.backgroundColor.isEmpty()
                                    ? CColorButton::kNoColor
                                    : ParseColor(options.backgroundColor));
}

CNavigatorNotesSettingsDlg::Options CNavigatorNotesSettingsDlg::GetOptions() const {
    Options options = m_initial;
    if (m_font->currentIndex() >= 0)
        options.font = m_font->currentText();
    if (m_fontSize->currentIndex() >= 0)
        options.fontSize = m_fontSize->currentText().toInt();
    if (m_backgroundColor->GetColor() != CColorButton::kNoColor)
        FormatColor(&options.backgroundColor, m_backgroundColor->GetColor());
    options.backgroundImage = m_backgroundImage->text();
    return options;
}

QStringList CNavigatorNotesSettingsDlg::PictureNameFilters() {
    // The table's filter is "description|pattern;pattern;|..." pairs.
    const QStringList parts = LoadString(StringId::PictureFileFilter).split(u'|');
    QStringList filters;
    for (qsizetype i = 0; i + 1 < parts.size(); i += 2) {
        const QStringList patterns = parts[i + 1].split(u';', Qt::SkipEmptyParts);
        if (!parts[i].isEmpty() && !patterns.isEmpty())
            filters.append(QStringLiteral("%1 (%2)").arg(parts[i], patterns.join(u' ')));
    }
    return filters;
}

void CNavigatorNotesSettingsDlg::BrowseForImage() {
    ModalDialog modal(new QFileDialog(this));
    auto* dialog = modal.Get<QFileDialog>();
    dialog->setAcceptMode(QFileDialog::AcceptOpen);
    dialog->setFileMode(QFileDialog::ExistingFile);
    dialog->setNameFilters(PictureNameFilters());
    if (modal.Exec() != QDialog::Accepted)
        return;
    if (auto* answered = modal.Get<QFileDialog>()) {
        const QStringList chosen = answered->selectedFiles();
        if (!chosen.isEmpty())
            m_backgroundImage->setText(chosen.first());
    }
}

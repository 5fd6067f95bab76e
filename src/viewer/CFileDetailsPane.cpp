#include "viewer/CFileDetailsPane.h"

#include <QDateTime>
#include <QDesktopServices>
#include <QFileInfo>
#include <QFormLayout>
#include <QHBoxLayout>
#include <QLabel>
#include <QLocale>
#include <QPushButton>
#include <QUrl>
#include <QVBoxLayout>

namespace {

QString DateText(const QDateTime& when) {
    return when.isValid() ? QLocale().toString(when, QLocale::LongFormat) : QStringLiteral("—");
}

QLabel* ValueLabel(QWidget* parent) {
    auto* label = new QLabel(parent);
    label->setTextInteractionFlags(Qt::TextSelectableByMouse);
    return label;
}

} // namespace

CFileDetailsPane::CFileDetailsPane(QWidget* parent)
    : QWidget(parent), m_name(ValueLabel(this)), m_size(ValueLabel(this)),
      m_created(ValueLabel(this)), m_modified(ValueLabel(this)) {
    QFont nameFont = m_name->font();
    nameFont.setPointSizeF(nameFont.pointSizeF() * 1.4);
    nameFont.setBold(true);
    m_name->setFont(nameFont);
    m_name->setWordWrap(true);

    auto* form = new QFormLayout;
    form->addRow(tr("Size:"), m_size);
    form->addRow(tr("Created:"), m_created);
    form->addRow(tr("Modified:"), m_modified);

    auto* open = new QPushButton(tr("Open with the default program"), this);
    auto* send = new QPushButton(tr("Send to word processor"), this);
    connect(open, &QPushButton::clicked, this, &CFileDetailsPane::OpenWithDefaultProgram);
    connect(send, &QPushButton::clicked, this, &CFileDetailsPane::SendToWordProcessorRequested);
    auto* buttons = new QHBoxLayout;
    buttons->addWidget(open);
    buttons->addWidget(send);
    buttons->addStretch();

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(24, 24, 24, 24);
    layout->addWidget(m_name);
    layout->addLayout(form);
    layout->addSpacing(12);
    layout->addLayout(buttons);
    layout->addStretch();
}

void CFileDetailsPane::ShowFile(const QString& path) {
    m_path = path;
    const QFileInfo info(path);
    m_name->setText(info.fileName());
    m_size->setText(
        tr("%1 (%2 bytes)")
            .arg(QLocale().formattedDataSize(info.size()), QLocale().toString(info.size())));
    m_created->setText(DateText(info.birthTime()));
    m_modified->setText(DateText(info.lastModified()));
}

QString CFileDetailsPane::NameText() const {
    return m_name->text();
}

QString CFileDetailsPane::SizeText() const {
    return m_size->text();
}

QString CFileDetailsPane::CreatedText() const {
    return m_created->text();
}

QString CFileDetailsPane::ModifiedText() const {
    return m_modified->text();
}

void CFileDetailsPane::OpenWithDefaultProgram() {
    if (!m_path.isEmpty())
        QDesktopServices::openUrl(QUrl::fromLocalFile(m_path));
}

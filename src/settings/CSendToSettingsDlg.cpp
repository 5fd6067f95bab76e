#include "settings/CSendToSettingsDlg.h"

#include "libs/toolwell/IQmBridge.h"
#include "libs/toolwell/WordProcessor.h"
#include "platform/Registry.h"

#include <QButtonGroup>
#include <QLabel>
#include <QLineEdit>
#include <QRadioButton>
#include <QVBoxLayout>

CSendToSettingsDlg::CSendToSettingsDlg(IQmBridge* bridge, QWidget* parent)
    : QWidget(parent), m_bridge(bridge), m_choice(new QButtonGroup(this)),
      m_command(new QLineEdit(this)),
      m_initialCommand(
          Platform::Registry::UserValue(WordProcessor::KeyPath, WordProcessor::CommandValue)
              .toString()) {
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    const QString texts[] = {QStringLiteral("Send to Quillmark"),
                             QStringLiteral("Send to Microsoft Word"),
                             QStringLiteral("Let me choose each time")};
    for (int id = 0; id < 3; ++id) {
        auto* button = new QRadioButton(texts[id], this);
        m_choice->addButton(button, id);
        layout->addWidget(button);
    }
    if (QAbstractButton* current = m_choice->button(m_bridge->GetSendToChoice()))
        current->setChecked(true);

    auto* commandLabel = new QLabel(QStringLiteral("Word processor command:"), this);
    commandLabel->setBuddy(m_command);
    m_command->setText(m_initialCommand);
    // Without a command of the user's own the installed one serves; show which.
    if (const std::optional<WordProcessor> installed = WordProcessor::Find())
        m_command->setPlaceholderText(installed->program);
    layout->addSpacing(layout->spacing() * 2);
    layout->addWidget(commandLabel);
    layout->addWidget(m_command);
    layout->addStretch();
}

int CSendToSettingsDlg::GetChoice() const {
    return m_choice->checkedId();
}

QString CSendToSettingsDlg::GetCommand() const {
    return m_command->text().trimmed();
}

void CSendToSettingsDlg::Apply() {
    if (GetChoice() >= 0)
        m_bridge->SetSendToChoice(GetChoice());
    const QString command = GetCommand();
    if (command == m_initialCommand.trimmed())
        return;
    using Platform::Registry;
    if (command.isEmpty())
        Registry::RemoveUserValue(WordProcessor::KeyPath, WordProcessor::CommandValue);
    else
        Registry::SetUserValue(WordProcessor::KeyPath, WordProcessor::CommandValue, command);
}

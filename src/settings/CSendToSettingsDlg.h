#pragma once

#include <QString>
#include <QWidget>

class IQmBridge;
class QButtonGroup;
class QLineEdit;

// The Send to Word Processor page: where items sent to a word processor go, and the command
// that starts the word processor.
class CSendToSettingsDlg final : public QWidget {
    Q_OBJECT
public:
    // Reads the current choice from the bridge and the command from the registry stand-in.
    // The bridge must outlive the page.
    explicit CSendToSettingsDlg(IQmBridge* bridge, QWidget* parent = nullptr);

    // 0 "Send to Quillmark", 1 "Send to Microsoft Word", 2 "Let me choose each time".
    int GetChoice() const;
    QString GetCommand() const;

    // Hands the choice to the bridge and stores the command when the user changed it; an
    // emptied command is removed, so that the installed word processor is used again.
    void Apply();

private:
    IQmBridge* m_bridge;
    QButtonGroup* m_choice;
    QLineEdit* m_command;
    QString m_initialCommand;
};

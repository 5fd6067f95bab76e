#pragma once

#include <QWidget>

class QCheckBox;
class QComboBox;
class QSpinBox;

// The General page of the settings dialog: the interface theme, start-up and shut-down
// behaviour and the limit on linked documents.
class CNavigatorGeneralSettingsDlg final : public QWidget {
    Q_OBJECT
public:
    struct Options {
        int maxLinkedDocuments = 100;
        bool cleanDeletedOnClose = false;
        bool launchAppOnStart = false;
        bool launchStartPanel = true;
        bool automaticUpdates = true;
    };

    // The theme list comes from the visual-style manager; without one it stays empty and
    // disabled.
    explicit CNavigatorGeneralSettingsDlg(QWidget* parent = nullptr);

    void SetOptions(const Options& options);
    Options GetOptions() const;
    // The identifier of the chosen style; empty when there is none to choose.
    QString SelectedStyle() const;

private:
    void FillThemes();

    QComboBox* m_theme;
    QCheckBox* m_launchAppOnStart;
    QCheckBox* m_launchStartPanel;
    QCheckBox* m_automaticUpdates;
    QCheckBox* m_cleanDeletedOnClose;
    QSpinBox* m_maxLinkedDocuments;
};

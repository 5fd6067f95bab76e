#pragma once

#include <QObject>

class CompanionBus;

// The one start panel of a session: the first panel owns the start panel's bus name, and a
// later one asks it to come to the front instead of running beside it.
class StartPanelInstance final : public QObject {
    Q_OBJECT
    Q_CLASSINFO("D-Bus Interface", "com.brindle.QuillmarkAmbrel.StartPanel")
public:
    explicit StartPanelInstance(CompanionBus& bus, QObject* parent = nullptr);
    ~StartPanelInstance() override;

    // True when this panel is now the one; false when another panel runs (and was asked to
    // come to the front) or there is no bus.
    bool Claim();

public Q_SLOTS:
    // Called over the bus by a later panel.
    void Activate();

Q_SIGNALS:
    void ActivateRequested();

private:
    CompanionBus& m_bus;
    bool m_registered = false;
    bool m_claimed = false;
};

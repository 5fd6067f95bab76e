#include "libs/lustre/CVisualStyleManager.h"

#include "platform/Registry.h"

#include <QApplication>
#include <QPalette>
#include <QStyle>
#include <QStyleFactory>

#include <memory>

namespace {

const QString kStyleValue = QStringLiteral("CurrentStyle");

std::unique_ptr<Lustre::CVisualStyleManager> g_manager;

QString AmbrelStyle() {
    return QString::fromUtf16(Lustre::kAmbrelStyle);
}

} // namespace

namespace Lustre {

CVisualStyleManager::CVisualStyleManager() : m_current(AmbrelStyle()) {}

HRESULT CVisualStyleManager::Register(const QString& registryPath) {
    if (registryPath.isEmpty())
        return E_INVALIDARG;
    return ApplyStoredStyle(registryPath);
}

QList<VisualStyle> CVisualStyleManager::Styles() const {
    QList<VisualStyle> styles{{AmbrelStyle(), AmbrelStyle()}};
    for (const QString& key : QStyleFactory::keys())
        styles.append({key, key});
    return styles;
}

bool CVisualStyleManager::CanChangeStyle() const {
    return Styles().size() > 1;
}

HRESULT CVisualStyleManager::SetCurrentStyle(const QString& identifier,
                                             const QString& registryPath) {
    if (!IsKnown(identifier))
        return E_INVALIDARG;
    if (!Platform::Registry::SetUserValue(registryPath, kStyleValue, identifier))
        return E_FAIL;
    Apply(identifier);
    return S_OK;
}

HRESULT CVisualStyleManager::ApplyStoredStyle(const QString& registryPath) {
    const QString stored = Platform::Registry::UserValue(registryPath, kStyleValue).toString();
    Apply(IsKnown(stored) ? stored : AmbrelStyle());
    return S_OK;
}

QPalette CVisualStyleManager::AmbrelPalette() {
    // Warm light greys with dark ink and one calm blue accent: quiet beside a desktop of any
    // colour, and every text well above the usual contrast guidelines.
    const QColor ink(0x1f, 0x23, 0x28);
    const QColor window(0xf4, 0xf2, 0xee);
    const QColor button(0xe9, 0xe6, 0xe0);
    const QColor accent(0x2f, 0x6a, 0x8c);
    const QColor muted(0x86, 0x8b, 0x92);

    QPalette palette(ink, button, button.lighter(112), button.darker(135), button.darker(118), ink,
                     Qt::white, Qt::white, window);
    palette.setColor(QPalette::AlternateBase, QColor(0xf8, 0xf6, 0xf2));
    palette.setColor(QPalette::Highlight, accent);
    palette.setColor(QPalette::HighlightedText, Qt::white);
    palette.setColor(QPalette::Link, accent);
    palette.setColor(QPalette::LinkVisited, accent.darker(125));
    palette.setColor(QPalette::ToolTipBase, QColor(0xfd, 0xfb, 0xf3));
    palette.setColor(QPalette::ToolTipText, ink);
    palette.setColor(QPalette::PlaceholderText, muted);
    for (const QPalette::ColorRole role :
         {QPalette::WindowText, QPalette::Text, QPalette::ButtonText})
        palette.setColor(QPalette::Disabled, role, muted);
    palette.setColor(QPalette::Disabled, QPalette::Highlight, muted);
    return palette;
}

bool CVisualStyleManager::IsKnown(const QString& identifier) const {
    for (const VisualStyle& style : Styles()) {
        if (style.identifier == identifier)
            return true;
    }
    return false;
}

void CVisualStyleManager::Apply(const QString& identifier) {
    const bool ambrel = identifier == AmbrelStyle();
    if (qobject_cast<QApplication*>(QCoreApplication::instance())) {
        QStyle* style = QStyleFactory::create(ambrel ? QStringLiteral("Fusion") : identifier);
        if (style) {
            QApplication::setStyle(style);
            QApplication::setPalette(ambrel ? AmbrelPalette() : style->standardPalette());
        }
    }
    if (identifier == m_current)
        return;
    m_current = identifier;
    Q_EMIT VisualStyleChanged(identifier);
}

} // namespace Lustre

Lustre::CVisualStyleManager* CreateVisualStyleManager() {
    if (!g_manager)
        g_manager = std::make_unique<Lustre::CVisualStyleManager>();
    return g_manager.get();
}

Lustre::CVisualStyleManager* GetVisualStyleManager() {
    return g_manager.get();
}

void DeleteVisualStyleManager() {
    g_manager.reset();
}

#pragma once

#include "common/Result.h"

#include <QList>
#include <QObject>
#include <QString>

class QPalette;

namespace Lustre {

// Where the product's programs keep their shared visual-style choice in the registry stand-in.
inline constexpr char16_t kVisualStylesKey[] =
    u"Software\\Brindle\\Quillmark Ambrel\\Quillmark Suite\\14\\Visual Styles";

// The identifier of the product's own style, the default.
inline constexpr char16_t kAmbrelStyle[] = u"Ambrel";

struct VisualStyle {
    QString identifier;
    QString displayName;
};

// Keeps the product's look: the list of styles, the one in use and its place in the registry.
// Choosing a style applies it to the running application at once.
class CVisualStyleManager final : public QObject {
    Q_OBJECT
public:
    CVisualStyleManager();

    // Registers the program: remembers the registry path of its choice and applies the stored
    // style. Answers S_OK, or E_INVALIDARG for an empty path. Later changes are announced by
    // VisualStyleChanged.
    HRESULT Register(const QString& registryPath);

    // "Ambrel" first, then every style Qt offers, in its order.
    QList<VisualStyle> Styles() const;
    QString CurrentStyle() const { return m_current; }
    // False when there is nothing to choose from.
    bool CanChangeStyle() const;

    // Makes the style current, stores it under the registry path and applies it. An unknown
    // identifier is refused with E_INVALIDARG.
    HRESULT SetCurrentStyle(const QString& identifier, const QString& registryPath);
    // Applies the style stored under the registry path; an unknown or missing one means
    // "Ambrel". Answers S_OK.
    HRESULT ApplyStoredStyle(const QString& registryPath);

    // The palette of the "Ambrel" style.
    static QPalette AmbrelPalette();

Q_SIGNALS:
    // The current style changed; the new style is already applied.
    void VisualStyleChanged(const QString& identifier);

private:
    bool IsKnown(const QString& identifier) const;
    void Apply(const QString& identifier);

    QString m_current;
};

} // namespace Lustre

// The process's one manager: created once, found by everyone, deleted at shut-down.
Lustre::CVisualStyleManager* CreateVisualStyleManager();
Lustre::CVisualStyleManager* GetVisualStyleManager();
void DeleteVisualStyleManager();

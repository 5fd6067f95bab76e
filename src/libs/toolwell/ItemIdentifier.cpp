#include "libs/toolwell/ItemIdentifier.h"

#include <QRegularExpression>
#include <QUuid>

bool IsItemIdentifier(const QString& text) {
    static const QRegularExpression shape(QStringLiteral(
        "^[0-9A-Fa-f]{8}-[0-9A-Fa-f]{4}-[0-9A-Fa-f]{4}-[0-9A-Fa-f]{4}-[0-9A-Fa-f]{12}$"));
    return text.size() == 36 && shape.match(text).hasMatch();
}

QString NewItemIdentifier() {
    return QUuid::createUuid().toString(QUuid::WithoutBraces).toUpper();
}

#include "dataexchange/ParsePipeDelimitedString.h"

namespace DataExchange {

void ParsePipeDelimitedString(const QString& text, IProperties* target) {
    if (target == nullptr)
        return;
    // Empty but never null, so that an empty name or value is stored as such.
    QString name = QStringLiteral("");
    QString current = QStringLiteral("");
    bool haveName = false;
    const qsizetype length = text.size();
    for (qsizetype i = 0; i < length; ++i) {
        const QChar c = text.at(i);
        if (c == u'\\') {
            ++i;
            if (i >= length)
                break; // a lone trailing backslash is pending text, dropped like any other
            current.append(text.at(i) == u'\\' ? u'\\' : u'|');
        } else if (c != u'|') {
            current.append(c);
        } else if (!haveName) {
            name = current;
            current = QStringLiteral("");
            haveName = true;
        } else {
            target->SetProperty(name, current);
            name = QStringLiteral("");
            current = QStringLiteral("");
            haveName = false;
        }
    }
}

} // namespace DataExchange

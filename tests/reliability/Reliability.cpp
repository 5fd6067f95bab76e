#include "Reliability.h"

#include <QDBusConnection>
#include <QDBusConnectionInterface>
#include <QDir>
#include <QFile>
#include <QTextStream>

#include <algorithm>
#include <cstdio>

#include <unistd.h>

namespace Reliability {

bool LongForm() {
    return qgetenv("AMBREL_RELIABILITY") == "long";
}

int Rounds(int shortForm, int longForm) {
    return LongForm() ? longForm : shortForm;
}

void Report(const QString& line) {
    std::printf("%s\n", qPrintable(line));
    std::fflush(stdout);
    const QString path = qEnvironmentVariable("AMBREL_RELIABILITY_REPORT");
    if (path.isEmpty())
        return;
    QFile file(path);
    if (file.open(QIODevice::WriteOnly | QIODevice::Append | QIODevice::Text))
        QTextStream(&file) << line << '\n';
}

QString LoneNavigatorCopy(const QString& home) {
    const QString folder = home + QStringLiteral("/lone");
    const QString copy = folder + QStringLiteral("/ambrel-navigator");
    if (!QFile::exists(copy) &&
        !(QDir().mkpath(folder) && QFile::copy(QStringLiteral(AMBREL_NAVIGATOR_PATH), copy)))
        return {};
    return copy;
}

bool HoldsOpenFileIn(qint64 pid, const QString& folder, const QString& except) {
    const QString fds = QStringLiteral("/proc/%1/fd").arg(pid);
    for (const QString& fd :
         QDir(fds).entryList(QDir::AllEntries | QDir::System | QDir::NoDotAndDotDot)) {
        char buffer[4096];
        const ssize_t length =
            ::readlink(QFile::encodeName(fds + u'/' + fd).constData(), buffer, sizeof buffer);
        const QString target = QFile::decodeName(QByteArray(buffer, std::max<ssize_t>(length, 0)));
        if (target.startsWith(folder + u'/') && target != except)
            return true;
    }
    return false;
}

QString NoteToolOnBus() {
    const QStringList names =
        QDBusConnection::sessionBus().interface()->registeredServiceNames().value();
    for (const QString& name : names) {
        if (name.startsWith(QStringLiteral("com.brindle.QuillmarkAmbrel.NoteTool.")))
            return name;
    }
    return {};
}

} // namespace Reliability

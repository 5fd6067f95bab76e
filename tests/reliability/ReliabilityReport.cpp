#include "ReliabilityReport.h"

#include <QDir>
#include <QFile>
#include <QTextStream>

#include <cstdio>

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

} // namespace Reliability

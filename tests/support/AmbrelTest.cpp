#include "support/AmbrelTest.h"

#include "platform/Registry.h"
#include "support/ResetSingletons.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QStringDecoder>

void AmbrelTest::SetUp() {
    m_home = std::make_unique<QTemporaryDir>();
    ASSERT_TRUE(m_home->isValid());
    for (const QString& folder : {DataHome(), ConfigHome(), RuntimeHome()})
        ASSERT_TRUE(QDir().mkpath(folder));
    QFile::setPermissions(RuntimeHome(), QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
    qputenv("HOME", QFile::encodeName(Home()));
    qputenv("XDG_DATA_HOME", QFile::encodeName(DataHome()));
    qputenv("XDG_CONFIG_HOME", QFile::encodeName(ConfigHome()));
    qputenv("XDG_RUNTIME_DIR", QFile::encodeName(RuntimeHome()));
    ResetSingletons();
    Platform::Registry::SetMachineFile(Home() + QStringLiteral("/etc/Quillmark Ambrel.ini"));
}

void AmbrelTest::TearDown() {
    ResetSingletons();
}

QString AmbrelTest::Home() const {
    return m_home->path();
}
QString AmbrelTest::DataHome() const {
    return Home() + QStringLiteral("/data");
}
QString AmbrelTest::ConfigHome() const {
    return Home() + QStringLiteral("/config");
}
QString AmbrelTest::RuntimeHome() const {
    return Home() + QStringLiteral("/runtime");
}

QString AmbrelTest::AppDataFolder() const {
    return DataHome() + QStringLiteral("/Brindle/Quillmark Ambrel");
}

QString AmbrelTest::CatalogFileText() const {
    QFile catalog(AppDataFolder() + QStringLiteral("/Catalog/catalog.xml"));
    return catalog.open(QIODevice::ReadOnly)
               ? QStringDecoder(QStringConverter::Utf16LE).decode(catalog.readAll())
               : QString();
}

QString AmbrelTest::WriteFile(const QString& relativePath, const QByteArray& content) const {
    const QString path = Home() + u'/' + relativePath;
    QDir().mkpath(QFileInfo(path).absolutePath());
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly) || file.write(content) != content.size())
        ADD_FAILURE() << "cannot write " << path.toStdString();
    return path;
}

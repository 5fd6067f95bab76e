#pragma once

#include "support/AmbrelTest.h"
#include "support/FakeNavigatorBroker.h"
#include "support/RecordingProcessLauncher.h"

#include <QDir>
#include <QFile>

#include <functional>

// A home whose PATH holds only the programs a test puts there, whose temporary folder is its
// own, and whose program starts are recorded.
class ServicesTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        ASSERT_TRUE(QDir().mkpath(BinFolder()) && QDir().mkpath(TempFolder()));
        qputenv("PATH", QFile::encodeName(BinFolder()));
        qputenv("TMPDIR", QFile::encodeName(TempFolder()));
        Platform::SetProcessLauncher(&launcher);
    }
    void TearDown() override {
        AmbrelTest::TearDown();
        qputenv("PATH", m_path);
        m_tmpdir.isNull() ? qunsetenv("TMPDIR") : qputenv("TMPDIR", m_tmpdir);
    }

    QString BinFolder() const { return Home() + QStringLiteral("/bin"); }
    QString TempFolder() const { return Home() + QStringLiteral("/tmp"); }

    // An executable shell script, answering its path.
    QString WriteScript(const QString& relativePath, const QByteArray& body = {}) const {
        const QString path = WriteFile(relativePath, QByteArrayLiteral("#!/bin/sh\n") + body);
        QFile::setPermissions(path, QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
        return path;
    }
    QString InstallWriter() const { return WriteScript(QStringLiteral("bin/lowriter")); }

    QStringList TempEntries() const {
        return QDir(TempFolder()).entryList(QDir::AllEntries | QDir::NoDotAndDotDot);
    }

    static QByteArray ReadAll(const QString& path) {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }

    RecordingProcessLauncher launcher;

private:
    const QByteArray m_path = qgetenv("PATH");
    const QByteArray m_tmpdir = qgetenv("TMPDIR");
};

#pragma once

#include "support/ResetSingletons.h"

#include <gtest/gtest.h>

#include <QString>
#include <QTemporaryDir>

#include <memory>
#include <ostream>

// Test failures show strings as text.
inline void PrintTo(const QString& text, std::ostream* out) {
    *out << '"' << text.toStdString() << '"';
}

// The fixture every test stands on: a fresh temporary home for the program's data, settings
// and runtime folders, and every process-wide singleton back in its first state.
class AmbrelTest : public ::testing::Test {
protected:
    void SetUp() override;
    void TearDown() override;

    // The temporary home and the folders inside it.
    QString Home() const;
    QString DataHome() const;
    QString ConfigHome() const;
    QString RuntimeHome() const;
    // "$XDG_DATA_HOME/Brindle/Quillmark Ambrel".
    QString AppDataFolder() const;
    // The catalog file as text, as a navigator in this home wrote it; empty when there is none.
    QString CatalogFileText() const;

    // Writes a file (making its folder), answering its path.
    QString WriteFile(const QString& relativePath, const QByteArray& content) const;

private:
    std::unique_ptr<QTemporaryDir> m_home;
};

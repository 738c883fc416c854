// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The certificate prompt in programs without a user interface, which have no QApplication. Each test runs in a process
// of its own.

#include <kavellaccounts/KACertificatePanel.h>

#include <cstdlib>

#include <QtCore/QCoreApplication>
#include <QtCore/QProcess>
#include <QtCore/QTemporaryDir>
#include <QtCore/QUrl>

#include <gtest/gtest.h>

#include "tests/support/log_capture.h"

namespace {

KAError certificateError()
{
    const QTemporaryDir directory;
    const QString path = directory.filePath("certificate.pem");
    QProcess maker;
    maker.start("openssl", {"req", "-x509", "-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:prime256v1", "-nodes",
                            "-subj", "/CN=mail.example", "-keyout", directory.filePath("key.pem"), "-out", path});
    EXPECT_TRUE(maker.waitForFinished());
    return KAError("Example", -1202,
                   {{KAError::failingURLKey, QUrl("https://mail.example/")},
                    {KAError::peerCertificateChainKey, QVariant::fromValue(QSslCertificate::fromPath(path))}});
}

/// Ends the process with 0 when the prompt is refused with its line in the log.
[[noreturn]] void showAndExit(const KAError &error)
{
    const kavell::test::LogCapture log;
    const bool accepted = KAShowCertificatePanelForError(error, "Title");
    const bool logged =
        log.messages() == QStringList({"*** Certificate panel not shown: the program has no user interface."});
    std::_Exit(!accepted && logged ? 0 : 1);
}

TEST(KACertificatePanelDeathTest, WithoutAnApplicationObjectThePromptIsRefused)
{
    const KAError error = certificateError();
    EXPECT_EXIT(showAndExit(error), testing::ExitedWithCode(0), "");
}

TEST(KACertificatePanelDeathTest, InAConsoleProgramThePromptIsRefused)
{
    const KAError error = certificateError();
    const auto show = [&] {
        int count = 1;
        char name[] = "console";
        char *arguments[] = {name, nullptr};
        const QCoreApplication application(count, arguments);
        showAndExit(error);
    };
    EXPECT_EXIT(show(), testing::ExitedWithCode(0), "");
}

}  // namespace

int main(int argc, char *argv[])
{
    testing::InitGoogleTest(&argc, argv);
    return RUN_ALL_TESTS();
}

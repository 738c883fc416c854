// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KACertificatePanel.h>

#include <cstdlib>
#include <thread>

#include <QtCore/QFile>
#include <QtCore/QProcess>
#include <QtCore/QTemporaryDir>
#include <QtCore/QTimer>
#include <QtCore/QUrl>
#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPushButton>

#include <gtest/gtest.h>

#include "tests/support/log_capture.h"

namespace {

QList<QSslCertificate> selfSignedChain()
{
    const QTemporaryDir directory;
    const QString path = directory.filePath("certificate.pem");
    QProcess maker;
    maker.start("openssl",
                {"req", "-x509", "-newkey", "ec", "-pkeyopt", "ec_paramgen_curve:prime256v1", "-nodes", "-days", "2",
                 "-subj", "/CN=mail.example", "-keyout", directory.filePath("key.pem"), "-out", path});
    EXPECT_TRUE(maker.waitForFinished());
    const auto chain = QSslCertificate::fromPath(path);
    EXPECT_EQ(chain.size(), 1);
    return chain;
}

KAError errorFor(const QString &url, const QList<QSslCertificate> &chain, qint64 code = -1202)
{
    return KAError(
        "Example", code,
        {{KAError::failingURLKey, QUrl(url)}, {KAError::peerCertificateChainKey, QVariant::fromValue(chain)}});
}

/// Presses the panel's button of that name, on its window, once the panel is up, and notes its informative text.
void pressWhenShown(const QString &button, QString *informative = nullptr)
{
    QTimer::singleShot(0, qApp, [=] {
        QWidget *panel = QApplication::activeModalWidget();
        if (!panel) {
            pressWhenShown(button, informative);
            return;
        }
        if (informative)
            *informative = panel->findChild<QLabel *>("informative")->text();
        if (const QByteArray path = qgetenv("KAVELL_PANEL_PICTURE"); !path.isEmpty())
            panel->grab().save(QString::fromLocal8Bit(path));
        const auto *target = panel->findChild<QPushButton *>(button);
        QTest::mouseClick(panel->windowHandle(), Qt::LeftButton, {}, target->mapTo(panel, target->rect().center()));
    });
}

TEST(KACertificatePanelTest, AnErrorWithoutAChainIsLoggedAndRefused)
{
    const kavell::test::LogCapture log;
    const KAError error("Example", -1202, {{KAError::failingURLKey, QUrl("https://mail.example/")}});
    EXPECT_FALSE(KAShowCertificatePanelForError(error, "Title"));
    EXPECT_EQ(log.messages(), QStringList({"*** Error object Error Example -1202 in unexpected format."}));
}

TEST(KACertificatePanelTest, AURLWithoutAHostFailsThePolicy)
{
    const kavell::test::LogCapture log;
    EXPECT_FALSE(KAShowCertificatePanelForError(errorFor("file:///tmp", selfSignedChain()), "Title"));
    EXPECT_TRUE(log.messages().value(0).startsWith("*** SSL policy creation failed"));
}

TEST(KACertificatePanelTest, AChainWithoutCertificatesFailsTheTrust)
{
    const kavell::test::LogCapture log;
    EXPECT_FALSE(KAShowCertificatePanelForError(errorFor("https://mail.example/", {QSslCertificate()}), "Title"));
    EXPECT_TRUE(log.messages().value(0).startsWith("*** Trust creation failed"));
}

TEST(KACertificatePanelTest, CancellingAcceptsNothing)
{
    const auto chain = selfSignedChain();
    pressWhenShown("cancel");
    EXPECT_FALSE(KAShowCertificatePanelForError(errorFor("https://cancelled.example/", chain), "Title"));
    EXPECT_FALSE(KAAcceptedCertificates::isAccepted("cancelled.example", chain));
}

TEST(KACertificatePanelTest, ContinuingAcceptsTheChainForTheHost)
{
    const auto chain = selfSignedChain();
    QString informative;
    pressWhenShown("continue", &informative);
    EXPECT_TRUE(KAShowCertificatePanelForError(errorFor("https://continued.example/", chain), "Title"));
    EXPECT_TRUE(KAAcceptedCertificates::isAccepted("continued.example", chain));
    EXPECT_TRUE(informative.contains("continued.example"));
}

TEST(KACertificatePanelTest, AnUnknownCodeHasNoInformativeText)
{
    for (const qint64 code : {-1205, -1200, 0}) {
        QString informative = "unset";
        pressWhenShown("cancel", &informative);
        EXPECT_FALSE(
            KAShowCertificatePanelForError(errorFor("https://mail.example/", selfSignedChain(), code), "Title"));
        EXPECT_EQ(informative, "") << code;
    }
}

TEST(KACertificatePanelTest, AnotherThreadIsAnsweredFromTheMainThread)
{
    const auto chain = selfSignedChain();
    bool answer = false;
    bool ended = false;
    pressWhenShown("continue");
    std::thread asker([&] {
        answer = KAShowCertificatePanelForError(errorFor("https://thread.example/", chain), "Title");
        QMetaObject::invokeMethod(qApp, [&] { ended = true; });
    });
    EXPECT_TRUE(QTest::qWaitFor([&] { return ended; }, 10000));
    asker.join();
    EXPECT_TRUE(answer);
}

}  // namespace

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KACertificatePanel.h>

#include <algorithm>
#include <functional>
#include <thread>

#include <QtCore/QCryptographicHash>
#include <QtCore/QTimer>
#include <QtCore/QUrl>
#include <QtTest/QTest>
#include <QtWidgets/QApplication>
#include <QtWidgets/QLabel>
#include <QtWidgets/QPushButton>
#include <QtWidgets/QScrollBar>
#include <QtWidgets/QTextEdit>
#include <QtWidgets/QTreeWidget>
#include <QtWidgets/QWhatsThis>

#include <gtest/gtest.h>

#include "tests/support/log_capture.h"
#include "tests/ui/tls_identity.h"

namespace {

QList<QSslCertificate> selfSignedChain()
{
    return kavell::test::selfSigned("mail.example").chain();
}

KAError errorFor(const QString &url, const QList<QSslCertificate> &chain, qint64 code = -1202)
{
    return KAError(
        "Example", code,
        {{KAError::failingURLKey, QUrl(url)}, {KAError::peerCertificateChainKey, QVariant::fromValue(chain)}});
}

/// Does this with the panel once it is up. It must end the panel, or have another thing to come end it.
void whenShown(const std::function<void(QWidget *)> &act)
{
    QTimer::singleShot(0, qApp, [act] {
        if (QWidget *panel = QApplication::activeModalWidget())
            act(panel);
        else
            whenShown(act);
    });
}

/// On the panel's window, as the user does, and not on the button itself.
void press(QWidget *panel, const QString &button)
{
    const auto *target = panel->findChild<QPushButton *>(button);
    QTest::mouseClick(panel->windowHandle(), Qt::LeftButton, {}, target->mapTo(panel, target->rect().center()));
}

void pressWhenShown(const QString &button)
{
    whenShown([=](QWidget *panel) { press(panel, button); });
}

QString textOf(const QWidget *panel, const char *label)
{
    return panel->findChild<QLabel *>(label)->text();
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

TEST(KACertificatePanelTest, AnEmptyChainIsAChainAndFailsTheTrust)
{
    const kavell::test::LogCapture log;
    EXPECT_FALSE(KAShowCertificatePanelForError(errorFor("https://mail.example/", {}), "Title"));
    EXPECT_EQ(log.messages(), QStringList({"*** Trust creation failed: the chain holds no certificate."}));
}

TEST(KACertificatePanelTest, WhatIsNoListOfCertificatesIsNoChain)
{
    const kavell::test::LogCapture log;
    const KAError error(
        "Example", -1202,
        {{KAError::failingURLKey, QUrl("https://mail.example/")}, {KAError::peerCertificateChainKey, "chain"}});
    EXPECT_FALSE(KAShowCertificatePanelForError(error, "Title"));
    EXPECT_EQ(log.messages(), QStringList({"*** Error object Error Example -1202 in unexpected format."}));
}

TEST(KACertificatePanelTest, AChainThatHoldsMoreThanCertificatesFailsTheTrust)
{
    const kavell::test::LogCapture log;
    const QList<QSslCertificate> chain{selfSignedChain().first(), QSslCertificate()};
    EXPECT_FALSE(KAShowCertificatePanelForError(errorFor("https://mail.example/", chain), "Title"));
    EXPECT_TRUE(log.messages().value(0).startsWith("*** Trust creation failed"));
}

TEST(KACertificatePanelTest, AnErrorWithoutAURLIsLoggedAndRefused)
{
    const kavell::test::LogCapture log;
    const KAError error("Other", -1, {{KAError::peerCertificateChainKey, QVariant::fromValue(selfSignedChain())}});
    EXPECT_FALSE(KAShowCertificatePanelForError(error, "Title"));
    EXPECT_EQ(log.messages(), QStringList({"*** Error object Error Other -1 in unexpected format."}));
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
    pressWhenShown("continue");
    EXPECT_TRUE(KAShowCertificatePanelForError(errorFor("https://continued.example/", chain), "Title"));
    EXPECT_TRUE(KAAcceptedCertificates::isAccepted("continued.example", chain));
}

TEST(KACertificatePanelTest, ReturnContinuesSinceThatIsTheDefault)
{
    whenShown([](QWidget *panel) { QTest::keyClick(panel->windowHandle(), Qt::Key_Return); });
    EXPECT_TRUE(KAShowCertificatePanelForError(errorFor("https://return.example/", selfSignedChain()), "Title"));
}

TEST(KACertificatePanelTest, EscapeCancels)
{
    const auto chain = selfSignedChain();
    whenShown([](QWidget *panel) { QTest::keyClick(panel->windowHandle(), Qt::Key_Escape); });
    EXPECT_FALSE(KAShowCertificatePanelForError(errorFor("https://escape.example/", chain), "Title"));
    EXPECT_FALSE(KAAcceptedCertificates::isAccepted("escape.example", chain));
}

TEST(KACertificatePanelTest, HelpIsShownBesideThePanelWhichStays)
{
    const auto helpBubbles = [] {
        const QWidgetList all = QApplication::topLevelWidgets();
        return std::count_if(all.begin(), all.end(),
                             [](const QWidget *one) { return one->isVisible() && one->inherits("QWhatsThat"); });
    };
    std::ptrdiff_t shown = 0;
    bool stayed = false;
    QString description;
    whenShown([&](QWidget *panel) {
        press(panel, "help");
        shown = helpBubbles();
        stayed = panel->isVisible();
        description = panel->findChild<QPushButton *>("help")->accessibleDescription();
        QWhatsThis::hideText();
        panel->close();
    });
    EXPECT_FALSE(KAShowCertificatePanelForError(errorFor("https://help.example/", selfSignedChain()), "Title"));
    EXPECT_EQ(shown, 1);
    EXPECT_TRUE(stayed);
    EXPECT_TRUE(description.startsWith("A certificate tells you whose server this is."));
}

TEST(KACertificatePanelTest, TheMessageNamesTheCallersTitleAndTheHostOnly)
{
    QString message;
    whenShown([&](QWidget *panel) {
        message = textOf(panel, "message");
        panel->close();
    });
    EXPECT_FALSE(
        KAShowCertificatePanelForError(errorFor("https://mail.example:8443/a%20b", selfSignedChain()), "%2 <b>Title"));
    EXPECT_EQ(message, QString::fromUtf8("%2 <b>Title can’t verify the identity of the server “mail.example”."));
}

TEST(KACertificatePanelTest, TheLongestHostNameNeitherWidensThePanelNorIsCutOff)
{
    const QString label(63, QLatin1Char('a'));
    const QString host = QStringList({label, label, label, "example"}).join(QLatin1Char('.'));
    int width = 0;
    int missing = 0;
    QString read;
    whenShown([&](QWidget *panel) {
        width = panel->width();
        for (const char *name : {"message", "informative"}) {
            const auto *text = panel->findChild<QLabel *>(name);
            missing += std::max(0, text->heightForWidth(text->width()) - text->height());
        }
        read = panel->findChild<QLabel *>("message")->accessibleName();
        panel->close();
    });
    EXPECT_FALSE(KAShowCertificatePanelForError(errorFor("https://" + host + "/", selfSignedChain()), "Title"));
    EXPECT_EQ(width, 560);
    EXPECT_EQ(missing, 0);
    EXPECT_TRUE(read.contains(host));
}

TEST(KACertificatePanelTest, ALongWordIsBrokenBetweenLettersOnly)
{
    // Each of the letters takes two units, which lie across the place of the break for one of the titles.
    const QString letters = QString::fromUtf8("\U00010400").repeated(60);
    for (const QString &title : {letters, "a" + letters}) {
        QString message;
        whenShown([&](QWidget *panel) {
            message = textOf(panel, "message");
            panel->close();
        });
        EXPECT_FALSE(KAShowCertificatePanelForError(errorFor("https://mail.example/", selfSignedChain()), title));
        EXPECT_TRUE(message.contains(QChar(0x200B)));
        EXPECT_TRUE(message.isValidUtf16());
    }
}

TEST(KACertificatePanelTest, EachCodeHasItsInformativeText)
{
    const std::pair<qint64, const char *> beginnings[] = {
        {-1204, "The certificate of “mail.example” is not valid yet."},
        {-1203, "The certificate of “mail.example” was signed by an unknown authority."},
        {-1202, "The certificate of “mail.example” is not trusted."},
        {-1201, "The certificate of “mail.example” has expired or has a wrong date."},
    };
    for (const auto &[code, beginning] : beginnings) {
        QString informative;
        bool visible = false;
        whenShown([&](QWidget *panel) {
            informative = textOf(panel, "informative");
            visible = panel->findChild<QLabel *>("informative")->isVisible();
            panel->close();
        });
        static_cast<void>(
            KAShowCertificatePanelForError(errorFor("https://mail.example/", selfSignedChain(), code), "Title"));
        EXPECT_TRUE(informative.startsWith(QString::fromUtf8(beginning))) << code << informative.toStdString();
        EXPECT_TRUE(visible);
    }
}

TEST(KACertificatePanelTest, AnUnknownCodeHasNoInformativeText)
{
    for (const qint64 code : {-1205, -1200, 0}) {
        QString informative = "unset";
        whenShown([&](QWidget *panel) {
            informative = textOf(panel, "informative");
            panel->close();
        });
        EXPECT_FALSE(
            KAShowCertificatePanelForError(errorFor("https://mail.example/", selfSignedChain(), code), "Title"));
        EXPECT_EQ(informative, "") << code;
    }
}

TEST(KACertificatePanelTest, TheDetailsOfTheServersCertificateAreShownWithoutScrolling)
{
    const auto chain = selfSignedChain();
    QString details;
    bool scrolls = true;
    whenShown([&](QWidget *panel) {
        const auto *edit = panel->findChild<QTextEdit *>("details");
        details = edit->toPlainText();
        scrolls = edit->verticalScrollBar()->isVisible() ||
                  panel->findChild<QTreeWidget *>("chain")->verticalScrollBar()->isVisible();
        panel->close();
    });
    EXPECT_FALSE(KAShowCertificatePanelForError(errorFor("https://mail.example/", chain), "Title"));
    EXPECT_TRUE(details.contains("mail.example"));
    const QByteArray digest = chain.first().digest(QCryptographicHash::Sha256).toHex(':').toUpper();
    EXPECT_TRUE(details.contains(QString::fromLatin1(digest)));
    EXPECT_FALSE(scrolls);
}

TEST(KACertificatePanelTest, ChoosingAnotherCertificateOfTheChainShowsItsDetails)
{
    const auto server = selfSignedChain();
    const auto issuer = selfSignedChain();
    QStringList titles;
    QString details;
    whenShown([&](QWidget *panel) {
        auto *tree = panel->findChild<QTreeWidget *>("chain");
        titles = {tree->topLevelItem(0)->text(0), tree->topLevelItem(0)->child(0)->text(0)};
        tree->setCurrentItem(tree->topLevelItem(0));
        details = panel->findChild<QTextEdit *>("details")->toPlainText();
        panel->close();
    });
    EXPECT_FALSE(
        KAShowCertificatePanelForError(errorFor("https://mail.example/", {server.first(), issuer.first()}), "Title"));
    EXPECT_EQ(titles, QStringList({"mail.example", "mail.example"}));
    const QByteArray digest = issuer.first().digest(QCryptographicHash::Sha256).toHex(':').toUpper();
    EXPECT_TRUE(details.contains(QString::fromLatin1(digest)));
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

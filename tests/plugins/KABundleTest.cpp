// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KABundle.h>

#include <QtCore/QDir>
#include <QtCore/QFile>
#include <QtCore/QTemporaryDir>
#include <gtest/gtest.h>
#include <kavellaccounts/KAPlugin.h>

namespace {

const QString kBundles = QStringLiteral(KAVELL_TEST_BUNDLES);

std::shared_ptr<KABundle> exampleBundle()
{
    return KABundle::bundleWithPath(kBundles + "/good/ExampleList.kaplugin");
}

void writeInformation(const QString &bundlePath, const QByteArray &content)
{
    QDir().mkpath(bundlePath + "/Contents");
    QFile file(bundlePath + "/Contents/Info.plist");
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    file.write(content);
}

QByteArray informationWithIdentifier(const QByteArray &identifier)
{
    return "<plist version=\"1.0\"><dict><key>KABundleIdentifier</key>" + identifier + "</dict></plist>";
}

TEST(KABundle, SaysWhatItsInformationDictionarySays)
{
    const auto bundle = exampleBundle();
    ASSERT_TRUE(bundle);
    EXPECT_EQ(bundle->bundleIdentifier(), "com.corvane.examplelist.kaplugin");
    EXPECT_EQ(bundle->infoDictionary().value("KAPluginVersion").toInt(), 1);
    EXPECT_TRUE(QFile::exists(bundle->executablePath()));
}

TEST(KABundle, LooksTextsUpByKeyElseAnswersTheValueElseTheKey)
{
    const auto bundle = exampleBundle();
    EXPECT_EQ(bundle->localizedString("BRAND_NAME"), "Zorbo");
    EXPECT_EQ(bundle->localizedString("NO_SUCH_KEY"), "NO_SUCH_KEY");
    EXPECT_EQ(bundle->localizedString("NO_SUCH_KEY", ""), "NO_SUCH_KEY");
    EXPECT_EQ(bundle->localizedString("NO_SUCH_KEY", "instead"), "instead");
    EXPECT_TRUE(bundle->localizedString(QString()).isNull());
}

TEST(KABundle, LocalizedInformationHasATableOfItsOwn)
{
    EXPECT_EQ(exampleBundle()->localizedInfoForKey("KABundleName"), "Zorbo Online");
    EXPECT_TRUE(exampleBundle()->localizedInfoForKey("BRAND_NAME").isNull());
}

TEST(KABundle, FindsResourcesByNameAndType)
{
    EXPECT_TRUE(exampleBundle()->pathForResource("domains", "plist").endsWith("/Contents/Resources/domains.plist"));
    EXPECT_TRUE(exampleBundle()->pathForResource("domains", "txt").isNull());
}

TEST(KABundle, InformationThatNoMemoryHoldsIsNone)
{
    const QTemporaryDir directory;
    writeInformation(directory.path(), {});
    ASSERT_TRUE(QFile::resize(directory.path() + "/Contents/Info.plist", qint64{1} << 40));
    EXPECT_FALSE(KABundle::bundleWithPath(directory.path()));
}

TEST(KABundle, WithoutReadableInformationIsNone)
{
    const QTemporaryDir directory;
    EXPECT_FALSE(KABundle::bundleWithPath(directory.path()));
    writeInformation(directory.path(), "<plist><dict><key>broken");
    EXPECT_FALSE(KABundle::bundleWithPath(directory.path()));
}

TEST(KABundle, InformationThatCouldNotBeWrittenAgainIsNone)
{
    const QTemporaryDir directory;
    writeInformation(directory.path(), informationWithIdentifier("<string>first\xEF\xBF\xBF</string>"));  // U+FFFF
    EXPECT_FALSE(KABundle::bundleWithPath(directory.path()));
}

TEST(KABundle, IdentifierThatIsNoTextIsNull)
{
    const QTemporaryDir directory;
    writeInformation(directory.path(), informationWithIdentifier("<integer>5</integer>"));
    EXPECT_TRUE(KABundle::bundleWithPath(directory.path())->bundleIdentifier().isNull());
}

TEST(KABundle, ChangedInformationIsReadAgain)
{
    const QTemporaryDir directory;
    writeInformation(directory.path(), informationWithIdentifier("<string>first</string>"));
    ASSERT_EQ(KABundle::bundleWithPath(directory.path())->bundleIdentifier(), "first");
    writeInformation(directory.path(), informationWithIdentifier("<string>the second</string>"));
    EXPECT_EQ(KABundle::bundleWithPath(directory.path())->bundleIdentifier(), "the second");
}

TEST(KABundle, LoadingWithoutCodeSaysWhy)
{
    const QTemporaryDir directory;
    writeInformation(directory.path(), informationWithIdentifier("<string>first</string>"));
    KAError error;
    EXPECT_FALSE(KABundle::bundleWithPath(directory.path())->load(&error));
    EXPECT_EQ(error.description(), "The bundle's information dictionary names no executable.");
}

TEST(KABundle, MakesNoObjectBeforeItsCodeIsLoadedAndOneAfterwards)
{
    const auto bundle = KABundle::bundleWithPath(kBundles + "/Working/Working.kaplugin");
    EXPECT_FALSE(bundle->makePrincipalObject(bundle));
    ASSERT_TRUE(bundle->load());
    EXPECT_TRUE(bundle->makePrincipalObject(bundle));
}

TEST(KABundle, LibraryHasEnglishTexts)
{
    EXPECT_EQ(KABundle::libraryBundle()->localizedString("SERVICE_DISPLAY_NAME_MAIL"), "Mail");
    EXPECT_EQ(KABundle::libraryBundle()->localizedString("CANCEL"), "Cancel");
}

}  // namespace

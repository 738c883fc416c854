// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KADefaults.h>

#include <kavellaccounts/KAFieldList.h>

#include "tests/model/account_fixture.h"
#include "tests/support/process.h"

using namespace kavell::test;

namespace {

const QString kKey = QStringLiteral("key");

class KADefaultsTest : public AccountTest {
protected:
    /// The file as text; empty when there is none.
    [[nodiscard]] std::string file() const { return readFile(homePath("config/com.corvane.kavellaccounts.plist")); }

    [[nodiscard]] bool fileHas(const std::string &text) const { return file().find(text) != std::string::npos; }

    static int setInAnotherProcess(const QString &key, const QString &value)
    {
        ChildProcess other([&] {
            KADefaults defaults;
            defaults.setObject(value, key);
            return defaults.synchronize() ? 0 : 1;
        });
        return other.wait();
    }
};

}  // namespace

TEST_F(KADefaultsTest, OneInstanceIsShared)
{
    const auto shared = KADefaults::shared();
    EXPECT_TRUE(shared);
    EXPECT_EQ(KADefaults::shared(), shared);
}

TEST_F(KADefaultsTest, AValueIsNotWrittenBeforeSynchronize)
{
    const auto defaults = KADefaults::shared();
    defaults->setObject(QStringLiteral("value"), kKey);
    EXPECT_EQ(defaults->objectForKey(kKey), QVariant(QStringLiteral("value")));
    EXPECT_EQ(file(), "");
    EXPECT_TRUE(defaults->synchronize());
    EXPECT_TRUE(fileHas("<key>key</key>"));
    EXPECT_TRUE(fileHas("<string>value</string>"));
}

TEST_F(KADefaultsTest, AMissingKeyHasNoValue)
{
    EXPECT_FALSE(KADefaults::shared()->objectForKey(QStringLiteral("missing")).isValid());
}

TEST_F(KADefaultsTest, ARemovedKeyIsGoneFromTheFile)
{
    const auto defaults = KADefaults::shared();
    defaults->setObject(1, kKey);
    ASSERT_TRUE(defaults->synchronize());
    defaults->removeObjectForKey(kKey);
    EXPECT_FALSE(defaults->objectForKey(kKey).isValid());
    EXPECT_TRUE(fileHas("<key>key</key>"));
    ASSERT_TRUE(defaults->synchronize());
    EXPECT_FALSE(fileHas("<key>key</key>"));
}

TEST_F(KADefaultsTest, SettingNothingRemovesTheKey)
{
    const auto defaults = KADefaults::shared();
    defaults->setObject(1, kKey);
    defaults->setObject(QVariant(), kKey);
    EXPECT_FALSE(defaults->objectForKey(kKey).isValid());
}

TEST_F(KADefaultsTest, SynchronizeReadsWhatOthersWrote)
{
    const auto defaults = KADefaults::shared();
    ASSERT_EQ(setInAnotherProcess(kKey, QStringLiteral("theirs")), 0);
    EXPECT_FALSE(defaults->objectForKey(kKey).isValid());
    ASSERT_TRUE(defaults->synchronize());
    EXPECT_EQ(defaults->objectForKey(kKey), QVariant(QStringLiteral("theirs")));
}

TEST_F(KADefaultsTest, ProcessesThatSetDifferentKeysBothKeepTheirs)
{
    // The other one comes first, because a forked child would have what was set here already.
    ASSERT_EQ(setInAnotherProcess(QStringLiteral("other"), QStringLiteral("theirs")), 0);
    const auto defaults = KADefaults::shared();
    EXPECT_FALSE(defaults->objectForKey(QStringLiteral("other")).isValid());
    defaults->setObject(QStringLiteral("ours"), kKey);
    ASSERT_TRUE(defaults->synchronize());
    EXPECT_TRUE(fileHas("<string>ours</string>"));
    EXPECT_TRUE(fileHas("<string>theirs</string>"));
}

TEST_F(KADefaultsTest, ANewInstanceReadsWhatOthersWrote)
{
    ASSERT_EQ(setInAnotherProcess(kKey, QStringLiteral("theirs")), 0);
    const KADefaults defaults;
    EXPECT_EQ(defaults.objectForKey(kKey), QVariant(QStringLiteral("theirs")));
}

TEST_F(KADefaultsTest, AnInstanceThatGoesSynchronizesOnceMore)
{
    {
        KADefaults defaults;
        defaults.setObject(QStringLiteral("last"), kKey);
        EXPECT_EQ(file(), "");
    }
    EXPECT_TRUE(fileHas("<string>last</string>"));
}

TEST_F(KADefaultsTest, ItHasNoFields)
{
    KAFieldList fields;
    KADefaults::shared()->describeFields(fields);
    EXPECT_TRUE(fields.fields().empty());
}

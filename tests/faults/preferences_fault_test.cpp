// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Every system call of writing and reading preferences fails in turn (fault_injector.h says in which ways). After each:
// one line in the log exactly when synchronize says that it failed, the file as before or as after, as it says, what
// was set still set, no descriptor left open, and a next synchronize that succeeds.

#include <cstdlib>
#include <filesystem>

#include <gtest/gtest.h>

#include "platform/qt/preferences.h"
#include "tests/faults/fault_injector.h"
#include "tests/support/log_capture.h"
#include "tests/support/process.h"

using namespace kavell;
using namespace kavell::test;

namespace {

const QString kDomain = QStringLiteral("org.example.faults");
const QString kOurs = QStringLiteral("ours");
const QString kTheirs = QStringLiteral("theirs");
constexpr std::string_view kDamaged = "these are no preferences, but a user may want them back";

class PreferencesFaults : public testing::Test {
protected:
    PreferencesFaults()
    {
        m_directory = std::string(std::getenv("TMPDIR")) + "/preferences";
        setenv("XDG_CONFIG_HOME", m_directory.c_str(), 1);
    }

    [[nodiscard]] std::string path() const { return m_directory + "/org.example.faults.plist"; }

    /// Puts preferences on the disk as another process does; none of ours.
    void putTheirs(int value) const
    {
        std::filesystem::remove_all(m_directory);
        Preferences preferences(kDomain);
        preferences.setObject(QString(9000, QChar(u'a' + value)), kTheirs);
        EXPECT_TRUE(preferences.synchronize());
    }

    static std::string describe(const Preferences &preferences)
    {
        const QString theirs = preferences.objectForKey(kTheirs).toString();
        if (!theirs.isEmpty() && theirs != QString(9000, theirs.front()))
            return "preferences that are not whole";
        return "ours " + preferences.objectForKey(kOurs).toString().toStdString() + ", theirs " +
               theirs.left(1).toStdString();
    }

    /// What another process finds, without a fault.
    static std::string find()
    {
        const LogCapture log;
        Preferences preferences(kDomain);
        EXPECT_TRUE(preferences.synchronize());
        return describe(preferences);
    }

    struct Outcome {
        bool isDone = false;
        qsizetype lines = 0;
    };

    static Outcome synchronize(FaultInjector &injector, Preferences &preferences)
    {
        Outcome outcome;
        const LogCapture log;
        {
            const Observation observation(injector);
            outcome.isDone = preferences.synchronize();
        }
        outcome.lines = log.messages().size();
        return outcome;
    }

    static void expectReason(const FaultInjector &injector, const Outcome &outcome)
    {
        EXPECT_EQ(outcome.lines, outcome.isDone ? 0 : 1);
        if (!outcome.isDone) {
            EXPECT_FALSE(injector.fault().isPassing(injector.failed()->kind));
        }
    }

    [[nodiscard]] bool isDamagedKept() const
    {
        for (const auto &entry : std::filesystem::directory_iterator(m_directory)) {
            if (readFile(entry.path()) == kDamaged)
                return true;
        }
        return false;
    }

    std::string m_directory;
};

}  // namespace

TEST_F(PreferencesFaults, AChangeIsWrittenOrKeptForTheNextTime)
{
    forEachFault({}, [&](FaultInjector &injector) {
        putTheirs(0);
        const size_t descriptors = countOpenDescriptors();
        Preferences preferences(kDomain);
        preferences.setObject(QStringLiteral("one"), kOurs);
        const Outcome outcome = synchronize(injector, preferences);
        expectReason(injector, outcome);
        EXPECT_EQ(find(), outcome.isDone ? "ours one, theirs a" : "ours , theirs a");
        EXPECT_EQ(preferences.objectForKey(kOurs), QVariant(QStringLiteral("one")));
        EXPECT_EQ(countOpenDescriptors(), descriptors);
        EXPECT_TRUE(preferences.synchronize());
        EXPECT_EQ(find(), "ours one, theirs a");
        EXPECT_FALSE(std::filesystem::exists(m_directory + "/.org.example.faults.plist.new"));
    });
}

TEST_F(PreferencesFaults, TheFirstPreferencesAreWrittenOrKeptForTheNextTime)
{
    forEachFault({}, [&](FaultInjector &injector) {
        std::filesystem::remove_all(m_directory);
        const size_t descriptors = countOpenDescriptors();
        Preferences preferences(kDomain);
        preferences.setObject(QStringLiteral("one"), kOurs);
        const Outcome outcome = synchronize(injector, preferences);
        expectReason(injector, outcome);
        EXPECT_EQ(find(), outcome.isDone ? "ours one, theirs " : "ours , theirs ");
        EXPECT_EQ(countOpenDescriptors(), descriptors);
        EXPECT_TRUE(preferences.synchronize());
        EXPECT_EQ(find(), "ours one, theirs ");
    });
}

TEST_F(PreferencesFaults, AReadingFindsWhatIsThereOrKeepsWhatItKnew)
{
    forEachFault({}, [&](FaultInjector &injector) {
        putTheirs(0);
        Preferences preferences(kDomain);
        EXPECT_TRUE(preferences.synchronize());
        putTheirs(1);
        const size_t descriptors = countOpenDescriptors();
        const Outcome outcome = synchronize(injector, preferences);
        expectReason(injector, outcome);
        EXPECT_EQ(describe(preferences), outcome.isDone ? "ours , theirs b" : "ours , theirs a");
        EXPECT_EQ(countOpenDescriptors(), descriptors);
        EXPECT_TRUE(preferences.synchronize());
        EXPECT_EQ(describe(preferences), "ours , theirs b");
    });
}

TEST_F(PreferencesFaults, ADamagedFileIsKeptWhateverFails)
{
    forEachFault({}, [&](FaultInjector &injector) {
        std::filesystem::remove_all(m_directory);
        writeFile(path(), kDamaged);
        const size_t descriptors = countOpenDescriptors();
        Preferences preferences(kDomain);
        preferences.setObject(QStringLiteral("one"), kOurs);
        const Outcome outcome = synchronize(injector, preferences);
        EXPECT_TRUE(isDamagedKept());
        EXPECT_EQ(find(), outcome.isDone ? "ours one, theirs " : "ours , theirs ");
        EXPECT_EQ(countOpenDescriptors(), descriptors);
        const LogCapture log;
        EXPECT_TRUE(preferences.synchronize());
        EXPECT_TRUE(isDamagedKept());
    });
}

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A crash at every moment of writing preferences: they are read as before or as after, whatever the disk was left in
// (crash_scenario.h says what that covers and how to try more).

#include <cstdlib>
#include <filesystem>
#include <memory>

#include <gtest/gtest.h>

#include "platform/qt/preferences.h"
#include "tests/crash/crash_scenario.h"
#include "tests/support/log_capture.h"
#include "tests/support/process.h"

using namespace kavell;
using namespace kavell::test;

namespace {

const QString kDomain = QStringLiteral("org.example.crash");
const QString kRound = QStringLiteral("round");
const QString kText = QStringLiteral("text");

class PreferencesCrash : public testing::Test {
protected:
    PreferencesCrash()
    {
        const std::string scratch = std::string(std::getenv("TMPDIR")) + "/preferences";
        std::filesystem::remove_all(scratch);
        m_watched = std::make_unique<WatchedDirectory>(scratch + "/home", scratch + "/anchors");
        setenv("XDG_CONFIG_HOME", (m_watched->path() + "/all/config").c_str(), 1);
        m_scenario = std::make_unique<CrashScenario>(
            *m_watched, [this] { return observe(); }, [this](const std::string &found) { return proceed(found); });
    }

    [[nodiscard]] std::string path() const { return m_watched->path() + "/all/config/org.example.crash.plist"; }

    static QString textOf(int round) { return QString(round / 100, QChar(u'a' + round % 26)); }
    static std::string foundAs(int round) { return "round " + std::to_string(round); }

    /// Saves what a round is known by: a number whose hundreds are the length of its text.
    static void save(int round)
    {
        Preferences preferences(kDomain);
        preferences.setObject(round, kRound);
        preferences.setObject(textOf(round), kText);
        EXPECT_TRUE(preferences.synchronize());
    }

    virtual std::string observe()
    {
        const LogCapture log;
        Preferences preferences(kDomain);
        if (!preferences.synchronize())
            return "preferences that cannot be read";
        const QVariant round = preferences.objectForKey(kRound);
        const QVariant text = preferences.objectForKey(kText);
        std::string found = "nothing";
        if (round.isValid() || text.isValid())
            found =
                text.toString() == textOf(round.toInt()) ? foundAs(round.toInt()) : "preferences that are not whole";
        for (const QString &message : log.messages())
            found += ", saying " + message.toStdString();
        return found;
    }

    std::string proceed(const std::string &)
    {
        const LogCapture log;
        save(70017);
        return foundAs(70017);
    }

    void saveStep(const std::string &name, int round)
    {
        m_scenario->step(
            name, [round] { save(round); }, foundAs(round));
    }

    std::unique_ptr<WatchedDirectory> m_watched;
    std::unique_ptr<CrashScenario> m_scenario;
};

/// A file that is no property list counts as empty and is kept when it is replaced.
class DamagedPreferencesCrash : public PreferencesCrash {
protected:
    static constexpr std::string_view kDamaged = "these are no preferences, but a user may want them back";

    DamagedPreferencesCrash()
    {
        writeFile(path(), kDamaged);
        std::filesystem::permissions(path(), std::filesystem::perms(0600));
    }

    std::string observe() override
    {
        // Reading says that the file is damaged for as long as it is; that is not what is looked at here.
        std::string found = PreferencesCrash::observe();
        found.resize(std::min(found.find(", saying"), found.size()));
        return found + (isKept() ? "" : ", and what was damaged is lost");
    }

    [[nodiscard]] bool isKept() const
    {
        for (const auto &entry : std::filesystem::directory_iterator(std::filesystem::path(path()).parent_path())) {
            if (readFile(entry.path()) == kDamaged)
                return true;
        }
        return false;
    }
};

}  // namespace

TEST_F(PreferencesCrash, LeavesTheFirstPreferencesWholeOrNotThere)
{
    m_scenario->start("nothing");
    saveStep("create", 200001);
    m_scenario->checkEverything();
}

TEST_F(PreferencesCrash, LeavesPreferencesAsBeforeOrAsAfter)
{
    save(200001);
    m_scenario->start(foundAs(200001));
    saveStep("change", 200002);
    saveStep("grow", 400003);
    saveStep("shrink", 50004);
    m_scenario->checkEverything();
}

TEST_F(DamagedPreferencesCrash, KeepsWhatWasDamaged)
{
    m_scenario->start("nothing");
    m_scenario->step(
        "save over it",
        [] {
            const LogCapture log;
            save(20001);
        },
        foundAs(20001));
    m_scenario->checkEverything();
}

TEST_F(PreferencesCrash, LeavesPreferencesAsBeforeOrAsAfterWhereACallFailedToo)
{
    save(20001);
    m_scenario->start(foundAs(20001));
    const auto trySaving = [] {
        const LogCapture log;
        Preferences preferences(kDomain);
        preferences.setObject(90002, kRound);
        preferences.setObject(textOf(90002), kText);
        static_cast<void>(preferences.synchronize());
    };
    m_scenario->checkPowerCutsAfterFaults(trySaving, foundAs(90002));
    m_scenario->checkSavesAfterFaults(trySaving);
}

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Preferences of one domain as several objects, threads and real processes see them. Each test has a domain's file of
// its own.

#include "platform/qt/preferences.h"

#include <array>
#include <atomic>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <memory>
#include <set>
#include <sys/file.h>
#include <sys/stat.h>
#include <thread>
#include <vector>

#include <QtCore/QDateTime>
#include <QtCore/QRect>
#include <QtCore/QStringList>
#include <QtCore/QUrl>

#include <gtest/gtest.h>

#include "tests/support/log_capture.h"
#include "tests/support/process.h"

using namespace kavell;
using namespace kavell::test;
using namespace std::chrono_literals;

namespace {

const QString kOne = QStringLiteral("one");
const QString kTwo = QStringLiteral("two");
const QString kThree = QStringLiteral("three");

class PreferencesTest : public testing::Test {
protected:
    PreferencesTest()
    {
        const auto *test = testing::UnitTest::GetInstance()->current_test_info();
        domain = QStringLiteral("org.example.") + QString::fromUtf8(test->name());
        directory = std::getenv("XDG_CONFIG_HOME");
        path = directory + "/" + domain.toStdString() + ".plist";
    }

    [[nodiscard]] std::string lockPath() const { return directory + "/." + domain.toStdString() + ".plist.lock"; }

    /// Sets one value in a process of its own and writes it.
    void setInAnotherProcess(const QString &key, const QVariant &value) const
    {
        ChildProcess other([&] {
            Preferences preferences(domain);
            preferences.setObject(value, key);
            return preferences.synchronize() ? 0 : 1;
        });
        EXPECT_EQ(other.wait(), 0);
    }

    /// The value as a reader that starts now finds it in the file.
    [[nodiscard]] QVariant onDisk(const QString &key) const
    {
        Preferences reader(domain);
        EXPECT_TRUE(reader.synchronize());
        return reader.objectForKey(key);
    }

    /// The damaged files that were set aside.
    [[nodiscard]] std::vector<std::string> damagedFiles() const
    {
        std::vector<std::string> found;
        for (const auto &entry : std::filesystem::directory_iterator(directory))
            if (entry.path().string().starts_with(path + ".damaged-"))
                found.push_back(entry.path());
        return found;
    }

    QString domain;
    std::string directory;
    std::string path;
};

}  // namespace

TEST_F(PreferencesTest, AMissingFileHoldsNothing)
{
    Preferences preferences(domain);
    EXPECT_TRUE(preferences.synchronize());
    EXPECT_FALSE(preferences.objectForKey(kOne).isValid());
    EXPECT_FALSE(std::filesystem::exists(path));
}

TEST_F(PreferencesTest, AValueIsReadBackBeforeItIsWritten)
{
    Preferences preferences(domain);
    preferences.setObject(1, kOne);
    EXPECT_EQ(preferences.objectForKey(kOne), QVariant(1));
    EXPECT_FALSE(std::filesystem::exists(path));
}

TEST_F(PreferencesTest, SynchronizeWritesAPropertyListForTheOwnerOnly)
{
    Preferences preferences(domain);
    preferences.setObject(QStringLiteral("Ada"), kOne);
    ASSERT_TRUE(preferences.synchronize());
    struct stat status;
    ASSERT_EQ(stat(path.c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 07777, 0600u);
    const std::string xml = readFile(path);
    EXPECT_NE(xml.find("<key>one</key>"), std::string::npos);
    EXPECT_NE(xml.find("<string>Ada</string>"), std::string::npos);
}

TEST_F(PreferencesTest, EveryTypeComesBackFromTheFile)
{
    Preferences preferences(domain);
    const QVariantMap value{{QStringLiteral("text"), QStringLiteral("a<b>&\u00eb")},
                            {QStringLiteral("blanks"), QStringLiteral(" a\r\nb\rc\t\n ")},
                            {QStringLiteral("empty"), QStringLiteral("")},
                            {QStringLiteral(" & \n"), QStringLiteral("key")},
                            {QStringLiteral("integer"), -3},
                            {QStringLiteral("real"), 0.25},
                            {QStringLiteral("boolean"), true},
                            {QStringLiteral("data"), QByteArray("\0\xFF", 2)},
                            {QStringLiteral("date"), QDateTime::fromSecsSinceEpoch(1770087906, Qt::UTC)},
                            {QStringLiteral("list"), QVariantList{1, QStringLiteral("x")}}};
    preferences.setObject(value, kOne);
    ASSERT_TRUE(preferences.synchronize());
    const QVariantMap back = onDisk(kOne).toMap();
    EXPECT_EQ(back, value);
    EXPECT_EQ(back.value(QStringLiteral("boolean")).metaType().id(), QMetaType::Bool);
    EXPECT_EQ(back.value(QStringLiteral("integer")).metaType().id(), QMetaType::LongLong);
    EXPECT_EQ(back.value(QStringLiteral("real")).metaType().id(), QMetaType::Double);
    EXPECT_EQ(back.value(QStringLiteral("data")).metaType().id(), QMetaType::QByteArray);
}

TEST_F(PreferencesTest, AValueHasTheSameFormBeforeAndAfterItIsWritten)
{
    Preferences preferences(domain);
    preferences.setObject(QUrl(QStringLiteral("https://example.org/")), kOne);
    EXPECT_EQ(preferences.objectForKey(kOne), QVariant(QStringLiteral("https://example.org/")));
    ASSERT_TRUE(preferences.synchronize());
    EXPECT_EQ(preferences.objectForKey(kOne), QVariant(QStringLiteral("https://example.org/")));
}

TEST_F(PreferencesTest, NothingRemovesTheKeyFromTheFile)
{
    setInAnotherProcess(kOne, 1);
    setInAnotherProcess(kTwo, 2);
    Preferences preferences(domain);
    ASSERT_TRUE(preferences.synchronize());
    preferences.setObject({}, kOne);
    EXPECT_FALSE(preferences.objectForKey(kOne).isValid());
    ASSERT_TRUE(preferences.synchronize());
    EXPECT_FALSE(onDisk(kOne).isValid());
    EXPECT_EQ(onDisk(kTwo), QVariant(2));
}

TEST_F(PreferencesTest, AValueThatNoPropertyListHoldsIsRefusedAndTheOldOneStays)
{
    Preferences preferences(domain);
    preferences.setObject(1, kOne);
    const LogCapture capture;
    preferences.setObject(QRect(), kOne);
    EXPECT_EQ(preferences.objectForKey(kOne), QVariant(1));
    EXPECT_EQ(capture.messages().size(), 1);
}

TEST_F(PreferencesTest, ANullKeyNamesNothingNotEvenTheEmptyKey)
{
    Preferences preferences(domain);
    preferences.setObject(1, QStringLiteral(""));
    preferences.setObject(2, QString());
    EXPECT_FALSE(preferences.objectForKey(QString()).isValid());
    EXPECT_EQ(preferences.objectForKey(QStringLiteral("")), QVariant(1));
    ASSERT_TRUE(preferences.synchronize());
    EXPECT_EQ(onDisk(QStringLiteral("")), QVariant(1));
}

TEST_F(PreferencesTest, ValuesThatAreTogetherTooManyAreNotWrittenAndTheLogSaysWhy)
{
    Preferences preferences(domain);
    preferences.setObject(0, kOne);
    ASSERT_TRUE(preferences.synchronize());
    QVariantMap many;
    for (int number = 0; number < 6000; ++number)
        many.insert(QString::number(number), number);
    preferences.setObject(many, kTwo);
    preferences.setObject(many, kThree);
    const LogCapture capture;
    EXPECT_FALSE(preferences.synchronize());
    EXPECT_EQ(onDisk(kOne), QVariant(0));
    EXPECT_FALSE(onDisk(kTwo).isValid());
    EXPECT_EQ(capture.messages(),
              QStringList(QStringLiteral("Cannot write the preferences file ") + QString::fromStdString(path) +
                          QStringLiteral(": the values are together more than could be read again")));
}

TEST_F(PreferencesTest, ProcessesThatSetDifferentKeysBothKeepTheirs)
{
    Preferences preferences(domain);
    ASSERT_TRUE(preferences.synchronize());
    preferences.setObject(1, kOne);
    setInAnotherProcess(kTwo, 2);
    ASSERT_TRUE(preferences.synchronize());
    EXPECT_EQ(preferences.objectForKey(kTwo), QVariant(2));
    EXPECT_EQ(onDisk(kOne), QVariant(1));
    EXPECT_EQ(onDisk(kTwo), QVariant(2));
}

TEST_F(PreferencesTest, OfTwoProcessesThatSetOneKeyTheLaterWins)
{
    Preferences preferences(domain);
    preferences.setObject(1, kOne);
    setInAnotherProcess(kOne, 2);
    ASSERT_TRUE(preferences.synchronize());
    EXPECT_EQ(onDisk(kOne), QVariant(1));
    setInAnotherProcess(kOne, 3);
    ASSERT_TRUE(preferences.synchronize());
    EXPECT_EQ(preferences.objectForKey(kOne), QVariant(3));
}

TEST_F(PreferencesTest, AValueOnceWrittenIsNotWrittenAgainOverAnothers)
{
    Preferences preferences(domain);
    preferences.setObject(1, kOne);
    ASSERT_TRUE(preferences.synchronize());
    setInAnotherProcess(kOne, 2);
    preferences.setObject(5, kTwo);
    ASSERT_TRUE(preferences.synchronize());
    EXPECT_EQ(onDisk(kOne), QVariant(2));
}

TEST_F(PreferencesTest, ManyProcessesWritingAtOnceLoseNoKey)
{
    constexpr int kProcesses = 4, kKeys = 25;
    {
        std::vector<std::unique_ptr<ChildProcess>> writers;
        for (int writer = 0; writer < kProcesses; ++writer)
            writers.push_back(std::make_unique<ChildProcess>([&] {
                Preferences preferences(domain);
                bool done = true;
                for (int key = 0; key < kKeys; ++key) {
                    preferences.setObject(key, QStringLiteral("%1-%2").arg(writer).arg(key));
                    done = preferences.synchronize() && done;
                }
                return done ? 0 : 1;
            }));
        for (const auto &writer : writers)
            EXPECT_EQ(writer->wait(), 0);
    }
    Preferences reader(domain);
    ASSERT_TRUE(reader.synchronize());
    for (int writer = 0; writer < kProcesses; ++writer)
        for (int key = 0; key < kKeys; ++key)
            EXPECT_EQ(reader.objectForKey(QStringLiteral("%1-%2").arg(writer).arg(key)), QVariant(key));
}

TEST_F(PreferencesTest, WhoeverReadsWhileAnotherWritesHasTheWholeOldFile)
{
    setInAnotherProcess(kOne, QString(100000, u'x'));
    const std::string before = readFile(path);
    std::ifstream reader(path);
    std::string found(50000, '\0');
    reader.read(found.data(), static_cast<std::streamsize>(found.size()));
    setInAnotherProcess(kOne, 1);
    found.append(std::istreambuf_iterator<char>(reader), {});
    EXPECT_EQ(found, before);
    EXPECT_EQ(onDisk(kOne), QVariant(1));
}

TEST_F(PreferencesTest, AProcessKilledInTheMiddleOfWritingLosesNothing)
{
    setInAnotherProcess(kOne, QStringLiteral("kept"));
    for (int round = 0; round < 40; ++round) {
        std::array<int, 2> written{};
        ASSERT_EQ(pipe2(written.data(), O_CLOEXEC), 0);
        ChildProcess writer([&] {
            Preferences preferences(domain);
            for (int number = 1;; ++number) {
                preferences.setObject(number, kTwo);
                preferences.setObject(QString(number % 5000, u'x'), kThree);
                if (!preferences.synchronize() || write(written[1], &number, sizeof number) != sizeof number)
                    return 1;
            }
        });
        close(written[1]);
        // Each round's kill comes a little later after the first write.
        int last = 0;
        ASSERT_EQ(read(written[0], &last, sizeof last), static_cast<ssize_t>(sizeof last));
        const auto until = std::chrono::steady_clock::now() + round * 37us;
        while (std::chrono::steady_clock::now() < until)
            std::this_thread::yield();
        writer.signal(SIGKILL);
        EXPECT_EQ(writer.wait(), 128 + SIGKILL);
        while (read(written[0], &last, sizeof last) == static_cast<ssize_t>(sizeof last))
            ;
        close(written[0]);
        Preferences reader(domain);
        ASSERT_TRUE(reader.synchronize());
        EXPECT_EQ(reader.objectForKey(kOne), QVariant(QStringLiteral("kept")));
        const int found = reader.objectForKey(kTwo).toInt();
        EXPECT_TRUE(found == last || found == last + 1) << found << " after " << last;
        EXPECT_EQ(reader.objectForKey(kThree).toString().size(), found % 5000);
    }
    EXPECT_TRUE(damagedFiles().empty());
    setInAnotherProcess(kTwo, 0);
    EXPECT_FALSE(std::filesystem::exists(directory + "/." + domain.toStdString() + ".plist.new"));
}

TEST_F(PreferencesTest, AnUnchangedFileIsNotReadAgain)
{
    setInAnotherProcess(kOne, 1);
    Preferences preferences(domain);
    ASSERT_TRUE(preferences.synchronize());
    // Other contents behind the same stamp: whoever reads the file again would see them.
    struct stat status;
    ASSERT_EQ(stat(path.c_str(), &status), 0);
    std::string xml = readFile(path);
    const size_t digit = xml.find("<integer>1<");
    ASSERT_NE(digit, std::string::npos);
    std::fstream(path, std::ios::in | std::ios::out).seekp(static_cast<std::streamoff>(digit + 9)).put('7');
    const std::array<timespec, 2> times{status.st_atim, status.st_mtim};
    ASSERT_EQ(utimensat(AT_FDCWD, path.c_str(), times.data(), 0), 0);
    ASSERT_TRUE(preferences.synchronize());
    EXPECT_EQ(preferences.objectForKey(kOne), QVariant(1));
    EXPECT_EQ(onDisk(kOne), QVariant(7));
}

TEST_F(PreferencesTest, AFileThatIsDeletedHoldsNothing)
{
    setInAnotherProcess(kOne, 1);
    Preferences preferences(domain);
    ASSERT_TRUE(preferences.synchronize());
    ASSERT_TRUE(std::filesystem::remove(path));
    ASSERT_TRUE(preferences.synchronize());
    EXPECT_FALSE(preferences.objectForKey(kOne).isValid());
}

TEST_F(PreferencesTest, ADamagedFileCountsAsEmptyAndStaysWhileNothingIsWritten)
{
    writeFile(path, "<plist><dict><key>one</key>");
    Preferences preferences(domain);
    const LogCapture capture;
    EXPECT_TRUE(preferences.synchronize());
    EXPECT_TRUE(preferences.synchronize());
    EXPECT_FALSE(preferences.objectForKey(kOne).isValid());
    EXPECT_EQ(readFile(path), "<plist><dict><key>one</key>");
    EXPECT_EQ(capture.messages(), QStringList(QStringLiteral("The preferences file ") + QString::fromStdString(path) +
                                              QStringLiteral(" is damaged and counts as empty")));
}

TEST_F(PreferencesTest, ADamagedFileIsKeptWhenItIsReplaced)
{
    for (const char *damage : {"first", "second"}) {
        writeFile(path, damage);
        setInAnotherProcess(kOne, 1);
        EXPECT_EQ(onDisk(kOne), QVariant(1));
    }
    const auto damaged = damagedFiles();
    ASSERT_EQ(damaged.size(), 2u);
    EXPECT_EQ(std::set<std::string>({readFile(damaged[0]), readFile(damaged[1])}),
              std::set<std::string>({"first", "second"}));
}

TEST_F(PreferencesTest, WhatCannotBeReadFailsAndIsLeftAlone)
{
    std::filesystem::create_directories(path);
    Preferences preferences(domain);
    const LogCapture capture;
    EXPECT_FALSE(preferences.synchronize());
    preferences.setObject(1, kOne);
    EXPECT_FALSE(preferences.synchronize());
    EXPECT_TRUE(std::filesystem::is_directory(path));
    ASSERT_EQ(capture.messages().size(), 2);
    EXPECT_EQ(capture.messages()[0], QStringLiteral("Cannot read the preferences file ") +
                                         QString::fromStdString(path) + QStringLiteral(": Invalid argument"));
}

TEST_F(PreferencesTest, WhatCouldNotBeWrittenIsKeptForTheNextTime)
{
    Preferences preferences(domain);
    preferences.setObject(1, kOne);
    std::filesystem::create_directories(path);
    {
        const LogCapture capture;
        EXPECT_FALSE(preferences.synchronize());
    }
    EXPECT_EQ(preferences.objectForKey(kOne), QVariant(1));
    std::filesystem::remove(path);
    EXPECT_TRUE(preferences.synchronize());
    EXPECT_EQ(onDisk(kOne), QVariant(1));
}

TEST_F(PreferencesTest, WaitsForAnotherWriterForABoundedTimeOnly)
{
    writeFile(lockPath(), "");
    const FileDescriptor other(open(lockPath().c_str(), O_RDWR | O_CLOEXEC));
    ASSERT_EQ(flock(other.get(), LOCK_EX), 0);
    Preferences preferences(domain, 50ms);
    preferences.setObject(1, kOne);
    {
        const LogCapture capture;
        EXPECT_FALSE(preferences.synchronize());
        EXPECT_EQ(capture.messages(),
                  QStringList(QStringLiteral("Cannot lock the preferences file ") + QString::fromStdString(path) +
                              QStringLiteral(": Connection timed out")));
    }
    ASSERT_EQ(flock(other.get(), LOCK_UN), 0);
    EXPECT_TRUE(preferences.synchronize());
    EXPECT_EQ(Preferences::kLongestWait, 10s);
}

TEST_F(PreferencesTest, ReadingDoesNotWaitForWriters)
{
    setInAnotherProcess(kOne, 1);
    const FileDescriptor other(open(lockPath().c_str(), O_RDWR | O_CLOEXEC));
    ASSERT_EQ(flock(other.get(), LOCK_EX), 0);
    EXPECT_EQ(onDisk(kOne), QVariant(1));
}

TEST_F(PreferencesTest, TheConfigurationDirectoryIsMadeForTheOwnerOnly)
{
    const std::string home = std::getenv("HOME");
    const std::string configuration = home + "/fresh/config";
    setenv("XDG_CONFIG_HOME", configuration.c_str(), 1);
    Preferences preferences(domain);
    preferences.setObject(1, kOne);
    EXPECT_TRUE(preferences.synchronize());
    setenv("XDG_CONFIG_HOME", directory.c_str(), 1);
    struct stat status;
    ASSERT_EQ(stat(configuration.c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777, 0700u);
    EXPECT_TRUE(std::filesystem::exists(configuration + "/" + domain.toStdString() + ".plist"));
}

TEST_F(PreferencesTest, WithoutAConfigurationDirectoryTheHomesIsUsed)
{
    const std::string home = std::getenv("HOME");
    unsetenv("XDG_CONFIG_HOME");
    EXPECT_EQ(preferencesPath("org.example"), home + "/.config/org.example.plist");
    setenv("XDG_CONFIG_HOME", "relative", 1);
    EXPECT_EQ(preferencesPath("org.example"), home + "/.config/org.example.plist");
    setenv("XDG_CONFIG_HOME", "/elsewhere", 1);
    EXPECT_EQ(preferencesPath("org.example"), "/elsewhere/org.example.plist");
    setenv("XDG_CONFIG_HOME", directory.c_str(), 1);
}

TEST_F(PreferencesTest, WhatIsSetWhileAnotherThreadSynchronizesStaysAndIsWrittenTheNextTime)
{
    Preferences preferences(domain);
    std::atomic<bool> done = false;
    std::atomic<int> failures = 0;
    std::thread writer([&] {
        for (int round = 0; round < 100; ++round) {
            preferences.setObject(round, kTwo);
            failures += preferences.synchronize() ? 0 : 1;
        }
        done = true;
    });
    int number = 0, lost = 0;
    while (!done) {
        preferences.setObject(++number, kOne);
        lost += preferences.objectForKey(kOne).toInt() == number ? 0 : 1;
    }
    writer.join();
    EXPECT_EQ(failures, 0);
    EXPECT_EQ(lost, 0);
    ASSERT_TRUE(preferences.synchronize());
    EXPECT_EQ(onDisk(kOne), QVariant(number));
    EXPECT_EQ(onDisk(kTwo), QVariant(99));
}

TEST_F(PreferencesTest, ThreadsMayReadWriteAndSynchronizeAtOnce)
{
    Preferences preferences(domain);
    std::atomic<bool> failed = false;
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 4; ++thread)
        threads.emplace_back([&, thread] {
            const QString key = QString::number(thread);
            for (int number = 1; number <= 20; ++number) {
                preferences.setObject(number, key);
                if (!preferences.synchronize() || preferences.objectForKey(key).toInt() != number)
                    failed = true;
            }
        });
    for (std::thread &thread : threads)
        thread.join();
    EXPECT_FALSE(failed);
    for (int thread = 0; thread < 4; ++thread)
        EXPECT_EQ(onDisk(QString::number(thread)), QVariant(20));
}

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the tests of the records share: a fixture whose scratch home starts empty for each test, short ways to make and
// read accounts, hand-written data files, and a way to see which notifications were posted without waiting. Used by the
// tests of store/, integration/ and stress/; one thread.

#ifndef KAVELL_TESTS_STORE_STORE_TEST_H
#define KAVELL_TESTS_STORE_STORE_TEST_H

#include <cerrno>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <poll.h>
#include <string>
#include <string_view>
#include <sys/stat.h>
#include <vector>

#include <gtest/gtest.h>
#include <kavellaccounts/KavellStore.h>
#include <kavellaccounts/Ref.h>

#include "platform/sibling_path.h"
#include "tests/runtime/values.h"
#include "tests/support/process.h"
#include "tests/support/redo_records.h"
#include "tests/support/standard_error_capture.h"

namespace kavell::test {

inline constexpr std::string_view kMail = "com.corvane.account.mail";
inline constexpr std::string_view kUUID = "0a1b2c3d-4e5f-4a6b-8c7d-8e9fa0b1c2d3";
inline constexpr std::string_view kLoadMessage = "Error: failed to load Kavell Accounts settings\n";
inline constexpr std::string_view kSaveMessage = "Error: failed to save Kavell Settings datafile\n";
inline constexpr std::string_view kSerialiseMessage =
    "Error: unable to create XML property list for Kavell Accounts settings - save failed\n";
inline constexpr std::string_view kSemaphoreMessage = "Error: unable to initialize Kavell Accounts data semaphore\n";
inline constexpr std::string_view kStatMessage = "Error -1: failed to stat kavell account datafile\n";

using Account = Ref<CSKavellAccountRef>;

[[nodiscard]] inline Account openAccount(std::string_view loginName, std::string_view providerType = kMail)
{
    return adopt(_CSKavellAccountCreate(nullptr, text(providerType).get(), text(loginName).get()));
}

inline void setAttribute(const Account &account, std::string_view key, const Value &value)
{
    _CSKavellAccountSetProviderAttribute(account.get(), text(key).get(), value.get());
}

[[nodiscard]] inline Value attribute(const Account &account, std::string_view key)
{
    return adopt(_CSKavellAccountCopyProviderAttribute(account.get(), text(key).get()));
}

[[nodiscard]] inline Ref<CSKavellDictionaryRef> attributes(const Account &account)
{
    return adopt(_CSKavellAccountCopyProviderAttributes(account.get()));
}

[[nodiscard]] inline Ref<CSKavellDictionaryRef> serviceAttributes(const Account &account, CSKavellStringRef service)
{
    return adopt(_CSKavellAccountCopyServiceAttributes(account.get(), service));
}

[[nodiscard]] inline std::string uuidOf(const Account &account)
{
    return toStdString(adopt(_CSKavellAccountCopyUUIDString(account.get())).get());
}

[[nodiscard]] inline bool hasPendingChanges(const Account &account)
{
    return _CSKavellAccountHasPendingChanges(account.get());
}

inline void commit(const Account &account)
{
    _CSKavellAccountCommitChanges(account.get());
}

/// An XML property list around the text of a dictionary's contents.
[[nodiscard]] inline std::string propertyList(std::string_view contents)
{
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
           "<plist version=\"1.0\">\n<dict>\n" +
           std::string(contents) + "</dict>\n</plist>\n";
}

/// The contents of a data file with a UUID and, if not empty, the given provider attributes.
[[nodiscard]] inline std::string accountFile(std::string_view settings, std::string_view services = {})
{
    std::string contents = "<key>UUID</key><string>" + std::string(kUUID) + "</string>\n";
    if (!settings.empty())
        contents += "<key>AccountSettings</key><dict>" + std::string(settings) + "</dict>\n";
    if (!services.empty())
        contents += "<key>Services</key><dict>" + std::string(services) + "</dict>\n";
    return propertyList(contents);
}

[[nodiscard]] inline mode_t permissionsOf(const std::string &path)
{
    struct stat status {};
    return stat(path.c_str(), &status) == 0 ? status.st_mode & 07777 : 0;
}

[[nodiscard]] inline struct timespec modificationTime(const std::string &path)
{
    struct stat status {};
    stat(path.c_str(), &status);
    return status.st_mtim;
}

inline void setModificationTime(const std::string &path, struct timespec moment)
{
    const struct timespec times[2] = {moment, moment};
    ASSERT_EQ(utimensat(AT_FDCWD, path.c_str(), times, 0), 0);
}

/// Every notification posted since it was made, in this process or another.
class Notifications {
public:
    Notifications() : m_observer(adopt(CSKavellNotificationObserverCreate(nullptr)))
    {
        EXPECT_TRUE(m_observer) << "no observer, errno " << errno;
    }

    /// The next one, waited for with a bound; none when the bound has passed.
    [[nodiscard]] Ref<CSKavellNotificationRef> next(int milliseconds = 10000)
    {
        Ref<CSKavellNotificationRef> notification = adopt(CSKavellNotificationObserverCopyNext(m_observer.get()));
        while (!notification) {
            pollfd waiting{CSKavellNotificationObserverGetFileDescriptor(m_observer.get()), POLLIN, 0};
            if (poll(&waiting, 1, milliseconds) == 0)
                return nullptr;
            notification = adopt(CSKavellNotificationObserverCopyNext(m_observer.get()));
        }
        return notification;
    }

    /// The login names of the changes posted so far. What this thread posts arrives in order, so a mark of its own says
    /// when all has arrived that ever will.
    [[nodiscard]] std::vector<std::string> takeLoginNames()
    {
        EXPECT_TRUE(CSKavellNotificationPost(text("mark").get(), nullptr, nullptr));
        std::vector<std::string> names;
        while (const auto notification = next()) {
            if (toStringView(CSKavellNotificationGetName(notification.get())) == "mark")
                return names;
            const auto information = CSKavellNotificationGetUserInformation(notification.get());
            names.push_back(
                toStdString(cast<CSKavellStringRef>(valueOf(information, "LoginName"), CSKavellStringGetTypeID())));
        }
        ADD_FAILURE() << "the mark did not arrive";
        return names;
    }

private:
    Ref<CSKavellNotificationObserverRef> m_observer;
};

using Names = std::vector<std::string>;

/// Starts each test with no accounts.
class StoreTest : public testing::Test {
protected:
    StoreTest() { std::filesystem::remove_all(home() + "/Library"); }

    [[nodiscard]] static std::string home() { return std::getenv("HOME"); }
    [[nodiscard]] static std::string providerDirectory()
    {
        return home() + "/Library/Kavell Accounts/V1/" + std::string(kMail);
    }
    [[nodiscard]] static std::string fileOf(std::string_view loginName) { return dataFilePath(kMail, loginName); }

    /// Names of the directory's entries that begin with a prefix.
    [[nodiscard]] static Names entriesBeginningWith(std::string_view prefix)
    {
        Names found;
        for (const auto &entry : std::filesystem::directory_iterator(providerDirectory())) {
            if (entry.path().filename().string().starts_with(prefix))
                found.push_back(entry.path().filename());
        }
        return found;
    }

    /// All of them but the void redo records, which stay after a save.
    [[nodiscard]] static Names entriesBesideVoidRecords()
    {
        Names names = entriesBeginningWith("");
        std::erase_if(names, [](const std::string &name) {
            return name.starts_with(kRedoRecordPrefix) && isVoidRecordAt(providerDirectory() + "/" + name);
        });
        return names;
    }
};

}  // namespace kavell::test

#endif

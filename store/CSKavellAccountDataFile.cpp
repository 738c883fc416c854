// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The data file of an account: reading it, saving pending changes over what it holds now, deleting it, and announcing
// that. Everything here runs under the record's lock.
//
//     top level of the file    "UUID"             string
//                              "AccountSettings"  dictionary, only when not empty
//                              "Services"         dictionary of dictionaries, only when not empty
//
// One change's way:   commit -> re-read under the semaphore -> fold the pending changes in -> write under the semaphore
//                     -> post. The two holds of the semaphore are separate, by contract: it orders whole reads and
//                     writes, not the step from one to the other.

#include <sys/stat.h>

#include <kavellaccounts/CSKavellAccountConstants.h>
#include <kavellaccounts/CSKavellNotification.h>
#include <kavellaccounts/CSKavellType.h>

#include "platform/file_semaphore.h"
#include "platform/property_list.h"
#include "runtime/string_p.h"
#include "store/CSKavellAccount_p.h"
#include "store/error_message.h"

namespace kavell {

namespace {

constinit ConstantString uuidKey("UUID");
constinit ConstantString accountSettingsKey("AccountSettings");
constinit ConstantString servicesKey("Services");

CSKavellDictionaryRef asDictionary(CSKavellTypeRef value) noexcept
{
    return cast<CSKavellDictionaryRef>(value, CSKavellDictionaryGetTypeID());
}

/// Queries the status of the data file; false, with errno, when it cannot be had. An account whose name cannot be a
/// path has no file to query.
bool queryStatus(const CSKavellAccount &account, struct stat &status) noexcept
{
    errno = EINVAL;
    return account.dataFilePath && stat(account.dataFilePath.get(), &status) == 0;
}

FileTime modificationTime(const struct stat &status) noexcept
{
    return {status.st_mtim.tv_sec, status.st_mtim.tv_nsec};
}

/// Reads the whole file under the semaphore; Failed when the semaphore could not be taken.
FileRead readUnderSemaphore(CSKavellAccount &account, FoundFile found, const struct stat &status,
                            FileContents &contents) noexcept
{
    if (!LockDatafileAccess(account, &status))
        return FileRead::Failed;
    // A pipe or a device would never end; only files hold accounts.
    const FileRead result = S_ISREG(status.st_mode)
                                ? readDataFile(account.dataFilePath.get(), contents, status.st_size, std::move(found))
                                : FileRead::Failed;
    UnlockDatafileAccess(account);
    return result;
}

void updateFromPropertyList(CSKavellAccount &account, CSKavellDictionaryRef propertyList) noexcept
{
    // A value of the wrong type counts as absent.
    if (const auto uuidString =
            cast<CSKavellStringRef>(GetDictValue(propertyList, &uuidKey.header), CSKavellStringGetTypeID()))
        account.uuidString = retain(uuidString);
    // The property list was just made for this, and is let go after it: its dictionaries need no copying.
    TakeAttributes(*account.accountSettings.get(),
                   asDictionary(GetDictValue(propertyList, &accountSettingsKey.header)));
    UpdateServiceAttributes(account, asDictionary(GetDictValue(propertyList, &servicesKey.header)));
}

/// Gives one service its committed side out of the working copy, and takes it out of there.
void UpdateServiceAttributesAux(CSKavellStringRef serviceID, CSKavellAccountSettingsRef settings,
                                CSKavellMutableDictionaryRef working) noexcept
{
    TakeAttributes(*settings, asDictionary(GetDictValue(working, serviceID)));
    CSKavellDictionaryRemoveValue(working, serviceID);
}

void dropServicesWithoutAttributes(CSKavellAccount &account) noexcept
{
    // Identifiers are distinct as they are; to look for each in the list would let a file of very many useless services
    // hold up its reader for half an hour.
    ArraySlot withoutAttributes;
    forEachService(account, [&](CSKavellStringRef serviceID, CSKavellAccountSettingsRef settings) {
        if (CSKavellAccountSettingsHasAttributes(settings))
            return;
        if (!withoutAttributes)
            withoutAttributes = NewMutableArray();
        CSKavellArrayAppendValue(withoutAttributes.get(), serviceID);
    });
    RemoveDictKeys(account.services, withoutAttributes.get());
}

/// Folds the pending changes of one attribute set in, and puts the result into the property list unless it is empty.
void CommitChangesToPropList(CSKavellStringRef key, CSKavellAccountSettingsRef settings,
                             DictionarySlot &target) noexcept
{
    CSKavellAccountSettingsCommitChanges(settings);
    const auto attributes = adopt(CSKavellAccountSettingsCopyAttributes(settings));
    if (CSKavellDictionaryGetCount(attributes.get()) > 0)
        SetDictKey(target, key, attributes.get());
}

/// The account as its file shall hold it; none when it holds nothing.
DictionarySlot makePropertyList(CSKavellAccount &account) noexcept
{
    DictionarySlot propertyList, services;
    if (account.newUUIDString)
        account.uuidString = std::move(account.newUUIDString);
    SetDictKey(propertyList, &uuidKey.header, account.uuidString.get());
    CommitChangesToPropList(&accountSettingsKey.header, account.accountSettings.get(), propertyList);
    forEachService(account, [&](CSKavellStringRef serviceID, CSKavellAccountSettingsRef settings) {
        CommitChangesToPropList(serviceID, settings, services);
    });
    SetDictKey(propertyList, &servicesKey.header, services.get());
    return propertyList;
}

void NotifySendMsg(const CSKavellAccount &account) noexcept
{
    DictionarySlot userInformation;
    SetDictKey(userInformation, kCSKavellAccountProviderName, account.providerType.get());
    SetDictKey(userInformation, kCSKavellAccountUserLoginName, account.loginName.get());
    CSKavellNotificationPost(kCSKavellAccountNotificationSender, kCSKavellAccountProviderSettingsChangedNotification,
                             userInformation.get());
}

void deleteDataFile(const CSKavellAccount &account) noexcept
{
    if (removeDataFile(account.dataFilePath.get()))
        NotifySendMsg(account);
}

/// Writes the file under the semaphore, where its directory is on the disk. When the semaphore cannot be taken nothing is
/// written and nothing more is said.
void writeUnderSemaphore(CSKavellAccount &account, std::string_view contents, bool hasDirectory) noexcept
{
    struct stat status;
    const bool isNeeded = account.semaphoreID == 0;
    if (!LockDatafileAccess(account, isNeeded && queryStatus(account, status) ? &status : nullptr))
        return;
    // The time is taken while nobody else can write: records of one account may hold different semaphores.
    if (hasDirectory && writeDataFile(account.dataFilePath.get(), contents, isPropertyList, &account.dataFileModTime)) {
        account.hasChanges = false;
    } else {
        writeError("Error: failed to save Kavell Settings datafile\n");
    }
    UnlockDatafileAccess(account);
}

void saveDataFile(CSKavellAccount &account, CSKavellDictionaryRef propertyList) noexcept
{
    struct stat status;
    bool hasDirectory = true;
    if (account.dataFilePath && !queryStatus(account, status))
        hasDirectory = createDirectoriesAbove(account.dataFilePath.get());
    std::string contents;
    if (writePropertyList(propertyList, contents))
        writeUnderSemaphore(account, contents, hasDirectory);
    else
        writeError("Error: unable to create XML property list for Kavell Accounts settings - save failed\n");
    // Announced after every attempt, also one that failed: observers reload, and find what there is.
    NotifySendMsg(account);
}

}  // namespace

bool ReadAccountData(CSKavellAccount &account, FoundFile found) noexcept
{
    struct stat status;
    const bool isKnown = found.file ? fstat(found.file.get(), &status) == 0 : queryStatus(account, status);
    if (!isKnown) {
        const bool isMissing = errno == ENOENT;
        // The number is the call's result, not the system's error; programs compare the line as it is.
        if (!isMissing)
            writeError("Error %d: failed to stat kavell account datafile\n", -1);
        CSKavellAccountSettingsUpdateAttributes(account.accountSettings.get(), nullptr);
        UpdateServiceAttributes(account, nullptr);
        return isMissing;
    }
    // Only what this record has just written itself is known without reading.
    if (modificationTime(status) == account.dataFileModTime)
        return true;
    FileContents contents;
    const DataDirectory *const directory = found.directory;
    const FileRead result = readUnderSemaphore(account, std::move(found), status, contents);
    if (result == FileRead::Failed)
        return true;
    const auto propertyList = result == FileRead::Done ? parsePropertyList(contents.view()) : nullptr;
    if (!propertyList) {
        // It may have been torn since the listing, by a program that left a record of what it is to be. Whoever listed the
        // directory reads all anew then, and has it said if it is still so.
        if (directory && !directory->isAsListed())
            return false;
        writeError("Error: failed to load Kavell Accounts settings\n");
        return false;
    }
    updateFromPropertyList(account, propertyList.get());
    return true;
}

void UpdateServiceAttributes(CSKavellAccount &account, CSKavellDictionaryRef fileServices) noexcept
{
    // A record that knows no service yet takes nothing out of the working copy, and needs none.
    const bool knowsServices = CSKavellDictionaryGetCount(account.services.get()) > 0;
    const DictionarySlot working = knowsServices ? adopt(CSKavellDictionaryCreateMutableCopy(fileServices)) : nullptr;
    forEachService(account, [&](CSKavellStringRef serviceID, CSKavellAccountSettingsRef settings) {
        UpdateServiceAttributesAux(serviceID, settings, working.get());
    });
    if (const CSKavellDictionaryRef added = knowsServices ? working.get() : fileServices) {
        added->forEach([&](CSKavellTypeRef serviceID, CSKavellTypeRef attributes) {
            const auto settings = adopt(CSKavellAccountSettingsCreate(nullptr));
            if (!settings)
                return;
            TakeAttributes(*settings.get(), asDictionary(attributes));
            SetDictKey(account.services, serviceID, settings.get());
        });
    }
    dropServicesWithoutAttributes(account);
}

bool LockDatafileAccess(CSKavellAccount &account, const struct stat *status) noexcept
{
    if (account.semaphoreID == 0) {
        const auto semaphoreID = obtainFileSemaphore(status);
        if (!semaphoreID) {
            writeError("Error: unable to initialize Kavell Accounts data semaphore\n");
            return false;
        }
        account.semaphoreID = *semaphoreID;
    }
    return account.semaphoreID != 0 && takeFileSemaphore(account.semaphoreID);
}

void UnlockDatafileAccess(CSKavellAccount &account) noexcept
{
    // Programs compare this line too; it ends without a line feed.
    if (account.semaphoreID != 0 && !giveFileSemaphore(account.semaphoreID))
        writeError("Error %d: failed to release Kavell Accounts data lock", errno);
}

void commitAccount(CSKavellAccount &account) noexcept
{
    if (account.pendingRemove) {
        deleteDataFile(account);
        account.pendingRemove = false;
        return;
    }
    if (!account.hasChanges)
        return;
    ReadAccountData(account);
    const DictionarySlot propertyList = makePropertyList(account);
    if (!propertyList)
        deleteDataFile(account);
    else
        saveDataFile(account, propertyList.get());
}

}  // namespace kavell

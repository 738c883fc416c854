// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The structure of an account record, and the operations on it that its source files share. All expect the record's
// lock to be held by the caller unless they say otherwise.

#ifndef KAVELL_STORE_CSKAVELLACCOUNT_P_H
#define KAVELL_STORE_CSKAVELLACCOUNT_P_H

#include <cstdlib>
#include <memory>
#include <string>
#include <sys/stat.h>

#include <kavellaccounts/CSKavellAccount.h>
#include <kavellaccounts/Ref.h>

#include "platform/data_file.h"
#include "runtime/dictionary_p.h"
#include "runtime/object_p.h"
#include "store/CSKavellAccountSettings_p.h"
#include "store/collection_helpers.h"
#include "store/record_lock.h"

namespace kavell {

/// Frees what malloc gave.
struct FreeDeleter {
    void operator()(void *memory) const noexcept { std::free(memory); }
};

using OwnedCString = std::unique_ptr<char, FreeDeleter>;

}  // namespace kavell

struct CSKavellAccount : kavell::Object {
    /// Both are fixed at creation and may be read without the lock.
    kavell::Ref<CSKavellStringRef> providerType{};
    kavell::Ref<CSKavellStringRef> loginName{};
    /// The committed UUID, and the one that the next commit makes committed.
    kavell::Ref<CSKavellStringRef> uuidString{};
    kavell::Ref<CSKavellStringRef> newUUIDString{};
    kavell::Ref<CSKavellAccountSettingsRef> accountSettings{};
    /// Service identifier to CSKavellAccountSettings.
    kavell::DictionarySlot services{};
    kavell::RecordLock lock{};
    /// The data file's semaphore set; 0 until it is first needed, then kept for the record's life.
    int32_t semaphoreID = 0;
    kavell::OwnedCString dataFilePath{};
    /// When this record last saved the file; never set by a read.
    kavell::FileTime dataFileModTime{};
    bool hasChanges = false;
    bool pendingRemove = false;
};

namespace kavell {

/// Calls `body(service identifier, settings)` for each service of the account.
template <typename Body> void forEachService(const CSKavellAccount &account, Body &&body)
{
    if (!account.services)
        return;
    account.services->forEach([&](CSKavellTypeRef serviceID, CSKavellTypeRef settings) {
        body(static_cast<CSKavellStringRef>(serviceID),
             const_cast<CSKavellAccountSettingsRef>(static_cast<const CSKavellAccountSettings *>(settings)));
    });
}

/// The string as NUL-terminated UTF-8; none for none and for text that holds a NUL itself.
[[nodiscard]] OwnedCString CreateUTF8CString(CSKavellStringRef string) noexcept;

/// The absolute path of the directory that holds all accounts, without a closing "/".
[[nodiscard]] std::string dataRootPath();

/// The absolute path of the directory that holds the accounts of a provider, without a closing "/".
[[nodiscard]] std::string providerDirectoryPath(CSKavellStringRef providerType);

/// _CSKavellAccountCreate for an account whose data file was found in a listing of its directory, with that directory's
/// path; both empty for any other.
[[nodiscard]] CSKavellAccountRef createFoundAccount(FoundFile found, std::string_view directory,
                                                    const CSKavellAllocator *allocator, CSKavellStringRef providerType,
                                                    CSKavellStringRef loginName) noexcept;

/// Brings the committed side up to what the data file says. False on a real error, after its message.
bool ReadAccountData(CSKavellAccount &account, FoundFile found = {}) noexcept;

/// Replaces the committed side of every service by what the file's "Services" dictionary (may be none) says, taking its
/// dictionaries over.
void UpdateServiceAttributes(CSKavellAccount &account, CSKavellDictionaryRef fileServices) noexcept;

/// Takes the semaphore of the data file, waiting for as long as it takes; false when it cannot be taken. The status is the
/// file's, from just before, or null when there is no file; it is looked at only when the record has no semaphore yet.
[[nodiscard]] bool LockDatafileAccess(CSKavellAccount &account, const struct stat *status) noexcept;

/// Gives the semaphore back.
void UnlockDatafileAccess(CSKavellAccount &account) noexcept;

/// Saves the pending changes or deletes the data file.
void commitAccount(CSKavellAccount &account) noexcept;

}  // namespace kavell

#endif

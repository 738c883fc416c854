// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A data file of any bytes, read into an account's record: what is a property list of the right types is in the record,
// and nothing else is; and a change saved over it leaves everything else of it in the file.

#include <fstream>

#include <kavellaccounts/KavellStore.h>
#include <kavellaccounts/Ref.h>

#include "platform/property_list.h"
#include "tests/fuzz/fuzz_target.h"

using namespace kavell;
using kavell::fuzz::require;

namespace {

using Account = Ref<CSKavellAccountRef>;
using Dictionary = Ref<CSKavellDictionaryRef>;

/// A home with the directory of one provider, and no session bus to announce changes on.
class Home {
public:
    Home()
    {
        setenv("HOME", m_directory.path().c_str(), 1);
        setenv("XDG_RUNTIME_DIR", m_directory.path().c_str(), 1);
        unsetenv("DBUS_SESSION_BUS_ADDRESS");
        std::filesystem::create_directories(m_file.parent_path());
    }

    /// The file keeps its inode, which its semaphore is found by, and loses what earlier inputs left beside it: of a
    /// hundred damaged ones a second there are copies, and more are not replaced.
    void setDataFile(std::string_view bytes) const
    {
        for (const auto &entry : std::filesystem::directory_iterator(m_file.parent_path())) {
            if (entry.path() != m_file)
                std::filesystem::remove(entry.path());
        }
        std::ofstream(m_file, std::ios::binary) << bytes;
    }

    [[nodiscard]] static Account openAccount()
    {
        auto account = adopt(_CSKavellAccountCreate(nullptr, kCSKavellAccountProviderTest, makeString("ada").get()));
        require(account.get() != nullptr, "an account can be had whatever its file is");
        return account;
    }

private:
    const fuzz::ScratchDirectory m_directory;
    const std::filesystem::path m_file =
        m_directory.path() + "/Library/Kavell Accounts/V1/com.corvane.account.testing/ada.plist";
};

/// A member of a dictionary, when it is a dictionary as well.
CSKavellDictionaryRef dictionaryIn(CSKavellDictionaryRef dictionary, CSKavellStringRef key)
{
    return dictionary
               ? cast<CSKavellDictionaryRef>(CSKavellDictionaryGetValue(dictionary, key), CSKavellDictionaryGetTypeID())
               : nullptr;
}

/// The attributes of a service, or of the account itself for none, are what the file has for it.
void checkAttributes(const Account &account, CSKavellStringRef service, CSKavellDictionaryRef inFile)
{
    const Dictionary attributes = adopt(_CSKavellAccountCopyServiceAttributes(account.get(), service));
    if (CSKavellDictionaryGetCount(inFile) == 0)
        require(CSKavellDictionaryGetCount(attributes.get()) == 0, "what the file does not have is not there");
    else
        require(CSKavellEqual(attributes.get(), inFile), "attributes are what the file has");
}

void checkRecord(const Account &account, CSKavellDictionaryRef file)
{
    checkAttributes(account, nullptr, dictionaryIn(file, makeString("AccountSettings").get()));
    const CSKavellDictionaryRef services = dictionaryIn(file, makeString("Services").get());
    const auto identifiers = adopt(_CSKavellAccountCopyServiceIDs(account.get()));
    for (size_t index = 0; index < CSKavellArrayGetCount(identifiers.get()); ++index) {
        const auto identifier = static_cast<CSKavellStringRef>(CSKavellArrayGetValueAtIndex(identifiers.get(), index));
        require(CSKavellDictionaryGetCount(dictionaryIn(services, identifier)) > 0, "a service has attributes");
        checkAttributes(account, identifier, dictionaryIn(services, identifier));
    }
}

/// One more attribute of the account itself, saved.
void change(const Account &account)
{
    _CSKavellAccountSetServiceAttribute(account.get(), nullptr, makeString("changed").get(), makeString("yes").get());
    _CSKavellAccountCommitChanges(account.get());
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    static const Home home;
    const std::string_view bytes = fuzz::textOf(data, size);
    home.setDataFile(bytes);
    const auto file = parsePropertyList(bytes);
    const Account account = Home::openAccount();
    checkRecord(account, file.get());

    change(account);
    require(!_CSKavellAccountHasPendingChanges(account.get()), "what was read can be saved");
    const Dictionary all = adopt(_CSKavellAccountCopyServiceAttributes(account.get(), nullptr));
    const Account reread = Home::openAccount();
    checkAttributes(reread, nullptr, all.get());
    const auto serviceIDs = adopt(_CSKavellAccountCopyServiceIDs(account.get()));
    require(CSKavellEqual(serviceIDs.get(), adopt(_CSKavellAccountCopyServiceIDs(reread.get())).get()),
            "a change keeps the services");
    for (size_t index = 0; index < CSKavellArrayGetCount(serviceIDs.get()); ++index) {
        const auto service = static_cast<CSKavellStringRef>(CSKavellArrayGetValueAtIndex(serviceIDs.get(), index));
        checkAttributes(reread, service, adopt(_CSKavellAccountCopyServiceAttributes(account.get(), service)).get());
    }
    require(CSKavellEqual(adopt(_CSKavellAccountCopyUUIDString(account.get())).get(),
                          adopt(_CSKavellAccountCopyUUIDString(reread.get())).get()),
            "a change keeps the UUID");
    return 0;
}

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/NBSShim.h>

#include <atomic>
#include <dlfcn.h>

#include "model/configuration.h"

namespace {

/// A function of the library, looked up once. Threads that make the first call together each look it up and store the
/// same address.
template <typename Result, typename... Arguments> class ShimmedFunction {
public:
    explicit constexpr ShimmedFunction(const char *symbol) : m_symbol(symbol) {}

    /// Calls it, or answers nothing without the library.
    Result operator()(Arguments... arguments)
    {
        void *const library = NBSAccountsFramework();
        if (!library)
            return Result();
        Function function = m_function.load(std::memory_order_relaxed);
        if (!function) {
            function = reinterpret_cast<Function>(dlsym(library, m_symbol));  // deliberately taken to be there
            m_function.store(function, std::memory_order_relaxed);
        }
        return function(arguments...);
    }

private:
    using Function = Result (*)(Arguments...);
    const char *m_symbol;
    std::atomic<Function> m_function = nullptr;
};

std::atomic<void *> cachedLibrary = nullptr;

constinit ShimmedFunction<CSKavellTypeRef, CSKavellStringRef, CSKavellStringRef, CSKavellStringRef>
    serviceCopyProperty("NBServiceCopyProperty");
constinit ShimmedFunction<CSKavellTypeRef, CSKavellStringRef, CSKavellStringRef>
    accountCopyProperty("NBAccountCopyProperty");
constinit ShimmedFunction<void, CSKavellStringRef, CSKavellStringRef, bool> serviceSetEnabled("NBServiceSetEnabled");
constinit ShimmedFunction<bool, CSKavellStringRef, CSKavellStringRef> serviceIsEnabled("NBServiceIsEnabled");
constinit ShimmedFunction<CSKavellStringRef, CSKavellStringRef>
    copyAccountIDFromMailAlias("NBCopyAccountIDFromMailAlias");
constinit ShimmedFunction<CSKavellTypeRef, CSKavellStringRef> copyAccountType("NBCopyAccountType");
constinit ShimmedFunction<void, CSKavellStringRef> accountRefreshLoggedIn("NBAccountRefreshLoggedIn");
constinit ShimmedFunction<bool, CSKavellStringRef> accountIsLoggedIn("NBAccountIsLoggedIn");
constinit ShimmedFunction<bool, CSKavellStringRef, CSKavellStringRef> accountLogin("NBAccountLogin");

}  // namespace

void *NBSAccountsFramework(void)
{
    void *library = cachedLibrary.load(std::memory_order_acquire);
    if (!library) {
        library = dlopen(kavell::configuration::kOnlineServiceLibraryPath, RTLD_LAZY);
        cachedLibrary.store(library, std::memory_order_release);
    }
    return library;
}

CSKavellTypeRef NBSShimServiceCopyProperty(CSKavellStringRef account, CSKavellStringRef service,
                                           CSKavellStringRef property)
{
    return serviceCopyProperty(account, service, property);
}

CSKavellTypeRef NBSShimAccountCopyProperty(CSKavellStringRef account, CSKavellStringRef property)
{
    return accountCopyProperty(account, property);
}

void NBSShimServiceSetEnabled(CSKavellStringRef account, CSKavellStringRef service, bool enabled)
{
    serviceSetEnabled(account, service, enabled);
}

bool NBSShimServiceIsEnabled(CSKavellStringRef account, CSKavellStringRef service)
{
    return serviceIsEnabled(account, service);
}

CSKavellStringRef NBSShimCopyAccountIDFromMailAlias(CSKavellStringRef mailAlias)
{
    return copyAccountIDFromMailAlias(mailAlias);
}

CSKavellTypeRef NBSShimCopyAccountType(CSKavellStringRef account)
{
    return copyAccountType(account);
}

void NBSShimAccountRefreshLoggedIn(CSKavellStringRef account)
{
    accountRefreshLoggedIn(account);
}

bool NBSShimAccountIsLoggedIn(CSKavellStringRef account)
{
    return accountIsLoggedIn(account);
}

bool NBSShimAccountLogin(CSKavellStringRef account, CSKavellStringRef password)
{
    return accountLogin(account, password);
}

CSKavellStringRef NBSShimGetStringConst(const char *name)
{
    void *const library = NBSAccountsFramework();
    if (!library || !name)
        return nullptr;
    const auto *constant = static_cast<const CSKavellStringRef *>(dlsym(library, name));
    return constant ? *constant : nullptr;
}

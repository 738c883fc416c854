// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Looking into the tests' own online service (tests/support/online_service.cpp). One thread at a time.

#ifndef KAVELL_TESTS_SETUP_ONLINE_SERVICE_CALLS_H
#define KAVELL_TESTS_SETUP_ONLINE_SERVICE_CALLS_H

#include <dlfcn.h>
#include <stdexcept>
#include <string>
#include <utility>

#include <QtCore/QStringList>

#include <kavellaccounts/NBSShim.h>

namespace kavell::test {

/// A variable of the service.
template <typename Type> Type &onlineServiceVariable(const char *name)
{
    void *const found = NBSAccountsFramework() ? dlsym(NBSAccountsFramework(), name) : nullptr;
    if (!found)
        throw std::runtime_error(std::string("the online service has no ") + name);
    return *static_cast<Type *>(found);
}

/// The calls since this was last asked, one a line: "isEnabled NAME SERVICE".
inline QStringList takeOnlineServiceCalls()
{
    const std::string calls = std::exchange(onlineServiceVariable<std::string>("testCalls"), {});
    return QString::fromStdString(calls).split(u'\n', Qt::SkipEmptyParts);
}

/// While it lives, the service has no constant of this name.
class WithoutConstant {
public:
    explicit WithoutConstant(const char *name)
        : m_variable(onlineServiceVariable<CSKavellStringRef>(name)), m_value(std::exchange(m_variable, nullptr))
    {
    }
    ~WithoutConstant() { m_variable = m_value; }
    WithoutConstant(const WithoutConstant &) = delete;
    WithoutConstant &operator=(const WithoutConstant &) = delete;

private:
    CSKavellStringRef &m_variable;
    const CSKavellStringRef m_value;
};

}  // namespace kavell::test

#endif

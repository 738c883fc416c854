// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Thrown by a plug-in base class when a method that a subclass must implement is called and was not implemented. The
// library never catches it on the way to the caller.

#ifndef KAVELLACCOUNTS_KAREQUIREDMETHODEXCEPTION_H
#define KAVELLACCOUNTS_KAREQUIREDMETHODEXCEPTION_H

#include <stdexcept>

#include <QtCore/QString>

#include <kavellaccounts/KAExport.h>

class KAVELL_ACCOUNTS_EXPORT KARequiredMethodException : public std::logic_error {
public:
    /// `method` is the full name, with the class that declares it: "-[KADataPlugin accountUIDs]".
    explicit KARequiredMethodException(const char *method);
    ~KARequiredMethodException() override;

    /// "KavellAccountsRequiredMethod".
    [[nodiscard]] QString name() const;

    /// "Subclassers must implement this method (METHOD)"; the same text as what().
    [[nodiscard]] QString reason() const;
};

#endif

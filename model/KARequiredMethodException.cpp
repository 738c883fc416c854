// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/KARequiredMethodException.h>

#include <string>

KARequiredMethodException::KARequiredMethodException(const char *method)
    : std::logic_error(std::string("Subclassers must implement this method (").append(method).append(")"))
{
}

KARequiredMethodException::~KARequiredMethodException() = default;

QString KARequiredMethodException::name() const
{
    return QStringLiteral("KavellAccountsRequiredMethod");
}

QString KARequiredMethodException::reason() const
{
    return QString::fromUtf8(what());
}

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// How the mail-host lookup reads one answer. Any thread.

#ifndef KAVELL_PLUGINS_KADNSSERVICE_P_H
#define KAVELL_PLUGINS_KADNSSERVICE_P_H

#include <string_view>

#include <QtCore/QString>

/// The exchanger's host name in lower case from the data of an MX record: a 16-bit preference, then the name in wire
/// form, of which 256 bytes are looked at. Null when there is no data, the name is none, or it is no valid UTF-8.
[[nodiscard]] QString KADNSServiceHostOfMailExchanger(std::string_view data);

#endif

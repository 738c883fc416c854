// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Domain names from their wire form, labels with a length byte each, to text. Any thread.

#ifndef KAVELL_PLUGINS_KADNSSERVICENAMES_P_H
#define KAVELL_PLUGINS_KADNSSERVICENAMES_P_H

#include <array>
#include <cstddef>
#include <cstdint>

/// Room for the wire form of a name, and for its text with the closing NUL.
constexpr size_t kKADNSServiceNameSize = 256;
using KADNSServiceWireName = std::array<uint8_t, kKADNSServiceNameSize>;
using KADNSServiceNameText = std::array<char, kKADNSServiceNameSize>;

/// Appends the text of one label at `text`, which has room up to `end`: a dot and the escape character with the escape
/// character before them, bytes below 33 as the escape character and three decimal digits, all others as they are.
/// Without an escape character (0) nothing is escaped. Answers where the text ends; null for a length above 63 or for
/// want of room.
[[nodiscard]] char *_KADNSServiceConvertDomainLabelToCString_withescape(const uint8_t *label, char *text,
                                                                        const char *end, char escape);

/// The text of a name, each label with a dot after it and "." for the root, with a closing NUL. Answers where the text
/// ends; null when a label is too long, the name reaches past its 256 bytes or the text does not fit.
[[nodiscard]] char *_KADNSServiceConvertDomainNameToCString_withescape(const KADNSServiceWireName &name,
                                                                       KADNSServiceNameText &text, char escape);

#endif

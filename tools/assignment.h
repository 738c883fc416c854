// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// KEY=VALUE and KEY:TYPE=VALUE as written on the command line:
//
//     server=imap.example.org            a string (the same as server:string=…)
//     port:int=993                       an integer of 64 bits
//     weight:real=1.5                    a real
//     enabled:bool=true                  a boolean: true, false, yes, no, on, off
//     since:date=2026-01-31T10:00:00Z    a date
//     picture:data=@photo.jpg            bytes, from a file or in base64
//     folders:json=["Inbox","Sent"]      anything, as JSON (see json_value.h), also from a @file
//
// Used by add, set and show. One thread.

#ifndef KAVELL_TOOLS_ASSIGNMENT_H
#define KAVELL_TOOLS_ASSIGNMENT_H

#include <string>
#include <string_view>

#include <kavellaccounts/CSKavellBase.h>
#include <kavellaccounts/Ref.h>

namespace kavell::tools {

struct Assignment {
    std::string key;  ///< the full attribute key
    Ref<CSKavellTypeRef> value;
};

/// The key and value that a word means; refuses a word that is none.
[[nodiscard]] Assignment parseAssignment(std::string_view word);

/// The full attribute key of a word; refuses one that cannot be a key, and the password's reference.
[[nodiscard]] std::string parseKey(std::string_view word);

/// The word that would set the key to the value, for people to read: long data is only counted.
[[nodiscard]] std::string assignmentText(std::string_view key, CSKavellTypeRef value);

}  // namespace kavell::tools

#endif

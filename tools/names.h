// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The words of the command line and what they stand for: provider types, services, attribute keys; and which names may
// become parts of a path. Used by every command. Any thread may call.

#ifndef KAVELL_TOOLS_NAMES_H
#define KAVELL_TOOLS_NAMES_H

#include <span>
#include <string>
#include <string_view>

namespace kavell::tools {

/// A short word and the value that it stands for.
struct ShortName {
    std::string_view word;
    std::string_view value;
};

/// The tables, in the order in which help and completion show them.
[[nodiscard]] std::span<const ShortName> providerTypes();
[[nodiscard]] std::span<const ShortName> services();
[[nodiscard]] std::span<const ShortName> attributeKeys();

/// The provider type of a short word (in any case) or of a full reverse-DNS name; refuses anything else, naming the
/// nearest known word.
[[nodiscard]] std::string providerTypeOf(std::string_view word);

/// The service identifier, in the same way.
[[nodiscard]] std::string serviceOf(std::string_view word);

/// The attribute key of a short word, exactly as it is spelt; any other key is taken as it stands.
[[nodiscard]] std::string attributeKeyOf(std::string_view word);

/// The short word of a value, or the value itself when it has none.
[[nodiscard]] std::string_view shortProviderType(std::string_view value);
[[nodiscard]] std::string_view shortService(std::string_view value);
[[nodiscard]] std::string_view shortAttributeKey(std::string_view value);

/// Refuses a provider type or login name that must not become part of a path: empty, "." or "..", with a "/" or a
/// control character, not UTF-8, or of more than 249 bytes (with ".plist" a file name then has 255). `what` names the
/// thing in the sentence ("login name").
void checkName(std::string_view name, std::string_view what);

/// Why checkName would refuse the name, as the end of a sentence; empty when it would not.
[[nodiscard]] std::string nameProblem(std::string_view name);

/// The candidate nearest to a mistyped word, or an empty view when none is near.
[[nodiscard]] std::string_view nearestWord(std::string_view word, std::span<const std::string_view> candidates);

/// The attribute under which the store keeps the reference to the password; the password commands alone change it.
inline constexpr std::string_view passwordReferenceKey = "com.corvane.account.CofferelToken";

}  // namespace kavell::tools

#endif

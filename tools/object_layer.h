// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The object layer as the client reaches it: a module of its own, loaded by the commands that need plug-ins, so that all
// other commands start without the toolkit. Question and answer are JSON objects. One thread.

#ifndef KAVELL_TOOLS_OBJECT_LAYER_H
#define KAVELL_TOOLS_OBJECT_LAYER_H

#include <string_view>

#include "tools/json_value.h"

namespace kavell::tools {

/// The module's entry: answers the text of a question with a text that the caller frees with free().
using ObjectLayerEntry = char *(const char *question);
inline constexpr char objectLayerEntry[] = "kavellAccountsAnswer";

/// The answer to a question of the given name ("plugins", "identify", "match", "children", "servers"), with further
/// members as that question needs them (tools/qt/answers.cpp). Plug-ins are loaded, and DNS look-ups made, as the question
/// needs. Fails when the object layer is not installed, or when it could not answer, with its sentence.
[[nodiscard]] Json askObjectLayer(std::string_view question, Json members = Json::object());

}  // namespace kavell::tools

#endif

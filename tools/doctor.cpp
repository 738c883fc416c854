// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/doctor.h"

#include <utility>

namespace kavell::tools {

void Findings::problem(std::string kind, std::string path, std::string sentence)
{
    all.push_back({std::move(kind), Weight::Problem, std::move(path), std::move(sentence), false, false});
}

void Findings::note(std::string kind, std::string path, std::string sentence)
{
    all.push_back({std::move(kind), Weight::Note, std::move(path), std::move(sentence), false, false});
}

void Findings::mendable(std::string kind, std::string path, const std::string &sentence,
                        const std::function<bool()> &mend)
{
    const bool mended = repair && mend();
    all.push_back({std::move(kind), Weight::Problem, std::move(path),
                   sentence + (repair && !mended ? "; it could not be mended" : ""), !repair, mended});
}

}  // namespace kavell::tools

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A process of its own for each user's language, which the toolkit reads only once. Prints, a line each,
//
//     language_probe strings DIRECTORY KEY…     the texts of the table "Table", or "(none)"
//     language_probe names PATH…                what the applications at the paths are called, or "(none)"

#include <cstdio>
#include <string_view>

#include "platform/qt/string_table.h"
#include "platform/qt/workspace.h"

namespace {

void print(const QString &text)
{
    std::puts(text.isNull() ? "(none)" : text.toUtf8().constData());
}

}  // namespace

int main(int argc, char *argv[])
{
    if (argc < 3)
        return 1;
    if (argv[1] == std::string_view("names")) {
        for (int index = 2; index < argc; ++index)
            print(kavell::displayNameAtPath(QString::fromUtf8(argv[index])));
        return 0;
    }
    const kavell::StringTable table(QString::fromUtf8(argv[2]), QStringLiteral("Table"));
    for (int index = 3; index < argc; ++index)
        print(table.textForKey(QString::fromUtf8(argv[index])));
    return 0;
}

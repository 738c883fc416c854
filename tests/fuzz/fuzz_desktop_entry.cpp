// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A desktop entry of any bytes: it is one when it has the group of that name, and says what the last line of a key in that
// group says; lines of other groups say nothing.

#include "platform/qt/desktop_entry.h"
#include "tests/fuzz/fuzz_target.h"

using kavell::fuzz::require;

namespace {

std::optional<kavell::DesktopEntry> read(std::string_view text)
{
    const kavell::fuzz::MemoryFile file(text);
    return kavell::readDesktopEntry(QString::fromStdString(file.path()));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    setenv("LANGUAGE", "de_AT:en", 1);
    const std::string text(kavell::fuzz::textOf(data, size));
    const auto entry = read(text);
    require(!entry || text.find("[Desktop Entry]") != std::string::npos, "an entry has a group");
    require(!entry || entry->name.isNull() || text.find("Name") != std::string::npos, "a name is written down");

    const auto other = read(text + "\n[Other]\nName=other\nIcon=other\nHidden=other\nName[de]=other\n");
    require(other.has_value() == entry.has_value(), "other groups make no entry");
    if (entry)
        require(other->name == entry->name && other->localizedName == entry->localizedName &&
                    other->icon == entry->icon && other->hidden == entry->hidden,
                "other groups say nothing");

    const auto last = read(text + "\n[Desktop Entry]\nName=a\\sb\nName[de]=c\nIcon=d\nHidden=true\nName[de_AT]=e\n");
    require(last && last->name == QLatin1String("a b") && last->localizedName == QLatin1String("e") &&
                last->icon == QLatin1String("d") && last->hidden,
            "the last line of a key counts");
    return 0;
}

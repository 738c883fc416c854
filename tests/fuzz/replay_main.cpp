// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Runs a fuzz target over the files of a directory, for builds without libFuzzer. Says which file it is at, so that the last
// one named is the one that failed. Fails when there are none.

#include <fstream>
#include <iterator>

#include "tests/fuzz/fuzz_target.h"

int main(int argumentCount, char **arguments)
{
    int count = 0;
    for (int index = 1; index < argumentCount; ++index) {
        for (const auto &entry : std::filesystem::directory_iterator(arguments[index])) {
            std::puts(entry.path().c_str());
            std::fflush(stdout);
            std::ifstream file(entry.path(), std::ios::binary);
            const std::string bytes((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
            LLVMFuzzerTestOneInput(reinterpret_cast<const uint8_t *>(bytes.data()), bytes.size());
            ++count;
        }
    }
    std::printf("%d inputs replayed\n", count);
    return count > 0 ? 0 : 1;
}

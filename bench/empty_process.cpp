// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The least that a C++ process costs. With an argument it prints its resident memory in KiB.

#include <cstdlib>
#include <fstream>
#include <iostream>
#include <string>

int main(int argumentCount, char **)
{
    if (argumentCount < 2)
        return 0;
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.starts_with("VmRSS:"))
            std::cout << std::atoi(line.c_str() + 6) << "\n";
    }
    return 0;
}

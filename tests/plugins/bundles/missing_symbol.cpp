// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

// Code that the dynamic loader refuses.

extern "C" int kavellTestSymbolThatNobodyDefines();

extern "C" __attribute__((visibility("default"))) int kavellTestCaller()
{
    return kavellTestSymbolThatNobodyDefines();
}

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Catches what the code under test writes to standard error, so that messages can be compared to the byte.
//
//     StandardErrorCapture capture;
//     … code that complains …
//     EXPECT_EQ(capture.take(), "Error: …\n");
//
// One capture at a time; it redirects descriptor 2 of the whole process.

#ifndef KAVELL_TESTS_SUPPORT_STANDARD_ERROR_CAPTURE_H
#define KAVELL_TESTS_SUPPORT_STANDARD_ERROR_CAPTURE_H

#include <string>

namespace kavell::test {

class StandardErrorCapture {
public:
    StandardErrorCapture();
    ~StandardErrorCapture();
    StandardErrorCapture(const StandardErrorCapture &) = delete;
    StandardErrorCapture &operator=(const StandardErrorCapture &) = delete;

    /// What was written since the start or the last take.
    [[nodiscard]] std::string take();

private:
    int m_saved = -1;
    int m_file = -1;
};

}  // namespace kavell::test

#endif

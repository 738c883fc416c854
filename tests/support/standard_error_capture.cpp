// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/support/standard_error_capture.h"

#include <cstdio>
#include <cstdlib>
#include <sys/mman.h>
#include <unistd.h>

namespace kavell::test {

StandardErrorCapture::StandardErrorCapture()
{
    std::fflush(stderr);
    m_file = memfd_create("standard-error", MFD_CLOEXEC);
    m_saved = dup(STDERR_FILENO);
    if (m_file < 0 || m_saved < 0 || dup2(m_file, STDERR_FILENO) < 0)
        std::abort();
}

StandardErrorCapture::~StandardErrorCapture()
{
    std::fflush(stderr);
    dup2(m_saved, STDERR_FILENO);
    close(m_saved);
    close(m_file);
}

std::string StandardErrorCapture::take()
{
    std::fflush(stderr);
    std::string text;
    char buffer[4096];
    lseek(m_file, 0, SEEK_SET);
    for (ssize_t count; (count = read(m_file, buffer, sizeof buffer)) > 0;)
        text.append(buffer, static_cast<size_t>(count));
    if (ftruncate(m_file, 0) != 0)
        std::abort();
    lseek(m_file, 0, SEEK_SET);
    return text;
}

}  // namespace kavell::test

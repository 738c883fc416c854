// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// What the fuzz targets share: the input as text, a sentence for each property that must hold, and places for parsers
// that read files. One thread, as libFuzzer and the replay call their target.

#ifndef KAVELL_TESTS_FUZZ_FUZZ_TARGET_H
#define KAVELL_TESTS_FUZZ_FUZZ_TARGET_H

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <string_view>
#include <sys/mman.h>
#include <unistd.h>

/// Called for each input; always answers 0.
extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size);

namespace kavell::fuzz {

/// Ends the program, and so reports the input, when a property does not hold.
inline void require(bool holds, const char *property)
{
    if (holds)
        return;
    std::fprintf(stderr, "does not hold: %s\n", property);
    std::abort();
}

inline std::string_view textOf(const uint8_t *data, size_t size)
{
    return size ? std::string_view(reinterpret_cast<const char *>(data), size) : std::string_view("");
}

/// Takes the text up to the next line feed, which goes with it, or all of the text where there is none.
inline std::string_view takeLine(std::string_view &text)
{
    const std::string_view line = text.substr(0, text.find('\n'));
    text.remove_prefix(line.size() < text.size() ? line.size() + 1 : line.size());
    return line;
}

/// A directory of the program's own, gone when it ends well.
class ScratchDirectory {
public:
    ScratchDirectory()
    {
        const char *const parent = std::getenv("TMPDIR");
        m_path = std::string(parent ? parent : "/tmp") + "/kavell-fuzz-XXXXXX";
        require(mkdtemp(m_path.data()) != nullptr, "a scratch directory can be made");
    }
    ~ScratchDirectory()
    {
        std::error_code error;
        std::filesystem::remove_all(m_path, error);
    }
    ScratchDirectory(const ScratchDirectory &) = delete;
    ScratchDirectory &operator=(const ScratchDirectory &) = delete;

    [[nodiscard]] const std::string &path() const { return m_path; }

private:
    std::string m_path;
};

/// A regular file without a place on any disk, for parsers that want a path.
class MemoryFile {
public:
    explicit MemoryFile(std::string_view contents) : m_descriptor(memfd_create("input", MFD_CLOEXEC))
    {
        const auto length = static_cast<ssize_t>(contents.size());
        require(write(m_descriptor, contents.data(), contents.size()) == length, "a file in memory can be written");
    }
    ~MemoryFile() { close(m_descriptor); }
    MemoryFile(const MemoryFile &) = delete;
    MemoryFile &operator=(const MemoryFile &) = delete;

    [[nodiscard]] std::string path() const { return "/proc/self/fd/" + std::to_string(m_descriptor); }

private:
    int m_descriptor;
};

}  // namespace kavell::fuzz

#endif

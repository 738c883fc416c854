// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The record of who held a data file's semaphore when, and what the file said. Written by store_probe, whose own semop
// and stat stand before the system's, and judged by the tests.
//
// Every event draws a number from one counter in memory that all processes share. A take draws it when the semaphore
// has been taken and a release before it is given back, so the numbers of two holds never interleave. A status query
// draws its number before it asks: it sees at least every save whose release has a smaller number.

#ifndef KAVELL_TESTS_INTEGRATION_HOLD_RECORDER_H
#define KAVELL_TESTS_INTEGRATION_HOLD_RECORDER_H

#include <array>
#include <cstdint>
#include <type_traits>

namespace kavell::test {

/// The environment: the file of the shared counter and events, and the data file to look at.
inline constexpr const char *kHoldLogVariable = "KAVELL_HOLD_LOG";
inline constexpr const char *kHoldFileVariable = "KAVELL_HOLD_FILE";

inline constexpr int kHoldWorkers = 8;

/// The attribute that each worker counts up, as the data file has it; -1 where it is missing.
using HoldValues = std::array<int32_t, kHoldWorkers>;

enum class HoldEvent : uint32_t { Unused, Status, Take, Release };

struct HoldEntry {
    HoldEvent event;
    int32_t process;
    HoldValues values;  ///< of the file at that moment; unused for a status query
};

inline constexpr uint64_t kMostHoldEntries = 1 << 16;

/// The shared file, mapped. An event's number is its index.
struct HoldLog {
    uint64_t count;
    std::array<HoldEntry, kMostHoldEntries> entries;
};

static_assert(std::is_trivially_copyable_v<HoldLog>);

}  // namespace kavell::test

#endif

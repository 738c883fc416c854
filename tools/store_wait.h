// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Waiting for a data file. The store waits for a file's semaphore without a bound, so a program that was killed while
// it held one stops everyone. While a StoreWait lives,
//
//   - a helper thread says after two seconds whom the program is waiting for, and what to do about it;
//   - SIGINT, SIGTERM and SIGHUP end the program at once when it waits, but only after the call when it holds the
//     semaphore itself, so that Ctrl-C never makes it the killed program that everyone waits for.
//
// A signal whose handler returned would break the wait instead, and the store then goes on without having read the
// file: a commit would overwrite what others have saved. Hence the handler either ends the program or touches nothing.
//
// The doctor, which only looks, breaks its waits off in that very way, with SIGUSR1.
//
// Used around every call that reads or writes a data file, on the main thread only, one at a time.

#ifndef KAVELL_TOOLS_STORE_WAIT_H
#define KAVELL_TOOLS_STORE_WAIT_H

#include <string>

namespace kavell::tools {

/// What becomes of a wait for a program that was killed, or that does not come to its end.
enum class Patience {
    Endless,  ///< the person is told, and may end it
    Bounded,  ///< it is broken off; the store's call then returns as if there were nothing to read. For reading only
};

class StoreWait {
public:
    /// `subject` names what is worked on, such as "google anna"; `dataFile` is the path of its data file.
    StoreWait(std::string subject, const std::string &dataFile, Patience patience = Patience::Endless);

    /// Ends the program when a signal asked for it meanwhile.
    ~StoreWait();
    StoreWait(const StoreWait &) = delete;
    StoreWait &operator=(const StoreWait &) = delete;

    /// Whether a wait was broken off since this was made.
    [[nodiscard]] bool wasBrokenOff() const;
};

}  // namespace kavell::tools

#endif

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Which file has an account's name. The log says when a process began to give the name to a new file or to unlink it, and
// when it was over; in between it is done at a moment that nobody saw, and the process may be killed there. All courses
// that agree with the log are followed side by side; an event that agrees with none is one that may not be. A file gets the
// name only where there is none, and each removal takes one file away:
//
//                   a creation that has begun
//     no file  -------------------------------->  a file
//              <--------------------------------
//                   a removal that has begun
//
// Followed by the judge (load_judge.h), event by event. One thread.

#ifndef KAVELL_TESTS_LOAD_LOAD_NAMES_H
#define KAVELL_TESTS_LOAD_LOAD_NAMES_H

#include <compare>
#include <cstdint>
#include <map>
#include <set>

namespace kavell::test {

/// Times are counted by what happens to the account. An inode of 0 stands for no file.
class LoadNames {
public:
    void begin(uint64_t inode) { m_courses = {{Course{inode, {}, {}}, 0}}; }

    /// A process begins to give the name to a new file; false when there is a file of this inode that cannot be gone.
    [[nodiscard]] bool creating(int32_t process, uint64_t inode);
    /// A process begins to unlink whatever has the name.
    void removing(int32_t process);
    /// What it began was done, or failed; false when that cannot be. A process that began nothing may have failed.
    [[nodiscard]] bool succeeded(int32_t process);
    [[nodiscard]] bool failed(int32_t process);
    /// The process does nothing any more. Whether it had done what it began nobody knows.
    void died(int32_t process);

    /// The time now, at which somebody looks for a file.
    [[nodiscard]] uint64_t look();
    /// And found none; false when there was one all the time.
    [[nodiscard]] bool missed(uint64_t lookedAt);
    [[nodiscard]] bool mayHaveBeenMissing(uint64_t since) const;

    /// A process has the flock of a file. Before it writes it makes sure that the file has the name.
    void taken(int32_t process, uint64_t inode);
    /// It gives the flock back; false when it has written to a file that did not have the name any more.
    [[nodiscard]] bool released(int32_t process, bool hasWritten);

    [[nodiscard]] bool mayBe(uint64_t inode) const;
    /// The files of which each may have the name now.
    [[nodiscard]] std::set<uint64_t> possible();

private:
    struct Course {
        uint64_t inode = 0;
        std::set<int32_t> done;      ///< which of the processes have done what they began
        std::set<int32_t> nameless;  ///< which hold a file that did not have the name when they took it
        auto operator<=>(const Course &) const = default;
    };
    /// And when the name was last missing at the latest, where there is a file.
    using Courses = std::map<Course, uint64_t>;

    void advance();
    void advanceFrom(const Course &course);
    [[nodiscard]] bool decide(int32_t process, bool isDone);
    void forget(int32_t process);
    template <typename Change> void changeCourses(Change change);

    Courses m_courses{{Course{}, 0}};
    std::map<int32_t, uint64_t> m_begun;  ///< which inode shall have the name, by process
    uint64_t m_time = 0;
};

}  // namespace kavell::test

#endif

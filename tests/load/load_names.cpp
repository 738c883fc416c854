// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/load/load_names.h"

#include <algorithm>
#include <vector>

namespace kavell::test {

/// Whatever has begun may have been done until now, in any order.
void LoadNames::advance()
{
    ++m_time;
    if (m_begun.empty())
        return;
    std::vector<Course> before;
    for (const auto &[course, missing] : m_courses)
        before.push_back(course);
    for (const Course &course : before)
        advanceFrom(course);
}

void LoadNames::advanceFrom(const Course &course)
{
    for (const auto &[process, inode] : m_begun) {
        if (course.done.contains(process) || (course.inode == 0) == (inode == 0))
            continue;
        Course next = course;
        next.inode = inode;
        next.done.insert(process);
        const auto [place, isNew] = m_courses.try_emplace(next, m_time);
        place->second = m_time;
        if (isNew)
            advanceFrom(next);
    }
}

/// Has the courses changed one by one, or given up where the change says false. Those that are then alike become one.
template <typename Change> void LoadNames::changeCourses(Change change)
{
    Courses changed;
    for (const auto &[before, missing] : m_courses) {
        Course course = before;
        if (change(course)) {
            uint64_t &latest = changed[course];
            latest = std::max(latest, missing);
        }
    }
    m_courses.swap(changed);
}

bool LoadNames::creating(int32_t process, uint64_t inode)
{
    advance();
    // The number was free, so that a file which had it is gone, and will not get the name either.
    std::erase_if(m_courses, [&](const auto &each) { return each.first.inode == inode; });
    const auto sameNumber =
        std::find_if(m_begun.begin(), m_begun.end(), [&](const auto &each) { return each.second == inode; });
    if (sameNumber != m_begun.end())
        forget(sameNumber->first);
    m_begun[process] = inode;
    return !m_courses.empty();
}

void LoadNames::removing(int32_t process)
{
    advance();
    m_begun[process] = 0;
}

bool LoadNames::succeeded(int32_t process)
{
    return decide(process, true);
}

bool LoadNames::failed(int32_t process)
{
    return decide(process, false);
}

bool LoadNames::decide(int32_t process, bool isDone)
{
    if (!m_begun.contains(process))
        return !isDone;
    advance();
    m_begun.erase(process);
    changeCourses([&](Course &course) { return (course.done.erase(process) != 0) == isDone; });
    return !m_courses.empty();
}

void LoadNames::died(int32_t process)
{
    advance();
    forget(process);
}

void LoadNames::forget(int32_t process)
{
    m_begun.erase(process);
    changeCourses([&](Course &course) {
        course.done.erase(process);
        course.nameless.erase(process);
        return true;
    });
}

uint64_t LoadNames::look()
{
    advance();
    return m_time;
}

bool LoadNames::missed(uint64_t lookedAt)
{
    advance();
    std::erase_if(m_courses, [&](const auto &each) { return each.first.inode != 0 && each.second <= lookedAt; });
    return !m_courses.empty();
}

bool LoadNames::mayHaveBeenMissing(uint64_t since) const
{
    return std::any_of(m_courses.begin(), m_courses.end(),
                       [&](const auto &each) { return each.first.inode == 0 || each.second > since; });
}

void LoadNames::taken(int32_t process, uint64_t inode)
{
    advance();
    changeCourses([&](Course &course) {
        if (course.inode != inode)
            course.nameless.insert(process);
        return true;
    });
}

bool LoadNames::released(int32_t process, bool hasWritten)
{
    advance();
    changeCourses([&](Course &course) { return course.nameless.erase(process) == 0 || !hasWritten; });
    return !m_courses.empty();
}

bool LoadNames::mayBe(uint64_t inode) const
{
    return std::any_of(m_courses.begin(), m_courses.end(), [&](const auto &each) { return each.first.inode == inode; });
}

std::set<uint64_t> LoadNames::possible()
{
    advance();
    std::set<uint64_t> inodes;
    for (const auto &[course, missing] : m_courses)
        inodes.insert(course.inode);
    return inodes;
}

}  // namespace kavell::test

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/crash/recorder.h"

#include <cerrno>
#include <fcntl.h>
#include <filesystem>
#include <stdexcept>
#include <sys/stat.h>
#include <unistd.h>

#include "tests/support/process.h"

namespace kavell::test {

namespace fs = std::filesystem;

namespace {

void require(bool isDone, const std::string &what)
{
    if (!isDone)
        throw std::runtime_error("The crash test cannot " + what + ", errno " + std::to_string(errno));
}

std::string pathOf(int descriptor)
{
    std::error_code error;
    return fs::read_symlink("/proc/self/fd/" + std::to_string(descriptor), error);
}

}  // namespace

WatchedDirectory::WatchedDirectory(std::string path, std::string anchors)
    : m_path(std::move(path)), m_anchors(std::move(anchors))
{
    fs::create_directories(m_path);
    fs::remove_all(m_anchors);
    fs::create_directories(m_anchors);
    m_files.emplace_back();
}

std::optional<std::string> WatchedDirectory::relative(std::string_view path) const
{
    if (path == m_path)
        return "";
    if (!path.starts_with(m_path + "/"))
        return std::nullopt;
    return std::string(path.substr(m_path.size() + 1));
}

Node WatchedDirectory::nodeOf(ino_t inode) const
{
    const auto found = m_nodes.find(inode);
    return found == m_nodes.end() ? 0 : found->second;
}

Node WatchedDirectory::adopt(const std::string &relativePath)
{
    const std::string path = m_path + "/" + relativePath;
    const auto node = static_cast<Node>(m_files.size());
    struct stat status {};
    m_files.emplace_back(open(path.c_str(), O_RDWR | O_CLOEXEC));
    require(fstat(m_files.back().get(), &status) == 0 &&
                link(path.c_str(), (m_anchors + "/" + std::to_string(node)).c_str()) == 0,
            "keep " + path);
    m_nodes[status.st_ino] = node;
    return node;
}

DiskState WatchedDirectory::look()
{
    DiskState state;
    for (const auto &entry : fs::recursive_directory_iterator(m_path)) {
        const std::string path = *relative(entry.path().string());
        struct stat status {};
        require(lstat(entry.path().c_str(), &status) == 0, "look at " + path);
        if (S_ISDIR(status.st_mode)) {
            state.directories.insert(path);
            continue;
        }
        const Node known = nodeOf(status.st_ino);
        state.files[path] = {known != 0 ? known : adopt(path), readFile(entry.path()), status.st_mode & 07777};
    }
    return state;
}

void WatchedDirectory::removeOthers(const std::string &directory, const DiskState &wanted)
{
    for (const auto &entry : fs::directory_iterator(m_path + "/" + directory)) {
        const std::string path = joined(directory, entry.path().filename());
        if (entry.is_directory()) {
            removeOthers(path, wanted);
            if (!wanted.directories.contains(path))
                fs::remove(entry.path());
            continue;
        }
        struct stat status {};
        const auto file = wanted.files.find(path);
        const bool isWanted = file != wanted.files.end() && lstat(entry.path().c_str(), &status) == 0 &&
                              nodeOf(status.st_ino) == file->second.node;
        if (!isWanted)
            fs::remove(entry.path());
    }
}

void WatchedDirectory::make(const DiskState &state)
{
    removeOthers("", state);
    for (const std::string &directory : state.directories) {
        if (!directory.empty())
            require(mkdir((m_path + "/" + directory).c_str(), 0700) == 0 || errno == EEXIST, "make " + directory);
    }
    for (const auto &[path, file] : state.files) {
        const int descriptor = m_files.at(file.node).get();
        require(link((m_anchors + "/" + std::to_string(file.node)).c_str(), (m_path + "/" + path).c_str()) == 0 ||
                    errno == EEXIST,
                "name " + path);
        require(writeWhole(descriptor, file.contents) &&
                    ftruncate(descriptor, static_cast<off_t>(file.contents.size())) == 0 &&
                    fchmod(descriptor, file.mode) == 0,
                "fill " + path);
    }
}

void WatchedDirectory::makeAnew(const DiskState &state)
{
    std::vector<std::string> standing;
    for (const auto &entry : fs::directory_iterator(m_path))
        standing.push_back(entry.path());
    // Put away, not removed: their inodes' numbers are not to come back either.
    for (const std::string &path : standing)
        fs::rename(path, m_anchors + "/away-" + std::to_string(++m_putAway));
    make(state);
}

Node Recorder::nodeAt(const char *path) const
{
    struct stat status {};
    return path && lstat(path, &status) == 0 ? m_directory.nodeOf(status.st_ino) : 0;
}

/// Notes what a call that was made did to names; `node` had the first of them.
void Recorder::noteNames(const SystemCall &call, Node node, bool existed)
{
    using Kind = DiskOperation::Kind;
    const auto path = m_directory.relative(call.path);
    if (!path)
        return;
    DiskOperation operation{
        .kind = Kind::MakeFile, .node = node, .directory = directoryOf(*path), .name = nameOf(*path)};
    switch (call.kind) {
    case CallKind::Open: {
        if (existed || (call.flags & O_CREAT) == 0)
            return;
        struct stat status {};
        operation.node = m_directory.adopt(*path);
        require(lstat(call.path, &status) == 0, "look at " + *path);
        operation.mode = status.st_mode & 07777;
        break;
    }
    case CallKind::MakeDirectory:
        operation.kind = Kind::MakeDirectory;
        operation.node = 0;
        break;
    case CallKind::Unlink:
        operation.kind = Kind::RemoveName;
        break;
    case CallKind::Rename:
    case CallKind::Link: {
        const auto newPath = m_directory.relative(call.newPath);
        require(newPath && directoryOf(*newPath) == operation.directory, "follow a file to another directory");
        operation.kind = call.kind == CallKind::Rename ? Kind::Rename : Kind::AddName;
        (call.kind == CallKind::Rename ? operation.newName : operation.name) = nameOf(*newPath);
        break;
    }
    case CallKind::ChangeMode:
        // Of a directory: nothing of what is shown here depends on it.
        if (node == 0)
            return;
        operation = {.kind = Kind::ChangeMode, .node = node, .mode = call.mode};
        break;
    default:
        return;
    }
    m_operations.push_back(std::move(operation));
}

/// Notes what a call that was made did to an open file.
void Recorder::noteFile(const SystemCall &call, long result, off_t offset)
{
    using Kind = DiskOperation::Kind;
    struct stat status {};
    if (fstat(call.descriptor, &status) != 0)
        return;
    if (S_ISDIR(status.st_mode)) {
        const auto path = m_directory.relative(pathOf(call.descriptor));
        if (path && (call.kind == CallKind::SyncFile || call.kind == CallKind::SyncData))
            m_operations.push_back({.kind = Kind::SyncDirectory, .directory = *path});
        return;
    }
    const Node node = m_directory.nodeOf(status.st_ino);
    if (node == 0)
        return;
    switch (call.kind) {
    case CallKind::Write:
        m_operations.push_back({.kind = Kind::Write,
                                .node = node,
                                .offset = static_cast<size_t>(offset),
                                .bytes = std::string(call.bytes, static_cast<size_t>(result))});
        break;
    case CallKind::Truncate:
        m_operations.push_back({.kind = Kind::Resize, .node = node, .offset = static_cast<size_t>(call.offset)});
        break;
    case CallKind::ChangeMode:
        m_operations.push_back({.kind = Kind::ChangeMode, .node = node, .mode = call.mode});
        break;
    case CallKind::SyncFile:
        m_operations.push_back({.kind = Kind::SyncFile, .node = node});
        break;
    case CallKind::SyncData:
        m_operations.push_back({.kind = Kind::SyncData, .node = node});
        break;
    default:
        break;
    }
}

long Recorder::onCall(SystemCall &call, const std::function<long()> &make)
{
    if (call.kind == CallKind::Rename && call.flags != 0 && m_refusal == Refusal::NewNames) {
        errno = EINVAL;
        return -1;
    }
    if (call.kind == CallKind::Write && m_refusal == Refusal::Writes) {
        errno = EIO;
        return -1;
    }
    struct stat status {};
    const bool existed = call.path && lstat(call.path, &status) == 0;
    const Node node = nodeAt(call.path);
    const off_t offset =
        call.kind == CallKind::Write && call.offset < 0 ? lseek(call.descriptor, 0, SEEK_CUR) : call.offset;
    const long result = m_maker ? m_maker->onCall(call, make) : make();
    const int error = errno;
    require(call.kind != CallKind::Open || (call.flags & (O_TRUNC | O_APPEND)) == 0 || !m_directory.relative(call.path),
            "follow a file that is emptied or appended to when it is opened");
    if (result >= 0 && call.path)
        noteNames(call, node, existed);
    else if (result >= 0)
        noteFile(call, result, offset);
    errno = error;
    return result;
}

}  // namespace kavell::test

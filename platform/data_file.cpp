// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/data_file.h"

#include <algorithm>
#include <array>
#include <atomic>
#include <chrono>
#include <cstring>
#include <ctime>
#include <fcntl.h>
#include <optional>
#include <sys/file.h>
#include <sys/stat.h>
#include <thread>

#include "platform/damaged_copy.h"
#include "platform/file_io.h"
#include "platform/redo_record.h"
#include "runtime/object_p.h"
#include "runtime/single_threaded.h"

namespace kavell {

namespace {

constexpr auto kLongestFlockWait = std::chrono::seconds(10);
// Beyond both contents in a record there is only its small frame.
constexpr size_t kLargestRedoRecord = 2 * kLargestDataFile + 64;
// How often a file may come and go under a writer before it gives up.
constexpr int kMostAttempts = 16;

/// Asks for the flock once. Over NFS, who may only read a file cannot have it alone (flock(2)); a shared one keeps writers
/// out as well.
int tryToLock(int file) noexcept
{
    const int result = flock(file, LOCK_EX | LOCK_NB);
    return result != 0 && errno == EBADF ? flock(file, LOCK_SH | LOCK_NB) : result;
}

/// Waits for the flock for a bounded time. It is free nearly always: whoever holds it also holds the semaphore that the
/// caller has just taken, unless their records found different ones.
bool lockFile(int file) noexcept
{
    if (tryToLock(file) == 0)
        return true;
    const auto deadline = std::chrono::steady_clock::now() + kLongestFlockWait;
    auto pause = std::chrono::microseconds(50);
    while (tryToLock(file) != 0) {
        if ((errno != EWOULDBLOCK && errno != EINTR) || std::chrono::steady_clock::now() > deadline)
            return false;
        std::this_thread::sleep_for(pause);
        pause = std::min(pause * 2, std::chrono::microseconds(5000));
    }
    return true;
}

/// Whether the file has a name for certain, and its status.
bool hasName(int file, struct stat &status) noexcept
{
    return fstat(file, &status) == 0 && status.st_nlink > 0;
}

/// What a data file is opened with, so that opening never waits, whatever the path names.
constexpr int kOpenFlags = O_NONBLOCK | O_NOCTTY;

/// An open file with its flock. The flock is given back explicitly where another thread may have forked meanwhile: its
/// child has the file open too, and would keep it.
class LockedFile {
public:
    /// Opens the file that has the path and takes its flock; none, with errno, when either fails. A file that was deleted
    /// while its flock was waited for is not the one that has the path, and must not be written to; for reading, it is
    /// as good as the moment before.
    LockedFile(const char *path, int access) noexcept
    {
        for (int attempt = 0; attempt < kMostAttempts; ++attempt) {
            m_file = openFile(path, access | kOpenFlags);
            if (m_file && !lockFile(m_file.get()))
                m_file = FileDescriptor();
            if (!m_file || access == O_RDONLY || hasName(m_file.get(), m_status))
                return;
        }
        m_file = FileDescriptor();
        errno = EBUSY;
    }
    /// Takes the flock of a file that was opened for reading.
    explicit LockedFile(FileDescriptor file) noexcept : m_file(std::move(file))
    {
        if (m_file && !lockFile(m_file.get()))
            m_file = FileDescriptor();
    }
    ~LockedFile()
    {
        if (m_file && !isSingleThreaded())
            flock(m_file.get(), LOCK_UN);
    }
    LockedFile(const LockedFile &) = delete;
    LockedFile &operator=(const LockedFile &) = delete;

    [[nodiscard]] int get() const noexcept { return m_file.get(); }
    /// Of a file that was opened for writing, from when its flock had been taken.
    [[nodiscard]] const struct stat &status() const noexcept { return m_status; }
    explicit operator bool() const noexcept { return static_cast<bool>(m_file); }

private:
    FileDescriptor m_file;
    struct stat m_status {};
};

/// Puts the new contents over the old, which are never cut off first: a full disk must not cost them.
bool overwrite(int file, std::string_view contents, off_t oldSize) noexcept
{
    if (!writeWhole(file, contents))
        return false;
    const auto newSize = static_cast<off_t>(contents.size());
    return oldSize <= newSize || withoutInterruption([&] { return ftruncate(file, newSize); }) == 0;
}

bool syncData(int file) noexcept
{
    return withoutInterruption([&] { return fdatasync(file); }) == 0;
}

/// Permissions, too, which syncing the data leaves out: the next save takes them to be on the disk.
bool syncWhole(int file) noexcept
{
    return withoutInterruption([&] { return fsync(file); }) == 0;
}

/// Makes what was written durable, and the file its owner's alone; `wasPrivate` when it certainly was before.
bool makeDurable(int file, bool wasPrivate) noexcept
{
    return wasPrivate ? syncData(file) : fchmod(file, 0600) == 0 && syncWhole(file);
}

/// A redo record that was found, read and judged.
struct FoundRecord {
    std::string newContents;
    RedoVerdict verdict = RedoVerdict::Discard;
};

/// Judges the record at `recordPath` against the file; none when there is no record or it cannot be read.
std::optional<FoundRecord> findRecord(int file, const std::string &recordPath)
{
    const FileDescriptor record = openFile(recordPath.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK);
    FileContents bytes, contents;
    struct stat status;
    if (!record || !bytes.read(record.get(), kLargestRedoRecord) || !contents.read(file, kLargestDataFile) ||
        fstat(file, &status) != 0)
        return std::nullopt;
    FoundRecord found;
    if (const auto decoded = decodeRedoRecord(bytes.view())) {
        found.verdict = judgeRedoRecord(*decoded, status.st_ino, contents.view());
        found.newContents = decoded->newContents;
    }
    return found;
}

/// What stands under a redo record's name.
enum class RecordState {
    None,
    Void,
    Pending,  ///< it is to be settled
    Unknown,  ///< that cannot be told, and the file may be torn
};

RecordState stateOfRecord(const std::string &recordPath, int directory = AT_FDCWD) noexcept
{
    struct stat status;
    if (fstatat(directory, recordPath.c_str(), &status, AT_SYMLINK_NOFOLLOW) != 0)
        return errno == ENOENT ? RecordState::None : RecordState::Unknown;
    return isVoidRecord(status) ? RecordState::Void : RecordState::Pending;
}

/// The same for a data file of a directory that was listed.
RecordState stateOfRecord(const DataDirectory &directory, const char *name)
{
    return directory.hadNoRecordOf(name) ? RecordState::None
                                         : stateOfRecord(siblingPath(name, kRedoRecordPrefix), directory.descriptor());
}

/// Settles a pending redo record, if there is one, on a file that is open for writing. What stands there then: none, a
/// void one, or what could not be settled.
RecordState settleRecord(int file, const std::string &recordPath)
{
    const RecordState state = stateOfRecord(recordPath);
    if (state != RecordState::Pending)
        return state;
    const auto found = findRecord(file, recordPath);
    if (!found)
        return RecordState::Unknown;
    struct stat status;
    if (found->verdict == RedoVerdict::Finish &&
        (fstat(file, &status) != 0 || !overwrite(file, found->newContents, status.st_size) ||
         !makeDurable(file, false)))
        return RecordState::Pending;
    // Whoever made it may have died before its name was durable, so it cannot become a void one.
    return unlink(recordPath.c_str()) == 0 ? RecordState::None : RecordState::Pending;
}

bool isSettled(RecordState state) noexcept
{
    return state == RecordState::None || state == RecordState::Void;
}

/// Makes a file that must not exist yet; it has its contents durably, but not its name. None, with errno, on failure.
FileDescriptor makeNewFile(const std::string &path, std::string_view contents) noexcept
{
    FileDescriptor file = openFile(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW, 0600);
    if (!file)
        return file;
    if (fchmod(file.get(), 0600) == 0 && writeWhole(file.get(), contents) && syncData(file.get()))
        return file;
    unlink(path.c_str());
    return FileDescriptor();
}

/// Gives the file a modification time of its own. The kernel's default is as coarse as its tick on many systems, and
/// two programs that save within one tick must not be taken for one.
bool stampFile(int file) noexcept
{
    std::array<timespec, 2> times{};
    times[0].tv_nsec = UTIME_OMIT;
    return clock_gettime(CLOCK_REALTIME, &times[1]) == 0 && futimens(file, times.data()) == 0;
}

/// Makes sure that the longer contents have room on the disk before a byte of the old ones changes.
bool reserveRoom(int file, size_t size) noexcept
{
    const int result = withoutInterruption(
        [&] { return fallocate(file, FALLOC_FL_KEEP_SIZE, 0, static_cast<off_t>(std::max<size_t>(size, 1))); });
    return result == 0 || errno == EOPNOTSUPP;
}

/// Notes the modification time of a file while its flock is held.
void noteTime(int file, FileTime *written) noexcept
{
    struct stat status;
    if (written && fstat(file, &status) == 0)
        *written = {status.st_mtim.tv_sec, status.st_mtim.tv_nsec};
}

/// Makes a record void, or deletes it where that fails; false when neither could be done.
bool voidRecord(int record, const std::string &recordPath) noexcept
{
    return withoutInterruption([&] { return ftruncate(record, kVoidRecordLength); }) == 0 ||
           unlink(recordPath.c_str()) == 0 || errno == ENOENT;
}

bool isPrivate(const struct stat &status) noexcept
{
    return (status.st_mode & 07777) == 0600;
}

/// Opens the void record of the file with this inode for writing; it is its owner's alone then. None when that fails, or
/// the record is another file's.
FileDescriptor openVoidRecord(const std::string &recordPath, ino_t inode)
{
    FileDescriptor record = openFile(recordPath.c_str(), O_RDWR | O_NOFOLLOW | O_NONBLOCK);
    FileContents bytes;
    struct stat status;
    const bool isUsable = record && bytes.read(record.get(), kLargestRedoRecord, kVoidRecordLength) &&
                          inodeOfRedoRecord(bytes.view()) == inode && fstat(record.get(), &status) == 0 &&
                          (isPrivate(status) || fchmod(record.get(), 0600) == 0);
    return isUsable ? std::move(record) : FileDescriptor();
}

/// Makes a record durable, in the place of the file's void one if there is one. None when that fails; there is no record
/// then, or a void one.
FileDescriptor makeRecord(const std::string &recordPath, const RedoRecord &contents, RecordState state)
{
    const std::string bytes = encodeRedoRecord(contents);
    if (FileDescriptor record =
            state == RecordState::Void ? openVoidRecord(recordPath, contents.inode) : FileDescriptor()) {
        if (writeWhole(record.get(), bytes) && syncData(record.get()))
            return record;
        voidRecord(record.get(), recordPath);
        return FileDescriptor();
    }
    if (state == RecordState::Void && unlink(recordPath.c_str()) != 0)
        return FileDescriptor();
    FileDescriptor record = makeNewFile(recordPath, bytes);
    if (!record || syncDirectoryOf(recordPath.c_str()))
        return record;
    unlink(recordPath.c_str());
    return FileDescriptor();
}

bool replaceInPlace(const LockedFile &lockedFile, const char *path, std::string_view contents, IntactCheck isIntact,
                    FileTime *written)
{
    const int file = lockedFile.get();
    const std::string recordPath = siblingPath(path, kRedoRecordPrefix);
    struct stat status = lockedFile.status();
    RecordState state = stateOfRecord(recordPath);
    if (state == RecordState::Pending) {
        state = settleRecord(file, recordPath);
        if (fstat(file, &status) != 0)
            return false;
    }
    FileContents old;
    if (!isSettled(state) || !S_ISREG(status.st_mode) || !old.read(file, kLargestDataFile, status.st_size))
        return false;
    const std::string_view oldContents = old.view();
    RedoRecord record;
    record.inode = status.st_ino;
    record.newContents = contents;
    if (oldContents.size() <= kLargestDataFile)
        record.oldContents = oldContents;
    if ((!record.oldContents || !isIntact(oldContents)) && !keepDamagedCopy(file, path))
        return false;
    if (contents.size() > oldContents.size() && !reserveRoom(file, contents.size()))
        return false;
    const FileDescriptor recordFile = makeRecord(recordPath, record, state);
    if (!recordFile)
        return false;
    if (overwrite(file, contents, status.st_size) && stampFile(file) && makeDurable(file, isPrivate(status))) {
        noteTime(file, written);
        return voidRecord(recordFile.get(), recordPath);
    }
    // Back to the old contents where they are known and can be put back; else the record stays and is finished later.
    if (record.oldContents && overwrite(file, oldContents, static_cast<off_t>(contents.size())) &&
        (isPrivate(status) ? syncData(file) : syncWhole(file)))
        voidRecord(recordFile.get(), recordPath);
    return false;
}

enum class Creation { Done, Exists, Failed };

/// Gives a finished file its name unless something has that name already.
Creation publish(const char *newPath, const char *path) noexcept
{
    if (renameat2(AT_FDCWD, newPath, AT_FDCWD, path, RENAME_NOREPLACE) == 0)
        return Creation::Done;
    // Some file systems cannot rename without replacing; a second name that must be new does the same in two steps.
    if ((errno == EINVAL || errno == ENOSYS) && link(newPath, path) == 0) {
        unlink(newPath);
        return Creation::Done;
    }
    const bool exists = errno == EEXIST;
    unlink(newPath);
    return exists ? Creation::Exists : Creation::Failed;
}

/// Whether a record that an earlier file left could be taken for this file's: inodes' numbers are given out again.
bool mayOwnRecord(int file, const std::string &recordPath)
{
    const FileDescriptor record = openFile(recordPath.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK);
    FileContents bytes;
    struct stat status;
    if (!record)
        return errno != ENOENT;
    if (!bytes.read(record.get(), kLargestRedoRecord) || fstat(file, &status) != 0)
        return true;
    // Of a void one, too: that it is void may not be on the disk, nor is what it says of names true of this file.
    return inodeOfRedoRecord(bytes.view()) == status.st_ino;
}

/// The file of a new account, before it has its name. A crash may leave it beside an earlier file's record, which must
/// be void for it.
FileDescriptor makeFirstFile(const std::string &newPath, const std::string &recordPath, std::string_view contents)
{
    FileDescriptor file = makeNewFile(newPath, contents);
    // A process of this number may have died here before.
    if (!file && errno == EEXIST && unlink(newPath.c_str()) == 0)
        file = makeNewFile(newPath, contents);
    if (!file || !mayOwnRecord(file.get(), recordPath))
        return file;
    // Its number stays taken while the next one is made.
    const FileDescriptor taken = std::move(file);
    return unlink(newPath.c_str()) == 0 ? makeNewFile(newPath, contents) : FileDescriptor();
}

Creation createWhole(const char *path, std::string_view contents, FileTime *written)
{
    static std::atomic<unsigned> counter{0};
    const std::string newPath = siblingPath(path, kNewFilePrefix) + "-" + std::to_string(getpid()) + "-" +
                                std::to_string(counter.fetch_add(1, std::memory_order_relaxed));
    const std::string recordPath = siblingPath(path, kRedoRecordPrefix);
    const FileDescriptor file = makeFirstFile(newPath, recordPath, contents);
    if (!file)
        return Creation::Failed;
    if (!lockFile(file.get()) || !stampFile(file.get())) {
        unlink(newPath.c_str());
        return Creation::Failed;
    }
    const Creation creation = publish(newPath.c_str(), path);
    if (creation == Creation::Done) {
        noteTime(file.get(), written);
        // Whoever has the flock is the only one who may make a record; one that is there was left by an earlier file.
        unlink(recordPath.c_str());
        if (!syncDirectoryOf(path))
            return Creation::Failed;
    }
    return creation;
}

/// The contents of a file whose flock is taken; none when it has a pending redo record. `size` is the one that it may
/// have, the directory the one in which it was found.
std::optional<FileRead> readSettled(const LockedFile &file, const char *path, FileContents &contents, off_t size,
                                    const DataDirectory *directory)
{
    if (!file)
        return FileRead::Failed;
    const RecordState state = directory ? stateOfRecord(*directory, std::strrchr(path, '/') + 1)
                                        : stateOfRecord(siblingPath(path, kRedoRecordPrefix));
    if (state == RecordState::Pending)
        return std::nullopt;
    if (state == RecordState::Unknown)
        return FileRead::Failed;
    return contents.read(file.get(), kLargestDataFile, size) ? FileRead::Done : FileRead::Failed;
}

/// The contents of a file that has a redo record, settling the record where that can be done.
FileRead readWithRecord(const char *path, FileContents &contents)
{
    const std::string recordPath = siblingPath(path, kRedoRecordPrefix);
    if (const LockedFile writable(path, O_RDWR); writable && isSettled(settleRecord(writable.get(), recordPath)))
        return contents.read(writable.get(), kLargestDataFile) ? FileRead::Done : FileRead::Failed;
    // Who may not write, or finds the disk full, reads what the record would make of the file, and leaves it to others.
    const LockedFile file(path, O_RDONLY);
    if (!file)
        return FileRead::Failed;
    const auto found = findRecord(file.get(), recordPath);
    if (found && found->verdict == RedoVerdict::Finish) {
        contents.assign(found->newContents);
        return FileRead::Done;
    }
    // A record that cannot be read may be of a torn file.
    if (!found && !isSettled(stateOfRecord(recordPath)))
        return FileRead::Failed;
    return contents.read(file.get(), kLargestDataFile) ? FileRead::Done : FileRead::Failed;
}

}  // namespace

FoundFile FoundFile::open(const DataDirectory &directory, const char *name) noexcept
{
    return {&directory, openFile(name, O_RDONLY | kOpenFlags, 0, directory.descriptor())};
}

FileRead readDataFile(const char *path, FileContents &contents, off_t size, FoundFile found) noexcept
{
    return guarded(FileRead::Failed, [&] {
        const auto settled = found.file
                                 ? readSettled(LockedFile(std::move(found.file)), path, contents, size, found.directory)
                                 : readSettled(LockedFile(path, O_RDONLY), path, contents, size, nullptr);
        const FileRead result = settled ? *settled : readWithRecord(path, contents);
        return result == FileRead::Done && contents.view().size() > kLargestDataFile ? FileRead::TooLarge : result;
    });
}

bool writeDataFile(const char *path, std::string_view contents, IntactCheck isIntact, FileTime *written) noexcept
{
    if (!path || contents.size() > kLargestDataFile)
        return false;
    return guarded(false, [&] {
        for (int attempt = 0; attempt < kMostAttempts; ++attempt) {
            if (const LockedFile file(path, O_RDWR); file)
                return replaceInPlace(file, path, contents, isIntact, written);
            if (errno != ENOENT)
                return false;
            const Creation creation = createWhole(path, contents, written);
            if (creation != Creation::Exists)
                return creation == Creation::Done;
        }
        return false;
    });
}

bool removeDataFile(const char *path) noexcept
{
    if (!path)
        return false;
    return guarded(false, [&] {
        // Not while somebody is in the middle of replacing it, if that can be helped. A record that somebody left is
        // settled, not only deleted: a power cut may undo the deletion of the file and keep that of the record.
        const std::string recordPath = siblingPath(path, kRedoRecordPrefix);
        const LockedFile file(path, O_RDWR);
        struct stat status;
        // One that comes from here on is not the one that was to be removed, and is its maker's to hold.
        if (!file && errno == ENOENT && lstat(path, &status) != 0)
            return false;
        const RecordState state = file ? settleRecord(file.get(), recordPath) : RecordState::Unknown;
        // While the file has its name: what stands there after it may be a new file's.
        if (state == RecordState::Void)
            unlink(recordPath.c_str());
        if (unlink(path) != 0)
            return false;
        // The file is gone for every program; that a power cut may bring it back is no failure of the removal. But then
        // it is torn without its record, so a record that could not be settled goes only when it cannot come back, and is
        // not that of a file which was made meanwhile.
        if (syncDirectoryOf(path) && !isSettled(state) && (!file || mayOwnRecord(file.get(), recordPath)))
            unlink(recordPath.c_str());
        return true;
    });
}

}  // namespace kavell

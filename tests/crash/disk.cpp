// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tests/crash/disk.h"

#include <algorithm>
#include <array>
#include <stdexcept>
#include <string_view>

namespace kavell::test {

namespace {

// With more name changes than this that are not synced, their subsets are picked at random too.
constexpr size_t kMostChangesInFull = 8;
constexpr size_t kMostSubsets = size_t{1} << kMostChangesInFull;

std::string sectorOf(const std::string &contents, size_t number)
{
    std::string sector = number * Disk::kSector < contents.size()
                             ? contents.substr(number * Disk::kSector, Disk::kSector)
                             : std::string();
    sector.resize(Disk::kSector, '\0');
    return sector;
}

template <typename Value> void addVersion(std::vector<Value> &versions, const Value &value)
{
    if (std::find(versions.begin(), versions.end(), value) == versions.end())
        versions.push_back(value);
}

/// Visits all combinations of one value below each count, or the extreme ones and `most` at random.
void forEachCombination(const std::vector<size_t> &counts, size_t most, std::mt19937_64 &random,
                        const std::function<void(const std::vector<size_t> &)> &visit)
{
    std::vector<size_t> chosen(counts.size(), 0);
    size_t total = 1;
    for (const size_t count : counts)
        total = total > most ? total : total * count;
    if (total <= most) {
        for (size_t number = 0; number < total; ++number) {
            size_t rest = number;
            for (size_t place = 0; place < counts.size(); ++place) {
                chosen[place] = rest % counts[place];
                rest /= counts[place];
            }
            visit(chosen);
        }
        return;
    }
    // Everything old up to a place and new behind it, the other way round, and one that differs from all others.
    for (size_t split = 0; split <= counts.size(); ++split) {
        for (const bool isNewFirst : {false, true}) {
            for (size_t place = 0; place < counts.size(); ++place)
                chosen[place] = (place < split) == isNewFirst ? counts[place] - 1 : 0;
            visit(chosen);
            for (size_t place = 0; place < counts.size(); ++place)
                chosen[place] = (place == split) == isNewFirst ? counts[place] - 1 : 0;
            visit(chosen);
        }
    }
    for (size_t number = 0; number < most; ++number) {
        for (size_t place = 0; place < counts.size(); ++place)
            chosen[place] = std::uniform_int_distribution<size_t>(0, counts[place] - 1)(random);
        visit(chosen);
    }
}

}  // namespace

std::string directoryOf(const std::string &path)
{
    const size_t slash = path.rfind('/');
    return slash == std::string::npos ? "" : path.substr(0, slash);
}

std::string nameOf(const std::string &path)
{
    return path.substr(path.rfind('/') + 1);
}

std::string joined(const std::string &directory, const std::string &name)
{
    return directory.empty() ? name : directory + "/" + name;
}

std::string DiskOperation::description() const
{
    static constexpr std::array<std::string_view, 11> kNames = {
        "make file", "make directory", "add name",  "remove name", "rename",        "write",
        "resize",    "change mode",    "sync file", "sync data",   "sync directory"};
    std::string text(kNames[static_cast<size_t>(kind)]);
    if (node != 0)
        text += " #" + std::to_string(node);
    if (!name.empty() || !directory.empty())
        text += " " + joined(directory, name);
    if (!newName.empty())
        text += " to " + newName;
    if (kind == Kind::Write)
        text += " " + std::to_string(bytes.size()) + " bytes at " + std::to_string(offset);
    if (kind == Kind::Resize)
        text += " to " + std::to_string(offset);
    return text;
}

Disk::Disk(const DiskState &state)
{
    for (const std::string &directory : state.directories) {
        m_certain[directory];
        if (!directory.empty())
            m_certain[directoryOf(directory)][test::nameOf(directory)] = 0;
    }
    for (const auto &[path, file] : state.files) {
        m_certain[directoryOf(path)][test::nameOf(path)] = file.node;
        m_files[file.node] = {file.contents, {file.contents.size()}, {}, file.mode, {file.mode}};
    }
}

void Disk::write(File &file, size_t offset, const std::string &bytes)
{
    const size_t oldSize = file.contents.size(), end = offset + bytes.size();
    const size_t first = std::min(offset, oldSize) / kSector, last = (end + kSector - 1) / kSector;
    std::string changed = file.contents;
    changed.resize(std::max(oldSize, end), '\0');
    changed.replace(offset, bytes.size(), bytes);
    for (size_t number = first; number < last; ++number) {
        auto &versions = file.sectors[number];
        addVersion(versions, sectorOf(file.contents, number));
        addVersion(versions, sectorOf(changed, number));
    }
    for (size_t size = (oldSize / kSector + 1) * kSector; size < end; size += kSector)
        addVersion(file.sizes, size);
    addVersion(file.sizes, changed.size());
    file.contents = std::move(changed);
}

void Disk::resize(File &file, size_t size)
{
    std::string changed = file.contents;
    changed.resize(size, '\0');
    for (size_t number = size / kSector; number * kSector < file.contents.size(); ++number) {
        auto &versions = file.sectors[number];
        addVersion(versions, sectorOf(file.contents, number));
        addVersion(versions, sectorOf(changed, number));
    }
    addVersion(file.sizes, size);
    file.contents = std::move(changed);
}

void Disk::makeCertain(File &file, bool isWhole)
{
    file.sizes = {file.contents.size()};
    file.sectors.clear();
    if (isWhole)
        file.modes = {file.mode};
}

void Disk::apply(const DiskOperation &operation)
{
    using Kind = DiskOperation::Kind;
    switch (operation.kind) {
    case Kind::MakeFile:
        m_files[operation.node] = {{}, {0}, {}, operation.mode, {operation.mode}};
        [[fallthrough]];
    case Kind::AddName:
        m_changes.push_back({operation.directory, {}, operation.name, operation.node});
        break;
    case Kind::MakeDirectory:
        m_changes.push_back({operation.directory, {}, operation.name, 0});
        m_certain[joined(operation.directory, operation.name)];
        break;
    case Kind::RemoveName:
        m_changes.push_back({operation.directory, operation.name, {}, operation.node});
        break;
    case Kind::Rename:
        m_changes.push_back({operation.directory, operation.name, operation.newName, operation.node});
        break;
    case Kind::Write:
        write(m_files.at(operation.node), operation.offset, operation.bytes);
        break;
    case Kind::Resize:
        resize(m_files.at(operation.node), operation.offset);
        break;
    case Kind::ChangeMode: {
        File &file = m_files.at(operation.node);
        file.mode = operation.mode;
        addVersion(file.modes, operation.mode);
        break;
    }
    case Kind::SyncFile:
    case Kind::SyncData:
        makeCertain(m_files.at(operation.node), operation.kind == Kind::SyncFile);
        break;
    case Kind::SyncDirectory: {
        std::vector<bool> happened;
        for (const NameChange &change : m_changes)
            happened.push_back(change.directory == operation.directory);
        m_certain = treeWith(happened);
        std::erase_if(m_changes, [&](const NameChange &change) { return change.directory == operation.directory; });
        break;
    }
    }
}

Disk::Tree Disk::treeWith(const std::vector<bool> &happened) const
{
    Tree tree = m_certain;
    for (size_t number = 0; number < m_changes.size(); ++number) {
        const NameChange &change = m_changes[number];
        if (!happened[number])
            continue;
        Names &names = tree[change.directory];
        const auto removed = names.find(change.removed);
        if (removed != names.end() && removed->second == change.node)
            names.erase(removed);
        if (!change.added.empty())
            names[change.added] = change.node;
    }
    return tree;
}

void Disk::addDirectory(const Tree &tree, const std::string &path, DiskState &state) const
{
    state.directories.insert(path);
    const auto names = tree.find(path);
    if (names == tree.end())
        return;
    for (const auto &[name, node] : names->second) {
        if (node == 0)
            addDirectory(tree, joined(path, name), state);
        else
            state.files[joined(path, name)] = {node, m_files.at(node).contents, m_files.at(node).mode};
    }
}

DiskState Disk::stateOf(const Tree &tree) const
{
    DiskState state;
    addDirectory(tree, "", state);
    return state;
}

DiskState Disk::latest() const
{
    return stateOf(treeWith(std::vector<bool>(m_changes.size(), true)));
}

void Disk::forEachState(size_t most, std::mt19937_64 &random, const std::function<void(const DiskState &)> &visit) const
{
    // A file may have lost its name in one outcome and have it in another, so the directories come first.
    forEachCombination(std::vector<size_t>(m_changes.size(), 2), kMostSubsets, random,
                       [&](const std::vector<size_t> &chosen) {
                           forEachContents(stateOf(treeWith({chosen.begin(), chosen.end()})), most, random, visit);
                       });
}

/// One thing about a file that is not certain: its size, its mode, or a sector.
struct Disk::Choice {
    FileState *state;
    const File *file;
    enum class What { Mode, Size, Sector } what;
    std::map<size_t, std::vector<std::string>>::const_iterator sector{};

    [[nodiscard]] size_t count() const
    {
        return what == What::Mode   ? file->modes.size()
               : what == What::Size ? file->sizes.size()
                                    : sector->second.size();
    }

    void apply(size_t version) const
    {
        std::string &contents = state->contents;
        if (what == What::Mode) {
            state->mode = file->modes[version];
        } else if (what == What::Size) {
            // Before the sectors, which only fill it.
            contents = file->contents;
            contents.resize(file->sizes[version], '\0');
        } else if (const size_t start = sector->first * kSector; start < contents.size()) {
            const size_t length = std::min(kSector, contents.size() - start);
            contents.replace(start, length, sector->second[version], 0, length);
        }
    }
};

void Disk::forEachContents(DiskState state, size_t most, std::mt19937_64 &random,
                           const std::function<void(const DiskState &)> &visit) const
{
    std::vector<Choice> choices;
    for (auto &[path, fileState] : state.files) {
        const File &file = m_files.at(fileState.node);
        choices.push_back({&fileState, &file, Choice::What::Mode});
        choices.push_back({&fileState, &file, Choice::What::Size});
        const size_t largest = *std::max_element(file.sizes.begin(), file.sizes.end());
        for (auto sector = file.sectors.begin(); sector != file.sectors.end(); ++sector) {
            if (sector->first * kSector < largest)
                choices.push_back({&fileState, &file, Choice::What::Sector, sector});
        }
    }
    std::vector<size_t> counts;
    for (const Choice &choice : choices)
        counts.push_back(choice.count());
    forEachCombination(counts, most, random, [&](const std::vector<size_t> &chosen) {
        for (size_t place = 0; place < choices.size(); ++place)
            choices[place].apply(chosen[place]);
        visit(state);
    });
}

}  // namespace kavell::test

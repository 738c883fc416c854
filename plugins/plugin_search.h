// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// Where plug-ins are looked for, and which bundles of a directory need a closer look. A search runs before every
// question that lists plug-ins, so a bundle that is known and unchanged must cost no more than one status call. Used by
// the plug-in manager under its registry lock.

#ifndef KAVELL_PLUGINS_PLUGIN_SEARCH_H
#define KAVELL_PLUGINS_PLUGIN_SEARCH_H

#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include <sys/stat.h>

namespace kavell {

/// The search path: the directories of VESK_FRAMEWORK_PATH, set apart by ":", then the system's. An unset variable
/// counts as the text "(null)", which names no directory.
[[nodiscard]] std::vector<std::string> pluginDirectories();

/// Whether something is at a search path. Nothing ever is at "(null)": a directory of that name, wherever a program happens
/// to be started, must not bring code into it.
[[nodiscard]] bool isSearchPathTaken(const std::string &path);

/// The directory that is listed for a search path. The path is taken as the path of a URL as it stands: percent escapes
/// are decoded, "?" and "#" end it, and one with a character that a URL does not allow, such as a blank, lists nothing.
[[nodiscard]] std::optional<std::string> listedDirectory(const std::string &path);

/// Whether a file name has exactly the extension "kaplugin".
[[nodiscard]] bool hasPluginExtension(std::string_view name);

/// A bundle's information dictionary on the disk, as far as needed to see that it is still the same.
struct FileIdentity {
    dev_t device = 0;
    ino_t inode = 0;
    off_t size = 0;
    timespec modified{};

    [[nodiscard]] static FileIdentity of(const struct stat &status)
    {
        return {status.st_dev, status.st_ino, status.st_size, status.st_mtim};
    }

    friend bool operator==(const FileIdentity &first, const FileIdentity &second)
    {
        return first.inode == second.inode && first.device == second.device && first.size == second.size &&
               first.modified.tv_sec == second.modified.tv_sec && first.modified.tv_nsec == second.modified.tv_nsec;
    }
};

/// One directory of the search path and the bundles in it that need no closer look as long as they stay as they are.
class PluginDirectory {
public:
    explicit PluginDirectory(std::string path);

    [[nodiscard]] const std::string &path() const { return m_path; }

    /// Calls `examine` with the path of each bundle that is not settled, in the directory's own order; a bundle for
    /// which it answers true is settled: its plug-in is registered for good. Lists nothing when nothing is at the path.
    void forEachUnsettledBundle(const std::function<bool(const std::string &)> &examine);

private:
    struct Hash : std::hash<std::string_view> {
        using is_transparent = void;
    };

    std::string m_path;
    std::optional<std::string> m_listed;
    std::unordered_map<std::string, FileIdentity, Hash, std::equal_to<>> m_settled;  ///< by file name
};

}  // namespace kavell

#endif

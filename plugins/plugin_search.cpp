// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "plugins/plugin_search.h"

#include <cstdlib>
#include <dirent.h>
#include <fcntl.h>
#include <memory>
#include <unistd.h>

#include "model/configuration.h"

namespace kavell {

namespace {

constexpr std::string_view kUnsetVariable = "(null)";
constexpr std::string_view kExtension = ".kaplugin";
constexpr std::string_view kInformation = "/Contents/Info.plist";

struct CloseDirectory {
    void operator()(DIR *directory) const noexcept { closedir(directory); }
};

using OpenDirectory = std::unique_ptr<DIR, CloseDirectory>;

/// The characters of a URL's path (RFC 3986, pchar and "/"), but for percent escapes.
bool isPathCharacter(char character)
{
    constexpr std::string_view allowed =
        "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789-._~!$&'()*+,;=:@/";
    return allowed.find(character) != std::string_view::npos;
}

int hexDigit(char character)
{
    if (character >= '0' && character <= '9')
        return character - '0';
    if (character >= 'a' && character <= 'f')
        return character - 'a' + 10;
    if (character >= 'A' && character <= 'F')
        return character - 'A' + 10;
    return -1;
}

/// Whether text behind the path, a query or a fragment, is allowed in a URL.
bool isAllowedBehindPath(std::string_view text)
{
    for (size_t index = 0; index < text.size(); ++index) {
        const char character = text[index];
        if (character == '%') {
            if (index + 2 >= text.size() || hexDigit(text[index + 1]) < 0 || hexDigit(text[index + 2]) < 0)
                return false;
            index += 2;
        } else if (!isPathCharacter(character) && character != '?' && character != '#') {
            return false;
        }
    }
    return true;
}

}  // namespace

std::vector<std::string> pluginDirectories()
{
    const char *const variable = secure_getenv("VESK_FRAMEWORK_PATH");
    std::string_view remaining = variable ? variable : kUnsetVariable;
    std::vector<std::string> directories;
    for (;;) {
        const size_t colon = remaining.find(':');
        directories.emplace_back(remaining.substr(0, colon));
        if (colon == std::string_view::npos)
            break;
        remaining.remove_prefix(colon + 1);
    }
    directories.push_back(configuration::kSystemPluginDirectory.toStdString());
    return directories;
}

bool isSearchPathTaken(const std::string &path)
{
    return path != kUnsetVariable && access(path.c_str(), F_OK) == 0;
}

std::optional<std::string> listedDirectory(const std::string &path)
{
    std::string decoded;
    for (size_t index = 0; index < path.size(); ++index) {
        const char character = path[index];
        if (character == '?' || character == '#')
            return isAllowedBehindPath(std::string_view(path).substr(index)) ? std::optional(decoded) : std::nullopt;
        if (character == '%') {
            const int high = index + 2 < path.size() ? hexDigit(path[index + 1]) : -1;
            const int low = high >= 0 ? hexDigit(path[index + 2]) : -1;
            if (low < 0 || (high == 0 && low == 0))
                return std::nullopt;
            decoded += static_cast<char>(high * 16 + low);
            index += 2;
        } else if (isPathCharacter(character)) {
            decoded += character;
        } else {
            return std::nullopt;
        }
    }
    return decoded;
}

bool hasPluginExtension(std::string_view name)
{
    return name.size() > kExtension.size() && name.ends_with(kExtension);
}

PluginDirectory::PluginDirectory(std::string path) : m_path(std::move(path)), m_listed(listedDirectory(m_path))
{
}

void PluginDirectory::forEachUnsettledBundle(const std::function<bool(const std::string &)> &examine)
{
    if (!m_listed || !isSearchPathTaken(m_path))
        return;
    const OpenDirectory directory(opendir(m_listed->c_str()));
    if (!directory)
        return;
    const std::string prefix = m_listed->ends_with('/') ? *m_listed : *m_listed + '/';
    std::string information;
    while (const dirent *entry = readdir(directory.get())) {
        const std::string_view name = entry->d_name;
        if (!hasPluginExtension(name))
            continue;
        information.assign(name).append(kInformation);
        struct stat status;
        const bool known = fstatat(dirfd(directory.get()), information.c_str(), &status, 0) == 0;
        const FileIdentity identity = known ? FileIdentity::of(status) : FileIdentity{};
        const auto settled = m_settled.find(name);
        if (settled != m_settled.end() && settled->second == identity)
            continue;
        // The name is copied first: the call may search again and list this directory within itself.
        const std::string bundleName(name);
        if (examine(prefix + bundleName))
            m_settled.insert_or_assign(bundleName, identity);
    }
}

}  // namespace kavell

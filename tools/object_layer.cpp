// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/object_layer.h"

#include <array>
#include <climits>
#include <cstdlib>
#include <dlfcn.h>
#include <memory>
#include <string>
#include <unistd.h>

#include "tools/failure.h"

namespace kavell::tools {

namespace {

constexpr char moduleName[] = "kavell-accounts-object-layer.so";

/// From the program's directory to the library's, as installed and in the build tree.
constexpr std::array<std::string_view, 2> libraryDirectories{"/../" KAVELL_LIBRARY_DIRECTORY, "/../lib"};

std::string programDirectory()
{
    std::array<char, PATH_MAX> path{};
    const ssize_t length = readlink("/proc/self/exe", path.data(), path.size());
    const std::string_view program(path.data(), length > 0 ? static_cast<size_t>(length) : 0);
    return std::string(program.substr(0, program.rfind('/')));
}

ObjectLayerEntry *loadObjectLayer()
{
    std::string reason = "it is not there";
    for (const std::string_view directory : libraryDirectories) {
        const std::string path = programDirectory().append(directory).append("/kavellaccounts/").append(moduleName);
        if (access(path.c_str(), F_OK) != 0)
            continue;
        void *const module = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL | RTLD_NODELETE);
        void *const entry = module ? dlsym(module, objectLayerEntry) : nullptr;
        if (entry)
            return reinterpret_cast<ObjectLayerEntry *>(entry);
        const char *const loaderReason = dlerror();
        reason = loaderReason ? loaderReason : "it has no entry";
    }
    throw Failure(ExitCode::Failed, std::string("the object layer, which this command needs, cannot be loaded (")
                                        .append(moduleName)
                                        .append(": ")
                                        .append(reason)
                                        .append("); install the package with libkavellaccounts"));
}

}  // namespace

Json askObjectLayer(std::string_view question, Json members)
{
    members["question"] = std::string(question);
    const std::unique_ptr<char, void (*)(void *)> text(loadObjectLayer()(members.dump().c_str()), std::free);
    if (!text)
        throw Failure(ExitCode::Failed, "the object layer ran out of memory");
    Json answer = Json::parse(text.get());
    if (answer.contains("error"))
        throw Failure(ExitCode::Failed, answer["error"].get<std::string>());
    return answer;
}

}  // namespace kavell::tools

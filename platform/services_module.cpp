// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "platform/services_module.h"

#include <cstdlib>
#include <dlfcn.h>

namespace kavell {

namespace {

// Beside the library, as installed and in the build tree; or in lib/ next to the directory of a program that has the
// library's code inside it, as the unit tests have.
constexpr const char *kPlaces[] = {"/kavellaccounts/kavellstore-services.so",
                                   "/../lib/kavellaccounts/kavellstore-services.so"};

/// The directory of the object that holds this code, which is pinned in memory: the module's users run threads in it.
std::string ownDirectory()
{
    Dl_info place{};
    if (!dladdr(reinterpret_cast<const void *>(&servicesModule), &place) || !place.dli_fname)
        return {};
    // Fails for the program itself, which nobody can unload.
    static_cast<void>(dlopen(place.dli_fname, RTLD_LAZY | RTLD_NOLOAD | RTLD_NODELETE));
    const std::string file = place.dli_fname;
    const size_t slash = file.rfind('/');
    return slash == std::string::npos ? "." : file.substr(0, slash);
}

void *openModule()
{
    // A program with raised privileges must not load what its caller's environment names: secure_getenv answers null.
    if (const char *forced = secure_getenv("KAVELL_SERVICES_MODULE"))
        return dlopen(forced, RTLD_NOW | RTLD_LOCAL | RTLD_NODELETE);
    const std::string directory = ownDirectory();
    if (directory.empty())
        return nullptr;
    for (const char *place : kPlaces) {
        if (void *module = dlopen((directory + place).c_str(), RTLD_NOW | RTLD_LOCAL | RTLD_NODELETE))
            return module;
    }
    return nullptr;
}

const ServicesModule *loadModule()
{
    void *module = openModule();
    if (!module)
        return nullptr;
    const auto entry = reinterpret_cast<ServicesModuleEntry *>(dlsym(module, kServicesModuleEntry));
    const ServicesModule *services = entry ? entry() : nullptr;
    return services && services->version == kServicesModuleVersion ? services : nullptr;
}

}  // namespace

const ServicesModule *servicesModule() noexcept
{
    static const ServicesModule *const loaded = loadModule();
    return loaded;
}

}  // namespace kavell

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The module's one exported function; everything else in it is hidden.

#include "platform/services_module.h"

#include "platform/services/bus_sender.h"
#include "platform/services/secret_service.h"
#include "platform/services/vault.h"

extern "C" __attribute__((visibility("default"))) const kavell::ServicesModule *kavellServicesModule()
{
    static constexpr kavell::ServicesModule services = {kavell::kServicesModuleVersion, kavell::makeSecretService,
                                                        kavell::makeVault, kavell::makeBusSender};
    return &services;
}

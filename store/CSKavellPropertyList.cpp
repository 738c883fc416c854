// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include <kavellaccounts/CSKavellPropertyList.h>

#include <string>

#include "platform/property_list.h"
#include "runtime/object_p.h"

CSKavellDictionaryRef CSKavellPropertyListCreateDictionary(const void *bytes, size_t length)
{
    if (!bytes)
        return nullptr;
    return kavell::parsePropertyList({static_cast<const char *>(bytes), length}).leak();
}

CSKavellDataRef CSKavellPropertyListCopyXML(CSKavellDictionaryRef dictionary)
{
    return kavell::guarded(CSKavellDataRef(), [&]() -> CSKavellDataRef {
        std::string xml;
        if (!dictionary || !kavell::writePropertyList(dictionary, xml))
            return nullptr;
        return CSKavellDataCreate(xml.data(), xml.size());
    });
}

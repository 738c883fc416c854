// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A name server's reply of any bytes: its records are read within its bounds, and every exchanger's name ends in the
// root. The names of the records, and the reply itself taken for a name, turn into text within the text's bounds.

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string_view>

#include "platform/qt/record_query.h"
#include "platform/qt/record_reply.h"
#include "plugins/KADNSServiceNames_p.h"

namespace {

/// The text ends with its dot, in the text's room, when the name converts at all.
void convert(std::string_view bytes, char escape)
{
    KADNSServiceWireName name{};
    std::copy_n(bytes.begin(), std::min(bytes.size(), name.size()), name.begin());
    KADNSServiceNameText text;
    const char *end = _KADNSServiceConvertDomainNameToCString_withescape(name, text, escape);
    if (end && (end <= text.data() || end >= text.data() + text.size() || *end != 0 || end[-1] != '.'))
        std::abort();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const std::string_view reply(reinterpret_cast<const char *>(data), size);
    for (const auto &record : kavell::recordsOfReply(reply, kavell::kRecordTypeMX, kavell::kRecordClassIN)) {
        if (record.data.size() < 3 || record.data.size() > 257 || record.data.back() != 0)
            std::abort();
        convert(std::string_view(record.data).substr(2), '\\');
    }
    convert(reply, '\\');
    convert(reply, 0);
    return 0;
}

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A name server's reply of any bytes: its records are read within its bounds, and every exchanger's name ends in the root.

#include <cstdint>
#include <cstdlib>
#include <string_view>

#include "platform/qt/record_query.h"
#include "platform/qt/record_reply.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const std::string_view reply(reinterpret_cast<const char *>(data), size);
    for (const auto &record : kavell::recordsOfReply(reply, kavell::kRecordTypeMX, kavell::kRecordClassIN))
        if (record.data.size() < 3 || record.data.size() > 257 || record.data.back() != 0)
            std::abort();
    return 0;
}

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A name server's reply of any bytes: its records are read within its bounds, and every exchanger's name ends in the
// root. The names of the records, and the reply itself taken for a record's data and for a name, turn into text within
// the text's bounds, which tells all bytes of the name, and into hosts that are found again.

#include <algorithm>

#include <kavellaccounts/KADNSService.h>

#include "platform/qt/record_query.h"
#include "platform/qt/record_reply.h"
#include "plugins/KADNSServiceNames_p.h"
#include "plugins/KADNSService_p.h"
#include "tests/fuzz/fuzz_target.h"

using kavell::fuzz::require;

namespace {

/// The name in wire form that a text with escapes means.
std::string wireNameOf(std::string_view text, char escape)
{
    std::string name, label;
    for (size_t at = 0; at < text.size() && text != "."; ++at) {
        if (text[at] == '.') {
            name += static_cast<char>(label.size());
            name += label;
            label.clear();
        } else if (text[at] != escape) {
            label += text[at];
        } else if (const char escaped = text[++at]; escaped >= '0' && escaped <= '9') {
            label += static_cast<char>((escaped - '0') * 100 + (text[at + 1] - '0') * 10 + (text[at + 2] - '0'));
            at += 2;
        } else {
            label += escaped;
        }
    }
    return name + '\0';
}

/// The text ends with its dot, in the text's room, when the name converts at all.
void convert(std::string_view bytes, char escape)
{
    KADNSServiceWireName name{};
    std::copy_n(bytes.begin(), std::min(bytes.size(), name.size()), name.begin());
    KADNSServiceNameText text;
    const char *end = _KADNSServiceConvertDomainNameToCString_withescape(name, text, escape);
    if (!end)
        return;
    require(end > text.data() && end < text.data() + text.size() && *end == 0, "a name's text ends in its room");
    require(end[-1] == '.', "a name's text ends with a dot");
    if (escape == 0)
        return;
    const std::string wire = wireNameOf({text.data(), end}, escape);
    require(std::equal(wire.begin(), wire.end(), name.begin(),
                       [](char byte, uint8_t other) { return static_cast<uint8_t>(byte) == other; }),
            "a name's text tells all of its bytes");
}

/// A host is in lower case, ends with its dot, and is known again by its name and by each domain that it lies in.
void readHost(std::string_view data)
{
    const QString host = KADNSServiceHostOfMailExchanger(data);
    if (host.isNull())
        return;
    require(host.endsWith(u'.'), "a host ends with a dot");
    require(host == host.toLower(), "a host is in lower case");
    const auto service = KADNSService::initWithServerAddress(QStringLiteral("example.org"));
    service->setMailServers({host});
    require(service->hasMailHost(host), "a host is found by its name");
    for (qsizetype dot = host.indexOf(u'.'); dot >= 0; dot = host.indexOf(u'.', dot + 1))
        require(service->hasMailHost(host.sliced(dot + 1)), "a host is found by its domain");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const std::string_view reply = kavell::fuzz::textOf(data, size);
    for (const auto &record : kavell::recordsOfReply(reply, kavell::kRecordTypeMX, kavell::kRecordClassIN)) {
        require(record.data.size() >= 3 && record.data.size() <= 257, "an exchanger's name has 1 to 255 bytes");
        require(record.data.back() == 0, "an exchanger's name ends in the root");
        convert(std::string_view(record.data).substr(2), '\\');
        readHost(record.data);
    }
    convert(reply, '\\');
    convert(reply, 0);
    readHost(reply);
    return 0;
}

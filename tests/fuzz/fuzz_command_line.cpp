// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// A word of any bytes on the command line, taken for each kind of value in turn: it is refused or it is something that a
// data file can hold, what is shown of it means the same again, and nothing that is shown steers a terminal.

#include <optional>
#include <vector>

#include <kavellaccounts/CSKavellData.h>

#include "platform/property_list.h"
#include "tests/fuzz/fuzz_target.h"
#include "tools/assignment.h"
#include "tools/failure.h"
#include "tools/json_value.h"
#include "tools/names.h"
#include "tools/text.h"
#include "tools/transfer_format.h"
#include "tools/value_forms.h"

using namespace kavell;
using namespace kavell::tools;
using kavell::fuzz::require;

namespace {

using Value = Ref<CSKavellTypeRef>;

/// What the reader answers; nothing when it refuses, which it does with a sentence that can be shown.
template <typename Read> auto accepted(Read read) -> std::optional<decltype(read())>
{
    try {
        return read();
    } catch (const Failure &failure) {
        require(failure.code() == ExitCode::BadInput, "a refusal says that the input is bad");
        require(isUTF8(failure.what()) && !hasControlCharacter(failure.what()),
                "a refusal does not steer the terminal");
        return std::nullopt;
    }
}

bool isStorable(std::string_view key, const Value &value)
{
    const auto dictionary = adopt(CSKavellDictionaryCreateMutable());
    CSKavellDictionarySetValue(dictionary.get(), makeString(key).get(), value.get());
    std::string xml;
    if (!writePropertyList(dictionary.get(), xml))
        return false;
    const auto read = parsePropertyList(xml);
    return read && CSKavellEqual(read.get(), dictionary.get());
}

void tryAssignment(std::string_view word)
{
    if (const size_t equals = word.find('='); equals != word.npos && word.substr(equals + 1).starts_with('@'))
        return;  // the name of a file that would be read
    const auto assignment = accepted([&] { return parseAssignment(word); });
    if (!assignment)
        return;
    require(isStorable(assignment->key, assignment->value), "an attribute can be stored");
    const std::string shown = assignmentText(assignment->key, assignment->value.get());
    require(!hasControlCharacter(shown), "an attribute does not steer the terminal");
    const auto data = cast<CSKavellDataRef>(assignment->value.get(), CSKavellDataGetTypeID());
    if (CSKavellDataGetLength(data) > 48 || shown.find('\\') != shown.npos)
        return;  // only counted, or shown with escapes
    const auto again = accepted([&] { return parseAssignment(shown); });
    require(again && again->key == assignment->key && CSKavellEqual(again->value.get(), assignment->value.get()),
            "what is shown of an attribute sets it again");
}

void tryJson(std::string_view text)
{
    const auto value = accepted([&] { return valueOf(parseJson(text, "the input"), "the input"); });
    if (!value)
        return;
    require(isStorable("key", *value), "a JSON value can be stored");
    const std::string written = textOf(jsonOf(value->get()));
    require(isUTF8(written), "JSON is UTF-8");
    require(CSKavellEqual(valueOf(parseJson(written, "the output"), "the output").get(), value->get()),
            "JSON loses nothing");
}

void tryDocument(std::string_view text)
{
    const auto accounts = accepted([&] { return readTransferDocument(text, "the document"); });
    for (const TransferredAccount &account : accounts.value_or(std::vector<TransferredAccount>())) {
        require(nameProblem(account.address.login).empty(), "a login name can be a file's");
        require(nameProblem(account.address.providerType).empty(), "a provider type can be a directory's");
        for (const auto &[service, attributes] : account.services)
            require(isStorable(service, Value(attributes)), "a service can be stored");
    }
}

void tryNames(std::string_view word)
{
    for (const auto read : {providerTypeOf, serviceOf}) {
        const auto name = accepted([&] { return read(word); });
        require(!name || nameProblem(*name).empty(), "a name can be a file's");
    }
    const auto key = accepted([&] { return parseKey(word); });
    require(!key || isStorableText(*key), "a key can be stored");
}

void tryForms(std::string_view text)
{
    if (const auto date = parseDate(text); date && isStorableDate(*date))
        require(parseDate(formatDate(*date)) == date, "a date is read as it is written");
    if (const auto bytes = parseBase64(text))
        require(parseBase64(formatBase64(*bytes)) == bytes, "data are read as they are written");
    if (const auto real = parseReal(text))
        require(parseReal(formatReal(*real)) == real, "a real is read as it is written");
    const std::string shown = escaped(text);
    require(isUTF8(shown) && !hasControlCharacter(shown), "escaped text does not steer the terminal");
    require(displayWidth(shown) <= 2 * shown.size(), "text has a width");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const std::string_view word = fuzz::textOf(data, size);
    tryAssignment(word);
    tryJson(word);
    tryDocument(word);
    tryNames(word);
    tryForms(word);
    return 0;
}

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts import: adds the accounts of an exported document. The whole document is understood, and every
// account it touches is looked at, before the first one is changed.

#include <kavellaccounts/CSKavellArray.h>
#include <kavellaccounts/CSKavellData.h>
#include <kavellaccounts/CSKavellDictionary.h>

#include "tools/account_json.h"
#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/files.h"
#include "tools/names.h"
#include "tools/text.h"
#include "tools/transfer_format.h"

namespace kavell::tools {

namespace {

constexpr CommandHelp help{
    "import", "FILE|-",
    "Add the accounts of an exported JSON document, or of standard input for -. Nothing is changed unless the whole "
    "document makes sense. Accounts that exist already are left alone, and then nothing is imported at all, unless "
    "one of --merge, --replace and --skip-existing says what to do with them. Passwords of existing accounts stay.",
    "  kavell-accounts import accounts.json --dry-run\n"
    "  kavell-accounts import accounts.json --merge\n"
    "  ssh other kavell-accounts export | kavell-accounts import -"};

enum class Treatment { Add, Merge, Replace, Skip };

constexpr const char *wordOf(Treatment treatment)
{
    switch (treatment) {
    case Treatment::Add:
        return "add";
    case Treatment::Merge:
        return "merge";
    case Treatment::Replace:
        return "replace";
    default:
        return "skip";
    }
}

/// What is done about one account of the document.
struct Step {
    TransferredAccount account;
    Treatment treatment = Treatment::Add;
};

struct ImportOptions {
    bool merge = false;
    bool replace = false;
    bool skip = false;
    bool dryRun = false;
};

Treatment treatmentOfExisting(const ImportOptions &options)
{
    return options.merge ? Treatment::Merge : options.replace ? Treatment::Replace : Treatment::Skip;
}

/// What an account would take in its data file, at most.
struct StoredSize {
    size_t keys = 0;
    size_t bytes = 0;
};

void measure(CSKavellTypeRef value, StoredSize &size)
{
    // The longest escape of a character is six bytes, base64 is a third longer, and each value stands between tags.
    constexpr size_t tags = 64;
    size.bytes += tags;
    if (const auto text = cast<CSKavellStringRef>(value, CSKavellStringGetTypeID()))
        size.bytes += CSKavellStringGetLength(text) * 6;
    if (const auto data = cast<CSKavellDataRef>(value, CSKavellDataGetTypeID()))
        size.bytes += CSKavellDataGetLength(data) * 3 / 2;
    const auto array = cast<CSKavellArrayRef>(value, CSKavellArrayGetTypeID());
    for (size_t index = 0; index < CSKavellArrayGetCount(array); ++index)
        measure(CSKavellArrayGetValueAtIndex(array, index), size);
    const auto dictionary = cast<CSKavellDictionaryRef>(value, CSKavellDictionaryGetTypeID());
    std::vector<CSKavellTypeRef> keys(CSKavellDictionaryGetCount(dictionary)), values(keys.size());
    CSKavellDictionaryGetKeysAndValues(dictionary, keys.data(), values.data());
    size.keys += keys.size();
    for (size_t index = 0; index < keys.size(); ++index) {
        measure(keys[index], size);
        measure(values[index], size);
    }
}

/// Refuses an account that no data file could hold now, not half way through.
void checkSize(const TransferredAccount &account)
{
    constexpr size_t mostKeys = 9000, mostBytes = size_t{30} << 20;
    StoredSize size;
    measure(account.attributes.get(), size);
    for (const auto &[service, attributes] : account.services)
        measure(attributes.get(), size);
    if (size.keys > mostKeys || size.bytes > mostBytes)
        refuse("nothing was imported, because " + account.address.text() +
               " is too large for an account, which has room for 9000 keys and 30 MiB");
}

std::vector<Step> planOf(std::vector<TransferredAccount> accounts, const ImportOptions &options)
{
    std::vector<Step> steps;
    std::string existing;
    for (TransferredAccount &account : accounts) {
        checkSize(account);
        Step step{std::move(account), Treatment::Add};
        if (isOnDisk(step.account.address)) {
            step.treatment = treatmentOfExisting(options);
            existing += (existing.empty() ? "" : ", ") + step.account.address.text();
            if (step.treatment != Treatment::Skip)
                (void)openExisting(step.account.address);  // refuses a damaged one now, not half way through
        }
        steps.push_back(std::move(step));
    }
    if (!existing.empty() && !options.merge && !options.replace && !options.skip)
        refuse("nothing was imported, because these accounts exist already: " + existing +
               "; say --merge to lay the imported attributes over theirs, --replace to take theirs away first, or "
               "--skip-existing to leave them alone");
    return steps;
}

void mergeAttributes(CSKavellAccountRef account, CSKavellStringRef service, CSKavellDictionaryRef attributes)
{
    std::vector<CSKavellTypeRef> keys(CSKavellDictionaryGetCount(attributes));
    std::vector<CSKavellTypeRef> values(keys.size());
    CSKavellDictionaryGetKeysAndValues(attributes, keys.data(), values.data());
    for (size_t index = 0; index < keys.size(); ++index)
        _CSKavellAccountSetServiceAttribute(account, service, static_cast<CSKavellStringRef>(keys[index]),
                                            values[index]);
}

/// Takes away what the account has, but not the reference to its password.
void clearAttributes(const OpenedAccount &account)
{
    CSKavellAccountRef record = account.record.get();
    const Ref<CSKavellDictionaryRef> own = ownAttributes(record);
    std::vector<CSKavellTypeRef> keys(CSKavellDictionaryGetCount(own.get()));
    CSKavellDictionaryGetKeysAndValues(own.get(), keys.data(), nullptr);
    for (CSKavellTypeRef key : keys)
        _CSKavellAccountRemoveProviderAttribute(record, static_cast<CSKavellStringRef>(key));
    for (const std::string &identifier : serviceIdentifiers(account))
        _CSKavellAccountRemoveAllServiceAttributes(record, makeString(identifier).get());
}

void perform(const Step &step)
{
    if (step.treatment == Treatment::Skip)
        return;
    const TransferredAccount &imported = step.account;
    const OpenedAccount account =
        step.treatment == Treatment::Add ? openAccount(imported.address) : openExisting(imported.address);
    if (step.treatment == Treatment::Replace)
        clearAttributes(account);
    if (step.treatment != Treatment::Merge && !imported.uuid.empty())
        _CSKavellAccountSetUUIDString(account.record.get(), makeString(imported.uuid).get());
    mergeAttributes(account.record.get(), nullptr, imported.attributes.get());
    for (const auto &[service, attributes] : imported.services)
        mergeAttributes(account.record.get(), makeString(service).get(), attributes.get());
    if (_CSKavellAccountHasPendingChanges(account.record.get()))
        save(account, imported.address.text());
}

void printPlan(const std::vector<Step> &steps, const CommandLine &line, bool dryRun)
{
    if (line.json) {
        Json json = Json::object();
        json["dryRun"] = dryRun;
        json["accounts"] = Json::array();
        for (const Step &step : steps) {
            Json account = addressJson(step.account.address);
            account["action"] = wordOf(step.treatment);
            json["accounts"].push_back(std::move(account));
        }
        print(textOf(json));
        return;
    }
    if (line.quiet && !dryRun)
        return;
    std::vector<std::vector<std::string>> rows;
    for (const Step &step : steps)
        rows.push_back({wordOf(step.treatment), step.account.address.text()});
    print(alignedTable(rows) + (steps.empty() ? "The document has no accounts.\n" : ""));
}

}  // namespace

ExitCode runImport(const Words &words)
{
    CommandLine line(help);
    ImportOptions options;
    line.addFlag("--merge", options.merge, "Lay the imported attributes over those of existing accounts");
    line.addFlag("--replace", options.replace, "Replace the attributes of existing accounts");
    line.addFlag("--skip-existing", options.skip, "Leave existing accounts as they are");
    line.addFlag("-n,--dry-run", options.dryRun, "Only say what would be done");
    line.parse(words);
    const std::string file = line.takeWord("the file is missing; name it, or write - for standard input");
    line.expectNoMore();
    if (options.merge + options.replace + options.skip > 1)
        refuse("--merge, --replace and --skip-existing exclude each other; say one of them");
    const std::string name = file == "-" ? "standard input" : inQuotes(file);
    const std::vector<Step> steps = planOf(readTransferDocument(readInputFile(file), name), options);
    printPlan(steps, line, options.dryRun);
    if (!options.dryRun)
        for (const Step &step : steps)
            perform(step);
    return ExitCode::Done;
}

}  // namespace kavell::tools

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts doctor: examines everything that the store keeps on disk and in the kernel, says what is wrong, and
// with --repair mends what can be mended without losing anything. Without --repair nothing is changed.

#include <algorithm>

#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/doctor.h"
#include "tools/json_value.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

constexpr CommandHelp help{
    "doctor", "",
    "Look for what is wrong: locks that a killed program left taken, damaged and unreadable data files, wrong "
    "permissions, saves that were interrupted, files left over, passwords without accounts and accounts without "
    "passwords. With --repair, mend what can be mended without losing anything; else nothing is changed. The exit "
    "code is 0 when nothing is wrong (any more) and 1 when problems are left.",
    "  kavell-accounts doctor\n"
    "  kavell-accounts doctor --repair\n"
    "  kavell-accounts doctor --json | jq '.findings[] | select(.weight == \"problem\")'"};

std::string counted(size_t count, const std::string &one)
{
    return std::to_string(count) + " " + one + (count == 1 ? "" : "s");
}

std::string wordOf(const Finding &finding)
{
    return finding.mended ? "mended" : finding.weight == Weight::Problem ? "problem" : "note";
}

Json jsonOf(const Finding &finding)
{
    Json json = Json::object();
    json["kind"] = finding.kind;
    json["weight"] = finding.weight == Weight::Problem ? "problem" : "note";
    json["mended"] = finding.mended;
    json["path"] = isUTF8(finding.path) ? finding.path : escaped(finding.path);
    json["sentence"] = finding.sentence;
    return json;
}

void printJson(const Findings &findings, size_t accounts, size_t left)
{
    Json json = Json::object();
    json["clean"] = left == 0;
    json["accounts"] = accounts;
    json["findings"] = Json::array();
    for (const Finding &finding : findings.all)
        json["findings"].push_back(jsonOf(finding));
    print(textOf(json));
}

void printText(const Findings &findings, size_t accounts, size_t left, size_t mended, bool canMend)
{
    std::string text;
    for (const Finding &finding : findings.all)
        text += bold(wordOf(finding) + ":") + " " + finding.sentence + "\n";
    const std::string examined = counted(accounts, "account") + " examined";
    text += examined + ", " + (left == 0 ? "no problems" : counted(left, "problem")) +
            (mended == 0 ? "" : ", " + std::to_string(mended) + " mended") + ".\n";
    if (canMend)
        text += "Run 'kavell-accounts doctor --repair' to mend what can be mended.\n";
    print(text);
}

}  // namespace

ExitCode runDoctor(const Words &words)
{
    CommandLine line(help);
    Findings findings;
    line.addFlag("--repair", findings.repair, "Mend what can be mended");
    line.parse(words);
    line.expectNoMore();
    const std::vector<Address> accounts = accountsOnDisk();
    examineLocks(accounts, findings);
    examineDirectories(findings);
    examineContents(accounts, findings);
    examineSecrets(accounts, findings);
    const auto count = [&](auto holds) {
        return static_cast<size_t>(std::count_if(findings.all.begin(), findings.all.end(), holds));
    };
    const size_t mended = count([](const Finding &finding) { return finding.mended; });
    const size_t left =
        count([](const Finding &finding) { return finding.weight == Weight::Problem && !finding.mended; });
    const bool canMend = count([](const Finding &finding) { return finding.canMend; }) > 0;
    if (line.json)
        printJson(findings, accounts.size(), left);
    else
        printText(findings, accounts.size(), left, mended, canMend);
    return left == 0 ? ExitCode::Done : ExitCode::Failed;
}

}  // namespace kavell::tools

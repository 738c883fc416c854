// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// kavell-accounts: lists, shows and changes the online accounts of the user. main picks the subcommand before anything
// is set up, so that a short command pays for itself only.

#include <array>
#include <cstdlib>
#include <exception>
#include <string>
#include <vector>

#include "tools/command_line.h"
#include "tools/commands.h"
#include "tools/names.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

struct Command {
    std::string_view name;
    std::string_view summary;  ///< empty for a hidden one
    ExitCode (*run)(const Words &words);
};

constexpr std::array<Command, 17> commands{{
    {"list", "List the accounts", runList},
    {"show", "Show one account with its attributes", runShow},
    {"add", "Add an account", runAdd},
    {"set", "Set attributes of an account or of one of its services", runSet},
    {"unset", "Remove attributes", runUnset},
    {"remove", "Remove an account with its password", runRemove},
    {"password", "Store, read or remove an account's password", runPassword},
    {"watch", "Print a line whenever an account changes", runWatch},
    {"doctor", "Find, and with --repair mend, what is wrong", runDoctor},
    {"import", "Add accounts from a JSON file", runImport},
    {"export", "Write accounts as JSON, without passwords", runExport},
    {"plugins", "List the plug-ins, and why one was refused", runPlugins},
    {"identify", "Tell which plug-in an address, server or settings belong to", runIdentify},
    {"match", "Find the account that an application's account belongs to", runMatch},
    {"children", "List the applications' accounts of one account", runChildren},
    {"servers", "List, add or remove organisation servers", runServers},
    {"words", "", runWords},
}};

void printHelp()
{
    std::vector<std::vector<std::string>> rows;
    for (const Command &command : commands)
        if (!command.summary.empty())
            rows.push_back({std::string(command.name), std::string(command.summary)});
    print("kavell-accounts lists, shows and changes your online accounts.\n\n" + bold("Usage:") +
          " kavell-accounts COMMAND [WORD...] [OPTION...]\n\n" + bold("Commands:") + "\n" + alignedTable(rows, "  ") +
          "\n" + bold("Options:") +
          "\n  -h, --help     Show this help, or with a command that command's\n"
          "  --version      Show the version\n"
          "  --json         Write results as JSON\n\n"
          "An account is named by its provider and login name: google anna@gmail.com,\n"
          "or google/anna@gmail.com in one word.\n\n" +
          bold("Examples:") +
          "\n"
          "  kavell-accounts add google anna@gmail.com fullname='Anna Example'\n"
          "  kavell-accounts set google anna@gmail.com --service IMAPMail server=imap.gmail.com port:int=993\n"
          "  kavell-accounts password set google anna@gmail.com\n"
          "  kavell-accounts list\n\n"
          "Each command explains itself: kavell-accounts set --help\n");
}

const Command &commandOf(std::string_view name)
{
    std::vector<std::string_view> known;
    for (const Command &command : commands) {
        if (command.name == name)
            return command;
        if (!command.summary.empty())
            known.push_back(command.name);
    }
    const std::string_view near = nearestWord(name, known);
    refuse("unknown command " + inQuotes(name) +
           (near.empty() ? "; known are " + joined(known, ", ") : ", did you mean " + inQuotes(near) + "?"));
}

/// Runs the command; what stands before its name (--json) is given to it like what stands behind.
ExitCode dispatch(Words words)
{
    Words before;
    while (!words.empty() && words.front().starts_with('-')) {
        const std::string option = words.front();
        words.erase(words.begin());
        if (option == "--help" || option == "-h") {
            printHelp();
            return ExitCode::Done;
        }
        if (option == "--version") {
            print("kavell-accounts " KAVELL_VERSION "\n");
            return ExitCode::Done;
        }
        if (option != "--json" && option != "-q" && option != "--quiet")
            refuse("unknown option " + inQuotes(option) + "; 'kavell-accounts --help' explains");
        before.push_back(option);
    }
    if (words.empty())
        refuse("a command is missing; 'kavell-accounts --help' shows all, 'kavell-accounts list' the accounts");
    if (words.front() == "help") {
        words.erase(words.begin());
        if (words.empty()) {
            printHelp();
            return ExitCode::Done;
        }
        words.insert(words.begin() + 1, "--help");
    }
    const Command &command = commandOf(words.front());
    words.erase(words.begin());
    words.insert(words.begin(), before.begin(), before.end());
    return command.run(words);
}

int run(int count, char **arguments)
{
    try {
        return static_cast<int>(dispatch(Words(arguments + 1, arguments + count)));
    } catch (const HelpWasAsked &) {
        return static_cast<int>(ExitCode::Done);
    } catch (const Failure &failure) {
        complain(failure.what());
        return static_cast<int>(failure.code());
    } catch (const std::exception &error) {
        complain(std::string("failed: ") + error.what());
        return static_cast<int>(ExitCode::Failed);
    }
}

}  // namespace

}  // namespace kavell::tools

int main(int count, char **arguments)
{
    return kavell::tools::run(count, arguments);
}

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later
//
// The words after a subcommand: its options through CLI11, the other words in their order, and the help that teaches.
// Every command makes one of these, adds its options, and parses. One thread.

#ifndef KAVELL_TOOLS_COMMAND_LINE_H
#define KAVELL_TOOLS_COMMAND_LINE_H

#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include <CLI/App.hpp>
#include <CLI/Config.hpp>
#include <CLI/Formatter.hpp>

#include "tools/account_access.h"

namespace kavell::tools {

/// What a command says about itself in --help.
struct CommandHelp {
    const char *name;      ///< "set"
    const char *usage;     ///< the words behind the name: "PROVIDER LOGIN KEY=VALUE..."
    const char *purpose;   ///< sentences
    const char *examples;  ///< whole lines, each indented by two blanks
};

/// Thrown by CommandLine::parse once help has been printed.
struct HelpWasAsked {};

class CommandLine {
public:
    explicit CommandLine(const CommandHelp &help);

    /// The options of every command.
    bool json = false;
    bool quiet = false;

    /// Options of this command; the targets are filled by parse.
    void addFlag(const std::string &names, bool &target, const std::string &description);
    void addValue(const std::string &names, std::string &target, const std::string &type,
                  const std::string &description);
    void addNumber(const std::string &names, std::optional<double> &target, const std::string &type,
                   const std::string &description);
    /// --service, which counts for the words after it.
    void addServices();

    /// Reads the words; refuses what it does not know. Prints help and throws HelpWasAsked when that is asked for.
    void parse(const Words &words);

    /// The words that are no options, in their order.
    [[nodiscard]] Words &positionals() { return m_positionals; }
    /// The service (full identifier, empty for the account itself) that each of them comes under.
    [[nodiscard]] std::vector<std::string> &servicesOfPositionals() { return m_servicesOfPositionals; }

    /// The service of the last --service (full identifier), empty when there was none.
    [[nodiscard]] const std::string &lastService() const { return m_lastService; }

    /// Refuses a --service that has no words behind it.
    void refuseTrailingService() const;

    /// Takes the account's address off the positionals.
    [[nodiscard]] Address takeAccount();

    /// Takes the next word off the positionals; refuses with this sentence when there is none.
    [[nodiscard]] std::string takeWord(const std::string &missing);

    /// Refuses positionals that are left over.
    void expectNoMore() const;

    /// The result of a command that changes something: `result` as JSON with --json, else the sentence, else nothing.
    void report(const std::string &sentence, const std::function<std::string()> &result) const;

private:
    void sortWords();

    CommandHelp m_help;
    CLI::App m_app;
    CLI::Option *m_wordOption = nullptr;
    CLI::Option *m_serviceOption = nullptr;
    Words m_rawWords;
    Words m_rawServices;
    Words m_positionals;
    std::vector<std::string> m_servicesOfPositionals;
    std::string m_lastService;
    bool m_lastServiceIsUsed = true;
    std::vector<std::string *> m_values;
};

}  // namespace kavell::tools

#endif

// SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
// SPDX-License-Identifier: LGPL-2.1-or-later

#include "tools/command_line.h"

#include <algorithm>
#include <memory>

#include "tools/failure.h"
#include "tools/names.h"
#include "tools/text.h"

namespace kavell::tools {

namespace {

/// CLI11 takes a word such as "[a,b]" for a list and splits it. A word that begins with "[" is given to it behind this
/// byte, which no valid word has, and the byte is taken off again.
constexpr char bracketGuard = '\x01';

std::string guarded(const std::string &word)
{
    return word.starts_with('[') ? bracketGuard + word : word;
}

std::string unguarded(const std::string &word)
{
    return word.starts_with(bracketGuard) && word.substr(1, 1) == "[" ? word.substr(1) : word;
}

constexpr size_t helpWidth = 80;

/// The sentences in lines of at most helpWidth columns.
std::string wrapped(std::string_view sentences)
{
    std::string text;
    size_t width = 0;
    while (!sentences.empty()) {
        const std::string_view word = sentences.substr(0, sentences.find(' '));
        sentences.remove_prefix(std::min(word.size() + 1, sentences.size()));
        const bool fits = width == 0 || width + 1 + word.size() <= helpWidth;
        text += width == 0 ? "" : fits ? " " : "\n";
        width = fits && width > 0 ? width + 1 + word.size() : word.size();
        text += word;
    }
    return text;
}

class HelpFormatter : public CLI::Formatter {
public:
    explicit HelpFormatter(std::string usage) : m_usage(std::move(usage)) { column_width(28); }

    std::string make_usage(const CLI::App *, std::string) const override
    {
        return "\n" + bold("Usage:") + " " + m_usage + "\n";
    }
    std::string make_group(std::string group, bool positional, std::vector<const CLI::Option *> options) const override
    {
        const std::string text = CLI::Formatter::make_group(group, positional, options);
        return "\n" + bold(group + ":") + text.substr(std::min(text.size(), group.size() + 2));
    }
    std::string make_positionals(const CLI::App *) const override { return {}; }
    std::string make_option_opts(const CLI::Option *option) const override
    {
        return option->get_type_size() == 0 ? std::string() : " " + option->get_type_name();
    }

private:
    std::string m_usage;
};

std::string sentenceOf(const CLI::ParseError &error, const Words &words)
{
    if (error.get_exit_code() == static_cast<int>(CLI::ExitCodes::ExtrasError))
        for (const std::string &word : words)
            if (word.size() > 1 && word.starts_with('-') &&
                std::string_view(error.what()).find(word) != std::string_view::npos)
                return "unknown option " + inQuotes(word.substr(0, word.find('=')));
    std::string sentence = escaped(error.what());
    while (sentence.ends_with('.') || sentence.ends_with(' '))
        sentence.pop_back();
    return sentence;
}

}  // namespace

CommandLine::CommandLine(const CommandHelp &help)
    : m_help(help), m_app(wrapped(help.purpose), std::string("kavell-accounts ") + help.name)
{
    const std::string usage =
        "kavell-accounts " + std::string(help.name) + " " + help.usage + (*help.usage ? " " : "") + "[OPTION...]";
    m_app.formatter(std::make_shared<HelpFormatter>(usage));
    m_app.footer(bold("Examples:") + "\n" + help.examples);
    m_app.set_help_flag("-h,--help", "Show this help");
    m_app.add_flag("--json", json, "Write the result as JSON");
    m_app.add_flag("-q,--quiet", quiet, "Do not say what was done");
    m_wordOption = m_app.add_option("words", m_rawWords, "");
}

void CommandLine::addFlag(const std::string &names, bool &target, const std::string &description)
{
    m_app.add_flag(names, target, description);
}

void CommandLine::addValue(const std::string &names, std::string &target, const std::string &type,
                           const std::string &description)
{
    m_app.add_option(names, target, description)->type_name(type);
    m_values.push_back(&target);
}

void CommandLine::addNumber(const std::string &names, std::optional<double> &target, const std::string &type,
                            const std::string &description)
{
    m_app
        .add_option_function<double>(
            names, [&target](const double &number) { target = number; }, description)
        ->type_name(type);
}

void CommandLine::addServices()
{
    m_serviceOption = m_app.add_option("-s,--service", m_rawServices, "The service that the words after it are for")
                          ->type_name("SERVICE")
                          ->expected(1)
                          ->allow_extra_args(false)
                          ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
}

void CommandLine::parse(const Words &words)
{
    Words reversed;
    for (auto word = words.rbegin(); word != words.rend(); ++word)
        reversed.push_back(guarded(*word));
    try {
        m_app.parse(reversed);
    } catch (const CLI::CallForHelp &) {
        print(m_app.help() + "\n");
        throw HelpWasAsked{};
    } catch (const CLI::ParseError &error) {
        refuse(sentenceOf(error, words) + "; 'kavell-accounts " + m_help.name + " --help' explains");
    }
    for (std::string *value : m_values)
        *value = unguarded(*value);
    sortWords();
}

/// Puts the words in order and notes which service each stands behind.
void CommandLine::sortWords()
{
    size_t nextWord = 0;
    size_t nextService = 0;
    for (const CLI::Option *option : m_app.parse_order()) {
        if (option == m_wordOption) {
            m_positionals.push_back(unguarded(m_rawWords[nextWord++]));
            m_servicesOfPositionals.push_back(m_lastService);
            m_lastServiceIsUsed = true;
        } else if (m_serviceOption && option == m_serviceOption) {
            m_lastService = serviceOf(unguarded(m_rawServices[nextService++]));
            m_lastServiceIsUsed = false;
        }
    }
}

void CommandLine::refuseTrailingService() const
{
    if (!m_lastServiceIsUsed)
        refuse("--service " + escaped(shortService(m_lastService)) +
               " has nothing behind it; it counts for the words after it, so put it before them");
}

Address CommandLine::takeAccount()
{
    Address address = takeAddress(m_positionals);
    m_servicesOfPositionals.erase(m_servicesOfPositionals.begin(),
                                  m_servicesOfPositionals.end() - static_cast<ptrdiff_t>(m_positionals.size()));
    return address;
}

std::string CommandLine::takeWord(const std::string &missing)
{
    if (m_positionals.empty())
        refuse(missing);
    std::string word = m_positionals.front();
    m_positionals.erase(m_positionals.begin());
    m_servicesOfPositionals.erase(m_servicesOfPositionals.begin());
    return word;
}

void CommandLine::expectNoMore() const
{
    if (!m_positionals.empty())
        refuse("the word " + inQuotes(m_positionals.front()) + " is one too many; 'kavell-accounts " + m_help.name +
               " --help' explains");
}

void CommandLine::report(const std::string &sentence, const std::function<std::string()> &result) const
{
    if (json)
        print(result());
    else if (!quiet)
        print(sentence + "\n");
}

}  // namespace kavell::tools

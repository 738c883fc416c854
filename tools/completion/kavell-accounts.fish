# SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
# SPDX-License-Identifier: LGPL-2.1-or-later
#
# Completion of kavell-accounts for fish. The words come from the program itself.

function __kavell_accounts_words
    # The words behind the command that are no options (nor their values).
    set -l words (commandline -opc)[2..]
    set -l plain
    set -l skip 0
    for word in $words
        if test $skip = 1
            set skip 0
        else if contains -- $word -s --service -p --provider --count -t --timeout
            set skip 1
        else if not string match -q -- '-*' $word
            set -a plain $word
        end
    end
    if test "$plain[1]" = password
        set -e plain[2]
    end
    printf '%s\n' $plain
end

function __kavell_accounts_position
    test (count (__kavell_accounts_words)) = $argv[1]
end

function __kavell_accounts_logins
    set -l words (__kavell_accounts_words)
    kavell-accounts list --names --provider $words[2] 2>/dev/null
end

set -l commands list show add set unset remove password watch doctor import export plugins identify match children servers
set -l addressed show set unset remove watch children

complete -c kavell-accounts -f
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a list -d 'List the accounts'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a show -d 'Show one account with its attributes'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a add -d 'Add an account'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a set -d 'Set attributes of an account or of one of its services'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a unset -d 'Remove attributes'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a remove -d 'Remove an account with its password'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a password -d "Store, read or remove an account's password"
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a watch -d 'Print a line whenever an account changes'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a doctor -d 'Find, and with --repair mend, what is wrong'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a import -d 'Add accounts from a JSON file'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a export -d 'Write accounts as JSON, without passwords'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a plugins -d 'List the plug-ins, and why one was refused'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a identify -d 'Tell which plug-in an address, server or settings belong to'
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a match -d "Find the account that an application's account belongs to"
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a children -d "List the applications' accounts of one account"
complete -c kavell-accounts -n "not __fish_seen_subcommand_from $commands" -a servers -d 'List, add or remove organisation servers'

complete -c kavell-accounts -s h -l help -d 'Show help'
complete -c kavell-accounts -l json -d 'Write the result as JSON'
complete -c kavell-accounts -s q -l quiet -d 'Do not say what was done'

complete -c kavell-accounts -n "__fish_seen_subcommand_from password; and not __fish_seen_subcommand_from set get remove" -a 'set get remove'
complete -c kavell-accounts -n "__fish_seen_subcommand_from $addressed add; and not __fish_seen_subcommand_from password; and __kavell_accounts_position 1" -a '(kavell-accounts words providers)'
complete -c kavell-accounts -n "__fish_seen_subcommand_from password; and __fish_seen_subcommand_from set get remove; and __kavell_accounts_position 1" -a '(kavell-accounts words providers)'
complete -c kavell-accounts -n "__fish_seen_subcommand_from $addressed password; and not __fish_seen_subcommand_from servers; and __kavell_accounts_position 2" -a '(__kavell_accounts_logins)'
complete -c kavell-accounts -n "__fish_seen_subcommand_from set add unset; and not __fish_seen_subcommand_from password; and not __kavell_accounts_position 1; and not __kavell_accounts_position 2" -a '(kavell-accounts words keys)'

complete -c kavell-accounts -n '__fish_seen_subcommand_from add set unset' -s s -l service -x -a '(kavell-accounts words services)' -d 'Service of the words after it'
complete -c kavell-accounts -n '__fish_seen_subcommand_from list export' -s p -l provider -x -a '(kavell-accounts words providers)' -d 'Only this provider'
complete -c kavell-accounts -n '__fish_seen_subcommand_from unset' -l all -d 'Remove every attribute'
complete -c kavell-accounts -n '__fish_seen_subcommand_from remove' -s y -l yes -d 'Do not ask'
complete -c kavell-accounts -n '__fish_seen_subcommand_from remove' -l keep-password -d 'Leave the password stored'
complete -c kavell-accounts -n '__fish_seen_subcommand_from watch' -s n -l count -x -d 'End after so many lines'
complete -c kavell-accounts -n '__fish_seen_subcommand_from watch' -s t -l timeout -x -d 'End after so many seconds'
complete -c kavell-accounts -n '__fish_seen_subcommand_from doctor' -l repair -d 'Mend what can be mended'
complete -c kavell-accounts -n '__fish_seen_subcommand_from import' -l merge -d 'Lay the imported attributes over existing ones'
complete -c kavell-accounts -n '__fish_seen_subcommand_from import' -l replace -d 'Replace existing attributes'
complete -c kavell-accounts -n '__fish_seen_subcommand_from import' -l skip-existing -d 'Leave existing accounts alone'
complete -c kavell-accounts -n '__fish_seen_subcommand_from import' -s n -l dry-run -d 'Only say what would be done'
complete -c kavell-accounts -n '__fish_seen_subcommand_from identify match' -s w -l why -d 'Show each rule that was tried'
complete -c kavell-accounts -n '__fish_seen_subcommand_from match; and __kavell_accounts_position 1' -a 'mail calendar contacts chat'
complete -c kavell-accounts -n '__fish_seen_subcommand_from identify' -a '(kavell-accounts words settings)='
complete -c kavell-accounts -n '__fish_seen_subcommand_from match; and not __kavell_accounts_position 1' -a '(kavell-accounts words settings)='
complete -c kavell-accounts -n '__fish_seen_subcommand_from servers; and __kavell_accounts_position 1' -a 'add remove'
complete -c kavell-accounts -n '__fish_seen_subcommand_from servers; and __fish_seen_subcommand_from remove; and __kavell_accounts_position 2' -a '(kavell-accounts servers --names)'
complete -c kavell-accounts -n '__fish_seen_subcommand_from servers' -l names -d 'List only the names'
complete -c kavell-accounts -n '__fish_seen_subcommand_from import export identify' -F
complete -c kavell-accounts -n '__fish_seen_subcommand_from match; and not __kavell_accounts_position 1' -F

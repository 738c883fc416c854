# SPDX-FileCopyrightText: 2026 The Kavell Accounts developers
# SPDX-License-Identifier: LGPL-2.1-or-later
#
# Completion of kavell-accounts for bash. The words come from the program itself.

# Offers the given lines that begin with the current word. Bash replaces only what stands behind the last "@", "=" or ":"
# of the word, so what is before it is taken off.
_kavell_accounts_offer()
{
    local current=$1 line prefix=''
    [[ $current = *[@=:]* ]] && prefix=${current%"${current##*[@=:]}"}
    while IFS= read -r line; do
        [[ -n $line && $line = "$current"* ]] && COMPREPLY+=("${line#"$prefix"}")
    done
}

_kavell_accounts()
{
    local commands='list show add set unset remove password watch doctor import export plugins identify
        match children servers'
    local words word previous='' current command='' action='' provider='' position=0 index
    COMPREPLY=()

    # Bash cuts words at "@" and "=", which logins and attributes have; blanks alone separate them here.
    read -ra words <<< "${COMP_LINE:0:COMP_POINT}"
    [[ ${COMP_LINE:0:COMP_POINT} = *[[:space:]] ]] && words+=('')
    current=${words[-1]}

    for ((index = 1; index < ${#words[@]} - 1; index++)); do
        word=${words[index]}
        previous=$word
        case $word in
            -s | --service | -p | --provider | --count | -t | --timeout)
                ((++index)) ;;
            -*) ;;
            *)
                if [[ -z $command ]]; then
                    command=$word
                elif [[ ($command = password || $command = servers || $command = match) && -z $action ]]; then
                    action=$word
                else
                    ((++position))
                    [[ $position = 1 ]] && provider=$word
                    [[ $position = 1 && $word = */* ]] && position=2
                fi ;;
        esac
    done

    case $previous in
        -s | --service)
            if ((index == ${#words[@]})); then
                _kavell_accounts_offer "$current" < <(kavell-accounts words services 2>/dev/null)
                return
            fi ;;
        -p | --provider)
            if ((index == ${#words[@]})); then
                _kavell_accounts_offer "$current" < <(kavell-accounts words providers 2>/dev/null)
                return
            fi ;;
        --count | -t | --timeout)
            ((index == ${#words[@]})) && return ;;
    esac

    if [[ -z $command ]]; then
        _kavell_accounts_offer "$current" < <(printf '%s\n' $commands --help --version --json)
        return
    fi

    if [[ $current = -* ]]; then
        local options='--help --json --quiet'
        case $command in
            list) options+=' --provider --names' ;;
            add | set) options+=' --service' ;;
            unset) options+=' --service --all' ;;
            remove) options+=' --yes --keep-password' ;;
            watch) options+=' --count --timeout' ;;
            doctor) options+=' --repair' ;;
            import) options+=' --merge --replace --skip-existing --dry-run' ;;
            export) options+=' --provider' ;;
            identify | match) options+=' --why' ;;
            servers) options+=' --names' ;;
        esac
        _kavell_accounts_offer "$current" < <(printf '%s\n' $options)
        return
    fi

    case $command in
        help)
            _kavell_accounts_offer "$current" < <(printf '%s\n' $commands)
            return ;;
        import | export)
            compopt -o filenames 2>/dev/null
            mapfile -t COMPREPLY < <(compgen -f -- "$current")
            return ;;
        list | doctor | plugins)
            return ;;
    esac

    if [[ $command = password && -z $action ]]; then
        _kavell_accounts_offer "$current" < <(printf '%s\n' set get remove)
    elif [[ $command = match && -z $action ]]; then
        _kavell_accounts_offer "$current" < <(printf '%s\n' mail calendar contacts chat)
    elif [[ $command = identify || $command = match ]]; then
        compopt -o filenames -o nospace 2>/dev/null
        _kavell_accounts_offer "$current" < <(kavell-accounts words settings 2>/dev/null | sed 's/$/=/'; compgen -f -- "$current")
    elif [[ $command = servers && -z $action ]]; then
        _kavell_accounts_offer "$current" < <(printf '%s\n' add remove)
    elif [[ $command = servers ]]; then
        [[ $action = remove && $position = 0 ]] &&
            _kavell_accounts_offer "$current" < <(kavell-accounts servers --names 2>/dev/null)
    elif [[ $position = 0 ]]; then
        _kavell_accounts_offer "$current" < <(kavell-accounts words providers 2>/dev/null)
    elif [[ $position = 1 && $command != add ]]; then
        _kavell_accounts_offer "$current" < <(kavell-accounts list --names --provider "$provider" 2>/dev/null)
    elif [[ $position -ge 2 && ($command = set || $command = add) ]]; then
        compopt -o nospace 2>/dev/null
        _kavell_accounts_offer "$current" < <(kavell-accounts words keys 2>/dev/null | sed 's/$/=/')
    elif [[ $position -ge 2 && $command = unset ]]; then
        _kavell_accounts_offer "$current" < <(kavell-accounts words keys 2>/dev/null)
    fi
}

complete -F _kavell_accounts kavell-accounts

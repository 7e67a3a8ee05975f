# Completion of qelosim for bash: commands, options and what they take.
#
# Names of accounts and groups are offered only where the command works on this machine: those
# of another root directory, node file or server are not looked up while somebody types.

# Offers the words of the remaining arguments that continue the first.
_qelosim_offer() {
    local cur=$1
    shift
    mapfile -t COMPREPLY < <(compgen -W "$*" -- "$cur")
}

# Offers the names of files ("f") or directories ("d"), behind a prefix that they do not have.
_qelosim_offer_paths() {
    local kind=$1 cur=$2 prefix=${3-}
    mapfile -t COMPREPLY < <(compgen -"$kind" -P "$prefix" -- "$cur")
    compopt -o filenames 2>/dev/null
}

# The text goes on behind what is offered.
_qelosim_stay() { compopt -o nospace 2>/dev/null; }

_qelosim_classes="ZANTH_Account ZANTH_AccountHostedService ZANTH_AccountManagementCapabilities
    ZANTH_AccountManagementService ZANTH_ComputerSystem ZANTH_Group ZANTH_SimElementCapabilities
    ZANTH_SimIdentity"
_qelosim_associations="ZANTH_AccountHostedService ZANTH_SimElementCapabilities"
_qelosim_roles="Antecedent Capabilities Dependent ManagedElement"
_qelosim_commands="accounts add-member ai ain capabilities cm create-group create-user delete-group
    delete-user disable-user ecn ei ein enable-user gc gi groups identity init-root modify-user
    remove-member ri rin serve service set-password tree"

# The options that a command has beside those of all commands.
_qelosim_options() {
    local common="--ca-cert --format --help --insecure --json --namespace --password-file
        --provider-dir --root --schema-dir --store --url"
    local user="--create-home --full-name --gid --home --password-stdin --shell --uid"
    local filter="-ac -r -rc --assoc-class --result-class --role"
    case $1 in
    '') echo "$common --version" ;;
    ai) echo "$common $filter -rr --result-role -p --properties" ;;
    ain) echo "$common $filter -rr --result-role" ;;
    create-group) echo "$common --gid" ;;
    create-user) echo "$common $user" ;;
    delete-user) echo "$common --remove-home" ;;
    ecn) echo "$common --deep" ;;
    ei | gi) echo "$common -p --properties" ;;
    modify-user)
        echo "$common $user --expires --inactive-days --max-days --min-days --warn-days"
        ;;
    ri) echo "$common $filter -p --properties" ;;
    rin) echo "$common $filter" ;;
    serve)
        echo "$common --listen --method-group --no-auth --tls-cert --tls-key --user-file"
        ;;
    set-password) echo "$common --password-stdin" ;;
    *) echo "$common" ;;
    esac
}

# Whether an option is followed by a value.
_qelosim_takes_value() {
    case $1 in
    -ac | -p | -r | -rc | -rr) return 0 ;;
    --create-home | --deep | --help | --insecure | --json | --no-auth | --password-stdin) return 1 ;;
    --remove-home | --version | --*=*) return 1 ;;
    --*) return 0 ;;
    *) return 1 ;;
    esac
}

# Offers the values of an option.
_qelosim_value() {
    local option=$1 cur=$2
    case $option in
    --format) _qelosim_offer "$cur" json mof text ;;
    --root | --provider-dir | --schema-dir) _qelosim_offer_paths d "$cur" ;;
    --ca-cert | --password-file | --shell | --tls-cert | --tls-key | --user-file)
        _qelosim_offer_paths f "$cur"
        ;;
    --method-group) _qelosim_names group "$cur" ;;
    --home) _qelosim_offer_paths d "$cur" ;;
    --namespace) _qelosim_offer "$cur" root/cimv2 ;;
    --assoc-class | -ac) _qelosim_offer "$cur" "$_qelosim_associations" ;;
    --result-class | -rc) _qelosim_offer "$cur" "$_qelosim_classes" ;;
    --role | --result-role | -r | -rr) _qelosim_offer "$cur" "$_qelosim_roles" ;;
    --url)
        _qelosim_offer "$cur" http:// https://
        _qelosim_stay
        ;;
    --store)
        case $cur in
        accounts:*) _qelosim_offer_paths d "${cur#accounts:}" accounts: ;;
        file:*) _qelosim_offer_paths f "${cur#file:}" file: ;;
        *)
            _qelosim_offer "$cur" accounts: file:
            _qelosim_stay
            ;;
        esac
        ;;
    esac
}

# Offers the names in a database of this machine, "passwd" or "group". They may come from
# anywhere: bash would carry out what is hidden in a list of words, so none is made of them.
_qelosim_names() {
    local database=$1 cur=$2 name rest
    [[ $_qelosim_elsewhere == yes ]] && return
    while IFS=: read -r name rest; do
        if [[ $name == "$cur"* && $name =~ ^[A-Za-z0-9_][A-Za-z0-9_.-]*$ ]]; then
            COMPREPLY+=("$name")
        fi
    done < <(getent "$database" 2>/dev/null)
}

_qelosim_methods() {
    case ${1%%.*} in
    *ZANTH_Account)
        echo CreateUser DeleteUser DisableUser EnableUser ModifyUser SetPassword
        ;;
    *ZANTH_Group) echo AddMember CreateGroup DeleteGroup RemoveMember ;;
    esac
}

# Offers what a command takes in line. `positions` has what stands there already.
_qelosim_position() {
    local command=$1 cur=$2
    shift 2
    local positions=("$@")
    case $command:${#positions[@]} in
    ei:0 | ein:0 | gc:0 | ecn:0 | cm:0) _qelosim_offer "$cur" "$_qelosim_classes" ;;
    gi:0 | ai:0 | ain:0 | ri:0 | rin:0)
        _qelosim_offer "$cur" "$_qelosim_classes"
        _qelosim_stay
        ;;
    cm:1) _qelosim_offer "$cur" "$(_qelosim_methods "${positions[0]}")" ;;
    modify-user:0 | delete-user:0 | set-password:0 | enable-user:0 | disable-user:0)
        _qelosim_names passwd "$cur"
        ;;
    add-member:0 | remove-member:0 | delete-group:0) _qelosim_names group "$cur" ;;
    add-member:1 | remove-member:1) _qelosim_names passwd "$cur" ;;
    init-root:0) _qelosim_offer_paths d "$cur" ;;
    esac
}

# The words up to the cursor as the program gets them: bash takes ":" and "=" for words.
_qelosim_words() {
    local i glue=no
    words=()
    for ((i = 0; i <= COMP_CWORD; ++i)); do
        local word=${COMP_WORDS[i]-}
        if [[ $i -gt 1 && ($glue == yes || $word =~ ^[:=]+$) ]]; then
            words[${#words[@]} - 1]+=$word
        else
            words+=("$word")
        fi
        [[ $i -gt 0 && $word =~ ^[:=]+$ ]] && glue=yes || glue=no
    done
}

# Takes from each offer what bash keeps of the word: all up to the last of its own breaks.
_qelosim_trim() {
    local word=$1 breaks='' kept
    [[ ${COMP_WORDBREAKS-} == *:* ]] && breaks+=:
    [[ ${COMP_WORDBREAKS-} == *=* ]] && breaks+==
    [[ -n $breaks && $word == *["$breaks"]* ]] || return
    kept=${word%"${word##*["$breaks"]}"}
    COMPREPLY=("${COMPREPLY[@]#"$kept"}")
}

_qelosim() {
    local words command='' positions=() option='' onlyNames=no i
    local _qelosim_elsewhere=no
    COMPREPLY=()
    _qelosim_words
    local last=$((${#words[@]} - 1))
    local cur=${words[last]}
    [[ -n ${QELO_NODE_STORE-} ]] && _qelosim_elsewhere=yes
    for ((i = 1; i < last; ++i)); do
        local word=${words[i]}
        if [[ -n $option ]]; then
            option=''
        elif [[ $onlyNames == no && $word == -- ]]; then
            onlyNames=yes
        elif [[ $onlyNames == no && $word == -?* ]]; then
            case $word in --root | --root=* | --store | --store=* | --url | --url=*)
                _qelosim_elsewhere=yes
                ;;
            esac
            _qelosim_takes_value "$word" && option=$word
        elif [[ -z $command ]]; then
            command=$word
        else
            positions+=("$word")
        fi
    done
    if [[ -n $option ]]; then
        _qelosim_value "$option" "$cur"
    elif [[ $onlyNames == no && $cur == --*=* ]]; then
        _qelosim_value "${cur%%=*}" "${cur#*=}"
        COMPREPLY=("${COMPREPLY[@]/#/"${cur%%=*}="}")
    elif [[ $onlyNames == no && $cur == -* ]]; then
        _qelosim_offer "$cur" "$(_qelosim_options "$command")"
    elif [[ -z $command ]]; then
        _qelosim_offer "$cur" "$_qelosim_commands"
    else
        _qelosim_position "$command" "$cur" "${positions[@]}"
    fi
    _qelosim_trim "$cur"
}

complete -F _qelosim qelosim

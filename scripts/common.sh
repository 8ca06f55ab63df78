# shellcheck shell=bash
# What the scripts share. Sourced, never run.

# shellcheck disable=SC2034  # the scripts that source this use it
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
# Everything that is made once for all checkouts.
cache=${XDG_CACHE_HOME:-$HOME/.cache}/halvorn-installer

say() { printf '== %s\n' "$*" >&2; }

fail() {
    printf '%s: %s\n' "$(basename "$0")" "$*" >&2
    exit 1
}

# key TEXT...: a short name for exactly this state of the calling script, this file and the given texts.
key() {
    { cat "$0" "${BASH_SOURCE[0]}" && printf '%s\n' "$@"; } | sha256sum | cut -c 1-16
}

# versions PACKAGE...: the installed version of each package; fails when one is missing.
versions() {
    # shellcheck disable=SC2016  # the fields are dpkg-query's, not the shell's
    dpkg-query --show --showformat '${Package} ${Version} ${db:Status-Status}\n' "$@" 2>/dev/null
}

# publish FUNCTION FOLDER: makes FOLDER by calling FUNCTION with an empty folder beside it, which is then renamed, so
# that FOLDER is either missing or whole. Whoever comes at the same time waits. FOLDER lies in the cache. Call it as a
# command of its own, never after `if` or before `||`: there the shell would walk past steps that fail.
publish() {
    local make=$1 folder=$2 aside lock
    [[ -d $folder ]] && return
    mkdir -p "$cache"
    exec {lock}>"$folder.lock"
    flock "$lock"
    if [[ ! -d $folder ]]; then
        aside=$(mktemp -d "$folder.XXXXXX")
        (
            trap 'rm -rf "$aside"' EXIT
            "$make" "$aside"
            mv -T "$aside" "$folder"
        )
    fi
    exec {lock}>&-
}

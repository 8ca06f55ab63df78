# shellcheck shell=bash
# How sources of the distribution's packages are fetched: from the machine's own mirrors, without touching its lists of
# packages. Sourced after common.sh, never run; `sources` names the folder that all of it goes to.

# How apt is asked, the program first.
# shellcheck disable=SC2154  # whoever sources this sets it
private_apt() {
    "$1" -qq -o Dir::Etc::SourceList="$sources/list" -o Dir::Etc::SourceParts=- \
        -o Dir::State::Lists="$sources/lists" -o Dir::Cache="$sources/cache" \
        -o Acquire::Retries=3 -o APT::Sandbox::User="$(id -un)" "${@:2}"
}

# Reads what sources there are for this release.
list_sources() {
    local release
    release=$(. /etc/os-release && printf '%s' "$VERSION_CODENAME")
    mkdir -p "$sources/lists/partial" "$sources/cache/archives/partial"
    # shellcheck disable=SC2016  # the fields are apt's, not the shell's
    apt-get indextargets --format 'deb-src $(REPO_URI) $(RELEASE) $(COMPONENT)' 'Created-By: Packages' |
        sort -u | awk -v r="$release" '
            $4 == "main" && ($3 == r || $3 == r "-updates" || $3 == r "-security")' >"$sources/list"
    [[ -s $sources/list ]] || fail "apt names no mirror of $release"
    # A mirror that lacks one of the lists is no harm as long as the packages are found.
    private_apt apt-get update >&2 || true
}

# fetch_source BINARY FOLDER: unpacks the source of an installed package, in the installed version and with the
# distribution's patches, into a folder of that name.
fetch_source() {
    local source
    # shellcheck disable=SC2016  # the fields are dpkg-query's, not the shell's
    source=$(dpkg-query --show --showformat '${source:Package}=${source:Version}\n' "$1" | sort -u)
    (
        cd "$sources" || exit
        private_apt apt-get source --download-only --only-source "$source" >&2
        dpkg-source --no-check -x "${source%%=*}"_*.dsc "$2" >/dev/null
    )
}

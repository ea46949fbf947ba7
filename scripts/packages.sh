# shellcheck shell=bash
# Sourced by the scripts that need Debian packages, after stages.sh.

is_installed() {
    dpkg-query -W -f='${db:Status-Status}\n' "$1" 2>/dev/null | grep -qx installed
}

# cannot_install REASON PACKAGE...
cannot_install() {
    local reason=$1
    shift
    printf '%s\nneeded packages, by their Debian 12 names: %s\n' "$reason" "$*" >&2
    exit 1
}

as_root() {
    if [[ $(id -u) -eq 0 ]]; then
        "$@"
    else
        sudo "$@"
    fi
}

install_packages() {
    as_root apt-get -q update &&
        as_root env DEBIAN_FRONTEND=noninteractive apt-get -q install -y --no-install-recommends "$@"
}

# need_packages PACKAGE...: installs those that are missing; needs no network when none is.
need_packages() {
    local package missing=()
    if ! command -v dpkg-query >/dev/null || ! command -v apt-get >/dev/null; then
        cannot_install 'this is not Debian: install what is needed by other means' "$@"
    fi
    for package in "$@"; do
        is_installed "$package" || missing+=("$package")
    done
    [[ ${#missing[@]} -gt 0 ]] || return 0
    if [[ $(id -u) -ne 0 ]] && ! command -v sudo >/dev/null; then
        cannot_install 'packages are missing: run it as root, or install sudo' "${missing[@]}"
    fi
    stage "installing ${missing[*]}" install_packages "${missing[@]}"
}

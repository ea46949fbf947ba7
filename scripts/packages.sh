# shellcheck shell=bash
# Sourced by the scripts that need more packages than scripts/setup installs.

is_installed() {
    dpkg-query -W -f='${db:Status-Status}\n' "$1" 2>/dev/null | grep -qx installed
}

# need_packages PACKAGE...: installs those that are missing; needs no network when none is.
need_packages() {
    local package missing=() as_root=()
    for package in "$@"; do
        is_installed "$package" || missing+=("$package")
    done
    [[ ${#missing[@]} -gt 0 ]] || return 0
    [[ $(id -u) -eq 0 ]] || as_root=(sudo)
    stage "installing ${missing[*]}" "${as_root[@]}" env DEBIAN_FRONTEND=noninteractive \
        apt-get -q install -y --no-install-recommends "${missing[@]}"
}

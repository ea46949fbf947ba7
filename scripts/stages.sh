# shellcheck shell=bash
# Sourced by the other scripts: the project's directory, and stages that say their name and are silent
# otherwise. Their output goes to build/logs; it is shown when a stage fails.

root=$(cd -- "$(dirname -- "${BASH_SOURCE[0]}")/.." && pwd -P)
logs=$root/build/logs
mkdir -p "$logs"

export CMAKE_BUILD_PARALLEL_LEVEL=${CMAKE_BUILD_PARALLEL_LEVEL:-$(nproc)}
export CTEST_PARALLEL_LEVEL=${CTEST_PARALLEL_LEVEL:-$(nproc)}

# say_failed STAGE LOG: names the stage and where its log is.
say_failed() {
    printf '\nFAILED: %s\nwhole log: %s\n' "$1" "$2" >&2
}

# log_of STAGE: the file of a stage's output.
log_of() {
    printf '%s/%s.log' "$logs" "$(printf '%s' "$1" | tr -cs 'A-Za-z0-9\n' '-')"
}

# stage NAME COMMAND...: runs the command in the project's directory, silently.
stage() {
    local name=$1 log
    shift
    log=$(log_of "$name")
    printf '== %s\n' "$name"
    if ! (cd -- "$root" && "$@") >"$log" 2>&1; then
        tail -n 200 -- "$log" >&2
        say_failed "$name" "$log"
        exit 1
    fi
}

# show NAME COMMAND...: runs the command in the project's directory with its output on the screen.
show() {
    local name=$1
    shift
    printf '\n== %s\n' "$name"
    if ! (cd -- "$root" && "$@"); then
        printf '\nFAILED: %s (%s)\n' "$name" "$*" >&2
        exit 1
    fi
}

# configure PRESET NAME: anew when the build directory was made for a project elsewhere.
configure() {
    local cache=$root/build/$1/CMakeCache.txt fresh=()
    if [[ -f $cache ]] && ! grep -qxF "CMAKE_HOME_DIRECTORY:INTERNAL=$root" "$cache"; then
        fresh=(--fresh)
    fi
    stage "$2: configure" cmake --preset "$1" "${fresh[@]}"
}

# skipped_tests LOG: from what a GoogleTest program printed, the tests that skipped themselves because
# they want a process in which nothing has run yet.
skipped_tests() {
    sed -nE 's/^\[  SKIPPED \] ([^ ]+) \(.*/\1/p' "$1"
}

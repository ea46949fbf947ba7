# shellcheck shell=bash
# Sourced by the scripts that end with 'N passed, N failed': the totals, and what adds to them.

passed=0 failed=0 skipped=0

# add_ctest_counts LOG: adds what ctest says at its end; false when it says nothing.
add_ctest_counts() {
    local skips
    [[ $(<"$1") =~ %\ tests\ passed,\ ([0-9]+)\ tests\ failed\ out\ of\ ([0-9]+) ]] || return 1
    skips=$(grep -c '\*\*\*Skipped' "$1" || true)
    failed=$((failed + BASH_REMATCH[1]))
    passed=$((passed + BASH_REMATCH[2] - BASH_REMATCH[1] - skips))
    skipped=$((skipped + skips))
}

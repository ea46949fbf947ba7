# shellcheck shell=bash
# Sourced by scripts/bench: its tables of times, from what the programs printed in each run to
# $work/PRESET.TABLE.RUN.md.
# shellcheck disable=SC2154 # root, work, runs, presets and names are those of scripts/bench

# runs_of PRESET TABLE: the files of all runs, into the array files.
runs_of() {
    local run
    files=()
    for ((run = 1; run <= runs; ++run)); do
        files+=("$work/$1.$2.$run.md")
    done
}

# median_table PRESET TABLE LABELS: one table of all runs.
median_table() {
    local files
    runs_of "$1" "$2"
    awk -F'|' -v labels="$3" -f "$root/bench/median.awk" "${files[@]}"
}

# Plain, shipped and ratio of each build.
times_table() {
    local preset files=()
    for preset in "${presets[@]}"; do
        median_table "$preset" steps 1 >"$work/$preset.md"
        files+=("$work/$preset.md")
    done
    printf '| us | %s |\n' "$(printf '%s plain | shipped | ratio | ' "${names[@]}" | sed 's/ | $//')"
    printf '|---|%s\n' "$(printf -- '---:|---:|---:|%.0s' "${names[@]}")"
    awk -F' *[|] *' '
        FNR <= 2 { next }
        !($2 in row) { order[++steps] = $2 }
        { row[$2] = row[$2] " " $3 " | " $4 " | " $5 " |" }
        END {
            for (i = 1; i <= steps; ++i)
                print "| " order[i] " |" row[order[i]]
        }' "${files[@]}"
}

# compilers_of_run RUN: clang's times by GCC's in one run.
compilers_of_run() {
    printf '| clang by GCC | shipped | plain |\n|---|---:|---:|\n'
    awk -F' *[|] *' '
        FNR <= 2 { next }
        NR == FNR { plain[$2] = $3; shipped[$2] = $4; next }
        plain[$2] > 0 && shipped[$2] > 0 {
            printf "| %s | %.2f | %.2f |\n", $2, $4 / shipped[$2], $3 / plain[$2]
        }' "$work/bench.steps.$1.md" "$work/bench-clang.steps.$1.md"
}

# Whether a low ratio of the clang build means a slow module or a fast plain model.
compilers_table() {
    local run
    for ((run = 1; run <= runs; ++run)); do
        compilers_of_run "$run" >"$work/compilers.clang.$run.md"
    done
    median_table compilers clang 1
}

# Whole pairs at each size.
sizes_table() {
    printf '| us | %s |\n' 'pair, moved: plain | shipped | ratio | pair, still: plain | shipped | ratio | first frame: plain | shipped | ratio'
    printf '|---|%s\n' "$(printf -- '---:|%.0s' {1..9})"
    awk -F' *[|] *' '
        BEGIN {
            column["pair, moved"] = column["pair, hg"] = 1
            column["pair, still"] = 2
            column["first frame"] = column["first frame, hg"] = 3
        }
        FNR <= 2 || !($3 in column) { next }
        !($2 in known) { known[$2] = 1; order[++sizes] = $2 }
        { cell[$2, column[$3]] = " " $4 " | " $5 " | " $6 " |" }
        END {
            for (i = 1; i <= sizes; ++i) {
                line = "| " order[i] " |"
                for (c = 1; c <= 3; ++c)
                    line = line ((order[i], c) in cell ? cell[order[i], c] : " | | |")
                print line
            }
        }' "$work/sizes.md"
}

# Shipped time of each step for a unit of its work by the time at the default size.
units_table() {
    awk -F' *[|] *' '
        FNR <= 2 || $8 == "" { next }
        !($3 in step) { step[$3] = 1; steps[++stepNum] = $3 }
        !($2 in size) { size[$2] = 1; sizes[++sizeNum] = $2 }
        { cell[$3, $2] = $8 }
        END {
            head = "| times the default |"
            line = "|---|"
            for (s = 1; s <= sizeNum; ++s) {
                head = head " " sizes[s] " |"
                line = line "---:|"
            }
            print head "\n" line
            for (i = 1; i <= stepNum; ++i) {
                line = "| " steps[i] " |"
                for (s = 1; s <= sizeNum; ++s)
                    line = line " " cell[steps[i], sizes[s]] " |"
                print line
            }
        }' "$work/sizes.md"
}

times_tables() {
    times_table
    printf '\n'
    compilers_table
    printf '\n'
    median_table bench sizes 2 >"$work/sizes.md"
    sizes_table
    printf '\n'
    units_table
    printf '\n'
    median_table bench peers 2
}

# The deepest stack below a function, from GCC's call graphs (-fcallgraph-info=su, *.ci): the frames
# of the functions on the way, summed. Functions outside the files count as 0.
#
#   awk -v root=OrientationCalc -f stack-depth.awk FILES.ci
# Writes: bytes, then the path.
BEGIN { FS = "\"" }

/^node:/ && match($4, /[0-9]+ bytes/) {
    bytes[$2] = substr($4, RSTART, RLENGTH) + 0
    name = $4
    sub(/\(.*/, "", name)
    sub(/.* /, "", name)
    sub(/.*::/, "", name)
    names[$2] = name
}

/^edge:/ && !(($2, $4) in seen) {
    seen[$2, $4] = 1
    callees[$2] = callees[$2] SUBSEP $4
}

# A function that is being visited adds nothing: the module has no recursion to be bounded.
function depth(of, list, n, i, below, best, path) {
    if (of in result || of in visiting)
        return result[of] + 0
    visiting[of] = 1
    best = 0
    path = ""
    n = split(callees[of], list, SUBSEP)
    for (i = 2; i <= n; ++i) {
        below = depth(list[i])
        if (below > best) {
            best = below
            path = paths[list[i]]
        }
    }
    delete visiting[of]
    paths[of] = names[of] (path == "" ? "" : " > " path)
    return result[of] = bytes[of] + best
}

END {
    total = depth(root)
    print total, paths[root]
}

# One table of several runs' tables of the same benchmark: in each cell the middle of the runs'
# numbers, as it stands in one of them. Rows by their labels, in the order of the first run.
#
#   awk -F'|' -v labels=N -f median.awk RUN.md...    N: label columns
#
# An awk function has no array of its own but as a further parameter: those after the wide gap.

function trimmed(cell) {
    gsub(/^ +| +$/, "", cell)
    return cell
}

# The middle of the cells that are joined in text.
function middle(text,    cells, count, i, j, cell) {
    count = split(text, cells, "|")
    for (i = 2; i <= count; ++i) {
        cell = cells[i]
        for (j = i - 1; j >= 1 && cells[j] + 0 > cell + 0; --j)
            cells[j + 1] = cells[j]
        cells[j + 1] = cell
    }
    return cells[int((count + 1) / 2)]
}

# Titles and the line below them.
FNR <= 2 {
    if (NR <= 2)
        print
    next
}

{
    key = ""
    for (i = 2; i <= labels + 1; ++i)
        key = key "| " trimmed($i) " "
    if (!(key in known)) {
        known[key] = 1
        order[++rows] = key
    }
    columns = NF - 1
    for (i = labels + 2; i <= columns; ++i) {
        cell = trimmed($i)
        if (cell != "" && (key, i) in cells)
            cells[key, i] = cells[key, i] "|" cell
        else if (cell != "")
            cells[key, i] = cell
    }
}

END {
    for (row = 1; row <= rows; ++row) {
        line = order[row]
        for (i = labels + 2; i <= columns; ++i)
            line = line "| " middle(cells[order[row], i]) " "
        print line "|"
    }
}

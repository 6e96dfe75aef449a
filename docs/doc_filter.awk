# Doxygen's input filter for the installed headers: turns their plain comments into doxygen ones.
#   - A block of "//" lines directly above a declaration documents that declaration.
#   - A block followed by a blank line (a file's opening comment, a section heading over a group
#     of members) stays a plain comment, so a heading never becomes a member's first sentence.
#   - "// @{" and "// @}" around a few members share the comment above them (DISTRIBUTE_GROUP_DOC).
#   - A comment behind a declaration or an enumerator on the same line documents it.
# Banners ("// ----") and commented-out code ("//x") are left alone.

function emit_block(as_doc,    i, line) {
    for (i = 1; i <= n_block; i++) {
        line = block[i]
        if (as_doc && line ~ /^ *\/\/( |$)/)
            sub(/\/\//, "///", line)
        print line
    }
    n_block = 0
}

/^ *\/\// {
    block[++n_block] = $0
    next
}

{
    emit_block($0 !~ /^[ \t]*$/)
    line = $0
    if (match(line, /[;{,] *\/\/ /))
        line = substr(line, 1, RSTART) " ///< " substr(line, RSTART + RLENGTH)
    else if (match(line, /^ *[A-Z][A-Z0-9_]*( *= *[^\/]*)? *\/\/ /)) {
        # the last enumerator of an enumeration, without its comma
        match(line, /\/\/ /)
        line = substr(line, 1, RSTART - 1) "///< " substr(line, RSTART + RLENGTH)
    }
    print line
}

END {
    emit_block(0)
}

# Doxygen's input filter for the installed headers: turns their plain comments into doxygen ones.
#   - A block of "//" lines directly above a declaration documents that declaration.
#   - A block followed by a blank line (a file's opening comment, a section heading over a group
#     of members) stays a plain comment, so a heading never becomes a member's first sentence.
#   - "// @{" and "// @}" around a few members share the comment above them (DISTRIBUTE_GROUP_DOC);
#     these two marks always reach doxygen, blank line or not.
#   - A comment behind a declaration or an enumerator on the same line documents it.
# Banners ("// ----") and commented-out code ("//x") are left alone.

function emit_block(as_doc,    i, line) {
    for (i = 1; i <= n_block; i++) {
        line = block[i]
        if ((as_doc && line ~ /^ *\/\/( |$)/) || line ~ /^ *\/\/ @[{}]$/)
            sub(/\/\//, "///", line)
        print line
    }
    n_block = 0
}

# The comment that opens the file describes the file, and every file counts as documented, so
# that its free functions, variables and macros are checked too. The mark goes behind the first
# line (or, for a file without an opening comment, at its end), so that warnings keep the header's
# own line numbers.
NR == 1 && /^\/\/ / {
    block[++n_block] = $0 " @file"
    file_documented = 1
    next
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
    if (!file_documented) print "/// @file"
}

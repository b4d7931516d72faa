# man_page.awk: a manual page from a program's own help and its guide.
#   awk -f man_page.awk -v version=V HELP GUIDE.md
# HELP is what "PROGRAM --help" prints: its first line says what the program is, its "Usage:" is the
# synopsis, its commands and examples are listed. The guide gives the rest, heading by heading. Of
# Markdown it may use headings, paragraphs, lists, tables, fenced blocks, `code` and **bold**.

function troff(text) {
    gsub(/\\/, "\\e", text)
    gsub(/-/, "\\-", text)
    gsub(/'/, "\\(aq", text)
    gsub(/`/, "\\(ga", text)
    return text
}
# A line that does not begin with what troff takes for a request.
function line(text) {
    if (text ~ /^[.']/)
        text = "\\&" text
    print text
}
# `code` and **bold** become bold, the rest stays.
function inline(text,   result, mark, at, length_) {
    result = ""
    while (match(text, /`[^`]*`|\*\*[^*]*\*\*/)) {
        at = RSTART
        length_ = RLENGTH
        mark = substr(text, at, 1) == "`" ? 1 : 2
        result = result troff(substr(text, 1, at - 1)) "\\fB" \
                 troff(substr(text, at + mark, length_ - 2 * mark)) "\\fR"
        text = substr(text, at + length_)
    }
    return result troff(text)
}
function end_example() {
    if (example)
        print ".EE\n.RE"
    example = 0
}
function begin_example() {
    if (!example)
        print ".PP\n.RS 4\n.EX"
    example = 1
}

FNR == 1 { part++ }

# ---- The help ----
part == 1 && FNR == 1 { what = $0; sub(/[.]$/, "", what); next }
part == 1 && /^Usage: / {
    program = $2
    name = program
    upper = toupper(program)
    printf ".TH %s 1 \"\" \"%s %s\" \"User Commands\"\n", upper, program, version
    print ".SH NAME"
    line(troff(name " - " tolower(substr(what, 1, 1)) substr(what, 2)))
    print ".SH SYNOPSIS"
    usage = $0
    sub(/^Usage: [^ ]+ /, "", usage)
    print ".B " program
    line(troff(usage))
    next
}
part == 1 && /^(Options|Subcommands|Examples):$/ { section = $1; next }
part == 1 && /^$/ { section = ""; next }
part == 1 && section == "Examples:" { examples[++example_count] = substr($0, 3); next }
part == 1 && /^Exit status/ { section = "" }
part == 1 { next }

# ---- The guide ----
/^```/ {
    fenced = !fenced
    if (fenced)
        begin_example()
    else
        end_example()
    next
}
fenced { line(troff($0)); next }
/^# / { print ".SH DESCRIPTION"; fresh = 1; next }
/^## / { print ".SH " toupper(inline(substr($0, 4))); fresh = 1; next }
/^### / { print ".SS " inline(substr($0, 5)); fresh = 1; next }
/^[|][-|: ]*$/ { next }
# A table: its first column is the term, the others are told below it under their headings.
/^[|]/ {
    row = $0
    gsub(/\\[|]/, "\001", row)
    gsub(/^[|] *| *[|]$/, "", row)
    columns = split(row, cell, / *[|] */)
    if (!table) {
        table = 1
        for (i = 1; i <= columns; i++)
            heading[i] = cell[i]
        next
    }
    print ".TP"
    for (i = 1; i <= columns; i++)
        gsub(/\001/, "|", cell[i])
    line(inline(cell[1]))
    line(inline(cell[2]))
    for (i = 3; i <= columns; i++)
        if (cell[i] != "") {
            print ".br"
            line(inline(heading[i] ": " cell[i]))
        }
    next
}
/^- / { print ".IP \\(bu 2"; table = paragraph = fresh = 0; line(inline(substr($0, 3))); next }
/^$/ { table = 0; if (!fresh) paragraph = 1; next }
{
    if (table || paragraph)
        print ".PP"
    table = paragraph = fresh = 0
    sub(/^ +/, "") # of a list's item
    line(inline($0))
}

END {
    print ".SH EXAMPLES"
    begin_example()
    for (i = 1; i <= example_count; i++)
        line(troff(examples[i]))
    end_example()
}

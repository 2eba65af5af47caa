# A doc comment in the headers describes all declarations below it, up to an empty line or the next
# comment. Doxygen needs one for each: this filter repeats it before the second and later ones.
function indent() { match($0, /^ */); return RLENGTH }

/^ *\/\/\// {
    if (!in_comment)
        comment = ""
    comment = comment $0 "\n"
    level = indent()
    in_comment = 1
    print
    next
}
/^ *$/ || /^ *(public|protected|private):/ { comment = "" }
{
    # The first declaration has the comment itself; the end of one means that another begins.
    if (comment != "" && !in_comment && !/~/ && ended && indent() == level && $0 !~ /^ *[{}]/)
        printf "%s", comment
    in_comment = 0
    ended = $0 ~ /[;},]( *\/\/.*)?$/ || /^#/
    print
}

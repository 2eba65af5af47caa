# A doc comment in the headers holds for all declarations below it, up to an empty line or the next
# comment. Doxygen wants one for each: this filter repeats it in front of those that follow.
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
    # The first declaration has the comment itself; the end of one tells that another begins.
    if (comment != "" && !in_comment && !/~/ && ended && indent() == level && $0 !~ /^ *[{}]/)
        printf "%s", comment
    in_comment = 0
    ended = $0 ~ /[;},]( *\/\/.*)?$/ || /^#/
    print
}

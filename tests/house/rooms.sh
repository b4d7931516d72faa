#!/usr/bin/env bash
# rooms.sh SOURCE-FOLDER: each room includes what its row in the table of docs/design.md lets it call,
# and no more. Prints what does not, one line each, and fails.
set -euo pipefail
cd "$1"
awk -F'|' '
    # The room of a path: the longest of its folders that has a row.
    function room_of(path) {
        while (sub("/[^/]*$", "", path))
            if (path in may)
                return path
        return ""
    }
    function allowed(path, target, list,   count, i, words, pattern) {
        count = split(list, words, " ")
        for (i = 1; i <= count; i++) {
            pattern = words[i]
            gsub("[*]", ".*", pattern)
            if (words[i] == target || path ~ "^" pattern "$")
                return 1
        }
        return 0
    }
    function refuse(text) {
        print text
        wrong++
    }
    FILENAME == "docs/design.md" {
        if ($0 ~ "^[|] `") {
            gsub("[`,]|/ *$", "", $2)
            gsub("[`,]", "", $4)
            room = $2
            gsub(" ", "", room)
            sub("/$", "", room)
            may[room] = $4
        }
        next
    }
    {
        file = $0
        sub(":.*", "", file)
        path = $0
        sub("^[^\"]*\"", "", path)
        sub("\".*", "", path)
        room = room_of(file)
        target = room_of(path)
        checked++
        if (room == "")
            refuse(file ": no row for its room")
        else if (path ~ "^(tests|bench|fuzz)/" ||
                 (target != "" && target != room && !allowed(path, target, may[room])))
            refuse(file ": " room " may not call " path)
    }
    END {
        if (checked < 500)
            refuse("only " checked + 0 " includes found")
        exit wrong > 0
    }' docs/design.md <(grep -rn --include='*.h' --include='*.cpp' --include='*.inc' '^ *#include "' \
        cmpi cimple schema foundation device operations agent derivedObjects services simulator host \
        tools)

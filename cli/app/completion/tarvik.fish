# Completion of tarvik for fish. The tool itself lists the words: tarvik complete WORDS.

function __tarvik_complete
    set -l words (commandline --tokenize --current-process --cut-at-cursor)
    set -l tool $words[1]
    set -e words[1]
    set -l current (commandline --current-token --cut-at-cursor)
    $tool complete $words "$current" 2>/dev/null
    if test $status -eq 1
        __fish_complete_path "$current"
    end
end

complete --command tarvik --no-files --arguments '(__tarvik_complete)'

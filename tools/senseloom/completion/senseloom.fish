# Completion of senseloom's command line for fish. The tool itself knows what can stand where.

function __senseloom_complete
    set -l words (commandline -opc)
    set -l current (commandline -ct)
    set -l answer ($words[1] --complete $words[2..-1] "$current" 2>/dev/null)
    switch "$answer[1]"
        case files
            __fish_complete_path "$current"
        case folders
            __fish_complete_directories "$current"
        case programs
            __fish_complete_command
    end
    printf '%s\n' $answer[2..-1]
end

complete -c senseloom -f -a '(__senseloom_complete)'

# Completion of kelvash in fish. The tool does the work; fish picks what fits a half-typed word, which
# may be quoted, and quotes what it inserts. A host of the library takes this file with its own name
# in it.

function __kelvash_complete
    set -l word (commandline -ct)
    set -l words (commandline -opc) "$(string replace -rf '^[\'"]?(-[^=]*=?).*' '$1' -- $word)"
    set -l tool (string replace -r '^~/' $HOME/ $words[1])
    set -l answer (string join0 -- $words | ZELMAR_COMPLETE=fish $tool 2>/dev/null | string split0)
    set -l file (string replace -- "$answer[2]" '' $word)
    set -l files
    switch "$answer[1]"
        case any
            set files (__fish_complete_path $file)
        case plugins
            set files (__fish_complete_path $file | string match -r '.*(?:\.so|\.xml|/)(?:\t.*)?$')
        case directories
            set files (__fish_complete_directories $file '')
    end
    string join0 -- $answer[4..] $answer[2]$files
end

complete -c kelvash -f -a '(__kelvash_complete | string split0)'

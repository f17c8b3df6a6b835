# What a command script prints, made easy. A script that stands beside this file begins with
#
#     . "$(dirname "$0")/dialect.sh"
#
# and then has:
#
#     fail TEXT                   tell what is wrong, each line of it as an ERROR: line, and end
#                                 the script; such lines count only at the very start of the output
#     rows COMMAND ARGUMENT...    run a command whose rows go into a pipe; when it fails, the
#                                 dialect at the end of the pipe tells it in place of a result
#     read_files FILE...          each line of the files as "FILE<tab>LINE", in one process;
#     read_files -r FOLDER        what cannot be read is left out
#     dialect PROGRAM OPERAND...  run an awk program with the functions below. The operands are
#                                 files, "-" for standard input, or NAME=VALUE: a variable that
#                                 holds this very text in all of the program
#     progress DONE TOTAL TEXT    draw a bar on the error stream if that is a terminal; it goes
#                                 when all is done, and with fail
#
# A variable and a field of the input compare as texts. Write `size + 0 < least + 0` to compare
# numbers, and `$1 "" == $2 ""` for two fields, of which awk takes 10 and 1e1 for the same.
#
# The awk functions print one document, which appears when the program ended well. open_... opens a
# list, a structure or a field that holds more than one value, end() closes what was opened last;
# ..._field puts a value into a structure, ..._item into a list. Empty text and 0 are the truth
# value false; what is no whole number is refused as a number. fail(TEXT) ends the program, and its
# text is all that is printed.
#
#     open_structure("Disk")
#         text_field("Name", "sda")
#         number_field("Size", 512)
#         truth_field("Spare", 0)
#         open_field("Paths")
#             open_list("string")
#                 text_item("/dev/sda")
#             end()
#         end()
#     end()
#
# Text may hold any bytes: markup is escaped, and control characters and bytes that are no UTF-8,
# which XML cannot carry, are shown as \x1b.

unset CDPATH POSIXLY_CORRECT # with these, cd and many tools work otherwise than scripts expect

_line_feed='
'
_lost="[$$: lost] " # what no input holds by chance

fail() {
    _clear_bar
    _text=$*
    IFS=$_line_feed
    set -f
    printf 'ERROR:%s\n' $_text
    exit 1
}

rows() {
    "$@" || _tell_lost "$1" $?
}

_tell_lost() {
    printf '%s\n' "$_lost$1 ended with status $2"
}

read_files() {
    case $1 in
    -r) shift; set -- -r -e '' -- "$@" ;;
    *) set -- -e '' -- "$@" ;;
    esac
    {
        LC_ALL=C grep -asHZ "$@"
        _status=$? # 1 and 2 tell of files that are empty or cannot be read
        [ $_status -le 2 ] || _tell_lost grep $_status
    } | rows tr '\000' '\t'
}

dialect() {
    _program=$1
    shift
    _variables='' _operand_count=0
    for _operand; do
        _operand_count=$((_operand_count + 1))
        _name=${_operand%%=*}
        case $_name in
        "$_operand" | '' | [0-9]* | *[!A-Za-z0-9_]*)
            [ "$_operand" = - ] || { [ -r "$_operand" ] && [ ! -d "$_operand" ]; } ||
                fail "Unable to read $_operand"
            ;;
        *)
            _argument="ARGV[$_operand_count]"
            _text="substr($_argument, $((${#_name} + 2)))"
            _variables="$_variables $_name = $_text; $_argument = \"\";"
            ;;
        esac
    done
    # Without a pipe there are no rows to lose, and a program of BEGIN alone reads no input.
    [ ! -p /dev/stdin ] || _program="$_rows_are_lost$_program"
    _program="BEGIN { _lost = \"$_lost\";$_variables } $_dialect_functions$_program"
    _document=$(LC_ALL=C awk "$_program" "$@")
    _status=$?
    case $_document in
    *"$_lost"*) _text=${_document#*"$_lost"}; fail "${_text%%"$_line_feed"*}" ;;
    esac
    [ $_status -eq 0 ] || fail "awk ended with status $_status"
    printf %s "${_document:+$_document$_line_feed}"
}

progress() {
    [ -t 2 ] || return 0
    [ "$1" -lt "$2" ] || { _clear_bar; return 0; }
    _bar='##############################' _bar_is_drawn=yes
    while [ ${#_bar} -gt $((30 * $1 / $2)) ]; do _bar=${_bar#?}; done
    printf '\r[%-30s] %3d %% %.36s\033[K' "$_bar" $((100 * $1 / $2)) \
        "$(printf %s "$3" | LC_ALL=C tr -c ' -~' '?')" >&2
}

_clear_bar() {
    [ -z "${_bar_is_drawn-}" ] || printf '\r\033[K' >&2
    _bar_is_drawn=''
}

_rows_are_lost='index($0, _lost) { fail(substr($0, index($0, _lost) + length(_lost))) }
'

# An exit still runs the END rules, so the first such text is not the last that is printed.
_dialect_functions='
function fail(text) { gsub(/[^ -~\200-\377]/, " ", text); print _lost text; exit 1 }

function open_list(kind)      { _open("list", " type=\"" kind "\"") }
function open_structure(type) { _open("structure", " typeName=\"" type "\"") }
function open_field(name)     { _open("field", " name=\"" name "\"") }
function end() {
    if (!_depth) return
    print "</" _tags[_depth--] ">"
    if (!_depth) print "</output>"
}

function text_item(value)   { _print(_text(value)) }
function number_item(value) { _print(_number("An item", value)) }
function truth_item(value)  { _print(_truth(value)) }

function text_field(name, value)   { _print_field(name, _text(value)) }
function number_field(name, value) { _print_field(name, _number(name, value)) }
function truth_field(name, value)  { _print_field(name, _truth(value)) }

function _open(tag, attributes) {
    if (!_depth) print "<output>"
    print "<" tag attributes ">"
    _tags[++_depth] = tag
}
function _print(element) {
    if (!_depth) element = "<output>\n" element "\n</output>"
    print element
}
function _print_field(name, element) { print "<field name=\"" name "\">" element "</field>" }

# awk itself writes large numbers as 3e+12.
function _number(place, value,    digits) {
    if (value ~ /^-?[0-9]+$/) return "<int>" value "</int>"
    digits = sprintf("%.0f", value)
    if (value !~ /^-?[0-9.]+e[+][0-9]+$/ || value != digits + 0)
        fail(place ": '\''" value "'\'' is no whole number")
    return "<int>" digits "</int>"
}
function _text(value)   { return "<string>" _escape(value) "</string>" }
function _truth(value)  {
    return value "" == "" || value "" == "0" ? "<bool>false</bool>" : "<bool>true</bool>"
}

function _escape(value,    safe) {
    if (value !~ /[^ -~]|[&<>]/) return value
    gsub(/&/, "\\&amp;", value)
    gsub(/</, "\\&lt;", value)
    gsub(/>/, "\\&gt;", value)
    safe = ""
    while (match(value, /[^ -~]/)) {
        safe = safe substr(value, 1, RSTART - 1)
        value = substr(value, RSTART)
        if (match(value, _utf8)) {
            safe = safe substr(value, 1, RLENGTH)
            value = substr(value, RLENGTH + 1)
        } else {
            safe = safe sprintf("\\x%02x", _code[substr(value, 1, 1)])
            value = substr(value, 2)
        }
    }
    return safe value
}

# One character of several bytes that XML takes: no C1 controls, overlong forms, surrogates,
# U+FFFE, U+FFFF or anything above U+10FFFF.
BEGIN {
    _tail = "[\200-\277]"
    _utf8 = "^(\302[\240-\277]|[\303-\337]" _tail \
        "|\340[\240-\277]" _tail "|[\341-\354\356]" _tail _tail "|\355[\200-\237]" _tail \
        "|\357[\200-\276]" _tail "|\357\277[\200-\275]" \
        "|\360[\220-\277]" _tail _tail "|[\361-\363]" _tail _tail _tail \
        "|\364[\200-\217]" _tail _tail ")"
    for (_i = 0; _i < 256; _i++) _code[sprintf("%c", _i)] = _i
}
'

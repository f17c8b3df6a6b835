# What a command script prints, made easy. A script begins with
#
#     . "${0%/*}/lib/dialect.sh"
#
# and then has:
#
#     fail TEXT                   tell what is wrong as an ERROR: line and end the script;
#                                 such a line counts only at the very start of the output
#     read_files FILE...          each line of the files as "FILE<tab>LINE", in one process;
#     read_files -r FOLDER        what cannot be read is left out
#     dialect PROGRAM OPERAND...  run an awk program with the functions below; operands are
#                                 files, "-" and VARIABLE=VALUE, as awk takes them
#
# The awk functions print one document. open_... opens a list, a structure or a field that holds
# more than one value, end() closes what was opened last; ..._field puts a value into a structure,
# ..._item into a list. Empty text and 0 are the truth value false.
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

export LC_ALL=C

fail() {
    printf 'ERROR:%s\n' "$*"
    exit 1
}

read_files() {
    grep -asHZ '' "$@" | tr '\000' '\t'
}

dialect() {
    _program=$1
    shift
    awk "$_dialect_functions$_program" "$@"
}

_dialect_functions='
function open_list(kind)      { _open("list", " type=\"" kind "\"") }
function open_structure(type) { _open("structure", " typeName=\"" type "\"") }
function open_field(name)     { _open("field", " name=\"" name "\"") }
function end() {
    if (!_depth) return
    print "</" _tags[_depth--] ">"
    if (!_depth) print "</output>"
}

function text_item(value)   { _print(_text(value)) }
function number_item(value) { _print(_number(value)) }
function truth_item(value)  { _print(_truth(value)) }

function text_field(name, value)   { _print_field(name, _text(value)) }
function number_field(name, value) { _print_field(name, _number(value)) }
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

function _text(value)   { return "<string>" _escape(value) "</string>" }
function _number(value) { return "<int>" (value ~ /^-?[0-9]+$/ ? value : sprintf("%.0f", value)) "</int>" }
function _truth(value)  { return "<bool>" (value "" == "" || value "" == "0" ? "false" : "true") "</bool>" }

function _escape(value,    safe, character) {
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

# What a command script prints, declared. A script that stands beside this file is
#
#     #!/usr/bin/perl
#     use strict;
#     use warnings;
#     use File::Basename;
#     use lib dirname(__FILE__);
#     use Kelvash;
#
#     run(
#         path => 'backup.list',
#         description => 'List the backups',
#         read_only => 1,
#         parameters => [
#             folder => { type => 'string', short => 'f', description => 'Where to look' },
#             'min-size' => { type => 'int', range => [0, 9999],
#                 description => 'At least this size, %REGEX%' },
#         ],
#         result => list(structure(Backup => [Name => 'string', Size => 'int MiB'])),
#         code => sub {
#             my %option = ('min-size' => 0, folder => 'backups', @_);
#             -d $option{folder} or die "There is no folder '$option{folder}'\n";
#             my @backups = map { { Name => $_, Size => (-s) >> 20 } } glob "$option{folder}/*.tar";
#             return [grep { $_->{Size} >= $option{'min-size'} } @backups];
#         },
#     );
#
# Called with --descriptor it prints the descriptor of the command backup.list. Called by the
# command it gets `--folder backups --min-size 3`, calls the code with the options that were given
# and prints what that returns, when the whole of it fits what is declared: 'int', 'bool' (1, 0 or
# ''), 'string', structure(NAME => [FIELD => TYPE...]) as a hash, or list(TYPE) as an array, as
# deep as it may be. Words behind a type are the unit of the field. What does not fit is told with
# its place, as is whatever the code dies of, in ERROR: lines; a text with a line feed at its end
# has no place, as everywhere in Perl. What the script prints by the way goes to the error stream.
#
# A parameter has a type (string, int, bool, flag, or string-list, int-list, bool-list for one
# that may be repeated) and a description; it may have short, required, range, pattern, values
# (pairs of a value and what it means), values_from ("account user list:Name") and secret. A
# secret comes through standard input, of which no process list tells. Besides, run knows
# namespaces (a hash of what is below each) and examples (texts "ARGUMENTS : SENTENCE").
#
#     progress(DONE, TOTAL, TEXT)   draws a bar on the error stream if that is a terminal; it goes
#                                   when all is done
#
# In a descriptor, PERL_BADLANG=0 stands ahead of the script: kelvash sets LANG=en_US.UTF-8 where
# there is no LANG, and Perl warns of a locale that the machine does not have.
#
# Text may hold any bytes or characters: what XML cannot carry is shown, as \x1b.
#
# Needs Perl 5.20 and nothing else.
package Kelvash;

use strict;
use warnings;
use Exporter 'import';
use File::Spec;
use List::Util qw(pairkeys pairs);

our @EXPORT = qw(list progress run structure);

sub list { return { word => 'list', item => shift } }

sub structure {
    my ($name, $fields) = @_;
    my %structure = (word => 'structure', name => $name, order => [], fields => {}, units => {});
    for (pairs @$fields) {
        my ($field, $type) = @$_;
        ($type, $structure{units}{$field}) = split ' ', $type, 2 if !ref $type;
        push @{$structure{order}}, $field;
        $structure{fields}{$field} = $type;
    }
    return \%structure;
}

sub run {
    my %command = @_;
    my %parameters = @{$command{parameters} ||= []};
    $command{order} = [pairkeys @{$command{parameters}}];
    my $describe = @ARGV == 1 && $ARGV[0] eq '--descriptor';
    open my $result, '>&', \*STDOUT or die "Cannot keep standard output: $!\n";
    open STDOUT, '>&', \*STDERR or die "Cannot use the error stream: $!\n";
    my $text = eval {
        _check_parameter($_, $parameters{$_}) for @{$command{order}};
        _check_type($command{result});
        $describe
            ? _descriptor(\%command, \%parameters)
            : _document($command{result}, $command{code}->(_arguments(\%command, \%parameters)));
    };
    my $failed = !defined $text;
    if ($failed) {
        progress(1, 1);
        $text = join '', map { 'ERROR:' . _show($_) . "\n" } grep { length } split /\n/, $@;
        $result = \*STDERR if $describe;
    }
    binmode $result;
    print {$result} $text and close $result or die "Cannot print the result: $!\n";
    exit($failed ? 1 : 0);
}

sub progress {
    my ($done, $total, $text) = @_;
    return if !-t STDERR;
    my $bar = '';
    if ($done < $total) {
        ($text = substr($text // '', 0, 36)) =~ s/[^ -~]/?/g;
        my $share = $done / $total;
        $bar = sprintf '[%-30s] %3d %% %s', '#' x int(30 * $share), 100 * $share, $text;
    }
    print STDERR "\r$bar\033[K";
}

my %read = (
    int => sub { $_[0] =~ /^\s*[-+]?[0-9]+\z/ ? $_[0] + 0 : die "whole number\n" },
    bool => sub {
        $_[0] =~ /^(?:(1|yes|y|true|True|t|T)|0|no|n|false|False|f|F)\z/ or die "truth value\n";
        return defined $1 ? 1 : 0;
    },
    string => sub { $_[0] },
);

sub _arguments {
    my ($command, $parameters) = @_;
    my %given;
    my @words = @ARGV;
    while (defined(my $word = shift @words)) {
        my ($name) = $word =~ /^--(.+)/s;
        my $parameter = defined $name ? $parameters->{$name} : undef;
        die "Unknown option: $word\n" if !$parameter || $parameter->{secret};
        if ($parameter->{type} eq 'flag') {
            $given{$name} = 1;
            next;
        }
        die "$word needs a value\n" if !@words;
        my ($kind, $is_list) = $parameter->{type} =~ /^(\w+)(-list)?/;
        my $text = shift @words;
        my $value = eval { $read{$kind}->($text) };
        die "$word: '$text' is no $@" if !defined $value;
        if ($is_list) { push @{$given{$name}}, $value }
        else { $given{$name} = $value }
    }
    for my $name (@{$command->{order}}) {
        my $parameter = $parameters->{$name};
        if ($parameter->{secret}) { local $/; $given{$name} = <STDIN> }
        die "--$name is missing\n" if $parameter->{required} && !exists $given{$name};
    }
    return %given;
}

sub _check_parameter {
    my ($name, $parameter) = @_;
    my $type = $parameter->{type} // '';
    die "$name: '$type' is no type of a parameter\n"
        if $type !~ /^(?:flag|(?:string|int|bool)(?:-list)?)\z/;
    die "$name has no description\n" if !defined $parameter->{description};
    die "$name: a secret is a required string\n"
        if $parameter->{secret} && ($type ne 'string' || !$parameter->{required});
}

sub _check_type {
    my ($type, $in_list) = @_;
    if (!ref $type) {
        die "'" . ($type // '') . "' is no type of a result: int, bool, string, list or structure\n"
            if ($type // '') !~ /^(?:int|bool|string)\z/;
    } elsif ($type->{word} eq 'list') {
        die "There are no lists of lists\n" if $in_list;
        _check_type($type->{item}, 1);
    } else {
        die "'$type->{name}': a structure is named with letters and digits\n"
            if $type->{name} !~ /^[a-zA-Z0-9]+\z/;
        _check_type($_) for values %{$type->{fields}};
    }
}

sub _document {
    my ($type, $value) = @_;
    my (@out, @faults);
    _print('result', $type, $value, \@out, \@faults);
    die map { "$_\n" } grep { defined } @faults[0 .. 9] if @faults;
    return join '', "<output>\n", @out, "\n</output>\n";
}

sub _print {
    my ($place, $type, $value, $out, $faults) = @_;
    if (!ref $type) { _print_scalar($place, $type, $value, $out, $faults) }
    elsif ($type->{word} eq 'list') { _print_list($place, $type, $value, $out, $faults) }
    else { _print_structure($place, $type, $value, $out, $faults) }
}

sub _print_scalar {
    my ($place, $type, $value, $out, $faults) = @_;
    my $is_text = defined $value && !ref $value;
    if ($type eq 'string' && $is_text) {
        push @$out, '<string>', _escape($value), '</string>';
    } elsif ($type eq 'bool' && $is_text && $value =~ /^[01]?\z/) {
        push @$out, $value ? '<bool>true</bool>' : '<bool>false</bool>';
    } elsif ($type eq 'int' && $is_text && defined(my $digits = _digits($value))) {
        push @$out, "<int>$digits</int>";
    } else {
        my %name = (string => 'text', bool => 'truth value', int => 'whole number of 64 bits');
        push @$faults, "$place: " . _short($value) . " is no $name{$type}";
    }
}

# Perl itself writes large numbers that it computed as 1e+15.
sub _digits {
    my ($value) = @_;
    $value = sprintf '%.0f', $value if $value =~ /^-?[0-9.]+e[+][0-9]+\z/ && int $value == $value;
    my ($sign, $digits) = $value =~ /^(-?)0*([0-9]+)\z/ or return undef;
    my $most = '922337203685477580' . ($sign ? 8 : 7);
    return length $digits < 19 || length $digits == 19 && $digits le $most ? "$sign$digits" : undef;
}

sub _print_list {
    my ($place, $type, $value, $out, $faults) = @_;
    if (ref $value ne 'ARRAY') {
        push @$faults, "$place: " . _short($value) . ' is no list';
        return;
    }
    my $word = ref $type->{item} ? $type->{item}{word} : $type->{item};
    push @$out, "<list type=\"$word\">\n";
    for my $i (0 .. $#$value) {
        _print("${place}[$i]", $type->{item}, $value->[$i], $out, $faults);
        push @$out, "\n";
    }
    push @$out, '</list>';
}

sub _print_structure {
    my ($place, $type, $value, $out, $faults) = @_;
    if (ref $value ne 'HASH') {
        push @$faults, "$place: " . _short($value) . " is no $type->{name}";
        return;
    }
    push @$faults, map { "$place.$_ is not declared" }
        grep { !$type->{fields}{$_} } sort keys %$value;
    push @$out, "<structure typeName=\"$type->{name}\">\n";
    for my $field (@{$type->{order}}) {
        push @$out, '<field name="', _escape($field), '">';
        _print("$place.$field", $type->{fields}{$field}, $value->{$field}, $out, $faults);
        push @$out, "</field>\n";
    }
    push @$out, '</structure>';
}

sub _short {
    my ($value) = @_;
    return 'nothing' if !defined $value;
    return ref $value if ref $value;
    $value =~ s/\n/ /g;
    return length $value <= 60 ? "'$value'" : "'" . substr($value, 0, 57) . "'...";
}

# What XML takes, in bytes of UTF-8: no control characters, overlong forms, surrogates, U+FFFE,
# U+FFFF or anything above U+10FFFF.
my $tail = '[\x80-\xbf]';
my $fits = qr/[\t\n\r -~]+|\xc2[\xa0-\xbf]|[\xc3-\xdf]$tail
    |\xe0[\xa0-\xbf]$tail|[\xe1-\xec\xee]$tail$tail|\xed[\x80-\x9f]$tail
    |\xef[\x80-\xbe]$tail|\xef\xbf[\x80-\xbd]
    |\xf0[\x90-\xbf]$tail$tail|[\xf1-\xf3]$tail$tail$tail|\xf4[\x80-\x8f]$tail$tail/x;

sub _show {
    my ($text) = @_;
    utf8::encode($text) if utf8::is_utf8($text);
    return $text if $text !~ /[^\t\n\r -~]/;
    return $text =~ s/($fits)|(.)/defined $1 ? $1 : sprintf '\x%02x', ord $2/gser;
}

my %entity = ('&' => '&amp;', '<' => '&lt;', '>' => '&gt;', '"' => '&quot;', "\r" => '&#13;');

sub _escape { return _show($_[0]) =~ s/([&<>"\r])/$entity{$1}/gr }

# An element with children, which are elements, or with a text, which is a reference to one.
sub _element {
    my ($tag, $attributes, @children) = @_;
    my $head = $tag;
    $head .= " $_->[0]=\"" . _escape($_->[1]) . '"' for pairs @$attributes;
    return "<$head/>\n" if !@children;
    return "<$head>" . _escape(${$children[0]} =~ s/\s*\n\s*/ /gr) . "</$tag>\n" if ref $children[0];
    return "<$head>\n" . join('', map { s/^/  /mgr } @children) . "</$tag>\n";
}

sub _descriptor {
    my ($command, $parameters) = @_;
    my $script = File::Spec->rel2abs($0);
    die "'$script' is no name for a script: it needs quotes in a shell\n"
        if $script =~ m{[^\w./+,@-]};

    my @parts = split /\./, $command->{path};
    my @namespaces = map {
        my $space = join '.', @parts[0 .. $_];
        my $text = $command->{namespaces}{$space} // "Commands of @parts[0 .. $_]";
        _element('namespace', [path => $space], _element('description', [], \$text));
    } 0 .. $#parts - 1;

    my @notes = $command->{read_only} ? ('read-only', 'true') : ();
    push @notes, "values:$_", $parameters->{$_}{values_from}
        for grep { $parameters->{$_}{values_from} } @{$command->{order}};
    push @notes, 'example', $_ for @{$command->{examples} || []};
    my @entries = map { _element('meta-data-entry', [name => $_->[0]], \$_->[1]) } pairs @notes;

    my @open = grep { !$parameters->{$_}{secret} } @{$command->{order}};
    my $execute = join ' ', "PERL_BADLANG=0 $script", map { _form($_, $parameters->{$_}) } @open;
    my @inputs = map { _parameter($_, $parameters->{$_}) } @{$command->{order}};
    my @stdin = map { my $form = "\$val{$_}"; _element('stdin', [], \$form) }
        grep { $parameters->{$_}{secret} } @{$command->{order}};
    return qq(<?xml version="1.0" encoding="UTF-8"?>\n) . _element('plugin', [],
        _element('version', [], \'1.0.0'),
        _element('namespaces', [], @namespaces),
        _element('commands', [], _element('command', [path => $command->{path}],
            _element('description', [], \$command->{description}),
            @entries ? _element('meta-data', [], @entries) : (),
            _element('input-spec', [], @inputs),
            _element('output-spec', [], _sample($command->{result})),
            _element('format-parameters', [], _formats($command->{result})),
            _element('execute', [], \$execute),
            @stdin)));
}

sub _parameter {
    my ($name, $parameter) = @_;
    my $constraint;
    if ($parameter->{range}) {
        my ($least, $most) = @{$parameter->{range}};
        $constraint = ['range', _element('range', [min => $least, max => $most])];
    } elsif ($parameter->{values}) {
        my ($kind) = $parameter->{type} =~ /^(\w+)/;
        $constraint = ["${kind}enum", _element('enum', [], map {
            _element('enum-value', [value => $_->[0]], \$_->[1])
        } pairs @{$parameter->{values}})];
    } elsif ($parameter->{type} =~ /^string/) {
        my $pattern = $parameter->{pattern} // _safe($parameter);
        $constraint = ['regex', _element('regex', [], \$pattern)];
    }
    my @attributes = (name => $name, type => $parameter->{type},
        required => $parameter->{required} ? 'true' : 'false');
    push @attributes, shortname => $parameter->{short} if $parameter->{short};
    push @attributes, secret => 'true' if $parameter->{secret};
    return _element('parameter', \@attributes,
        _element('description', [], \$parameter->{description}),
        $constraint ? _element('constraint', [type => $constraint->[0]], $constraint->[1]) : ());
}

# What may stand where the form of the parameter puts it.
sub _safe {
    my ($parameter) = @_;
    return '[^{}\x00]+' if $parameter->{secret};
    return $parameter->{type} eq 'string' ? "[^{}']*" : '[^{}"$\\\\`]*';
}

sub _form {
    my ($name, $parameter) = @_;
    return "\$if{$name,--$name}" if $parameter->{type} eq 'flag';
    my $form = $parameter->{type} =~ /-list$/
        ? "\$multilist{$name,--$name,true}" : "--$name '\$val{$name}'";
    return $parameter->{required} ? $form : "\$if{$name,$form}";
}

sub _sample {
    my ($type) = @_;
    return _element($type, []) if !ref $type;
    if ($type->{word} eq 'list') {
        my $item = $type->{item};
        return _element('list', [type => $item]) if !ref $item;
        return _element('list', [type => $item->{word}], _sample($item));
    }
    return _element('structure', [typeName => $type->{name}],
        map { _element('field', [name => $_], _sample($type->{fields}{$_})) } @{$type->{order}});
}

sub _formats {
    my ($type) = @_;
    my $formatter = _is_table($type) ? 'table' : 'simple';
    my @formats = _element('formatter', [], \$formatter);
    my %seen;
    for my $structure (grep { !$seen{$_->{name}}++ } _structures($type)) {
        my $fields = join ',', @{$structure->{order}};
        my @keys = ("fields:$structure->{name}" => $fields);
        push @keys, "units:$structure->{name}.$_" => $structure->{units}{$_}
            for grep { defined $structure->{units}{$_} } @{$structure->{order}};
        push @formats,
            map { _element('format-parameter', [name => $_->[0]], \$_->[1]) } pairs @keys;
    }
    return @formats;
}

sub _is_table {
    my ($type) = @_;
    return ref $type && $type->{word} eq 'list' && ref $type->{item}
        && !grep { ref } values %{$type->{item}{fields}};
}

sub _structures {
    my ($type) = @_;
    return () if !ref $type;
    return _structures($type->{item}) if $type->{word} eq 'list';
    return ($type, map { _structures($type->{fields}{$_}) } @{$type->{order}});
}

1;

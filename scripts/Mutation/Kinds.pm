package Mutation::Kinds;

# The kinds of mutants. Each is a function of a source and gives the edits {place, length, with} that it can make
# there, each of one small mistake that a developer could make and a reader could overlook.

use strict;
use warnings;
use List::Util qw(uniq);

# In the order in which they are looked for; the names are printed.
our @kinds = (
  ['message letter', \&message_letters],
  ['word letter', \&word_letters],
  ['comparison', \&comparisons],
  ['call dropped', \&dropped_calls],
  ['assignment dropped', \&dropped_assignments],
  ['guards swapped', \&swapped_guards],
  ['number', \&numbers],
  ['alias order', \&swapped_aliases],
  ['handler', \&exchanged_handlers],
);

# All edits of a source: [KIND, EDIT] each, none twice. `rand` chooses the letters that change.
sub edits_of {
  my ($source) = @_;
  my (@found, %seen);
  for my $kind (@kinds) {
    my ($name, $find) = @$kind;
    for my $edit ($find->($source)) {
      next if $seen{$source->edited($edit)}++;
      push @found, [$name, $edit];
    }
  }
  return @found;
}

# Patterns over Mutation::Source's `code`.
my $parentheses = qr/(?<round>\((?:[^()]++|(?&round))*\))/;
my $statement_begins = qr/(?:(?:[;{})]|\belse)\s+|:\n\s+)/;
my $callee = qr/\*?(?!static_assert\b)[A-Za-z_][\w:]*(?:(?:\.|->)\w+)*/;
my $declaration = qr/const\ [^;{}]*?=[^;{}]*;\n\ */x;
my $guard = qr/if\ (?:constexpr\ )?$parentheses\s+return\b[^;{}]*;/x;

# What a message is made of has a blank or a line end; other texts are words of the language that users type.
sub is_message { return $_[0] =~ /[ ]|\\n/ }

sub other_letter {
  my ($letter) = @_;
  return $letter eq 'z' ? 'a' : $letter eq 'Z' ? 'A' : chr(ord($letter) + 1);
}

# One edit for a literal: a letter becomes another one. Escapes and conversions are left alone, for without them a
# text is not a little wrong but altogether. One of the blanks of a doubled one may go: those are easily "corrected".
sub letter_edit {
  my ($string) = @_;
  my @places;
  my $text = $string->{text};
  while ($text =~ /(\\x[0-9A-Fa-f]+|\\.|%[-+0-9.]*[a-z])|([A-Za-z])|(?<=[ ])([ ])/g) {
    push @places, [$-[0], defined $3 ? '' : other_letter($2)] if !defined $1;
  }
  return if !@places;
  my ($place, $with) = @{$places[int rand @places]};
  return {place => $string->{place} + $place, length => 1, with => $with};
}

sub message_letters {
  my ($source) = @_;
  return map { letter_edit($_) } grep { is_message($_->{text}) } @{$source->{strings}};
}

sub word_letters {
  my ($source) = @_;
  return map { letter_edit($_) } grep { !is_message($_->{text}) } @{$source->{strings}};
}

my %opposite = (
  '==' => '!=', '!=' => '==', '<' => '<=', '<=' => '<', '>' => '>=', '>=' => '>', '&&' => '||', '||' => '&&',
  'true' => 'false', 'false' => 'true',
);

sub comparisons {
  my ($source) = @_;
  my @edits;
  # Blanks tell a comparison from a template's brackets and a reference.
  while ($source->{code} =~ /(?<=\s)(==|!=|<=|>=|<|>|&&|\|\|)(?=\s)|\b(true|false)\b/g) {
    push @edits, {place => $-[0], length => $+[0] - $-[0], with => $opposite{$&}};
  }
  while ($source->{code} =~ /!(?=[\w(*])/g) {
    push @edits, {place => $-[0], length => 1, with => ''};
  }
  return @edits;
}

# A statement becomes a block of nothing, for an empty one behind `if` draws a warning.
sub dropped {
  my ($source, $statement) = @_;
  my @edits;
  # The end of the statement before is looked at only, for it may be a statement to drop itself.
  while ($source->{code} =~ /(?=(?<before>$statement_begins)(?<statement>$statement))./gs) {
    push @edits, {place => $-[0] + length $+{before}, length => length $+{statement}, with => '{}'};
  }
  return @edits;
}

sub dropped_calls { return dropped($_[0], qr/$callee$parentheses(?:\.\w+\((?:[^()]|\(\))*\))*;/) }

# A declaration has a blank between type and name and so does not look like this.
sub dropped_assignments { return dropped($_[0], qr/(?:[-+]{2}$callee|$callee(?:\[[^\]]*\])?\ \+?=\ [^;]*);/) }

# Two guards, each with the declaration of what it looks at, in the wrong order.
sub swapped_guards {
  my ($source) = @_;
  my @edits;
  for my $unit ($guard, qr/$declaration$guard/) {
    while ($source->{code} =~ /^\ *\K(?=(?<first>$unit)(?<between>\n\ *)(?<second>$unit))/gm) {
      my ($first, $between, $second) = map { [$-{$_}[0], length $-{$_}[0]] } qw(first between second);
      my $place = $-[0];
      my @parts = map { substr($source->{text}, $_->[0], $_->[1]) } [$place, $first->[1]],
        [$place + $first->[1], $between->[1]], [$place + $first->[1] + $between->[1], $second->[1]];
      push @edits, {place => $place, length => length(join '', @parts), with => join('', reverse @parts)};
    }
  }
  return @edits;
}

sub numbers {
  my ($source) = @_;
  my @edits;
  while ($source->{code} =~ /(?<![\w.])(\d+)(?=[uUlL]*(?![\w.]))/g) {
    push @edits, {place => $-[0], length => length $1, with => $1 + 1};
  }
  for my $character (grep { $_->{text} =~ /^[A-Za-z0-9]$/ } @{$source->{characters}}) {
    push @edits, {place => $character->{place}, length => 1, with => chr(ord($character->{text}) + 1)};
  }
  return @edits;
}

# Which of two spellings of a switch is looked for first.
sub swapped_aliases {
  my ($source) = @_;
  my @edits;
  while ($source->{code} =~ /\bfindSwitch\(\w+, (?:"_*", )*\K(?=("_*")(, )("_*"))/g) {
    my ($first, $between, $second) = map { substr($source->{text}, $-[$_], $+[$_] - $-[$_]) } 1 .. 3;
    push @edits, {place => $-[1], length => $+[3] - $-[1], with => "$second$between$first"};
  }
  return @edits;
}

# Rows of the dispatcher: a word leads to the handler of the next row that has another one.
sub exchanged_handlers {
  my ($source) = @_;
  my @rows;
  while ($source->{code} =~ /^ +(?:whole|twoLetters)\("_+", ([^\n]+)\),$/gm) {
    push @rows, {place => $-[1], handler => $1};
  }
  my @edits;
  for my $i (0 .. $#rows) {
    my $own = $rows[$i]{handler};
    my ($other) = grep { $_ ne $own } map { $rows[($i + $_) % @rows]{handler} } 1 .. $#rows;
    push @edits, {place => $rows[$i]{place}, length => length $own, with => $other} if defined $other;
  }
  return @edits;
}

1;

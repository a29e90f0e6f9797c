package Mutation::Plan;

# Which mutants are made: the same ones for the same seed and the same files, whatever the number of workers.

use strict;
use warnings;
use List::Util qw(shuffle uniq);
use Mutation::Kinds;

# new(SEED, SOURCES)
sub new {
  my ($class, $seed, @sources) = @_;
  my $self = bless {waiting => {}, taken => {}, sizes => {}}, $class;
  for my $source (@sources) {
    # Each file has a sequence of its own, so that a change of one leaves the others' mutants alone.
    srand($seed + unpack('%32C*', $source->{name}));
    my @mutants = _ordered($source);
    $self->{waiting}{$source->{name}} = \@mutants;
    # The size of a file: in how many lines a mistake can be made. Declarations and layout have none.
    $self->{sizes}{$source->{name}} = uniq(map { $_->{line} } @mutants);
    $self->{taken}{$source->{name}} = 0;
  }
  return $self;
}

# The mutants of a file in the order in which they are drawn: a kind after the other, for some kinds have a hundred
# times as many as others.
sub _ordered {
  my ($source) = @_;
  my %of_kind;
  push @{$of_kind{$_->[0]}}, $_->[1] for Mutation::Kinds::edits_of($source);
  my @kinds = shuffle(sort keys %of_kind);
  $of_kind{$_} = [shuffle(@{$of_kind{$_}})] for @kinds;
  my @ordered;
  while (%of_kind) {
    for my $kind (grep { $of_kind{$_} } @kinds) {
      my $edit = shift @{$of_kind{$kind}};
      delete $of_kind{$kind} if !@{$of_kind{$kind}};
      my ($before, $after) = $source->excerpts($edit);
      my $line = $source->line_of($edit->{place});
      push @ordered, {
        source => $source, edit => $edit, kind => $kind, before => $before, after => $after, line => $line,
        name => "$source->{name}:$line $kind",
      };
    }
  }
  return @ordered;
}

# Up to COUNT mutants that were not drawn before, shared out to the files by their size; every file has its turn
# before any has two. Those of one file stand together.
sub draw {
  my ($self, $count) = @_;
  my ($waiting, $taken, $sizes) = @$self{qw(waiting taken sizes)};
  my %drawn;
  while ($count-- > 0) {
    my ($next) = sort { $taken->{$a} / $sizes->{$a} <=> $taken->{$b} / $sizes->{$b} or $a cmp $b }
      grep { @{$waiting->{$_}} } keys %$waiting;
    last if !defined $next;
    ++$taken->{$next};
    push @{$drawn{$next}}, shift @{$waiting->{$next}};
  }
  return map { @{$drawn{$_}} } sort keys %drawn;
}

# The mutant does not count; the next draw prefers its file.
sub return_turn {
  my ($self, $mutant) = @_;
  --$self->{taken}{$mutant->{source}{name}};
}

1;

package Mutation::Source;

# A C++ file, read far enough to change it safely. Beside the text stands `code`: the same text, place for place,
# with comments and preprocessor lines blanked and the insides of literals filled with "_". A pattern that matches
# in `code` has found code, and its place is the place in the text.

use strict;
use warnings;

sub read_file {
  my ($path) = @_;
  open(my $file, '<:raw', $path) or die "Cannot read $path: $!\n";
  local $/;
  my $text = <$file>;
  return defined $text ? $text : '';
}

sub write_file {
  my ($path, $text) = @_;
  open(my $file, '>:raw', $path) or die "Cannot write $path: $!\n";
  print {$file} $text or die "Cannot write $path: $!\n";
  close($file) or die "Cannot write $path: $!\n";
}

# load(ROOT, NAME): the file NAME below ROOT.
sub load {
  my ($class, $root, $name) = @_;
  my $self = bless {name => $name, text => read_file("$root/$name"), code => '', strings => [], characters => []}, $class;
  $self->_separate;
  return $self;
}

sub blank { return $_[0] =~ s/[^\n]/ /gr }

sub _separate {
  my ($self) = @_;
  my $code = '';
  local $_ = $self->{text};
  pos($_) = 0;
  while (pos($_) < length) {
    my $place = pos($_);
    if (m{\G(?://[^\n]*|/\*.*?\*/)}gcs or m{\G(?<![^\n])[ \t]*\#(?:\\\n|[^\n])*}gc) {
      $code .= blank($&);
    } elsif (m{\G"((?:\\.|[^"\\\n])*)"}gc) {
      push @{$self->{strings}}, {place => $place + 1, text => $1};
      $code .= '"' . '_' x length($1) . '"';
    } elsif (m{\G'((?:\\.|[^'\\\n])+)'}gc) {
      push @{$self->{characters}}, {place => $place + 1, text => $1};
      $code .= "'" . '_' x length($1) . "'";
    } elsif (m{\G\w[\w']*}gc or m{\G.}gcs) {
      $code .= $&;
    }
  }
  $self->{code} = $code;
}

sub line_of {
  my ($self, $place) = @_;
  return 1 + (substr($self->{text}, 0, $place) =~ tr/\n//);
}

# The text with an edit {place, length, with} applied.
sub edited {
  my ($self, $edit) = @_;
  my $text = $self->{text};
  substr($text, $edit->{place}, $edit->{length}) = $edit->{with};
  return $text;
}

# The lines that an edit touches, before and after, each as one line of text.
sub excerpts {
  my ($self, $edit) = @_;
  my $from = rindex($self->{text}, "\n", $edit->{place} - 1) + 1;
  $from = 0 if $edit->{place} == 0;
  my $to = index($self->{text}, "\n", $edit->{place} + $edit->{length});
  $to = length $self->{text} if $to < 0;
  my $before = substr($self->{text}, $from, $to - $from);
  my $after = $before;
  substr($after, $edit->{place} - $from, $edit->{length}) = $edit->{with};
  # Blanks inside a line stay: a doubled one may be the very change.
  return map { s/\n\s*/ /gr =~ s/^\s+//r } $before, $after;
}

1;

package Mutation::Workplace;

# A copy of the source tree with a build of its own, in which mutants are made and tested. The tree itself is only
# read.
#
#   my $workplace = Mutation::Workplace->new("$root/build/mutation/1", $root, Mutation::Workplace::list_files($root));
#   $workplace->prepare(2);
#   $workplace->put('batch/Help.cpp', $mutant);
#   print $workplace->find_killer($source) if $workplace->compile;

use strict;
use warnings;
use File::Basename qw(basename dirname);
use File::Path qw(make_path remove_tree);
use IO::Select;
use List::Util qw(uniq);
use POSIX ();
use Mutation::Source;

my ($cases, $unit_tests) = qw(tessel-conformance batch-test);
# In seconds. A case has 10; silence that is much longer means that the runner itself hangs.
my $longest_silence = 120;
my $hangs = 'hangs';

# new(DIRECTORY, ROOT, NAMES): a workplace in DIRECTORY, which may hold an earlier one, for the files NAMES of ROOT.
sub new {
  my ($class, $directory, $root, @names) = @_;
  my $self = bless {
    source => "$directory/source", build => "$directory/build", scratch => "$directory/scratch",
    log => "$directory/log",
  }, $class;
  make_path(@$self{qw(source build)});
  $self->_copy($root, @names);
  $self->_read_cases;
  return $self;
}

# Files that did not change keep their times, so that nothing is compiled for them. A mutant that an interrupted
# run left behind goes away here, too.
sub _copy {
  my ($self, $root, @names) = @_;
  my %wanted;
  for my $name (@names) {
    my $path = "$self->{source}/$name";
    $wanted{$path} = 1;
    make_path(dirname($path));
    $self->put($name, Mutation::Source::read_file("$root/$name"));
    chmod((stat "$root/$name")[2] & 07777, $path);
  }
  my @folders = ($self->{source});
  while (defined(my $folder = shift @folders)) {
    for my $path (glob "\Q$folder\E/{.[!.]*,*}") {
      if (-d $path) { push @folders, $path }
      elsif (-e $path && !$wanted{$path}) { unlink $path or die "Cannot remove $path: $!\n" }
    }
  }
}

# The files of a tree that git knows or would offer to add.
sub list_files {
  my ($root, @patterns) = @_;
  open(my $list, '-|', 'git', '-C', $root, '-c', "safe.directory=$root", 'ls-files', '-z', '--cached', '--others',
    '--exclude-standard', '--', @patterns) or die "Cannot run git: $!\n";
  local $/ = "\0";
  chomp(my @names = <$list>);
  close($list) or die "git ls-files failed in $root\n";
  my %seen;
  return grep { -f "$root/$_" && !$seen{$_}++ } sort @names;
}

# Gives a file of the copy a text, if it has not that text already.
sub put {
  my ($self, $name, $text) = @_;
  my $path = "$self->{source}/$name";
  return if -e $path && Mutation::Source::read_file($path) eq $text;
  Mutation::Source::write_file($path, $text);
}

sub _read_cases {
  my ($self) = @_;
  for my $path (sort glob "\Q$self->{source}\E/tests/conformance/*.case") {
    my $text = Mutation::Source::read_file($path);
    $self->{cases}{$path} = $text;
    $self->{file_of}{$_} = $path for $text =~ /^case "(.*)"$/mg;
  }
}

# Configures and builds all that tests need; dies when that fails.
sub prepare {
  my ($self, $jobs) = @_;
  # Time goes into compiling, not into running: no optimisation, no debug information.
  my @configure = ('cmake', '-S', $self->{source}, '-B', $self->{build}, '-G', 'Ninja', '-DBUILD_TESTING=ON',
    '-DCMAKE_BUILD_TYPE=Release', '-DCMAKE_CXX_FLAGS_RELEASE=-O0');
  $self->_logged(@configure) or die "cmake failed, see $self->{log}\n";
  $self->_build($jobs, $cases, $unit_tests) or die "The tree does not compile, see $self->{log}\n";
}

sub _build {
  my ($self, $jobs, @targets) = @_;
  return $self->_logged('ninja', '-C', $self->{build}, '-j', $jobs, @targets);
}

# Compiles what changed of the interpreter. False when it does not compile.
sub compile {
  my ($self) = @_;
  return $self->_build(1, $cases);
}

# Who notices a mutant of the source: the name of a case or a unit test, undef for nobody. The cases that share most
# texts with the source come first, for one of them fails most likely; the unit tests, which take longer to build,
# come last.
sub find_killer {
  my ($self, $source) = @_;
  my $case = $self->_failing_case($self->_cases_for($source));
  return $case if defined $case;
  return $self->_build(1, $unit_tests) ? $self->_failing_unit_test : "$unit_tests, which does not compile";
}

sub _cases_for {
  my ($self, $source) = @_;
  my @texts = grep { length > 3 } uniq(map { $_->{text} } @{$source->{strings}});
  my %shared;
  for my $path (keys %{$self->{cases}}) {
    $shared{$path} = grep { index($self->{cases}{$path}, $_) >= 0 } @texts;
  }
  return sort { $shared{$b} <=> $shared{$a} or $a cmp $b } keys %shared;
}

# Leaves out what the tests whose names fit the pattern say.
sub ignore {
  my ($self, $pattern) = @_;
  $self->{ignored} = qr/$pattern/;
}

sub _failing_case {
  my ($self, @files) = @_;
  my $name_of = sub { return $_[0] =~ /^not ok (.*)/ ? basename($self->{file_of}{$1}) . ": $1" : undef };
  return $self->_failing_test($name_of, "$self->{build}/bin/$cases", @files);
}

sub _failing_unit_test {
  my ($self) = @_;
  my $name_of = sub { return $_[0] =~ /Test +#\d+: ($unit_tests\.\S+) .*\*\*\*/ ? $1 : undef };
  # Through ctest, which gives each test a process of its own, as everywhere.
  return $self->_failing_test($name_of, 'ctest', '--test-dir', $self->{build}, '-R', "^$unit_tests\\.", '--timeout', 20);
}

# The first test that fails, by the lines of a test program's output.
sub _failing_test {
  my ($self, $name_of, @command) = @_;
  my ($named, $ignored);
  my $look = sub {
    my $name = $name_of->($_[0]);
    return undef if !defined $name;
    return $named = $name if !defined $self->{ignored} || $name !~ $self->{ignored};
    $ignored = 1;
    return undef;
  };
  my $found = $self->_watch($look, @command);
  return $named if defined $named;
  # An ignored failure is the reason for the program's status, too.
  return undef if !defined $found || $ignored && $found ne $hangs;
  return basename($command[0]) . " $found";
}

# Starts a command in a process group of its own, so that what it starts ends with it; gives its id and its output.
sub _start {
  my ($self, @command) = @_;
  make_path($self->{scratch});
  my $process = open(my $output, '-|') // die "Cannot fork: $!\n";
  if ($process == 0) {
    setpgrp(0, 0);
    # What a case or a test leaves behind when it is ended early goes with the scratch folder.
    chdir($self->{scratch}) or die "$self->{scratch}: $!\n";
    $ENV{TMPDIR} = $self->{scratch};
    open(STDERR, '>&', \*STDOUT) or die "stderr: $!\n";
    open(STDIN, '<', '/dev/null') or die "stdin: $!\n";
    exec(@command) or POSIX::_exit(127);
  }
  return ($process, $output);
}

# Hands each line of a command's output to LOOK until LOOK gives a text or the command ends or falls silent. Gives
# that text, or what else went wrong; undef when all is well.
sub _watch {
  my ($self, $look, @command) = @_;
  my ($process, $output) = $self->_start(@command);
  local @SIG{qw(INT TERM)} = (sub { kill('KILL', -$process); die "Interrupted\n" }) x 2;
  my $select = IO::Select->new($output);
  my ($found, $rest) = (undef, '');
  while (!defined $found) {
    if (!$select->can_read($longest_silence)) {
      $found = $hangs;
    } elsif (!sysread($output, $rest, 65536, length $rest)) {
      last;
    }
    while (!defined $found && $rest =~ s/^([^\n]*)\n//) { $found = $look->($1) }
  }
  kill('KILL', -$process) if defined $found;
  close($output);
  $found = "ends with status $?" if !defined $found && $? != 0;
  remove_tree($self->{scratch});
  return $found;
}

# Runs a command with its output in the log. True when it succeeds.
sub _logged {
  my ($self, @command) = @_;
  open(my $log, '>', $self->{log}) or die "Cannot write $self->{log}: $!\n";
  my $look = sub { print {$log} "$_[0]\n"; return undef };
  return !defined $self->_watch($look, @command);
}

1;

#!/usr/bin/perl
# Compares the (file:line) hit sets of fif and of a peer (grep or rg), both
# sorted. Hits that only one side has must be explained by the files' kinds,
# as the tools tell text from binary differently:
# - hits only the peer has: fif passed the file over, as its first 20 lines
#   hold a control character other than white space (in UTF-8: bytes 00-08,
#   0E-1F, 7F, or C2 80-C2 9F but C2 85);
# - hits only fif has: the peer took the file for binary, as it holds a zero
#   byte (fif reads such a file when the first 20 lines are clean, and reads
#   files of a UTF-16 or UTF-32 byte-order mark as text).
# Prints a one-line summary; exits 1 when a difference is not explained.
use strict;
use warnings;

my ($fifList, $peerList, $peer) = @ARGV;
sub load { my %h; open my $f, '<', $_[0] or die "$_[0]: $!"; while (<$f>) { chomp; $h{$_} = 1; } return \%h; }
my $fif = load($fifList);
my $other = load($peerList);

sub fileOf { my ($hit) = @_; $hit =~ s/:\d+$//; return $hit; }

sub slurpHead {
  my ($path, $bytes) = @_;
  open my $f, '<:raw', $path or return undef;
  my $data = '';
  read $f, $data, $bytes;
  return $data;
}

my %fifRejects;
sub fifRejects {
  my ($path) = @_;
  return $fifRejects{$path} //= do {
    my $data = slurpHead($path, 64 << 20) // '';
    my $head = $data;
    my $n = 0;
    my $pos = -1;
    while ($n < 20 && ($pos = index($data, "\n", $pos + 1)) >= 0) { $n++; }
    $head = substr($data, 0, $pos) if $n == 20;
    ($head =~ /[\x00-\x08\x0E-\x1F\x7F]|\xC2[\x80-\x84\x86-\x9F]/) ? 1 : 0;
  };
}

my %peerBinary;
sub peerBinary {
  my ($path) = @_;
  return $peerBinary{$path} //= do {
    my $data = slurpHead($path, 1 << 30) // '';
    index($data, "\0") >= 0 ? 1 : 0;
  };
}

my ($onlyFif, $onlyPeer, $bad) = (0, 0, 0);
my (%filesFif, %filesPeer);
for my $hit (keys %$fif) {
  next if $other->{$hit};
  my $file = fileOf($hit);
  $onlyFif++;
  $filesFif{$file} = 1;
  if (!peerBinary($file)) { $bad++; print STDERR "unexplained, only fif: $hit\n" if $bad <= 5; }
}
for my $hit (keys %$other) {
  next if $fif->{$hit};
  my $file = fileOf($hit);
  $onlyPeer++;
  $filesPeer{$file} = 1;
  if (!fifRejects($file)) { $bad++; print STDERR "unexplained, only $peer: $hit\n" if $bad <= 5; }
}
printf "%s: %d common hits; only fif %d in %d binary-to-%s files; only %s %d in %d files fif passes over%s\n",
  $peer, scalar(grep { $other->{$_} } keys %$fif), $onlyFif, scalar(keys %filesFif), $peer,
  $peer, $onlyPeer, scalar(keys %filesPeer), $bad ? "; $bad UNEXPLAINED" : "";
exit($bad ? 1 : 0);

#!/usr/bin/env perl
# manual_texts_test.pl: each text in double quotes and each label in single asterisks in the manual is in the string literals
# of the sources, to the letter. "Unit *01* answers." has constant pieces around a variable part. Each piece is one
# literal or several, one after the other; a literal can also be taken sentence by sentence, or between its own variables.
use strict;
use warnings;
use utf8;
use File::Basename;

binmode STDOUT, ':utf8';

chdir dirname(__FILE__) . '/../..' or die;

sub text_of {
  my ($path) = @_;
  open my $file, '<:utf8', $path or die "$path: $!";
  local $/;
  return <$file>;
}

my %fragments;
my $string = qr/(?:u8?|L)?"(?:[^"\\\n]|\\.)*"/;
my $raw = qr/R"\(.*?\)"/s;
for my $source (glob 'src/*/*.{h,cpp,in} src/*/*/*.{h,cpp}') {
  my $code = text_of($source) =~ s/^\s*#.*//gmr;
  while ($code =~ m{//[^\n]*|$raw|\b\d[\w']*|'(?:[^'\\]|\\.)+'|($string(?:\s*$string)*)}g) {
    next unless defined $1;
    my $literal = join '', map { /"(.*)"/s } $1 =~ /$string/g;
    $literal =~ s/\\u([0-9A-Fa-f]{4})/chr hex $1/ge;
    $literal =~ s/&(?=\w)//g;  # marks a menu's key
    $literal =~ s/ +/ /g;
    $fragments{$_} = $fragments{s/^[,;]? | $//r} = 1 for split /%\d|(?:\\[rnt"])+|(?<=[.!?:])(?= )/, $literal;
  }
}
$fragments{$_} = 1 for map { text_of($_) =~ /^Name=(.*)/gm } glob 'packaging/linux/*.desktop';
my $any = join '|', 'Yes', 'No', map { quotemeta } sort grep { !/^\w{0,2}$/ || /^F\d$/ } keys %fragments;
my $composed = qr/^(?:$any)+$/;
my $single = qr/^\s*(?:$any)\s*$/;

my $failed = 0;
for my $chapter (glob 'docs/manual/*.md') {
  my $text = text_of($chapter);
  if ($text =~ /^((?: {0,3}|\t| {5,})\$ .*|```.*)/m) {
    print "$chapter: this example is not run: $1\n";
    $failed = 1;
  }
  $text =~ s/(?<=\n\n)(?: {4}.*\n)+//g;  # code
  $text =~ s/`[^`]*`/`/g;
  $text =~ s/\*\*//g;
  $text =~ s/^\|/\n|/gm;  # each row stands alone
  for my $paragraph (split /\n\s*\n/, $text) {
    $paragraph =~ s/\s+/ /g;
    my $plain = $paragraph =~ s/\*[^*]*\*/*/gr;
    my $unpaired = () = $plain =~ /"/g;
    my @quoted = $plain =~ /"([^"]*)"/g;
    my @pieces = map { grep { /\w/ } split /[*`]/ } @quoted;
    # A variable part within a quoted text is no label.
    (my $outside = $paragraph) =~ s/"(?:[^"*]|\*[^*]*\*)*"//g;
    my @labels = map { /$single/ ? () : split / > |(?= Unit \d)|\b\d[\dA-F:]*\b/ }
      grep { /^[A-Z]/ } $outside =~ /\*([^*]*)\*/g;
    push @labels, grep { !/^Ctrl\+[1-8]$/ } $paragraph =~ /\bCtrl\+(?:Shift\+)?\w+/g;
    for my $wrong ((grep { /\w/ && !/$composed/ } @pieces), grep { /\w/ && !/$single/ } @labels) {
      print "$chapter: the sources do not have \"$wrong\".\n";
      $failed = 1;
    }
    if ($unpaired % 2 || grep { !/\w/ } @quoted) {
      print "$chapter: a double quote stands alone, or quotes nothing: $paragraph\n";
      $failed = 1;
    }
  }
}
exit $failed;

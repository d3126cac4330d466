#!/usr/bin/perl
# check_x12.pl FILE...: every envelope of these X12 files must be whole: headers and trailers in pairs that bear the same
# control numbers, and each trailer's count what was counted. One line for each file; exit status 1 when any has a fault.
use strict;
use warnings;
use FindBin;
use X12::Parser;

# The place of the control number in a header, and how deep the header stands. A trailer has its count in 1 and its
# number in 2.
my %NUMBER  = (ISA => 13, GS => 6, ST => 2);
my %DEPTH   = (ISA => 0,  GS => 1, ST => 2);
my %TRAILER = (ISA => 'IEA', GS => 'GE', ST => 'SE');
# Of the ISA's elements, from its tag on: translators read it by position.
my $WIDTHS = '3 2 10 2 10 2 15 2 15 6 4 1 5 9 1 1 1';

# The parser takes what stands behind the ISA's 105 characters for the end of every segment: "~", a line end or both.
sub open_file {
    my ($name) = @_;
    open(my $handle, '<:raw', $name) or die "cannot be opened: $!\n";
    my $parser = X12::Parser->new;
    $parser->parse(handle => $handle, conf => "$FindBin::RealBin/x12_envelope.cf");
    my $end = $parser->get_segment_separator;
    die "no segment ends behind character 105\n" unless $end =~ /^(?:~|~?\r?\n)\z/;
    return $parser;
}

# What is wrong with the file; `total` gets the numbers of interchanges, groups and transactions.
sub faults {
    my ($name, $total) = @_;
    my (@open, @faults);
    my $parser = open_file($name);
    my $separator = quotemeta $parser->get_element_separator;
    while (my $tag = $parser->get_next_loop) {
        my ($segment, @behind) = $parser->get_loop_segments;
        my @element = split /$separator/, $segment, -1;
        die "ISA of other widths\n" if $tag eq 'ISA' && "@{[map { length } @element]}" ne $WIDTHS;
        if (exists $DEPTH{$tag}) {
            @open == $DEPTH{$tag} or die "$tag where none belongs\n";
            $open[-1]{count}++ if @open;
            push @open, {tag => $tag, number => $element[$NUMBER{$tag}] // '', count => 0};
            $total->[$DEPTH{$tag}]++;
        } else {
            my $header = pop @open;
            $header && $TRAILER{$header->{tag}} eq $tag or die "$tag where none belongs\n";
            $header->{count} += 2 if $tag eq 'SE';    # ST and SE themselves
            my ($count, $number) = map { $_ // '' } @element[1, 2];
            push @faults, "$tag counts $count, not $header->{count}"
                unless $count =~ /^\d+$/ && $count == $header->{count};
            push @faults, "$tag has number $number, not $header->{number}" if $number ne $header->{number};
        }
        if ($tag eq 'ST') {
            $open[-1]{count} += @behind;
        } elsif (@behind) {
            push @faults, "behind $tag: $behind[0]";
        }
    }
    push @faults, "$open[-1]{tag} without $TRAILER{$open[-1]{tag}}" if @open;
    return @faults;
}

die "usage: check_x12.pl FILE...\n" unless @ARGV;
my $failed = 0;
for my $name (@ARGV) {
    my @total = (0, 0, 0);
    my @faults = eval { faults($name, \@total) };
    push @faults, $@ =~ s/\s+$//r if $@;
    print "$name: ", @faults ? join('; ', @faults) : "whole; interchanges, groups, transactions: @total", "\n";
    $failed = 1 if @faults;
}
exit $failed;

# Refuses names of files in a document that the tree does not have: who looks for the place of a change
# must find it.
#
#   tclsh8.6 named_files.tcl ROOT DOCUMENT
#
# A name with a folder counts from the root or from planner/; one without is a file of any folder.
# Prints each name that is wrong, and ends with status 1 when there is one.

# The names of all sources below a folder.
proc sources {folder} {
  set names {}
  foreach file [glob -nocomplain -directory $folder -types f -- *.cpp *.h] {
    lappend names [file tail $file]
  }
  foreach inner [glob -nocomplain -directory $folder -types d -- *] {
    lappend names {*}[sources $inner]
  }
  return $names
}

lassign $argv root document
set channel [open $document]
set text [read $channel]
close $channel
set all {}
foreach folder {hardware engine binding host planner cli tcl python tests} {
  lappend all {*}[sources [file join $root $folder]]
}
set count 0
set wrong 0
foreach {match name} [regexp -all -inline {`([\w/]+\.(?:cpp|h))`} $text] {
  incr count
  if {$name in $all || [file isfile [file join $root $name]] ||
      [file isfile [file join $root planner $name]]} {
    continue
  }
  puts "there is no $name"
  set wrong 1
}
if {$count == 0} {
  puts "no file is named"
  set wrong 1
}
exit $wrong

# Makes the manual page in doctools source into a page for man and one for browsers.
#
# Usage: tclsh make_manual.tcl SOURCE FOLDER
#
# Writes FOLDER/<name>.n and FOLDER/<name>.html. What doctools warns of is a failure, too; then
# nothing is written, and the exit status is 1.

package require doctools

proc readFile {path} {
  set channel [open $path]
  fconfigure $channel -encoding utf-8
  set text [read $channel]
  close $channel
  return $text
}

proc writeFile {path text} {
  set channel [open $path w]
  fconfigure $channel -encoding utf-8
  puts -nonewline $channel $text
  close $channel
}

# The page in a format of doctools. Its name, not its path, goes into what is made of it.
proc render {path format} {
  ::doctools::new page -format $format -file [file tail $path] -deprecated 1
  try {
    set text [page format [readFile $path]]
    set warnings [page warnings]
  } finally {
    page destroy
  }
  if {[llength $warnings] > 0} {
    error [join $warnings \n]
  }
  return $text
}

if {[llength $argv] != 2} {
  puts stderr "usage: make_manual.tcl SOURCE FOLDER"
  exit 2
}
lassign $argv source folder
if {[catch {list [render $source nroff] [render $source html]} pages]} {
  puts stderr "$source: [string trim $pages]"
  exit 1
}
set base [file join $folder [file rootname [file tail $source]]]
lassign $pages nroff html
writeFile $base.n $nroff
writeFile $base.html $html

# Tables and lists of text for a terminal.

package provide vorkel::table 1.1
package require vorkel::colour 1.1

namespace eval ::vorkel::table {
  variable gap "  "
  # The columns of a terminal, which no line of prose may exceed.
  variable line_width 80
}

# A table as text. Each column is a list of its alignment (left or right) and its heading;
# each row is a list of texts, one for each column. Every line ends in a newline and has no
# trailing blanks. `roles` has for each row "" or its colour (see colour.tcl).
proc ::vorkel::table::render {columns rows {roles {}}} {
  variable gap
  set headings [lmap column $columns {lindex $column 1}]
  set widths [Widths $columns $rows]
  set lines {}
  foreach row [list $headings {*}$rows] role [list heading {*}$roles] {
    set cells [lmap column $columns width $widths text $row {
      format [expr {[lindex $column 0] eq "left" ? "%-*s" : "%*s"}] $width $text
    }]
    set line [string trimright [join $cells $gap]]
    if {$role ne ""} {
      set line [::vorkel::colour::paint $role $line]
    }
    lappend lines $line
  }
  return "[join $lines \n]\n"
}

# The widths of the columns of a table.
proc ::vorkel::table::Widths {columns rows} {
  set widths [lmap column $columns {string length [lindex $column 1]}]
  foreach row $rows {
    set widths [lmap width $widths text $row {expr {max($width, [string length $text])}}]
  }
  return $widths
}

# A table like that of render. Where it would be wider than a terminal, the texts of the first
# column have lines of their own, above the rest of their rows.
proc ::vorkel::table::fitted {columns rows} {
  variable gap
  variable line_width
  set width [tcl::mathop::+ {*}[Widths $columns $rows] \
    [expr {([llength $columns] - 1) * [string length $gap]}]]
  if {$width <= $line_width} {
    return [render $columns $rows]
  }
  set rest [lmap row $rows {lreplace $row 0 0 ""}]
  set lines [lassign [split [string trimright [render $columns $rest] \n] \n] heading]
  set text $heading\n
  foreach row $rows line $lines {
    append text [lindex $row 0] \n $line \n
  }
  return $text
}

# Labels and their values, a line for each, with the values below each other.
proc ::vorkel::table::pairs {pairs} {
  variable gap
  set width [tcl::mathfunc::max {*}[lmap {label value} $pairs {string length $label}]]
  set lines [lmap {label value} $pairs {format "%-*s%s%s" $width $label $gap $value}]
  return "[join $lines \n]\n"
}

# A label and its value behind a column of labels; a value that would be wider than a terminal is
# broken.
proc ::vorkel::table::labelled {width label value} {
  variable line_width
  package require textutil::adjust
  set text [::textutil::adjust::adjust $value -length [expr {$line_width - $width}] \
    -strictlength 0]
  set indented [string map [list \n "\n[string repeat { } $width]"] $text]
  return [string trimright "[format %-*s $width $label]$indented"]\n
}

# A sentence behind a label, broken where it would be wider than a terminal; the further lines
# are indented. It ends in a newline.
proc ::vorkel::table::prose {label sentence} {
  variable line_width
  package require textutil::adjust
  set text $label$sentence
  if {[string length $text] > $line_width} {
    set text [::textutil::adjust::adjust $text -length [expr {$line_width - 2}] -strictlength 0]
    set text [string map {\n "\n  "} $text]
  }
  return $text\n
}

# Labels and what they mean, lists of two texts, with the texts below each other and broken where
# they would be wider than a terminal. Each line is indented.
proc ::vorkel::table::described {lines} {
  variable gap
  variable line_width
  package require textutil::adjust
  set width [tcl::mathfunc::max {*}[lmap line $lines {string length [lindex $line 0]}]]
  set rest [expr {$line_width - $width - 2 * [string length $gap]}]
  set text ""
  foreach line $lines {
    lassign $line label meaning
    foreach part [split [::textutil::adjust::adjust $meaning -length $rest] \n] {
      append text [string trimright "$gap[format %-*s $width $label]$gap$part"] \n
      set label ""
    }
  }
  return $text
}

# Sentences, broken where they would be wider than a terminal.
proc ::vorkel::table::paragraph {sentences} {
  variable line_width
  package require textutil::adjust
  return [::textutil::adjust::adjust $sentences -length $line_width]\n
}

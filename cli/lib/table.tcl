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
  set widths [lmap heading $headings {string length $heading}]
  foreach row $rows {
    set widths [lmap width $widths text $row {expr {max($width, [string length $text])}}]
  }
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

# Labels and their values, a line for each, with the values below each other.
proc ::vorkel::table::pairs {pairs} {
  variable gap
  set width [tcl::mathfunc::max {*}[lmap {label value} $pairs {string length $label}]]
  set lines [lmap {label value} $pairs {format "%-*s%s%s" $width $label $gap $value}]
  return "[join $lines \n]\n"
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

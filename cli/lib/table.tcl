# Tables and lists of text for a terminal.

package provide vorkel::table 1.1

namespace eval ::vorkel::table {
  variable gap "  "
}

# A table as text. Each column is a list of its alignment (left or right) and its heading;
# each row is a list of texts, one for each column. Every line ends in a newline and has no
# trailing blanks.
proc ::vorkel::table::render {columns rows} {
  variable gap
  set headings [lmap column $columns {lindex $column 1}]
  set widths [lmap heading $headings {string length $heading}]
  foreach row $rows {
    set widths [lmap width $widths text $row {expr {max($width, [string length $text])}}]
  }
  set lines {}
  foreach row [list $headings {*}$rows] {
    set cells [lmap column $columns width $widths text $row {
      format [expr {[lindex $column 0] eq "left" ? "%-*s" : "%*s"}] $width $text
    }]
    lappend lines [string trimright [join $cells $gap]]
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

# Answers as a Tcl dict with the entries of the JSON format (doc/planner-json.md). What is null
# there is empty here. Lines break between the entries, where a dict does not mind.

package provide vorkel::format_tcl 1.1
package require vorkel::plan_data 1.1

namespace eval ::vorkel::format {}
namespace eval ::vorkel::format::tcl_writer {
  # The entries that hold a dict and those that hold a list of dicts get lines of their own.
  variable dicts {request settings}
  variable lists {answers outputs}
  variable step "  "
}

proc ::vorkel::format::tcl {answers request} {
  return [tcl_writer::Entries [::vorkel::plan_data::of $answers $request] ""]
}

# A dict, an entry a line behind `indent`.
proc ::vorkel::format::tcl_writer::Entries {data indent} {
  variable dicts
  variable lists
  variable step
  set text ""
  dict for {key value} $data {
    if {$key in $dicts} {
      append text "$indent[list $key] [Block $value $indent]\n"
    } elseif {$key in $lists} {
      append text "$indent[list $key] \{\n"
      foreach element $value {
        append text "$indent$step[Block $element $indent$step]\n"
      }
      append text "$indent\}\n"
    } else {
      append text $indent[list $key $value]\n
    }
  }
  return $text
}

# A dict in braces. What `list` has quoted stays whole between them.
proc ::vorkel::format::tcl_writer::Block {data indent} {
  variable step
  return "\{\n[Entries $data $indent$step]$indent\}"
}

# Where the text of a command goes: standard output, or a file that is written whole or not at
# all.

package provide vorkel::output 1.1
package require vorkel::colour 1.1
package require vorkel::options 1.1

namespace eval ::vorkel::output {}

# Is told before a text is made where it goes: in a file it has no colour.
proc ::vorkel::output::into {file} {
  if {$file ni {"" -}} {
    ::vorkel::colour::off
  }
}

# Writes a text to a file, or to standard output when its name is "" or "-". A reader of standard
# output that has gone away is no failure; that it takes nothing else, such as on a full disk, is
# thrown as {VORKEL UNWRITTEN}. A file that cannot be written is wrong usage, and one that was
# there before is then as it was.
proc ::vorkel::output::write {text {file ""}} {
  if {$file ni {"" -}} {
    WriteFile $text $file
    return
  }
  try {
    puts -nonewline stdout $text
    flush stdout
  } trap {POSIX EPIPE} {} {
    # What is left in the buffer would fail again when the program ends.
    catch {close stdout}
  } on error {reason options} {
    catch {close stdout}
    set cause [Cause $reason $options]
    if {[lindex [dict get $options -errorcode] 1] eq "EBADF"} {
      set cause "it is closed"
    }
    throw {VORKEL UNWRITTEN} "standard output cannot be written: $cause"
  }
}

# Why something cannot be written.
proc ::vorkel::output::Cause {reason options} {
  set cause [lindex [dict get $options -errorcode] 2]
  return [expr {$cause eq "" ? $reason : $cause}]
}

# The text of answers in a format other than text: the writers stand in files of their own.
proc ::vorkel::output::format {format answers request} {
  package require vorkel::format_$format 1.1
  return [::vorkel::format::$format $answers $request]
}

# The file appears under its name when all of it is on the disk. A link is followed to what it
# stands for. What is no plain file, such as /dev/null, has nothing to keep whole.
proc ::vorkel::output::WriteFile {text file} {
  try {
    set path [Target [::vorkel::options::path $file]]
    if {[file exists $path] && [file type $path] ni {file directory}} {
      WriteTo $path $text {WRONLY}
      return
    }
    if {[file isdirectory $path]} {
      throw {POSIX EISDIR} "it is a directory"
    }
    if {[string match */ $file]} {
      throw {POSIX ENOENT} "there is no such directory"
    }
    if {[file exists $path] && ![file writable $path]} {
      throw {POSIX EACCES} "permission denied"
    }
    set draft [file join [file dirname $path] .vorkel.[pid]]
    try {
      WriteTo $draft $text {WRONLY CREAT EXCL}
      if {[file exists $path]} {
        file attributes $draft -permissions [file attributes $path -permissions]
      }
      file rename -force -- $draft $path
    } on error {reason options} {
      catch {file delete -- $draft}
      return -options $options $reason
    }
  } on error {reason options} {
    throw {VORKEL USAGE} "-o: [::vorkel::options::shown $file] cannot be written:\
      [Cause $reason $options]"
  }
}

# The path of a file behind links.
proc ::vorkel::output::Target {file} {
  # Joining a name before normalizing follows a link of the last name, too.
  return [file dirname [file normalize [file join $file _]]]
}

proc ::vorkel::output::WriteTo {path text access} {
  set channel [open $path $access 0666]
  try {
    fconfigure $channel -encoding utf-8 -translation lf
    puts -nonewline $channel $text
  } finally {
    close $channel
  }
}

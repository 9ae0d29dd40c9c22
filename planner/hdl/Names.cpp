// Tested by names.test.
#include "planner/hdl/Names.h"

#include <algorithm>
#include <iterator>

namespace planner::hdl {

namespace {

// Many words to a line.
// clang-format off
// IEEE 1800-2017, annex B.
constexpr std::string_view kVerilogKeywords[] = {
    "accept_on", "alias", "always", "always_comb", "always_ff", "always_latch", "and", "assert",
    "assign", "assume", "automatic", "before", "begin", "bind", "bins", "binsof", "bit", "break",
    "buf", "bufif0", "bufif1", "byte", "case", "casex", "casez", "cell", "chandle", "checker",
    "class", "clocking", "cmos", "config", "const", "constraint", "context", "continue", "cover",
    "covergroup", "coverpoint", "cross", "deassign", "default", "defparam", "design", "disable",
    "dist", "do", "edge", "else", "end", "endcase", "endchecker", "endclass", "endclocking",
    "endconfig", "endfunction", "endgenerate", "endgroup", "endinterface", "endmodule",
    "endpackage", "endprimitive", "endprogram", "endproperty", "endspecify", "endsequence",
    "endtable", "endtask", "enum", "event", "eventually", "expect", "export", "extends", "extern",
    "final", "first_match", "for", "force", "foreach", "forever", "fork", "forkjoin", "function",
    "generate", "genvar", "global", "highz0", "highz1", "if", "iff", "ifnone", "ignore_bins",
    "illegal_bins", "implements", "implies", "import", "incdir", "include", "initial", "inout",
    "input", "inside", "instance", "int", "integer", "interconnect", "interface", "intersect",
    "join", "join_any", "join_none", "large", "let", "liblist", "library", "local", "localparam",
    "logic", "longint", "macromodule", "matches", "medium", "modport", "module", "nand", "negedge",
    "nettype", "new", "nexttime", "nmos", "nor", "noshowcancelled", "not", "notif0", "notif1",
    "null", "or", "output", "package", "packed", "parameter", "pmos", "posedge", "primitive",
    "priority", "program", "property", "protected", "pull0", "pull1", "pulldown", "pullup",
    "pulsestyle_ondetect", "pulsestyle_onevent", "pure", "rand", "randc", "randcase",
    "randsequence", "rcmos", "real", "realtime", "ref", "reg", "reject_on", "release", "repeat",
    "restrict", "return", "rnmos", "rpmos", "rtran", "rtranif0", "rtranif1", "s_always",
    "s_eventually", "s_nexttime", "s_until", "s_until_with", "scalared", "sequence", "shortint",
    "shortreal", "showcancelled", "signed", "small", "soft", "solve", "specify", "specparam",
    "static", "string", "strong", "strong0", "strong1", "struct", "super", "supply0", "supply1",
    "sync_accept_on", "sync_reject_on", "table", "tagged", "task", "this", "throughout", "time",
    "timeprecision", "timeunit", "tran", "tranif0", "tranif1", "tri", "tri0", "tri1", "triand",
    "trior", "trireg", "type", "typedef", "union", "unique", "unique0", "unsigned", "until",
    "until_with", "untyped", "use", "uwire", "var", "vectored", "virtual", "void", "wait",
    "wait_order", "wand", "weak", "weak0", "weak1", "while", "wildcard", "wire", "with", "within",
    "wor", "xnor", "xor"};

// IEEE 1076-2019, 15.10.
constexpr std::string_view kVhdlKeywords[] = {
    "abs", "access", "after", "alias", "all", "and", "architecture", "array", "assert", "assume",
    "assume_guarantee", "attribute", "begin", "block", "body", "buffer", "bus", "case", "component",
    "configuration", "constant", "context", "cover", "default", "disconnect", "downto", "else",
    "elsif", "end", "entity", "exit", "fairness", "file", "for", "force", "function", "generate",
    "generic", "group", "guarded", "if", "impure", "in", "inertial", "inout", "is", "label",
    "library", "linkage", "literal", "loop", "map", "mod", "nand", "new", "next", "nor", "not",
    "null", "of", "on", "open", "or", "others", "out", "package", "parameter", "port", "postponed",
    "private", "procedure", "process", "property", "protected", "pure", "range", "record",
    "register", "reject", "release", "rem", "report", "restrict", "restrict_guarantee", "return",
    "rol", "ror", "select", "sequence", "severity", "shared", "signal", "sla", "sll", "sra", "srl",
    "strong", "subtype", "then", "to", "transport", "type", "unaffected", "units", "until", "use",
    "variable", "view", "vmode", "vpkg", "vprop", "vunit", "wait", "when", "while", "with", "xnor",
    "xor"};

// Libraries, packages, types and names of the generated text, which an entity of the same name
// would hide.
constexpr std::string_view kUsedNames[] = {
    "bit", "boolean", "character", "clk_in_sel", "clkfb", "delay_length", "false", "fs", "ieee",
    "integer", "jitter_rms_fs", "jitter_seed", "locked", "math_real", "natural", "now",
    "numeric_std", "positive", "real", "rst", "rtl", "sel", "severity_level", "simulation",
    "standard", "std", "std_logic", "std_logic_1164", "std_ulogic", "string", "textio", "time",
    "true", "work"};
// clang-format on

bool IsLetter(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }
bool IsDigit(char c) { return c >= '0' && c <= '9'; }

template <std::size_t N>
bool Has(const std::string_view (&list)[N], std::string_view word) {
  return std::find(std::begin(list), std::end(list), word) != std::end(list);
}

std::string Lowered(std::string_view name) {
  std::string text(name);
  for (char& c : text) {
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
  }
  return text;
}

// Whether a name is `stem`, or goes on with digits only.
bool IsNumbered(std::string_view name, std::string_view stem) {
  return name.substr(0, stem.size()) == stem &&
         std::all_of(name.begin() + static_cast<std::ptrdiff_t>(stem.size()), name.end(), IsDigit);
}

// Whether an instance is called so, which would hide the module.
bool IsLabel(std::string_view name) {
  return std::any_of(
      hardware::kPrimitives.begin(), hardware::kPrimitives.end(),
      [&](hardware::Primitive primitive) { return name == LabelOf(primitive); });
}

}  // namespace

std::string LabelOf(hardware::Primitive primitive) {
  return Lowered(hardware::Name(primitive)) + "_inst";
}

std::string NameProblem(std::string_view name) {
  if (name.empty()) return "is empty";
  if (name.size() > kLongestName) return "is longer than " + std::to_string(kLongestName);
  if (!IsLetter(name.front())) return "does not begin with a letter";
  for (const char c : name) {
    if (!IsLetter(c) && !IsDigit(c) && c != '_') {
      return "has something else than letters, digits and underscores";
    }
  }
  if (name.back() == '_') return "ends with an underscore, which VHDL does not allow";
  if (name.find("__") != std::string_view::npos) {
    return "has two underscores side by side, which VHDL does not allow";
  }
  const std::string lower = Lowered(name);
  if (Has(kVerilogKeywords, lower)) return "is a keyword of Verilog";
  if (Has(kVhdlKeywords, lower)) return "is a keyword of VHDL";
  if (Has(kUsedNames, lower) || IsLabel(lower) || IsNumbered(lower, "clk_in") ||
      IsNumbered(lower, "clk_out")) {
    return "has another meaning in what is written";
  }
  if (lower.rfind("vorkel_", 0) == 0) return "begins with vorkel_, as the models do";
  return "";
}

}  // namespace planner::hdl

// VHDL-93.
//
// Tested by hdl.test.
#include <string_view>

#include "planner/hdl/Writers.h"
#include "planner/report/Words.h"

namespace planner::hdl {

namespace {

using report::Join;
using std::string;

constexpr const char* kContext = "library ieee;\nuse ieee.std_logic_1164.all;\n";

string Literal(const Attribute& attribute) {
  if (const auto* number = std::get_if<std::int64_t>(&attribute.value)) {
    return std::to_string(*number);
  }
  if (const auto* flag = std::get_if<Flag>(&attribute.value)) {
    return flag->is_set ? "true" : "false";
  }
  return "\"" + std::get<string>(attribute.value) + "\"";
}

string TypeOf(const Attribute& attribute) {
  if (std::holds_alternative<std::int64_t>(attribute.value)) return "integer";
  return std::holds_alternative<Flag>(attribute.value) ? "boolean" : "string";
}

string Bound(const string& name, const string& value) { return name + " => " + value; }

// Lines of a list, each at its place, with a separator between.
string Listed(const string& indent, const std::vector<string>& lines, const char* separator) {
  return indent + Join(lines, separator + ("\n" + indent));
}

string PortLine(const string& name, bool is_output) {
  return name + " : " + (is_output ? "out" : "in") + " std_logic";
}

// A port that is read in the module, too, has a signal of its own.
bool IsRead(const Instance& instance, const string& port) {
  for (const Copy& copy : instance.copies) {
    if (copy.net == port) return true;
  }
  for (const Connection& connection : instance.connections) {
    if (!connection.is_output && connection.net == port) return true;
  }
  return false;
}

string SignalOf(const Instance& instance, const string& net) {
  for (const Port& port : instance.ports) {
    if (port.name == net && port.is_output && IsRead(instance, net)) return net + "_net";
  }
  return net;
}

string Component(const Instance& instance) {
  std::vector<string> generics;
  for (const Attribute& attribute : instance.attributes) {
    generics.push_back(attribute.name + " : " + TypeOf(attribute));
  }
  generics.emplace_back("JITTER_RMS_FS : integer");
  generics.emplace_back("JITTER_SEED : integer");
  std::vector<string> ports;
  for (const Connection& connection : instance.connections) {
    ports.push_back(PortLine(connection.pin, connection.is_output));
  }
  return "  component " + instance.model + " is\n    generic (\n" +
         Listed("      ", generics, ";") + "\n    );\n    port (\n" + Listed("      ", ports, ";") +
         "\n    );\n  end component;\n";
}

string Signals(const Instance& instance) {
  string text;
  for (const string& net : instance.nets) text += "  signal " + net + " : std_logic;\n";
  for (const Port& port : instance.ports) {
    const string name = SignalOf(instance, port.name);
    if (name != port.name) text += "  signal " + name + " : std_logic;\n";
  }
  return text;
}

string Body(const Instance& instance) {
  std::vector<string> generics;
  for (const Attribute& attribute : instance.attributes) {
    generics.push_back(Bound(attribute.name, Literal(attribute)));
  }
  generics.push_back(Bound("JITTER_RMS_FS", "JITTER_RMS_FS"));
  generics.push_back(Bound("JITTER_SEED", "JITTER_SEED"));
  std::vector<string> ports;
  for (const Connection& connection : instance.connections) {
    const char* none = connection.is_output ? "open" : "'0'";
    ports.push_back(Bound(connection.pin, connection.net.empty()
                                              ? string(none)
                                              : SignalOf(instance, connection.net)));
  }
  string text = "  " + instance.label + " : " + instance.model + "\n    generic map (\n" +
                Listed("      ", generics, ",") + "\n    )\n    port map (\n" +
                Listed("      ", ports, ",") + "\n    );\n";
  for (const Port& port : instance.ports) {
    const string name = SignalOf(instance, port.name);
    if (name != port.name) text += "  " + port.name + " <= " + name + ";\n";
  }
  for (const Copy& copy : instance.copies) {
    text += "  " + copy.port + " <= " + SignalOf(instance, copy.net) + ";  -- the same pin\n";
  }
  return text;
}

string Source(const Parts& mhz, int n) {
  const string number = std::to_string(n);
  return "  source" + number + " : entity work.VORKEL_CLOCK_SOURCE\n    generic map (\n" +
         Listed("      ",
                {Bound("MHZ_NUM", std::to_string(mhz.numerator)),
                 Bound("MHZ_DEN", std::to_string(mhz.denominator))},
                ",") +
         "\n    )\n    port map (\n" +
         Listed(
             "      ",
             {Bound("enable", "enable"), Bound("clk", "clk_in" + number),
              Bound("edge_time", "edge_time" + number), Bound("edge_rest", "edge_rest" + number)},
             ",") +
         "\n    );\n";
}

string Check(const Bench& bench, const Expected& output, int input, int place) {
  const Parts& mhz = bench.inputs[static_cast<std::size_t>(input) - 1];
  const string n = std::to_string(input);
  const string o = std::to_string(output.output);
  const string at = "(" + std::to_string(place) + ")";
  return "  check" + o + "_in" + n + " : entity work.VORKEL_CLOCK_CHECK\n    generic map (\n" +
         Listed("      ",
                {Bound("INDEX", o), Bound("MHZ_NUM", std::to_string(mhz.numerator)),
                 Bound("MHZ_DEN", std::to_string(mhz.denominator)),
                 Bound("RATIO_NUM", std::to_string(output.ratio.numerator)),
                 Bound("RATIO_DEN", std::to_string(output.ratio.denominator)),
                 Bound("SHAPE_DEN", std::to_string(output.shape)),
                 Bound("PHASE", std::to_string(output.phase)),
                 Bound("HIGH", std::to_string(output.high)),
                 Bound("RISES",
                       (bench.hyperperiod ? "REPEAT * " : "") + std::to_string(output.rises))},
                ",") +
         "\n    )\n    port map (\n" +
         Listed("      ",
                {Bound("clk", "clk_out" + o), Bound("run", "run" + n),
                 Bound("source_time", "edge_time" + n), Bound("source_rest", "edge_rest" + n),
                 Bound("is_done", "is_done" + at), Bound("is_wrong", "is_wrong" + at)},
                ",") +
         "\n    );\n";
}

string Declarations(const Instance& instance, const Bench& bench) {
  string text;
  for (std::size_t i = 1; i <= bench.inputs.size(); ++i) {
    const string n = std::to_string(i);
    text += "  constant SPAN" + n + " : time := " + std::to_string(bench.spans[i - 1]) +
            " fs;  -- a period of input " + n + ", rounded up\n";
  }
  text += "  constant CYCLES : positive := " + std::to_string(bench.cycles) +
          (bench.hyperperiod ? ";  -- of the input, a hyperperiod\n" : ";  -- of the input\n") +
          "  constant MORE_CYCLES : positive := " + std::to_string(bench.before + bench.after) +
          ";  -- before the lock, and for the last edges\n\n"
          "  signal enable : std_logic := '0';\n  signal rst : std_logic := '1';\n";
  for (std::size_t i = 1; i <= bench.inputs.size(); ++i) {
    const string n = std::to_string(i);
    text += "  signal clk_in" + n + " : std_logic;\n  signal edge_time" + n +
            " : time;\n  signal edge_rest" + n + " : natural;\n  signal is_on" + n +
            " : std_logic := '0';\n  signal run" + n + " : std_logic;\n";
  }
  if (bench.inputs.size() > 1) text += "  signal clk_in_sel : std_logic := '0';\n";
  for (const Port& port : instance.ports) {
    if (port.is_output) text += "  signal " + port.name + " : std_logic;\n";
  }
  const string last = std::to_string(bench.outputs.size() * bench.inputs.size() - 1);
  return text + "  signal is_done : std_logic_vector(0 to " + last +
         ");\n  signal is_wrong : std_logic_vector(0 to " + last + ");\n";
}

// Looks at the outputs from one input after the other. Without an input nothing happens any more,
// and the simulation ends.
string Course(const Bench& bench) {
  string text =
      "  process\n"
      "    constant ALL_DONE : std_logic_vector(is_done'range) := (others => '1');\n"
      "    constant NONE_WRONG : std_logic_vector(is_wrong'range) := (others => '0');\n"
      "  begin\n"
      "    wait for SPAN1;\n"
      "    enable <= '1';\n"
      "    wait for 2 * SPAN1;\n"
      "    rst <= '0';\n";
  for (std::size_t i = 1; i <= bench.inputs.size(); ++i) {
    const string n = std::to_string(i);
    if (i > 1) text += "    clk_in_sel <= '1';\n    wait for 1 fs;\n";
    text += "    is_on" + n + " <= '1';\n    wait for MORE_CYCLES * SPAN" + n + ";\n    wait for " +
            (bench.hyperperiod ? "REPEAT * " : "") + "(CYCLES * SPAN" + n + ");\n    is_on" + n +
            " <= '0';\n    wait for SPAN" + n + ";\n";
  }
  return text +
         "    enable <= '0';\n"
         "    if is_done = ALL_DONE and is_wrong = NONE_WRONG then\n"
         "      write(output, \"PASS\" & LF);\n"
         "    else\n"
         "      write(output, \"FAIL\" & LF);\n"
         "      assert false report \"the clocks are not those of the plan\" severity failure;\n"
         "    end if;\n"
         "    wait;\n"
         "  end process;\n";
}

}  // namespace

string VhdlModule(const string& name, const Instance& instance) {
  std::vector<string> ports;
  for (const Port& port : instance.ports) ports.push_back(PortLine(port.name, port.is_output));
  // The models are visible in VHDL-93 only so.
  return kContext + ("use work.all;\n\nentity " + name) +
         " is\n"
         "  generic (\n"
         "    -- Of the simulation alone.\n"
         "    JITTER_RMS_FS : integer := 0;\n"
         "    JITTER_SEED : integer := 1\n"
         "  );\n"
         "  port (\n" +
         Listed("    ", ports, ";") + "\n  );\nend entity;\n\narchitecture rtl of " + name +
         " is\n" + Component(instance) + Signals(instance) + "begin\n" + Body(instance) +
         "end architecture;\n";
}

string VhdlBench(const string& name, const Instance& instance, const Bench& bench) {
  string text = kContext + ("use std.textio.all;\n\nentity " + name) + "_tb is\n";
  if (bench.hyperperiod) {
    text += "  generic (\n    REPEAT : positive := " + std::to_string(bench.repeat) + "\n  );\n";
  }
  text += "end entity;\n\narchitecture simulation of " + name + "_tb is\n" +
          Declarations(instance, bench) + "begin\n";
  int input = 0;
  for (const Parts& mhz : bench.inputs) text += Source(mhz, ++input) + "\n";
  std::vector<string> ports;
  for (const Port& port : instance.ports) ports.push_back(Bound(port.name, port.name));
  text += "  dut : entity work." + name + "\n    port map (\n" + Listed("      ", ports, ",") +
          "\n    );\n\n";
  for (int n = 1; n <= input; ++n) {
    const string number = std::to_string(n);
    text += "  run" + number + " <= locked and is_on" + number + ";\n";
  }
  int place = 0;
  for (int n = 1; n <= input; ++n) {
    for (const Expected& output : bench.outputs) text += "\n" + Check(bench, output, n, place++);
  }
  return text + "\n" + Course(bench) + "end architecture;\n";
}

}  // namespace planner::hdl

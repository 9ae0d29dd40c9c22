-- The feedback of a clock primitive: without edges there for CYCLES cycles of the input, the lock
-- is lost until a reset.
library ieee;
use ieee.std_logic_1164.all;
use work.vorkel_model.all;

entity vorkel_model_feedback is
  generic (
    PIN : string := "CLKFBIN";
    ENABLE : boolean := true;
    CYCLES : positive := 4
  );
  port (
    clk : in std_logic;
    rst : in std_logic;
    state : in input_state;
    missing : out boolean := false
  );
end entity;

architecture simulation of vorkel_model_feedback is
  signal returned : natural := 0;  -- edges, modulo COUNTS
begin
  process (clk)
  begin
    if rising_edge(clk) then
      returned <= next_edge(returned, 1);
    end if;
  end process;

  process
    variable session, before, from_edge : natural;
    impure function is_over return boolean is
    begin
      return not state.locked or state.locks /= session or
             edges_between(from_edge, state.count) >= CYCLES;
    end function;
  begin
    if not ENABLE then
      wait;
    end if;
    if not state.locked then
      wait until state.locked;
    end if;
    session := state.locks;
    before := returned;
    from_edge := state.count;
    wait on state until is_over;
    if state.locked and state.locks = session and returned = before then
      assert false report "no edge comes back at " & PIN severity error;
      missing <= true;
      wait until rst = '1';
      missing <= false;
      wait until not state.locked;
    end if;
  end process;
end architecture;

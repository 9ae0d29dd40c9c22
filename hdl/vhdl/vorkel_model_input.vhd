-- The input of a clock primitive: its period, and whether the primitive is locked to it.
--
-- A period that is within 1 fs of the planned one is taken for that, exactly: an edge can come only
-- at a whole femtosecond. Any other is taken as it is measured, cycle by cycle. So the outputs
-- follow the clock that there is.
--
-- The edges are counted from that with which the lock begins, which is edge 0. The lock is lost
-- with a reset, with another input, when no edge comes for some periods, and while the period
-- breaks a limit of the device (`bad`).
library ieee;
use ieee.std_logic_1164.all;
use work.vorkel_model.all;

entity vorkel_model_input is
  generic (
    LOCK_CYCLES : positive := 16
  );
  port (
    clk : in std_logic;
    rst : in std_logic;
    second : in std_logic;      -- which input it is; a change begins from the start
    planned_num : in natural;   -- MHz; 0: nothing is planned
    planned_den : in positive;
    bad : in boolean;
    state : out input_state := UNKNOWN
  );
end entity;

architecture simulation of vorkel_model_input is
  signal total : natural := 0;    -- edges, modulo COUNTS
  signal started : boolean := false;  -- there has been an edge since the start
  signal period : time := 0 fs;       -- the latest since the start; 0: there is none yet
  signal stops : natural := 0;    -- how often the input has stopped, modulo COUNTS
begin
  process (clk, rst, second, stops)
    variable now_state : input_state := UNKNOWN;
    variable selected : std_logic := '0';
    variable is_started : boolean := false;
    variable good : natural := 0;     -- periods in a row that break no limit
    variable stopped : natural := 0;  -- those stops that have been dealt with
    variable measured : time := 0 fs;

    procedure take_period is
      variable plan_whole : time := 0 fs;
      variable plan_rest : time := 0 fs;
      variable low : time;
    begin
      if planned_num /= 0 then
        plan_whole := planned_den * 1 us / planned_num;
        plan_rest := planned_den * 1 us - plan_whole * planned_num;
      end if;
      low := plan_whole;
      if plan_rest = 0 fs then
        low := plan_whole - 1 fs;
      end if;
      if planned_num /= 0 and measured <= plan_whole + 1 fs and measured >= low then
        now_state.whole := plan_whole;
        now_state.rest := to_natural(plan_rest);
        now_state.parts := planned_num;
        now_state.num := planned_num;
        now_state.den := planned_den * 1 fs;
      else
        now_state.whole := measured;
        now_state.rest := 0;
        now_state.parts := 1;
        now_state.num := 1000000000;
        now_state.den := measured;
      end if;
    end procedure;

    procedure take_edge is
    begin
      if is_started then
        measured := now - now_state.stamp;
      end if;
      if measured > 0 fs then
        take_period;
        if bad then
          good := 0;
        elsif good < LOCK_CYCLES then
          good := good + 1;
        end if;
      end if;
      now_state.stamp := now;
      is_started := true;
      now_state.count := next_edge(now_state.count, 1);
      if bad then
        now_state.locked := false;
      elsif not now_state.locked and good >= LOCK_CYCLES then
        now_state.count := 0;
        now_state.locks := next_edge(now_state.locks, 1);
        now_state.locked := true;
      end if;
    end procedure;
  begin
    if rst = '1' or second /= selected or stops /= stopped then
      now_state.locked := false;
      now_state.num := 0;
      good := 0;
      is_started := false;
      measured := 0 fs;
      selected := second;
      stopped := stops;
    elsif rising_edge(clk) then
      take_edge;
      total <= next_edge(total, 1);
    end if;
    started <= is_started;
    period <= measured;
    state <= now_state;
  end process;

  -- Looks every two periods whether there has been an edge. Before there is a period it waits for
  -- longer, since the clock may be slower than the planned one.
  process
    constant UNKNOWN_SPAN : time := 1 us;
    variable seen : natural;
    variable span : time;
  begin
    if not started then
      wait until started;
    end if;
    seen := total;
    if period > 0 fs then
      wait for 2 * period;
    else
      span := UNKNOWN_SPAN;
      if planned_num /= 0 and 2 * (planned_den * 1 us / planned_num) > span then
        span := 2 * (planned_den * 1 us / planned_num);
      end if;
      wait until period > 0 fs or not started for span;
    end if;
    if total = seen and started then
      stops <= next_edge(stops, 1);
      wait until not started;
    end if;
  end process;
end architecture;

-- An output of a clock primitive: edges at exact places between those of the input.
--
-- A place is a number of units, of which DENOM / SCALE are one cycle of the input. Rising edges are
-- at START, START + PERIOD, ...; falling ones HIGH units after them. What is carried from edge to
-- edge are whole cycles and a remainder in parts of a cycle, both whole numbers: nothing is rounded
-- but the time of each edge by itself, to the nearest femtosecond, counted from the edge of the
-- input before it.
--
-- With jitter each edge moves by a normal deviate of its own, which is never more than half of the
-- shorter of high and low time, nor more than a cycle of the input. The uniform deviates are those
-- of P. L'Ecuyer, "Efficient and portable combined random number generators", Communications of the
-- ACM 31(6), 1988, so that the Verilog model has the same ones; two of them make a normal one (G.
-- Box, M. Muller, 1958).
library ieee;
use ieee.math_real.all;
use ieee.std_logic_1164.all;
use work.vorkel_model.all;

entity vorkel_model_output is
  generic (
    ENABLE : boolean := true;
    START : natural := 0;  -- from 0 to below PERIOD
    PERIOD : positive := 2;
    HIGH : positive := 1;
    SCALE : positive := 1;
    DENOM : positive := 2;
    JITTER_RMS_FS : natural := 0;
    SEED : natural := 1
  );
  port (
    state : in input_state;
    clk : out std_logic := '0'
  );
end entity;

architecture simulation of vorkel_model_output is
  constant UP : positive := HIGH * SCALE;
  constant DOWN : positive := (PERIOD - HIGH) * SCALE;
  constant SHORTER : positive := choose(UP < DOWN, UP, DOWN);
  -- With jitter an edge is planned a cycle before.
  constant LEAD : natural := choose(JITTER_RMS_FS /= 0, 1, 0);
  constant MOST_MOVE : real := 2.0e9;  -- fs, what an integer holds

  signal level : std_logic := '0';
  signal session : natural := 0;  -- the lock that this clock belongs to
begin
  clk <= level when state.locked and session = state.locks else '0';

  process
    variable is_high : boolean;
    variable mine : natural := 0;
    variable cycle : natural;  -- the next edge: cycles of the input,
    variable part : natural;   -- and parts of one
    variable target : time;
    variable one, two : integer;
    variable uniform : real;

    impure function is_mine return boolean is
    begin
      return state.locked and state.locks = mine;
    end function;

    -- The time of a part of a cycle from its beginning, to the nearest femtosecond.
    impure function time_of(of_cycle : natural) return time is
      variable product, full, above, below : time;
    begin
      product := state.whole * of_cycle;
      full := product / DENOM;
      above := (product - full * DENOM) * state.parts + (state.rest * 1 fs) * of_cycle;
      below := (state.parts * 1 fs) * DENOM;
      return full + ((2 * above + below) / (2 * below)) * 1 fs;
    end function;

    procedure advance(by : natural) is
    begin
      cycle := next_edge(cycle, by / DENOM);
      part := part + by mod DENOM;
      if part >= DENOM then
        part := part - DENOM;
        cycle := next_edge(cycle, 1);
      end if;
    end procedure;

    procedure draw_uniform is
      variable high_part : integer;
    begin
      high_part := one / 53668;
      one := 40014 * (one - high_part * 53668) - high_part * 12211;
      if one < 0 then
        one := one + 2147483563;
      end if;
      high_part := two / 52774;
      two := 40692 * (two - high_part * 52774) - high_part * 3791;
      if two < 0 then
        two := two + 2147483399;
      end if;
      high_part := one - two;
      if high_part < 1 then
        high_part := high_part + 2147483562;
      end if;
      uniform := real(high_part) * 4.656613e-10;
    end procedure;

    procedure draw_move(move : out time) is
      variable radius, spread, most, span : real;
      variable magnitude : time;
    begin
      draw_uniform;
      radius := sqrt(-2.0 * log(uniform));
      draw_uniform;
      spread := real(JITTER_RMS_FS) * radius * cos(6.283185307179586 * uniform);
      span := to_real(state.whole);
      most := real(SHORTER) * span / real(DENOM) / 2.0 - 1.0;
      if most > span then
        most := span;
      end if;
      if most > MOST_MOVE then
        most := MOST_MOVE;
      end if;
      if spread > most then
        spread := most;
      end if;
      if spread < -most then
        spread := -most;
      end if;
      magnitude := integer(floor(abs(spread) + 0.5)) * 1 fs;
      if spread < 0.0 then
        move := -magnitude;
      else
        move := magnitude;
      end if;
    end procedure;

    procedure aim is
      variable ahead : integer;
      variable move : time;
    begin
      target := state.stamp + time_of(part);
      if LEAD /= 0 then
        -- From here to the cycle: one, or more when it is a late one.
        ahead := edges_between(state.count, cycle);
        target := target + state.whole * ahead + (state.rest * 1 fs) * ahead / state.parts;
        draw_move(move);
        target := target + move;
      end if;
    end procedure;
  begin
    one := SEED mod 2147483562 + 1;
    two := SEED mod 2147483398 + 1;
    for i in 1 to 16 loop
      draw_uniform;
    end loop;
    while ENABLE loop
      level <= '0';
      if not (state.locked and state.locks /= mine) then
        wait on state until state.locked and state.locks /= mine;
      end if;
      mine := state.locks;
      session <= mine;
      is_high := false;
      cycle := 0;
      part := 0;
      advance(START * SCALE);
      while is_mine loop
        if edges_between(state.count, cycle) > LEAD then
          wait on state until not is_mine or edges_between(state.count, cycle) <= LEAD;
        end if;
        if is_mine then
          aim;
          if target > now then
            wait for target - now;
          else
            wait for 0 fs;
          end if;
          is_high := not is_high;
          if is_high then
            level <= '1';
            advance(UP);
          else
            level <= '0';
            advance(DOWN);
          end if;
        end if;
      end loop;
    end loop;
    wait;
  end process;
end architecture;

-- Holds the edges of a clock against their exact times, for testbenches.
--
-- The clock has RATIO_NUM / RATIO_DEN cycles in one of the input, which has a frequency of MHZ_NUM
-- / MHZ_DEN MHz. A cycle has SHAPE_DEN parts: the clock rises with part PHASE, counted from the
-- edge of the input at which `run` rises, and is high for HIGH parts. Each edge may be off by 1 fs,
-- not more: by as much as the rounding of that edge and of the one of the input before it. RISES
-- rising edges are looked at, with the falling ones behind them. When `run` falls there must have
-- been all.
--
-- `source_time` and `source_rest` are those of a vorkel_clock_source.
library ieee;
use ieee.std_logic_1164.all;
use std.textio.all;
use work.vorkel_model.all;

entity vorkel_clock_check is
  generic (
    INDEX : natural := 0;  -- of the output, for what is printed
    MHZ_NUM : positive := 100;
    MHZ_DEN : positive := 1;
    RATIO_NUM : positive := 1;
    RATIO_DEN : positive := 1;
    SHAPE_DEN : positive := 2;
    PHASE : natural := 0;
    HIGH : positive := 1;
    RISES : positive := 100
  );
  port (
    clk : in std_logic;
    run : in std_logic;
    source_time : in time;
    source_rest : in natural;
    is_done : out std_logic := '0';  -- all edges have come
    is_wrong : out std_logic := '0'  -- one was not where it should be
  );
end entity;

architecture simulation of vorkel_clock_check is
  constant PIECES : positive := RATIO_NUM * SHAPE_DEN;
  constant PARTS : time := (MHZ_NUM * 1 fs) * PIECES;  -- of a femtosecond, as a number
  constant IN_WHOLE : time := MHZ_DEN * 1 us / MHZ_NUM;
  constant IN_REST : time := MHZ_DEN * 1 us - IN_WHOLE * MHZ_NUM;
  -- The part of a cycle is PART_WHOLE fs and PART_REST parts of one, these perhaps more than one.
  constant PART_WHOLE : time := IN_WHOLE * RATIO_DEN / PIECES;
  constant PART_REST : time :=
    (IN_WHOLE * RATIO_DEN - PART_WHOLE * PIECES) * MHZ_NUM + IN_REST * RATIO_DEN;
  constant MOST_PRINTED : positive := 3;
begin
  process
    variable whole, rest : time;  -- the next edge: whole + rest / PARTS fs
    variable high_whole, high_rest, low_whole, low_rest : time;
    variable rose, faults : natural := 0;
    variable begun, first, last, high_time : time := 0 fs;
    variable tolerated : time;

    procedure advance(by_whole, by_rest : time) is
    begin
      whole := whole + by_whole;
      rest := rest + by_rest;
      while rest >= PARTS loop
        rest := rest - PARTS;
        whole := whole + 1 fs;
      end loop;
    end procedure;

    -- From the beginning so many parts of a cycle.
    procedure measure(by : natural) is
    begin
      whole := 0 fs;
      rest := 0 fs;
      for i in 1 to by loop
        advance(PART_WHOLE, PART_REST);
      end loop;
    end procedure;

    procedure say(words : string) is
    begin
      write(output, "output " & integer'image(INDEX) & ": " & words & LF);
    end procedure;

    procedure take_edge is
    begin
      tolerated := 0 fs;
      if rest = 0 fs then
        tolerated := 1 fs;
      end if;
      if now > whole + 1 fs or now + tolerated < whole then
        is_wrong <= '1';
        faults := faults + 1;
        if faults <= MOST_PRINTED then
          say("edge " & integer'image(rose) & " to " & std_logic'image(clk) & " at " &
              time'image(now) & ", not at " & time'image(whole) & " + " & time'image(rest) & "/" &
              time'image(PARTS));
        end if;
      end if;
      if clk = '1' then
        last := now;
        if rose = 0 then
          first := now;
        end if;
        rose := rose + 1;
        advance(high_whole, high_rest);
      else
        high_time := high_time + now - last;
        advance(low_whole, low_rest);
        if rose = RISES then
          is_done <= '1';
        end if;
      end if;
    end procedure;

    procedure report_figures is
      variable span : real;
    begin
      if rose < RISES then
        is_wrong <= '1';
        say(integer'image(rose) & " of " & integer'image(RISES) & " rising edges");
      end if;
      if rose > 1 then
        span := to_real(last - first) / real(rose - 1);
        say(integer'image(rose) & " rising edges, period " & fixed(span / 1000.0, 6) &
            " ps, phase " & fixed(360.0 * to_real(first - begun) / span, 4) & " degrees, duty " &
            fixed(100.0 * to_real(high_time) / real(rose) / span, 4) & " %");
      end if;
    end procedure;
  begin
    measure(HIGH);
    high_whole := whole;
    high_rest := rest;
    measure(SHAPE_DEN - HIGH);
    low_whole := whole;
    low_rest := rest;
    if run /= '1' then
      wait until run = '1';
    end if;
    begun := now;
    measure(PHASE);
    advance(source_time, (source_rest * 1 fs) * PIECES);
    -- The first edge can have come with the lock, or comes in a later delta cycle.
    if clk = '1' and clk'last_event = 0 fs then
      take_edge;
    end if;
    while rose < RISES or clk = '1' loop
      wait on clk, run;
      exit when run /= '1';
      if clk'event then
        take_edge;
      end if;
    end loop;
    if run = '1' then
      wait until run /= '1';
    end if;
    report_figures;
    wait;
  end process;
end architecture;

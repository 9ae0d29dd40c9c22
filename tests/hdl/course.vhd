-- A PLL on the way through all that can happen to it: see course.v, of which this is the same in
-- VHDL.
library ieee;
use ieee.std_logic_1164.all;
use std.textio.all;

entity course is
end entity;

architecture simulation of course is
  signal clk, rst : std_logic := '0';
  signal runs : boolean := false;
  signal half : time := 5 ns;
  signal fb, clk0, clk1, locked : std_logic;
  signal edges0, edges1 : natural := 0;
  signal clear : boolean := false;
  signal is_through : boolean := false;
begin
  pll : entity work.VORKEL_PLL
    generic map (
      CLKIN1_MHZ_NUM => 100, M_EIGHTHS => 64, CLKOUT0_DIVIDE_EIGHTHS => 32,
      CLKOUT1_DIVIDE_EIGHTHS => 64, CLKOUT1_PHASE_EIGHTHS => -16, CLKOUT1_HIGH_HALVES => 4,
      VCO_MIN_NUM => 380, VCO_MAX_NUM => 1000
    )
    port map (
      CLKIN1 => clk, CLKFBIN => fb, RST => rst, CLKFBOUT => fb, CLKOUT0 => clk0, CLKOUT1 => clk1,
      CLKOUT2 => open, CLKOUT3 => open, CLKOUT4 => open, CLKOUT5 => open, CLKOUT6 => open,
      LOCKED => locked
    );

  process (clk0, clk1, clear)
  begin
    if clear then
      edges0 <= 0;
      edges1 <= 0;
    end if;
    if rising_edge(clk0) then
      edges0 <= edges0 + 1;
    end if;
    if rising_edge(clk1) then
      edges1 <= edges1 + 1;
    end if;
  end process;

  process
  begin
    clk <= '0';
    if not runs then
      wait until runs;
    end if;
    while runs loop
      clk <= '1';
      wait for half;
      clk <= '0';
      wait for half;
    end loop;
  end process;

  -- Where what is waited for does not come.
  process
  begin
    wait for 1 ms;
    assert is_through report "LATE" severity failure;
    wait;
  end process;

  process
    variable wrong : natural := 0;
    variable start : time;
    procedure expect_that(condition : boolean; what : string) is
    begin
      if not condition then
        write(output, "not so at " & time'image(now) & ": " & what & LF);
        wrong := wrong + 1;
      end if;
    end procedure;
  begin
    wait for 1 ns;

    -- Sixteen good periods after the first edge.
    start := now;
    runs <= true;
    wait until locked = '1';
    expect_that(now - start = 160 ns, "lock after 16 periods");
    wait for 1 fs;
    expect_that(edges0 = 1 and clk0'last_event = 1 fs, "clk0 rises with the lock");
    -- Two eighths of its 8 VCO periods of 1250 ps before the next cycle.
    wait for 7499 ps;
    expect_that(edges1 = 0, "clk1 not before its phase");
    wait for 2 ps;
    expect_that(edges1 = 1 and now - clk1'last_event - start = 167500 ps, "clk1 at its phase");
    expect_that(clk1 = '1', "clk1 is high");
    wait for 2500 ps;
    expect_that(clk1 = '0', "clk1 is high for 2 VCO periods");

    -- The input stops.
    wait until clk = '1';
    runs <= false;
    wait for 40001 ps;
    expect_that(locked = '0' and clk0 = '0' and clk1 = '0', "no lock without an input");
    clear <= true;
    wait for 1 fs;
    clear <= false;
    wait for 1 us;
    expect_that(edges0 = 0, "and no edges");

    -- It comes back with less than half of the planned 100 MHz: 48, which are 384 of the VCO.
    half <= 10416666 fs;
    runs <= true;
    wait for 375 ns;
    expect_that(locked = '1', "lock below half of the planned clock");
    wait until clk = '1';
    wait for half / 2;
    clear <= true;
    wait for 1 fs;
    clear <= false;
    wait for 200 * half;
    expect_that(locked = '1' and edges0 = 200, "twice its edges");

    -- It stops again.
    wait until clk = '1';
    runs <= false;
    wait for 84 ns;
    expect_that(locked = '0', "no lock without it");
    half <= 5 ns;

    -- It comes back as it was.
    start := now;
    runs <= true;
    wait until locked = '1';
    expect_that(now - start = 160 ns, "lock again after 16 periods");

    -- 40 MHz are 320 MHz of the VCO.
    half <= 12500 ps;
    wait for 100 ns;
    expect_that(locked = '0' and clk0 = '0', "no lock below the range of the VCO");
    wait for 1 us;
    expect_that(locked = '0', "and none later");

    -- 80 MHz are 640: a clock that was not planned is followed.
    half <= 6250 ps;
    wait for 1 us;
    expect_that(locked = '1', "lock in the range");
    wait until clk = '1';
    wait for 3125 ps;
    clear <= true;
    wait for 1 fs;
    clear <= false;
    wait for 1250 ns;
    expect_that(edges0 = 200 and edges1 = 100, "twice and once the edges of the input");

    -- A period of 12,347 ps.
    wait until clk = '0';
    half <= 6173500 fs;
    for i in 0 to 99 loop
      wait until clk = '1';
      start := now;
      wait for 1 fs;
      expect_that(i < 2 or (clk0 = '1' and clk0'last_event = 1 fs), "clk0 rises with the input");
      wait for half;
      expect_that(i < 2 or (clk0 = '1' and clk0'last_event = 1 fs),
                  "and in the middle of its cycle");
    end loop;

    -- A reset takes the lock away at once.
    rst <= '1';
    wait for 1 fs;
    expect_that(locked = '0' and clk0 = '0' and clk1 = '0', "no lock while there is a reset");
    wait for 1 us;
    expect_that(locked = '0', "however long");
    rst <= '0';
    wait for 36 * half;
    expect_that(locked = '1', "lock after it");

    runs <= false;
    is_through <= true;
    if wrong = 0 then
      write(output, "PASS" & LF);
    else
      write(output, "FAIL" & LF);
    end if;
    wait;
  end process;
end architecture;

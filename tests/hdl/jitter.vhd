-- Two PLLs with a jitter of 10 ps rms: see jitter.v, with which it is compared.
library ieee;
use ieee.std_logic_1164.all;
use std.textio.all;

entity jitter is
end entity;

architecture simulation of jitter is
  signal enable, clk, locked0 : std_logic := '0';
  type seeds is array (0 to 2) of natural;
  constant SEED : seeds := (1, 1, 2026);
  signal fb, clk0, locked : std_logic_vector(0 to 2);
begin
  source : entity work.VORKEL_CLOCK_SOURCE
    generic map (MHZ_NUM => 27)
    port map (enable => enable, clk => clk, edge_time => open, edge_rest => open);

  plls : for g in 0 to 2 generate
    pll : entity work.VORKEL_PLL
      generic map (
        CLKIN1_MHZ_NUM => 27, M_EIGHTHS => 264, CLKOUT0_DIVIDE_EIGHTHS => 96,
        JITTER_RMS_FS => 10000, JITTER_SEED => SEED(g)
      )
      port map (
        CLKIN1 => clk, CLKFBIN => fb(g), RST => '0', CLKFBOUT => fb(g), CLKOUT0 => clk0(g),
        CLKOUT1 => open, CLKOUT2 => open, CLKOUT3 => open, CLKOUT4 => open, CLKOUT5 => open,
        CLKOUT6 => open, LOCKED => locked(g)
      );

    process
    begin
      wait until locked(g) = '1';
      for i in 1 to 3 loop
        wait until clk0(g) = '1';
      end loop;
      for n in 1 to 5 loop
        wait until clk0(g) = '1';
        write(output, integer'image(g) & ": edge " & integer'image(n) & " at " &
              integer'image(now / 1 fs) & LF);
      end loop;
      wait;
    end process;
  end generate;

  process
  begin
    wait for 1 fs;
    enable <= '1';
    wait for 800 ns;
    enable <= '0';
    wait;
  end process;
end architecture;

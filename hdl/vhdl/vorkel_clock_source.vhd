-- A clock of an exact frequency for testbenches: MHZ_NUM / MHZ_DEN MHz, high for half of the time.
-- It begins with a rising edge when `enable` rises, and ends when that falls. Each edge is at the
-- femtosecond that is nearest to its exact time; the remainder is carried, so that nothing
-- accumulates.
library ieee;
use ieee.std_logic_1164.all;
use work.vorkel_model.all;

entity vorkel_clock_source is
  generic (
    MHZ_NUM : positive := 100;
    MHZ_DEN : positive := 1
  );
  port (
    enable : in std_logic;
    clk : out std_logic := '0';
    -- The exact time of the latest rising edge: edge_time + edge_rest / MHZ_NUM fs.
    edge_time : out time := 0 fs;
    edge_rest : out natural := 0
  );
end entity;

architecture simulation of vorkel_clock_source is
  constant PARTS : time := (MHZ_NUM * 1 fs) * 2;  -- of a femtosecond, as a number
  -- Half of a period: HALF_WHOLE fs and HALF_REST parts.
  constant HALF_WHOLE : time := (MHZ_DEN * 1 us) / 2 / MHZ_NUM;
  constant HALF_REST : time := MHZ_DEN * 1 us - HALF_WHOLE * MHZ_NUM * 2;
begin
  process
    variable whole, rest, nearest : time;
    variable is_high : boolean := false;
  begin
    clk <= '0';
    is_high := false;
    if enable /= '1' then
      wait until enable = '1';
    end if;
    whole := now;
    rest := 0 fs;
    while enable = '1' loop
      is_high := not is_high;
      if is_high then
        edge_time <= whole;
        edge_rest <= to_natural(rest / 2);
        clk <= '1';
      else
        clk <= '0';
      end if;
      whole := whole + HALF_WHOLE;
      rest := rest + HALF_REST;
      if rest >= PARTS then
        rest := rest - PARTS;
        whole := whole + 1 fs;
      end if;
      nearest := whole;
      if rest >= PARTS / 2 then
        nearest := whole + 1 fs;
      end if;
      wait for nearest - now;
    end loop;
  end process;
end architecture;

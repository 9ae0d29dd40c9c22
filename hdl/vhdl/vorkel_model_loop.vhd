-- PLL and TSYN in simulation:
--
--   input -> / D -> detector (PFD) -> VCO -> / divider of each output -> outputs
--                      ^-- / M --------|
--
-- All edges are places between those of the input, on a grid of sixteenths of a VCO period, of
-- which 2 M_EIGHTHS / D are one cycle of the input. The edge of the input with which the lock
-- begins is the place 0: there all outputs with a phase of 0 rise, and later ones by their phase;
-- each begins with a whole high time.
--
-- The feedback, CLKFBOUT to CLKFBIN, has the frequency of the detector. Without edges there the
-- lock is lost until a reset.
library ieee;
use ieee.std_logic_1164.all;
use work.vorkel_model.all;

entity vorkel_model_loop is
  generic (
    IS_TSYN : boolean;
    CLKIN1_MHZ_NUM : natural;
    CLKIN1_MHZ_DEN : positive;
    CLKIN2_MHZ_NUM : natural;
    CLKIN2_MHZ_DEN : positive;
    BANDWIDTH : string;
    M_EIGHTHS : positive;
    D : positive;
    DIVIDES : output_numbers;
    PHASES : output_numbers;
    HIGHS : output_numbers;
    VCO_MIN_NUM : natural := 0;
    VCO_MIN_DEN : positive := 1;
    VCO_MAX_NUM : natural := 0;
    VCO_MAX_DEN : positive := 1;
    PFD_MIN_NUM : natural := 0;
    PFD_MIN_DEN : positive := 1;
    PFD_MAX_NUM : natural := 0;
    PFD_MAX_DEN : positive := 1;
    CLKOUT_MIN_NUM : natural := 0;
    CLKOUT_MIN_DEN : positive := 1;
    CLKOUT_MAX_NUM : natural := 0;
    CLKOUT_MAX_DEN : positive := 1;
    CLKOUT1_MIN_NUM : natural := 0;
    CLKOUT1_MIN_DEN : positive := 1;
    CLKOUT1_MAX_NUM : natural := 0;
    CLKOUT1_MAX_DEN : positive := 1;
    MAX_COUNT : natural;
    LOCK_CYCLES : positive;
    JITTER_RMS_FS : natural;
    JITTER_SEED : natural
  );
  port (
    clkin1 : in std_logic;
    clkin2 : in std_logic;
    clkinsel : in std_logic;
    clkfbin : in std_logic;
    rst : in std_logic;
    clkfbout : out std_logic;
    clkout : out std_logic_vector(6 downto 0);
    locked : out std_logic
  );
end entity;

architecture simulation of vorkel_model_loop is
  constant LARGEST_DIVIDE : positive := choose(MAX_COUNT = 0 or MAX_COUNT > 64, 128, 2 * MAX_COUNT);

  function used_outputs return natural is
    variable used : natural := 0;
  begin
    for i in DIVIDES'range loop
      if DIVIDES(i) /= 0 then
        used := used + 1;
      end if;
    end loop;
    return used;
  end function;

  -- The settings that there are. Fractions of eighths are those of a TSYN with up to five outputs;
  -- beside them nothing moves.
  function is_right_output(i : natural) return boolean is
    constant DIVIDE : natural := DIVIDES(i);
    constant HALVES : natural := HIGHS(i);
    constant IS_FRACTION : boolean := M_EIGHTHS mod 8 /= 0 or DIVIDES(0) mod 8 /= 0;
  begin
    if (DIVIDE /= 8 and DIVIDE < 16) or DIVIDE > 8 * LARGEST_DIVIDE then
      return false;
    end if;
    if DIVIDE mod 8 /= 0 and (i /= 0 or not IS_TSYN or used_outputs > 5) then
      return false;
    end if;
    if IS_FRACTION and (PHASES(i) /= 0 or HALVES /= 0) then
      return false;
    end if;
    if HALVES = 0 then
      return true;
    end if;
    if DIVIDE = 8 then
      return HALVES = 1;
    end if;
    return HALVES >= 2 and HALVES <= DIVIDE / 4 - 1 and
           (MAX_COUNT = 0 or
            (HALVES <= 2 * MAX_COUNT + 1 and DIVIDE / 4 - HALVES <= 2 * MAX_COUNT));
  end function;

  function is_right return boolean is
    variable right : boolean := true;
  begin
    if M_EIGHTHS < 8 or M_EIGHTHS > 512 or
       (M_EIGHTHS mod 8 /= 0 and (not IS_TSYN or used_outputs > 5)) or
       (IS_TSYN and M_EIGHTHS > 8 and M_EIGHTHS < 40) then
      report "M is " & integer'image(M_EIGHTHS) & "/8" severity error;
      right := false;
    end if;
    if D > 80 then
      report "D is " & integer'image(D) severity error;
      right := false;
    end if;
    if BANDWIDTH /= "LOW" and BANDWIDTH /= "HIGH" and BANDWIDTH /= "OPTIMIZED" then
      report "the bandwidth is none of LOW, HIGH and OPTIMIZED" severity error;
      right := false;
    end if;
    for i in DIVIDES'range loop
      if DIVIDES(i) /= 0 and not is_right_output(i) then
        report "output " & integer'image(i) & ": divide " & integer'image(DIVIDES(i)) &
               "/8, phase " & integer'image(PHASES(i)) & "/8, high time " &
               integer'image(HIGHS(i)) & "/2" severity error;
        right := false;
      end if;
    end loop;
    return right;
  end function;

  constant IS_WRONG : boolean := not is_right;

  type output_flags is array (0 to 6) of boolean;
  signal clk : std_logic;
  signal planned_num : natural;
  signal planned_den : positive;
  signal state : input_state;
  signal vco_is_off, pfd_is_off, has_no_feedback, bad : boolean;
  signal output_is_off : output_flags := (others => false);
begin
  clk <= clkin2 when clkinsel = '1' else clkin1;
  planned_num <= CLKIN2_MHZ_NUM when clkinsel = '1' else CLKIN1_MHZ_NUM;
  planned_den <= CLKIN2_MHZ_DEN when clkinsel = '1' else CLKIN1_MHZ_DEN;
  locked <= '1' when state.locked else '0';

  process (vco_is_off, pfd_is_off, has_no_feedback, output_is_off)
    variable any : boolean;
  begin
    any := IS_WRONG or vco_is_off or pfd_is_off or has_no_feedback;
    for i in output_is_off'range loop
      any := any or output_is_off(i);
    end loop;
    bad <= any;
  end process;

  reference : entity work.vorkel_model_input
    generic map (LOCK_CYCLES => LOCK_CYCLES)
    port map (
      clk => clk, rst => rst, second => clkinsel, planned_num => planned_num,
      planned_den => planned_den, bad => bad, state => state
    );

  vco_limit : entity work.vorkel_model_limit
    generic map (
      WHAT => "VCO", MUL => M_EIGHTHS, DIV => 8 * D, MIN_NUM => VCO_MIN_NUM,
      MIN_DEN => VCO_MIN_DEN, MAX_NUM => VCO_MAX_NUM, MAX_DEN => VCO_MAX_DEN
    )
    port map (num => state.num, den => state.den, broken => vco_is_off);

  pfd_limit : entity work.vorkel_model_limit
    generic map (
      WHAT => "PFD", DIV => D, MIN_NUM => PFD_MIN_NUM, MIN_DEN => PFD_MIN_DEN,
      MAX_NUM => PFD_MAX_NUM, MAX_DEN => PFD_MAX_DEN
    )
    port map (num => state.num, den => state.den, broken => pfd_is_off);

  feedback : entity work.vorkel_model_output
    generic map (SCALE => D)
    port map (state => state, clk => clkfbout);

  feedback_watch : entity work.vorkel_model_feedback
    generic map (PIN => "CLKFBIN", CYCLES => 4 * D)
    port map (clk => clkfbin, rst => rst, state => state, missing => has_no_feedback);

  outputs : for i in 0 to 6 generate
    unused : if DIVIDES(i) = 0 generate
      clkout(i) <= '0';
    end generate;

    used : if DIVIDES(i) /= 0 generate
      divider : entity work.vorkel_model_output
        generic map (
          START => (2 * PHASES(i)) mod (2 * DIVIDES(i)),
          PERIOD => 2 * DIVIDES(i),
          HIGH => choose(HIGHS(i) /= 0 and not IS_WRONG, 8 * HIGHS(i), DIVIDES(i)),
          SCALE => D,
          DENOM => 2 * M_EIGHTHS,
          JITTER_RMS_FS => JITTER_RMS_FS,
          SEED => JITTER_SEED + i
        )
        port map (state => state, clk => clkout(i));

      limit : entity work.vorkel_model_limit
        generic map (
          WHAT => "output " & integer'image(i),
          MUL => M_EIGHTHS,
          DIV => D * DIVIDES(i),
          MIN_NUM => choose(i = 1, CLKOUT1_MIN_NUM, CLKOUT_MIN_NUM),
          MIN_DEN => choose(i = 1, CLKOUT1_MIN_DEN, CLKOUT_MIN_DEN),
          MAX_NUM => choose(i = 1, CLKOUT1_MAX_NUM, CLKOUT_MAX_NUM),
          MAX_DEN => choose(i = 1, CLKOUT1_MAX_DEN, CLKOUT_MAX_DEN)
        )
        port map (num => state.num, den => state.den, broken => output_is_off(i));
    end generate;
  end generate;
end architecture;

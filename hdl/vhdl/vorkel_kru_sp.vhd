-- The clock primitive KRU_SP: hdl.md describes its attributes.
--
-- Its line has the frequency of the input, or half of it. CLK0 to CLK270 have that, CLK2X twice of
-- it, CLKDV a quotient, CLKFX M / D of it; PHASE_SHIFT moves each of them by so many 255ths of its
-- own period. Without feedback there are only CLKFX and CLKFX180.
--
-- The feedback comes from CLK0 ("1X") or CLK2X ("2X"). Without edges at CLKFB the lock is lost
-- until a reset.
--
-- The edge of the input with which the lock begins is where CLK0, CLK2X, CLKDV and CLKFX rise, but
-- for PHASE_SHIFT.
library ieee;
use ieee.std_logic_1164.all;
use work.vorkel_model.all;

entity VORKEL_KRU_SP is
  generic (
    CLKIN_MHZ_NUM : natural := 100;  -- the planned clock, MHz
    CLKIN_MHZ_DEN : positive := 1;
    CLKIN_DIVIDE_BY_2 : boolean := false;
    CLK_FEEDBACK : string := "NONE";  -- or 1X, 2X
    M : natural := 0;  -- 0: no CLKFX
    D : natural := 0;
    CLKDV_DIVIDE_HALVES : natural := 0;  -- 0: no CLKDV
    PHASE_SHIFT : natural := 0;
    -- The limits of the device, MHz; no maximum where that is 0. CLK180 has those of CLK0, and so
    -- on.
    CLK0_MIN_NUM : natural := 0;
    CLK0_MIN_DEN : positive := 1;
    CLK0_MAX_NUM : natural := 0;
    CLK0_MAX_DEN : positive := 1;
    CLK90_MIN_NUM : natural := 0;
    CLK90_MIN_DEN : positive := 1;
    CLK90_MAX_NUM : natural := 0;
    CLK90_MAX_DEN : positive := 1;
    CLK2X_MIN_NUM : natural := 0;
    CLK2X_MIN_DEN : positive := 1;
    CLK2X_MAX_NUM : natural := 0;
    CLK2X_MAX_DEN : positive := 1;
    CLKDV_MIN_NUM : natural := 0;
    CLKDV_MIN_DEN : positive := 1;
    CLKDV_MAX_NUM : natural := 0;
    CLKDV_MAX_DEN : positive := 1;
    CLKFX_MIN_NUM : natural := 0;
    CLKFX_MIN_DEN : positive := 1;
    CLKFX_MAX_NUM : natural := 0;
    CLKFX_MAX_DEN : positive := 1;
    -- Of the simulation alone.
    LOCK_CYCLES : positive := 16;
    JITTER_RMS_FS : natural := 0;
    JITTER_SEED : natural := 1
  );
  port (
    CLKIN : in std_logic;
    CLKFB : in std_logic := '0';
    RST : in std_logic;
    CLK0 : out std_logic;
    CLK90 : out std_logic;
    CLK180 : out std_logic;
    CLK270 : out std_logic;
    CLK2X : out std_logic;
    CLK2X180 : out std_logic;
    CLKDV : out std_logic;
    CLKFX : out std_logic;
    CLKFX180 : out std_logic;
    LOCKED : out std_logic
  );
end entity;

architecture simulation of VORKEL_KRU_SP is
  -- The parts of a cycle for phases: quarters, and 255ths for PHASE_SHIFT.
  constant STEPS : positive := 1020;
  constant LINE_CYCLES : positive := choose(CLKIN_DIVIDE_BY_2, 2, 1);  -- of the input
  constant HAS_LINE : boolean := CLK_FEEDBACK /= "NONE";
  constant HAS_DV : boolean := HAS_LINE and CLKDV_DIVIDE_HALVES /= 0;
  constant HAS_FX : boolean := M /= 0;
  constant HALVES : positive := choose(HAS_DV, CLKDV_DIVIDE_HALVES, 2);
  constant FX_M : positive := choose(HAS_FX, M, 1);
  constant FX_D : positive := choose(HAS_FX and D /= 0, D, 1);

  -- The settings that there are.
  function is_right return boolean is
    variable right : boolean := true;
  begin
    if M /= 0 and (M < 2 or M > 32 or D < 1 or D > 32) then
      report "M is " & integer'image(M) & " and D " & integer'image(D) severity error;
      right := false;
    end if;
    if CLKDV_DIVIDE_HALVES /= 0 and
       (CLKDV_DIVIDE_HALVES < 4 or CLKDV_DIVIDE_HALVES > 34 or
        (CLKDV_DIVIDE_HALVES > 16 and CLKDV_DIVIDE_HALVES mod 2 /= 0)) then
      report "the divide of CLKDV is " & integer'image(CLKDV_DIVIDE_HALVES) & "/2" severity error;
      right := false;
    end if;
    if PHASE_SHIFT > 255 then
      report "PHASE_SHIFT is " & integer'image(PHASE_SHIFT) severity error;
      right := false;
    end if;
    if CLK_FEEDBACK /= "NONE" and CLK_FEEDBACK /= "1X" and CLK_FEEDBACK /= "2X" then
      report "CLK_FEEDBACK is none of NONE, 1X and 2X" severity error;
      right := false;
    end if;
    return right;
  end function;

  constant IS_WRONG : boolean := not is_right;

  signal state : input_state;
  signal bad, clk0_is_off, clk90_is_off, clk2x_is_off, clkdv_is_off, clkfx_is_off : boolean;
  signal has_no_feedback : boolean;
begin
  LOCKED <= '1' when state.locked else '0';
  bad <= IS_WRONG or clk0_is_off or clk90_is_off or clk2x_is_off or clkdv_is_off or
         clkfx_is_off or has_no_feedback;

  reference : entity work.vorkel_model_input
    generic map (LOCK_CYCLES => LOCK_CYCLES)
    port map (
      clk => CLKIN, rst => RST, second => '0', planned_num => CLKIN_MHZ_NUM,
      planned_den => CLKIN_MHZ_DEN, bad => bad, state => state
    );

  feedback_watch : entity work.vorkel_model_feedback
    generic map (PIN => "CLKFB", ENABLE => HAS_LINE, CYCLES => 8)
    port map (clk => CLKFB, rst => RST, state => state, missing => has_no_feedback);

  clk0_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_LINE,
      START => (4 * 2 * PHASE_SHIFT) mod (2 * STEPS),
      PERIOD => 2 * STEPS,
      HIGH => 2 / 2 * STEPS,
      SCALE => LINE_CYCLES,
      DENOM => 2 * STEPS,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 0
    )
    port map (state => state, clk => CLK0);

  clk90_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_LINE,
      START => (2 * STEPS / 4 + 4 * 2 * PHASE_SHIFT) mod (2 * STEPS),
      PERIOD => 2 * STEPS,
      HIGH => 2 / 2 * STEPS,
      SCALE => LINE_CYCLES,
      DENOM => 2 * STEPS,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 1
    )
    port map (state => state, clk => CLK90);

  clk180_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_LINE,
      START => (2 * STEPS / 4 * 2 + 4 * 2 * PHASE_SHIFT) mod (2 * STEPS),
      PERIOD => 2 * STEPS,
      HIGH => 2 / 2 * STEPS,
      SCALE => LINE_CYCLES,
      DENOM => 2 * STEPS,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 2
    )
    port map (state => state, clk => CLK180);

  clk270_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_LINE,
      START => (2 * STEPS / 4 * 3 + 4 * 2 * PHASE_SHIFT) mod (2 * STEPS),
      PERIOD => 2 * STEPS,
      HIGH => 2 / 2 * STEPS,
      SCALE => LINE_CYCLES,
      DENOM => 2 * STEPS,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 3
    )
    port map (state => state, clk => CLK270);

  clk2x_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_LINE,
      START => (4 * 2 * PHASE_SHIFT) mod (2 * STEPS),
      PERIOD => 2 * STEPS,
      HIGH => 2 / 2 * STEPS,
      SCALE => LINE_CYCLES,
      DENOM => 4 * STEPS,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 4
    )
    port map (state => state, clk => CLK2X);

  clk2x180_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_LINE,
      START => (2 * STEPS / 4 * 2 + 4 * 2 * PHASE_SHIFT) mod (2 * STEPS),
      PERIOD => 2 * STEPS,
      HIGH => 2 / 2 * STEPS,
      SCALE => LINE_CYCLES,
      DENOM => 4 * STEPS,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 5
    )
    port map (state => state, clk => CLK2X180);

  clkdv_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_DV,
      START => (4 * HALVES * PHASE_SHIFT) mod (HALVES * STEPS),
      PERIOD => HALVES * STEPS,
      HIGH => HALVES / 2 * STEPS,
      SCALE => LINE_CYCLES,
      DENOM => 2 * STEPS,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 6
    )
    port map (state => state, clk => CLKDV);

  clkfx_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_FX,
      START => (4 * 2 * PHASE_SHIFT) mod (2 * STEPS),
      PERIOD => 2 * STEPS,
      HIGH => 2 / 2 * STEPS,
      SCALE => LINE_CYCLES * FX_D,
      DENOM => 2 * STEPS * FX_M,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 7
    )
    port map (state => state, clk => CLKFX);

  clkfx180_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_FX,
      START => (2 * STEPS / 4 * 2 + 4 * 2 * PHASE_SHIFT) mod (2 * STEPS),
      PERIOD => 2 * STEPS,
      HIGH => 2 / 2 * STEPS,
      SCALE => LINE_CYCLES * FX_D,
      DENOM => 2 * STEPS * FX_M,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 8
    )
    port map (state => state, clk => CLKFX180);

  clk0_limit : entity work.vorkel_model_limit
    generic map (
      WHAT => "CLK0",
      MUL => 1,
      DIV => LINE_CYCLES,
      MIN_NUM => choose(HAS_LINE, CLK0_MIN_NUM, 0),
      MIN_DEN => CLK0_MIN_DEN,
      MAX_NUM => choose(HAS_LINE, CLK0_MAX_NUM, 0),
      MAX_DEN => CLK0_MAX_DEN
    )
    port map (num => state.num, den => state.den, broken => clk0_is_off);

  clk90_limit : entity work.vorkel_model_limit
    generic map (
      WHAT => "CLK90",
      MUL => 1,
      DIV => LINE_CYCLES,
      MIN_NUM => choose(HAS_LINE, CLK90_MIN_NUM, 0),
      MIN_DEN => CLK90_MIN_DEN,
      MAX_NUM => choose(HAS_LINE, CLK90_MAX_NUM, 0),
      MAX_DEN => CLK90_MAX_DEN
    )
    port map (num => state.num, den => state.den, broken => clk90_is_off);

  clk2x_limit : entity work.vorkel_model_limit
    generic map (
      WHAT => "CLK2X",
      MUL => 2,
      DIV => LINE_CYCLES,
      MIN_NUM => choose(HAS_LINE, CLK2X_MIN_NUM, 0),
      MIN_DEN => CLK2X_MIN_DEN,
      MAX_NUM => choose(HAS_LINE, CLK2X_MAX_NUM, 0),
      MAX_DEN => CLK2X_MAX_DEN
    )
    port map (num => state.num, den => state.den, broken => clk2x_is_off);

  clkdv_limit : entity work.vorkel_model_limit
    generic map (
      WHAT => "CLKDV",
      MUL => 2,
      DIV => LINE_CYCLES * HALVES,
      MIN_NUM => choose(HAS_DV, CLKDV_MIN_NUM, 0),
      MIN_DEN => CLKDV_MIN_DEN,
      MAX_NUM => choose(HAS_DV, CLKDV_MAX_NUM, 0),
      MAX_DEN => CLKDV_MAX_DEN
    )
    port map (num => state.num, den => state.den, broken => clkdv_is_off);

  clkfx_limit : entity work.vorkel_model_limit
    generic map (
      WHAT => "CLKFX",
      MUL => FX_M,
      DIV => LINE_CYCLES * FX_D,
      MIN_NUM => choose(HAS_FX, CLKFX_MIN_NUM, 0),
      MIN_DEN => CLKFX_MIN_DEN,
      MAX_NUM => choose(HAS_FX, CLKFX_MAX_NUM, 0),
      MAX_DEN => CLKFX_MAX_DEN
    )
    port map (num => state.num, den => state.den, broken => clkfx_is_off);
end architecture;

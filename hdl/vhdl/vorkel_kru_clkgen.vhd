-- The clock primitive KRU_CLKGEN: hdl.md describes its attributes. black box.
--
-- CLKFX has M / D of the frequency of the input, and CLKFXDV a quotient of that.
--
-- The edge of the input with which the lock begins is where all pins but CLKFX180 rise.
library ieee;
use ieee.std_logic_1164.all;
use work.vorkel_model.all;

entity VORKEL_KRU_CLKGEN is
  generic (
    CLKIN_MHZ_NUM : natural := 100;  -- the planned clock, MHz
    CLKIN_MHZ_DEN : positive := 1;
    M : natural := 0;  -- 0: no CLKFX
    D : natural := 0;
    CLKFXDV_DIVIDE_HALVES : natural := 0;  -- 0: no CLKFXDV
    -- The limits of the device, MHz; no maximum where that is 0.
    CLKFX_MIN_NUM : natural := 0;
    CLKFX_MIN_DEN : positive := 1;
    CLKFX_MAX_NUM : natural := 0;
    CLKFX_MAX_DEN : positive := 1;
    CLKFXDV_MIN_NUM : natural := 0;
    CLKFXDV_MIN_DEN : positive := 1;
    CLKFXDV_MAX_NUM : natural := 0;
    CLKFXDV_MAX_DEN : positive := 1;
    -- Of the simulation alone.
    LOCK_CYCLES : positive := 16;
    JITTER_RMS_FS : natural := 0;
    JITTER_SEED : natural := 1
  );
  port (
    CLKIN : in std_logic;
    RST : in std_logic;
    CLKFX : out std_logic;
    CLKFX180 : out std_logic;
    CLKFXDV : out std_logic;
    LOCKED : out std_logic
  );
end entity;

architecture simulation of VORKEL_KRU_CLKGEN is
  -- The parts of a cycle for phases: quarters, and 255ths for PHASE_SHIFT.
  constant STEPS : positive := 1020;
  constant LINE_CYCLES : positive := 1;
  constant HAS_DV : boolean := M /= 0 and CLKFXDV_DIVIDE_HALVES /= 0;
  constant HAS_FX : boolean := M /= 0;
  constant HALVES : positive := choose(HAS_DV, CLKFXDV_DIVIDE_HALVES, 2);
  constant FX_M : positive := choose(HAS_FX, M, 1);
  constant FX_D : positive := choose(HAS_FX and D /= 0, D, 1);

  -- The settings that there are.
  function is_right return boolean is
    variable right : boolean := true;
  begin
    if M /= 0 and (M < 2 or M > 256 or D < 1 or D > 256) then
      report "M is " & integer'image(M) & " and D " & integer'image(D) severity error;
      right := false;
    end if;
    if CLKFXDV_DIVIDE_HALVES /= 0 and CLKFXDV_DIVIDE_HALVES /= 4 and
       CLKFXDV_DIVIDE_HALVES /= 8 and CLKFXDV_DIVIDE_HALVES /= 16 and
       CLKFXDV_DIVIDE_HALVES /= 32 and CLKFXDV_DIVIDE_HALVES /= 64 then
      report "the divide of CLKFXDV is " & integer'image(CLKFXDV_DIVIDE_HALVES) & "/2"
        severity error;
      right := false;
    end if;
    return right;
  end function;

  constant IS_WRONG : boolean := not is_right;

  signal state : input_state;
  signal bad, clkfx_is_off, clkfxdv_is_off : boolean;
begin
  LOCKED <= '1' when state.locked else '0';
  bad <= IS_WRONG or clkfx_is_off or clkfxdv_is_off;

  reference : entity work.vorkel_model_input
    generic map (LOCK_CYCLES => LOCK_CYCLES)
    port map (
      clk => CLKIN, rst => RST, second => '0', planned_num => CLKIN_MHZ_NUM,
      planned_den => CLKIN_MHZ_DEN, bad => bad, state => state
    );

  clkfx_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_FX,
      START => 0,
      PERIOD => 2 * STEPS,
      HIGH => 2 / 2 * STEPS,
      SCALE => LINE_CYCLES * FX_D,
      DENOM => 2 * STEPS * FX_M,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 0
    )
    port map (state => state, clk => CLKFX);

  clkfx180_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_FX,
      START => 2 * STEPS / 4 * 2,
      PERIOD => 2 * STEPS,
      HIGH => 2 / 2 * STEPS,
      SCALE => LINE_CYCLES * FX_D,
      DENOM => 2 * STEPS * FX_M,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 1
    )
    port map (state => state, clk => CLKFX180);

  clkfxdv_output : entity work.vorkel_model_output
    generic map (
      ENABLE => HAS_DV,
      START => 0,
      PERIOD => HALVES * STEPS,
      HIGH => HALVES / 2 * STEPS,
      SCALE => FX_D,
      DENOM => 2 * STEPS * FX_M,
      JITTER_RMS_FS => JITTER_RMS_FS,
      SEED => JITTER_SEED + 2
    )
    port map (state => state, clk => CLKFXDV);

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

  clkfxdv_limit : entity work.vorkel_model_limit
    generic map (
      WHAT => "CLKFXDV",
      MUL => 2 * FX_M,
      DIV => FX_D * HALVES,
      MIN_NUM => choose(HAS_DV, CLKFXDV_MIN_NUM, 0),
      MIN_DEN => CLKFXDV_MIN_DEN,
      MAX_NUM => choose(HAS_DV, CLKFXDV_MAX_NUM, 0),
      MAX_DEN => CLKFXDV_MAX_DEN
    )
    port map (num => state.num, den => state.den, broken => clkfxdv_is_off);
end architecture;

-- The clock primitive TSYN: hdl.md describes its attributes, vorkel_model_loop what it does.
library ieee;
use ieee.std_logic_1164.all;
use work.vorkel_model.all;

entity VORKEL_TSYN is
  generic (
    CLKIN1_MHZ_NUM : natural := 100;  -- the planned clocks, MHz
    CLKIN1_MHZ_DEN : positive := 1;
    CLKIN2_MHZ_NUM : natural := 0;  -- 0: there is none
    CLKIN2_MHZ_DEN : positive := 1;
    BANDWIDTH : string := "OPTIMIZED";
    M_EIGHTHS : positive := 8;
    D : positive := 1;
    CLKOUT0_DIVIDE_EIGHTHS : natural := 0;  -- 0: not used
    CLKOUT0_PHASE_EIGHTHS : integer := 0;  -- of a VCO period
    CLKOUT0_HIGH_HALVES : natural := 0;  -- of a VCO period; 0: 50 percent
    CLKOUT1_DIVIDE_EIGHTHS : natural := 0;
    CLKOUT1_PHASE_EIGHTHS : integer := 0;
    CLKOUT1_HIGH_HALVES : natural := 0;
    CLKOUT2_DIVIDE_EIGHTHS : natural := 0;
    CLKOUT2_PHASE_EIGHTHS : integer := 0;
    CLKOUT2_HIGH_HALVES : natural := 0;
    CLKOUT3_DIVIDE_EIGHTHS : natural := 0;
    CLKOUT3_PHASE_EIGHTHS : integer := 0;
    CLKOUT3_HIGH_HALVES : natural := 0;
    CLKOUT4_DIVIDE_EIGHTHS : natural := 0;
    CLKOUT4_PHASE_EIGHTHS : integer := 0;
    CLKOUT4_HIGH_HALVES : natural := 0;
    CLKOUT5_DIVIDE_EIGHTHS : natural := 0;
    CLKOUT5_PHASE_EIGHTHS : integer := 0;
    CLKOUT5_HIGH_HALVES : natural := 0;
    CLKOUT6_DIVIDE_EIGHTHS : natural := 0;
    CLKOUT6_PHASE_EIGHTHS : integer := 0;
    CLKOUT6_HIGH_HALVES : natural := 0;
    -- The limits of the device, MHz; no maximum where that is 0.
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
    MAX_COUNT : natural := 0;  -- the largest high or low time, VCO periods; 0: any
    -- Of the simulation alone.
    LOCK_CYCLES : positive := 16;
    JITTER_RMS_FS : natural := 0;
    JITTER_SEED : natural := 1
  );
  port (
    CLKIN1 : in std_logic;
    CLKIN2 : in std_logic := '0';
    CLKINSEL : in std_logic := '0';  -- 0: CLKIN1, 1: CLKIN2
    CLKFBIN : in std_logic;
    RST : in std_logic;
    CLKFBOUT : out std_logic;
    CLKOUT0 : out std_logic;
    CLKOUT1 : out std_logic;
    CLKOUT2 : out std_logic;
    CLKOUT3 : out std_logic;
    CLKOUT4 : out std_logic;
    CLKOUT5 : out std_logic;
    CLKOUT6 : out std_logic;
    LOCKED : out std_logic
  );
end entity;

architecture simulation of VORKEL_TSYN is
  signal clkout : std_logic_vector(6 downto 0);
begin
  model : entity work.vorkel_model_loop
    generic map (
      IS_TSYN => true,
      CLKIN1_MHZ_NUM => CLKIN1_MHZ_NUM,
      CLKIN1_MHZ_DEN => CLKIN1_MHZ_DEN,
      CLKIN2_MHZ_NUM => CLKIN2_MHZ_NUM,
      CLKIN2_MHZ_DEN => CLKIN2_MHZ_DEN,
      BANDWIDTH => BANDWIDTH,
      M_EIGHTHS => M_EIGHTHS,
      D => D,
      DIVIDES => (
        CLKOUT0_DIVIDE_EIGHTHS, CLKOUT1_DIVIDE_EIGHTHS, CLKOUT2_DIVIDE_EIGHTHS,
        CLKOUT3_DIVIDE_EIGHTHS, CLKOUT4_DIVIDE_EIGHTHS, CLKOUT5_DIVIDE_EIGHTHS,
        CLKOUT6_DIVIDE_EIGHTHS
      ),
      PHASES => (
        CLKOUT0_PHASE_EIGHTHS, CLKOUT1_PHASE_EIGHTHS, CLKOUT2_PHASE_EIGHTHS,
        CLKOUT3_PHASE_EIGHTHS, CLKOUT4_PHASE_EIGHTHS, CLKOUT5_PHASE_EIGHTHS,
        CLKOUT6_PHASE_EIGHTHS
      ),
      HIGHS => (
        CLKOUT0_HIGH_HALVES, CLKOUT1_HIGH_HALVES, CLKOUT2_HIGH_HALVES,
        CLKOUT3_HIGH_HALVES, CLKOUT4_HIGH_HALVES, CLKOUT5_HIGH_HALVES,
        CLKOUT6_HIGH_HALVES
      ),
      VCO_MIN_NUM => VCO_MIN_NUM,
      VCO_MIN_DEN => VCO_MIN_DEN,
      VCO_MAX_NUM => VCO_MAX_NUM,
      VCO_MAX_DEN => VCO_MAX_DEN,
      PFD_MIN_NUM => PFD_MIN_NUM,
      PFD_MIN_DEN => PFD_MIN_DEN,
      PFD_MAX_NUM => PFD_MAX_NUM,
      PFD_MAX_DEN => PFD_MAX_DEN,
      CLKOUT_MIN_NUM => CLKOUT_MIN_NUM,
      CLKOUT_MIN_DEN => CLKOUT_MIN_DEN,
      CLKOUT_MAX_NUM => CLKOUT_MAX_NUM,
      CLKOUT_MAX_DEN => CLKOUT_MAX_DEN,
      CLKOUT1_MIN_NUM => CLKOUT_MIN_NUM,
      CLKOUT1_MIN_DEN => CLKOUT_MIN_DEN,
      CLKOUT1_MAX_NUM => CLKOUT_MAX_NUM,
      CLKOUT1_MAX_DEN => CLKOUT_MAX_DEN,
      MAX_COUNT => MAX_COUNT,
      LOCK_CYCLES => LOCK_CYCLES,
      JITTER_RMS_FS => JITTER_RMS_FS,
      JITTER_SEED => JITTER_SEED
    )
    port map (
      clkin1 => CLKIN1,
      clkin2 => CLKIN2,
      clkinsel => CLKINSEL,
      clkfbin => CLKFBIN,
      rst => RST,
      clkfbout => CLKFBOUT,
      clkout => clkout,
      locked => LOCKED
    );

  CLKOUT0 <= clkout(0);
  CLKOUT1 <= clkout(1);
  CLKOUT2 <= clkout(2);
  CLKOUT3 <= clkout(3);
  CLKOUT4 <= clkout(4);
  CLKOUT5 <= clkout(5);
  CLKOUT6 <= clkout(6);
end architecture;

// The clock primitive PLL: hdl.md describes its attributes, VORKEL_MODEL_LOOP what it does. To a
// synthesis tool it is a black box.
`timescale 1fs/1fs
`ifdef SYNTHESIS
/* verilator lint_save */
/* verilator lint_off UNUSEDPARAM */  // nothing is in the box
/* verilator lint_off UNUSEDSIGNAL */
/* verilator lint_off UNDRIVEN */
(* blackbox *)
`endif
module VORKEL_PLL #(
    parameter integer CLKIN1_MHZ_NUM = 100,  // the planned clocks, MHz
    parameter integer CLKIN1_MHZ_DEN = 1,
    parameter integer CLKIN2_MHZ_NUM = 0,  // 0: there is none
    parameter integer CLKIN2_MHZ_DEN = 1,
    parameter [8*9-1:0] BANDWIDTH = "OPTIMIZED",
    parameter integer M_EIGHTHS = 8,
    parameter integer D = 1,
    parameter integer CLKOUT0_DIVIDE_EIGHTHS = 0,  // 0: not used
    parameter integer CLKOUT0_PHASE_EIGHTHS = 0,  // of a VCO period
    parameter integer CLKOUT0_HIGH_HALVES = 0,  // of a VCO period; 0: 50 percent
    parameter integer CLKOUT1_DIVIDE_EIGHTHS = 0,
    parameter integer CLKOUT1_PHASE_EIGHTHS = 0,
    parameter integer CLKOUT1_HIGH_HALVES = 0,
    parameter integer CLKOUT2_DIVIDE_EIGHTHS = 0,
    parameter integer CLKOUT2_PHASE_EIGHTHS = 0,
    parameter integer CLKOUT2_HIGH_HALVES = 0,
    parameter integer CLKOUT3_DIVIDE_EIGHTHS = 0,
    parameter integer CLKOUT3_PHASE_EIGHTHS = 0,
    parameter integer CLKOUT3_HIGH_HALVES = 0,
    parameter integer CLKOUT4_DIVIDE_EIGHTHS = 0,
    parameter integer CLKOUT4_PHASE_EIGHTHS = 0,
    parameter integer CLKOUT4_HIGH_HALVES = 0,
    parameter integer CLKOUT5_DIVIDE_EIGHTHS = 0,
    parameter integer CLKOUT5_PHASE_EIGHTHS = 0,
    parameter integer CLKOUT5_HIGH_HALVES = 0,
    parameter integer CLKOUT6_DIVIDE_EIGHTHS = 0,
    parameter integer CLKOUT6_PHASE_EIGHTHS = 0,
    parameter integer CLKOUT6_HIGH_HALVES = 0,
    // The limits of the device, MHz; no maximum where that is 0.
    parameter integer VCO_MIN_NUM = 0,
    parameter integer VCO_MIN_DEN = 1,
    parameter integer VCO_MAX_NUM = 0,
    parameter integer VCO_MAX_DEN = 1,
    parameter integer PFD_MIN_NUM = 0,
    parameter integer PFD_MIN_DEN = 1,
    parameter integer PFD_MAX_NUM = 0,
    parameter integer PFD_MAX_DEN = 1,
    parameter integer CLKOUT_MIN_NUM = 0,
    parameter integer CLKOUT_MIN_DEN = 1,
    parameter integer CLKOUT_MAX_NUM = 0,
    parameter integer CLKOUT_MAX_DEN = 1,
    parameter integer CLKOUT1_MIN_NUM = 0,
    parameter integer CLKOUT1_MIN_DEN = 1,
    parameter integer CLKOUT1_MAX_NUM = 0,
    parameter integer CLKOUT1_MAX_DEN = 1,
    parameter integer MAX_COUNT = 0,  // the largest high or low time, VCO periods; 0: any
    // Of the simulation alone.
    parameter integer LOCK_CYCLES = 16,
    parameter integer JITTER_RMS_FS = 0,
    parameter integer JITTER_SEED = 1
) (
    input wire CLKIN1,
    input wire CLKIN2,
    input wire CLKINSEL,  // 0: CLKIN1, 1: CLKIN2
    input wire CLKFBIN,
    input wire RST,
    output wire CLKFBOUT,
    output wire CLKOUT0,
    output wire CLKOUT1,
    output wire CLKOUT2,
    output wire CLKOUT3,
    output wire CLKOUT4,
    output wire CLKOUT5,
    output wire CLKOUT6,
    output wire LOCKED
);
`ifndef SYNTHESIS
  function [31:0] word;
    input [31:0] number;
    word = number;
  endfunction

  VORKEL_MODEL_LOOP #(
      .IS_TSYN(0),
      .CLKIN1_MHZ_NUM(CLKIN1_MHZ_NUM),
      .CLKIN1_MHZ_DEN(CLKIN1_MHZ_DEN),
      .CLKIN2_MHZ_NUM(CLKIN2_MHZ_NUM),
      .CLKIN2_MHZ_DEN(CLKIN2_MHZ_DEN),
      .BANDWIDTH(BANDWIDTH),
      .M_EIGHTHS(M_EIGHTHS),
      .D(D),
      .DIVIDES({word(CLKOUT6_DIVIDE_EIGHTHS), word(CLKOUT5_DIVIDE_EIGHTHS),
          word(CLKOUT4_DIVIDE_EIGHTHS), word(CLKOUT3_DIVIDE_EIGHTHS),
          word(CLKOUT2_DIVIDE_EIGHTHS), word(CLKOUT1_DIVIDE_EIGHTHS),
          word(CLKOUT0_DIVIDE_EIGHTHS)}),
      .PHASES({word(CLKOUT6_PHASE_EIGHTHS), word(CLKOUT5_PHASE_EIGHTHS),
          word(CLKOUT4_PHASE_EIGHTHS), word(CLKOUT3_PHASE_EIGHTHS),
          word(CLKOUT2_PHASE_EIGHTHS), word(CLKOUT1_PHASE_EIGHTHS),
          word(CLKOUT0_PHASE_EIGHTHS)}),
      .HIGHS({word(CLKOUT6_HIGH_HALVES), word(CLKOUT5_HIGH_HALVES),
          word(CLKOUT4_HIGH_HALVES), word(CLKOUT3_HIGH_HALVES),
          word(CLKOUT2_HIGH_HALVES), word(CLKOUT1_HIGH_HALVES),
          word(CLKOUT0_HIGH_HALVES)}),
      .VCO_MIN_NUM(VCO_MIN_NUM),
      .VCO_MIN_DEN(VCO_MIN_DEN),
      .VCO_MAX_NUM(VCO_MAX_NUM),
      .VCO_MAX_DEN(VCO_MAX_DEN),
      .PFD_MIN_NUM(PFD_MIN_NUM),
      .PFD_MIN_DEN(PFD_MIN_DEN),
      .PFD_MAX_NUM(PFD_MAX_NUM),
      .PFD_MAX_DEN(PFD_MAX_DEN),
      .CLKOUT_MIN_NUM(CLKOUT_MIN_NUM),
      .CLKOUT_MIN_DEN(CLKOUT_MIN_DEN),
      .CLKOUT_MAX_NUM(CLKOUT_MAX_NUM),
      .CLKOUT_MAX_DEN(CLKOUT_MAX_DEN),
      .CLKOUT1_MIN_NUM(CLKOUT1_MIN_NUM),
      .CLKOUT1_MIN_DEN(CLKOUT1_MIN_DEN),
      .CLKOUT1_MAX_NUM(CLKOUT1_MAX_NUM),
      .CLKOUT1_MAX_DEN(CLKOUT1_MAX_DEN),
      .MAX_COUNT(MAX_COUNT),
      .LOCK_CYCLES(LOCK_CYCLES),
      .JITTER_RMS_FS(JITTER_RMS_FS),
      .JITTER_SEED(JITTER_SEED)
  ) loop (
      .clkin1(CLKIN1),
      .clkin2(CLKIN2),
      .clkinsel(CLKINSEL),
      .clkfbin(CLKFBIN),
      .rst(RST),
      .clkfbout(CLKFBOUT),
      .clkout({CLKOUT6, CLKOUT5, CLKOUT4, CLKOUT3, CLKOUT2, CLKOUT1, CLKOUT0}),
      .locked(LOCKED)
  );
`endif
endmodule
`ifdef SYNTHESIS
/* verilator lint_restore */
`endif

// The clock primitive KRU_CLKGEN: hdl.md describes its attributes. To a synthesis tool it is a
// black box.
//
// CLKFX has M / D of the frequency of the input, and CLKFXDV a quotient of that.
//
// The edge of the input with which the lock begins is where all pins but CLKFX180 rise.
`timescale 1fs/1fs
`ifdef SYNTHESIS
/* verilator lint_save */
/* verilator lint_off UNUSEDPARAM */  // nothing is in the box
/* verilator lint_off UNUSEDSIGNAL */
/* verilator lint_off UNDRIVEN */
(* blackbox *)
`endif
module VORKEL_KRU_CLKGEN #(
    parameter integer CLKIN_MHZ_NUM = 100,  // the planned clock, MHz
    parameter integer CLKIN_MHZ_DEN = 1,
    parameter integer M = 0,  // 0: no CLKFX
    parameter integer D = 0,
    parameter integer CLKFXDV_DIVIDE_HALVES = 0,  // 0: no CLKFXDV
    // The limits of the device, MHz; no maximum where that is 0.
    parameter integer CLKFX_MIN_NUM = 0,
    parameter integer CLKFX_MIN_DEN = 1,
    parameter integer CLKFX_MAX_NUM = 0,
    parameter integer CLKFX_MAX_DEN = 1,
    parameter integer CLKFXDV_MIN_NUM = 0,
    parameter integer CLKFXDV_MIN_DEN = 1,
    parameter integer CLKFXDV_MAX_NUM = 0,
    parameter integer CLKFXDV_MAX_DEN = 1,
    // Of the simulation alone.
    parameter integer LOCK_CYCLES = 16,
    parameter integer JITTER_RMS_FS = 0,
    parameter integer JITTER_SEED = 1
) (
    input wire CLKIN,
    input wire RST,
    output wire CLKFX,
    output wire CLKFX180,
    output wire CLKFXDV,
    output wire LOCKED
);
`ifndef SYNTHESIS
  // The parts of a cycle for phases: quarters, and 255ths for PHASE_SHIFT.
  localparam integer STEPS = 1020;
  localparam integer LINE = 1;
  localparam integer HAS_DV = M != 0 && CLKFXDV_DIVIDE_HALVES != 0 ? 1 : 0;
  localparam integer HAS_FX = M != 0 ? 1 : 0;
  localparam integer HALVES = HAS_DV != 0 ? CLKFXDV_DIVIDE_HALVES : 2;
  localparam integer FX_M = HAS_FX != 0 ? M : 1;
  localparam integer FX_D = HAS_FX != 0 ? D : 1;

  wire [63:0] locks;
  wire [63:0] unused_resets;
  wire [63:0] count;
  wire [63:0] stamp;
  wire [63:0] whole;
  wire [63:0] rest;
  wire [63:0] parts;
  wire [63:0] num;
  wire [63:0] den;
  wire clkfx_is_off;
  wire clkfxdv_is_off;
  reg is_wrong;  // a setting is


  VORKEL_MODEL_INPUT #(
      .LOCK_CYCLES(LOCK_CYCLES)
  ) reference (
      .clk(CLKIN),
      .rst(RST),
      .select(1'b0),
      .planned_num(CLKIN_MHZ_NUM),
      .planned_den(CLKIN_MHZ_DEN),
      .bad(clkfx_is_off || clkfxdv_is_off || is_wrong),
      .locked(LOCKED),
      .locks(locks),
      .resets(unused_resets),
      .count(count),
      .stamp(stamp),
      .whole(whole),
      .rest(rest),
      .parts(parts),
      .num(num),
      .den(den)
  );

  generate
    if (HAS_FX != 0) begin : clkfx_used
      VORKEL_MODEL_OUTPUT #(
          .START(0),
          .PERIOD(2 * STEPS),
          .HIGH(2 / 2 * STEPS),
          .SCALE(LINE * FX_D),
          .DENOM(2 * STEPS * FX_M),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 0)
      ) clkfx_output (
          .locked(LOCKED),
          .locks(locks),
          .count(count),
          .stamp(stamp),
          .whole(whole),
          .rest(rest),
          .parts(parts),
          .clk(CLKFX)
      );
    end else begin : clkfx_unused
      assign CLKFX = 1'b0;
    end
    if (HAS_FX != 0) begin : clkfx180_used
      VORKEL_MODEL_OUTPUT #(
          .START(2 * STEPS / 4 * 2),
          .PERIOD(2 * STEPS),
          .HIGH(2 / 2 * STEPS),
          .SCALE(LINE * FX_D),
          .DENOM(2 * STEPS * FX_M),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 1)
      ) clkfx180_output (
          .locked(LOCKED),
          .locks(locks),
          .count(count),
          .stamp(stamp),
          .whole(whole),
          .rest(rest),
          .parts(parts),
          .clk(CLKFX180)
      );
    end else begin : clkfx180_unused
      assign CLKFX180 = 1'b0;
    end
    if (HAS_DV != 0) begin : clkfxdv_used
      VORKEL_MODEL_OUTPUT #(
          .START(0),
          .PERIOD(HALVES * STEPS),
          .HIGH(HALVES / 2 * STEPS),
          .SCALE(FX_D),
          .DENOM(2 * STEPS * FX_M),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 2)
      ) clkfxdv_output (
          .locked(LOCKED),
          .locks(locks),
          .count(count),
          .stamp(stamp),
          .whole(whole),
          .rest(rest),
          .parts(parts),
          .clk(CLKFXDV)
      );
    end else begin : clkfxdv_unused
      assign CLKFXDV = 1'b0;
    end
  endgenerate

  VORKEL_MODEL_LIMIT #(
      .WHAT("CLKFX"),
      .MUL(FX_M),
      .DIV(LINE * FX_D),
      .MIN_NUM(HAS_FX != 0 ? CLKFX_MIN_NUM : 0),
      .MIN_DEN(CLKFX_MIN_DEN),
      .MAX_NUM(HAS_FX != 0 ? CLKFX_MAX_NUM : 0),
      .MAX_DEN(CLKFX_MAX_DEN)
  ) clkfx_limit (
      .num(num),
      .den(den),
      .broken(clkfx_is_off)
  );

  VORKEL_MODEL_LIMIT #(
      .WHAT("CLKFXDV"),
      .MUL(2 * FX_M),
      .DIV(FX_D * HALVES),
      .MIN_NUM(HAS_DV != 0 ? CLKFXDV_MIN_NUM : 0),
      .MIN_DEN(CLKFXDV_MIN_DEN),
      .MAX_NUM(HAS_DV != 0 ? CLKFXDV_MAX_NUM : 0),
      .MAX_DEN(CLKFXDV_MAX_DEN)
  ) clkfxdv_limit (
      .num(num),
      .den(den),
      .broken(clkfxdv_is_off)
  );

  // --- The settings that there are ---

  initial begin
    is_wrong = 1'b0;
    if (M != 0 && (M < 2 || M > 256 || D < 1 || D > 256)) begin
      $display("ERROR: %m: M is %0d and D %0d", M, D);
      is_wrong = 1'b1;
    end
    if (CLKFXDV_DIVIDE_HALVES != 0 && CLKFXDV_DIVIDE_HALVES != 4 && CLKFXDV_DIVIDE_HALVES != 8 &&
        CLKFXDV_DIVIDE_HALVES != 16 && CLKFXDV_DIVIDE_HALVES != 32 &&
        CLKFXDV_DIVIDE_HALVES != 64) begin
      $display("ERROR: %m: the divide of CLKFXDV is %0d/2", CLKFXDV_DIVIDE_HALVES);
      is_wrong = 1'b1;
    end
  end
`endif
endmodule
`ifdef SYNTHESIS
/* verilator lint_restore */
`endif

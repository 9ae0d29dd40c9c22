// The clock primitive KRU_SP: hdl.md describes its attributes. To a synthesis tool it is a black
// box.
//
// Its line has the frequency of the input, or half of it. CLK0 to CLK270 have that, CLK2X twice of
// it, CLKDV a quotient, CLKFX M / D of it; PHASE_SHIFT moves each of them by so many 255ths of its
// own period. Without feedback there are only CLKFX and CLKFX180.
//
// The feedback comes from CLK0 ("1X") or CLK2X ("2X"). Without edges at CLKFB the lock is lost
// until a reset.
//
// The edge of the input with which the lock begins is where CLK0, CLK2X, CLKDV and CLKFX rise, but
// for PHASE_SHIFT.
`timescale 1fs/1fs
`ifdef SYNTHESIS
/* verilator lint_save */
/* verilator lint_off UNUSEDPARAM */  // nothing is in the box
/* verilator lint_off UNUSEDSIGNAL */
/* verilator lint_off UNDRIVEN */
(* blackbox *)
`endif
module VORKEL_KRU_SP #(
    parameter integer CLKIN_MHZ_NUM = 100,  // the planned clock, MHz
    parameter integer CLKIN_MHZ_DEN = 1,
    parameter integer CLKIN_DIVIDE_BY_2 = 0,
    parameter [8*4-1:0] CLK_FEEDBACK = "NONE",  // or 1X, 2X
    parameter integer M = 0,  // 0: no CLKFX
    parameter integer D = 0,
    parameter integer CLKDV_DIVIDE_HALVES = 0,  // 0: no CLKDV
    parameter integer PHASE_SHIFT = 0,
    // The limits of the device, MHz; no maximum where that is 0. CLK180 has those of CLK0, and so
    // on.
    parameter integer CLK0_MIN_NUM = 0,
    parameter integer CLK0_MIN_DEN = 1,
    parameter integer CLK0_MAX_NUM = 0,
    parameter integer CLK0_MAX_DEN = 1,
    parameter integer CLK90_MIN_NUM = 0,
    parameter integer CLK90_MIN_DEN = 1,
    parameter integer CLK90_MAX_NUM = 0,
    parameter integer CLK90_MAX_DEN = 1,
    parameter integer CLK2X_MIN_NUM = 0,
    parameter integer CLK2X_MIN_DEN = 1,
    parameter integer CLK2X_MAX_NUM = 0,
    parameter integer CLK2X_MAX_DEN = 1,
    parameter integer CLKDV_MIN_NUM = 0,
    parameter integer CLKDV_MIN_DEN = 1,
    parameter integer CLKDV_MAX_NUM = 0,
    parameter integer CLKDV_MAX_DEN = 1,
    parameter integer CLKFX_MIN_NUM = 0,
    parameter integer CLKFX_MIN_DEN = 1,
    parameter integer CLKFX_MAX_NUM = 0,
    parameter integer CLKFX_MAX_DEN = 1,
    // Of the simulation alone.
    parameter integer LOCK_CYCLES = 16,
    parameter integer JITTER_RMS_FS = 0,
    parameter integer JITTER_SEED = 1
) (
    input wire CLKIN,
    /* verilator lint_save */
    /* verilator lint_off UNUSEDSIGNAL */  // without feedback nothing looks at it
    input wire CLKFB,
    /* verilator lint_restore */
    input wire RST,
    output wire CLK0,
    output wire CLK90,
    output wire CLK180,
    output wire CLK270,
    output wire CLK2X,
    output wire CLK2X180,
    output wire CLKDV,
    output wire CLKFX,
    output wire CLKFX180,
    output wire LOCKED
);
`ifndef SYNTHESIS
  // The parts of a cycle for phases: quarters, and 255ths for PHASE_SHIFT.
  localparam integer STEPS = 1020;
  localparam integer LINE = CLKIN_DIVIDE_BY_2 != 0 ? 2 : 1;  // cycles of the input
  localparam integer HAS_LINE = CLK_FEEDBACK != "NONE" ? 1 : 0;
  localparam integer HAS_DV = HAS_LINE != 0 && CLKDV_DIVIDE_HALVES != 0 ? 1 : 0;
  localparam integer HAS_FX = M != 0 ? 1 : 0;
  localparam integer HALVES = HAS_DV != 0 ? CLKDV_DIVIDE_HALVES : 2;
  localparam integer FX_M = HAS_FX != 0 ? M : 1;
  localparam integer FX_D = HAS_FX != 0 ? D : 1;

  wire [63:0] locks;
  /* verilator lint_off UNUSEDSIGNAL */  // without feedback nothing looks at it
  wire [63:0] resets;
  /* verilator lint_on UNUSEDSIGNAL */
  wire [63:0] count;
  wire [63:0] stamp;
  wire [63:0] whole;
  wire [63:0] rest;
  wire [63:0] parts;
  wire [63:0] num;
  wire [63:0] den;
  wire clk0_is_off;
  wire clk90_is_off;
  wire clk2x_is_off;
  wire clkdv_is_off;
  wire clkfx_is_off;
  reg is_wrong;  // a setting is
  reg has_no_feedback;


  VORKEL_MODEL_INPUT #(
      .LOCK_CYCLES(LOCK_CYCLES)
  ) reference (
      .clk(CLKIN),
      .rst(RST),
      .select(1'b0),
      .planned_num(CLKIN_MHZ_NUM),
      .planned_den(CLKIN_MHZ_DEN),
      .bad(clk0_is_off || clk90_is_off || clk2x_is_off ||
           clkdv_is_off || clkfx_is_off || is_wrong || has_no_feedback),
      .locked(LOCKED),
      .locks(locks),
      .resets(resets),
      .count(count),
      .stamp(stamp),
      .whole(whole),
      .rest(rest),
      .parts(parts),
      .num(num),
      .den(den)
  );

  generate
    if (HAS_LINE != 0) begin : clk0_used
      VORKEL_MODEL_OUTPUT #(
          .START((4 * 2 * PHASE_SHIFT) % (2 * STEPS)),
          .PERIOD(2 * STEPS),
          .HIGH(2 / 2 * STEPS),
          .SCALE(LINE),
          .DENOM(2 * STEPS),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 0)
      ) clk0_output (
          .locked(LOCKED),
          .locks(locks),
          .count(count),
          .stamp(stamp),
          .whole(whole),
          .rest(rest),
          .parts(parts),
          .clk(CLK0)
      );
    end else begin : clk0_unused
      assign CLK0 = 1'b0;
    end
    if (HAS_LINE != 0) begin : clk90_used
      VORKEL_MODEL_OUTPUT #(
          .START((2 * STEPS / 4 + 4 * 2 * PHASE_SHIFT) % (2 * STEPS)),
          .PERIOD(2 * STEPS),
          .HIGH(2 / 2 * STEPS),
          .SCALE(LINE),
          .DENOM(2 * STEPS),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 1)
      ) clk90_output (
          .locked(LOCKED),
          .locks(locks),
          .count(count),
          .stamp(stamp),
          .whole(whole),
          .rest(rest),
          .parts(parts),
          .clk(CLK90)
      );
    end else begin : clk90_unused
      assign CLK90 = 1'b0;
    end
    if (HAS_LINE != 0) begin : clk180_used
      VORKEL_MODEL_OUTPUT #(
          .START((2 * STEPS / 4 * 2 + 4 * 2 * PHASE_SHIFT) % (2 * STEPS)),
          .PERIOD(2 * STEPS),
          .HIGH(2 / 2 * STEPS),
          .SCALE(LINE),
          .DENOM(2 * STEPS),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 2)
      ) clk180_output (
          .locked(LOCKED),
          .locks(locks),
          .count(count),
          .stamp(stamp),
          .whole(whole),
          .rest(rest),
          .parts(parts),
          .clk(CLK180)
      );
    end else begin : clk180_unused
      assign CLK180 = 1'b0;
    end
    if (HAS_LINE != 0) begin : clk270_used
      VORKEL_MODEL_OUTPUT #(
          .START((2 * STEPS / 4 * 3 + 4 * 2 * PHASE_SHIFT) % (2 * STEPS)),
          .PERIOD(2 * STEPS),
          .HIGH(2 / 2 * STEPS),
          .SCALE(LINE),
          .DENOM(2 * STEPS),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 3)
      ) clk270_output (
          .locked(LOCKED),
          .locks(locks),
          .count(count),
          .stamp(stamp),
          .whole(whole),
          .rest(rest),
          .parts(parts),
          .clk(CLK270)
      );
    end else begin : clk270_unused
      assign CLK270 = 1'b0;
    end
    if (HAS_LINE != 0) begin : clk2x_used
      VORKEL_MODEL_OUTPUT #(
          .START((4 * 2 * PHASE_SHIFT) % (2 * STEPS)),
          .PERIOD(2 * STEPS),
          .HIGH(2 / 2 * STEPS),
          .SCALE(LINE),
          .DENOM(4 * STEPS),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 4)
      ) clk2x_output (
          .locked(LOCKED),
          .locks(locks),
          .count(count),
          .stamp(stamp),
          .whole(whole),
          .rest(rest),
          .parts(parts),
          .clk(CLK2X)
      );
    end else begin : clk2x_unused
      assign CLK2X = 1'b0;
    end
    if (HAS_LINE != 0) begin : clk2x180_used
      VORKEL_MODEL_OUTPUT #(
          .START((2 * STEPS / 4 * 2 + 4 * 2 * PHASE_SHIFT) % (2 * STEPS)),
          .PERIOD(2 * STEPS),
          .HIGH(2 / 2 * STEPS),
          .SCALE(LINE),
          .DENOM(4 * STEPS),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 5)
      ) clk2x180_output (
          .locked(LOCKED),
          .locks(locks),
          .count(count),
          .stamp(stamp),
          .whole(whole),
          .rest(rest),
          .parts(parts),
          .clk(CLK2X180)
      );
    end else begin : clk2x180_unused
      assign CLK2X180 = 1'b0;
    end
    if (HAS_DV != 0) begin : clkdv_used
      VORKEL_MODEL_OUTPUT #(
          .START((4 * HALVES * PHASE_SHIFT) % (HALVES * STEPS)),
          .PERIOD(HALVES * STEPS),
          .HIGH(HALVES / 2 * STEPS),
          .SCALE(LINE),
          .DENOM(2 * STEPS),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 6)
      ) clkdv_output (
          .locked(LOCKED),
          .locks(locks),
          .count(count),
          .stamp(stamp),
          .whole(whole),
          .rest(rest),
          .parts(parts),
          .clk(CLKDV)
      );
    end else begin : clkdv_unused
      assign CLKDV = 1'b0;
    end
    if (HAS_FX != 0) begin : clkfx_used
      VORKEL_MODEL_OUTPUT #(
          .START((4 * 2 * PHASE_SHIFT) % (2 * STEPS)),
          .PERIOD(2 * STEPS),
          .HIGH(2 / 2 * STEPS),
          .SCALE(LINE * FX_D),
          .DENOM(2 * STEPS * FX_M),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 7)
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
          .START((2 * STEPS / 4 * 2 + 4 * 2 * PHASE_SHIFT) % (2 * STEPS)),
          .PERIOD(2 * STEPS),
          .HIGH(2 / 2 * STEPS),
          .SCALE(LINE * FX_D),
          .DENOM(2 * STEPS * FX_M),
          .JITTER_RMS_FS(JITTER_RMS_FS),
          .SEED(JITTER_SEED + 8)
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
  endgenerate

  VORKEL_MODEL_LIMIT #(
      .WHAT("CLK0"),
      .MUL(1),
      .DIV(LINE),
      .MIN_NUM(HAS_LINE != 0 ? CLK0_MIN_NUM : 0),
      .MIN_DEN(CLK0_MIN_DEN),
      .MAX_NUM(HAS_LINE != 0 ? CLK0_MAX_NUM : 0),
      .MAX_DEN(CLK0_MAX_DEN)
  ) clk0_limit (
      .num(num),
      .den(den),
      .broken(clk0_is_off)
  );

  VORKEL_MODEL_LIMIT #(
      .WHAT("CLK90"),
      .MUL(1),
      .DIV(LINE),
      .MIN_NUM(HAS_LINE != 0 ? CLK90_MIN_NUM : 0),
      .MIN_DEN(CLK90_MIN_DEN),
      .MAX_NUM(HAS_LINE != 0 ? CLK90_MAX_NUM : 0),
      .MAX_DEN(CLK90_MAX_DEN)
  ) clk90_limit (
      .num(num),
      .den(den),
      .broken(clk90_is_off)
  );

  VORKEL_MODEL_LIMIT #(
      .WHAT("CLK2X"),
      .MUL(2),
      .DIV(LINE),
      .MIN_NUM(HAS_LINE != 0 ? CLK2X_MIN_NUM : 0),
      .MIN_DEN(CLK2X_MIN_DEN),
      .MAX_NUM(HAS_LINE != 0 ? CLK2X_MAX_NUM : 0),
      .MAX_DEN(CLK2X_MAX_DEN)
  ) clk2x_limit (
      .num(num),
      .den(den),
      .broken(clk2x_is_off)
  );

  VORKEL_MODEL_LIMIT #(
      .WHAT("CLKDV"),
      .MUL(2),
      .DIV(LINE * HALVES),
      .MIN_NUM(HAS_DV != 0 ? CLKDV_MIN_NUM : 0),
      .MIN_DEN(CLKDV_MIN_DEN),
      .MAX_NUM(HAS_DV != 0 ? CLKDV_MAX_NUM : 0),
      .MAX_DEN(CLKDV_MAX_DEN)
  ) clkdv_limit (
      .num(num),
      .den(den),
      .broken(clkdv_is_off)
  );

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

  // --- The settings that there are ---

  initial begin
    is_wrong = 1'b0;
    if (M != 0 && (M < 2 || M > 32 || D < 1 || D > 32)) begin
      $display("ERROR: %m: M is %0d and D %0d", M, D);
      is_wrong = 1'b1;
    end
    if (CLKDV_DIVIDE_HALVES != 0 &&
        (CLKDV_DIVIDE_HALVES < 4 || CLKDV_DIVIDE_HALVES > 34 ||
         (CLKDV_DIVIDE_HALVES > 16 && CLKDV_DIVIDE_HALVES % 2 != 0))) begin
      $display("ERROR: %m: the divide of CLKDV is %0d/2", CLKDV_DIVIDE_HALVES);
      is_wrong = 1'b1;
    end
    if (PHASE_SHIFT < 0 || PHASE_SHIFT > 255) begin
      $display("ERROR: %m: PHASE_SHIFT is %0d", PHASE_SHIFT);
      is_wrong = 1'b1;
    end
    if (CLK_FEEDBACK != "NONE" && CLK_FEEDBACK != "1X" && CLK_FEEDBACK != "2X") begin
      $display("ERROR: %m: CLK_FEEDBACK is none of NONE, 1X and 2X");
      is_wrong = 1'b1;
    end
  end

  // --- The feedback ---

  initial has_no_feedback = 1'b0;
  generate
    if (HAS_LINE != 0) begin : watch
      localparam [63:0] FEEDBACK_CYCLES = 64'd8;
      reg [63:0] returned;  // edges
      reg [63:0] session;
      reg [63:0] returned_before;
      reg [63:0] from;
      reg [63:0] resets_before;

      initial returned = 64'd0;
      initial forever begin
        @(posedge CLKFB);
        returned = returned + 64'd1;
      end

      initial forever begin
        wait (LOCKED && !has_no_feedback);
        session = locks;
        returned_before = returned;
        from = count;
        wait (!LOCKED || locks != session || count >= from + FEEDBACK_CYCLES);
        if (LOCKED && locks == session && returned == returned_before) begin
          $display("ERROR: %m: no edge comes back at CLKFB, at %0d fs", $time);
          has_no_feedback = 1'b1;
          resets_before = resets;
          wait (resets != resets_before);
          has_no_feedback = 1'b0;
        end
      end
    end
  endgenerate
`endif
endmodule
`ifdef SYNTHESIS
/* verilator lint_restore */
`endif

// PLL and TSYN in simulation:
//
//   input -> / D -> detector (PFD) -> VCO -> / divider of each output -> outputs
//                      ^-- / M --------|
//
// All edges are places between those of the input, on a grid of sixteenths of a VCO period, of
// which 2 M_EIGHTHS / D are one cycle of the input. The edge of the input with which the lock
// begins is the place 0: there all outputs with a phase of 0 rise, and later ones by their phase;
// each begins with a whole high time.
//
// The feedback, CLKFBOUT to CLKFBIN, has the frequency of the detector. Without edges there the
// lock is lost until a reset.
`ifndef SYNTHESIS
`timescale 1fs/1fs
module VORKEL_MODEL_LOOP #(
    parameter integer IS_TSYN = 0,
    parameter integer CLKIN1_MHZ_NUM = 0,
    parameter integer CLKIN1_MHZ_DEN = 1,
    parameter integer CLKIN2_MHZ_NUM = 0,
    parameter integer CLKIN2_MHZ_DEN = 1,
    parameter [8*9-1:0] BANDWIDTH = "OPTIMIZED",
    parameter integer M_EIGHTHS = 8,
    parameter integer D = 1,
    // Of each output 32 bits, those of output 0 the lowest.
    parameter [7*32-1:0] DIVIDES = 0,
    parameter [7*32-1:0] PHASES = 0,
    parameter [7*32-1:0] HIGHS = 0,
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
    parameter integer MAX_COUNT = 0,
    parameter integer LOCK_CYCLES = 16,
    parameter integer JITTER_RMS_FS = 0,
    parameter integer JITTER_SEED = 1
) (
    input wire clkin1,
    input wire clkin2,
    input wire clkinsel,
    input wire clkfbin,
    input wire rst,
    output wire clkfbout,
    output wire [6:0] clkout,
    output wire locked
);
  // A whole number in 64 bits.
  function [63:0] wide;
    input [31:0] number;
    wide = {32'd0, number};
  endfunction

  localparam integer LARGEST_DIVIDE = MAX_COUNT == 0 || MAX_COUNT > 64 ? 128 : 2 * MAX_COUNT;

  wire clk = clkinsel ? clkin2 : clkin1;
  wire [31:0] planned_num = clkinsel ? CLKIN2_MHZ_NUM : CLKIN1_MHZ_NUM;
  wire [31:0] planned_den = clkinsel ? CLKIN2_MHZ_DEN : CLKIN1_MHZ_DEN;

  wire [63:0] locks;
  wire [63:0] resets;
  wire [63:0] count;
  wire [63:0] stamp;
  wire [63:0] whole;
  wire [63:0] rest;
  wire [63:0] parts;
  wire [63:0] num;
  wire [63:0] den;
  wire vco_is_off;
  wire pfd_is_off;
  wire [6:0] output_is_off;
  reg is_wrong;     // a setting is
  reg has_no_feedback;

  VORKEL_MODEL_INPUT #(
      .LOCK_CYCLES(LOCK_CYCLES)
  ) reference (
      .clk(clk),
      .rst(rst),
      .select(clkinsel),
      .planned_num(planned_num),
      .planned_den(planned_den),
      .bad(vco_is_off || pfd_is_off || output_is_off != 7'd0 || is_wrong || has_no_feedback),
      .locked(locked),
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

  VORKEL_MODEL_LIMIT #(
      .WHAT("VCO"),
      .MUL(M_EIGHTHS),
      .DIV(8 * D),
      .MIN_NUM(VCO_MIN_NUM),
      .MIN_DEN(VCO_MIN_DEN),
      .MAX_NUM(VCO_MAX_NUM),
      .MAX_DEN(VCO_MAX_DEN)
  ) vco_limit (
      .num(num),
      .den(den),
      .broken(vco_is_off)
  );

  VORKEL_MODEL_LIMIT #(
      .WHAT("PFD"),
      .MUL(1),
      .DIV(D),
      .MIN_NUM(PFD_MIN_NUM),
      .MIN_DEN(PFD_MIN_DEN),
      .MAX_NUM(PFD_MAX_NUM),
      .MAX_DEN(PFD_MAX_DEN)
  ) pfd_limit (
      .num(num),
      .den(den),
      .broken(pfd_is_off)
  );

  VORKEL_MODEL_OUTPUT #(
      .SCALE(D)
  ) feedback (
      .locked(locked),
      .locks(locks),
      .count(count),
      .stamp(stamp),
      .whole(whole),
      .rest(rest),
      .parts(parts),
      .clk(clkfbout)
  );

  genvar i;
  generate
    for (i = 0; i < 7; i = i + 1) begin : outputs
      localparam integer DIVIDE = DIVIDES[32*i+:32];
      localparam integer PHASE = PHASES[32*i+:32];
      localparam integer HALVES = HIGHS[32*i+:32];
      if (DIVIDE == 0) begin : unused
        assign clkout[i] = 1'b0;
        assign output_is_off[i] = 1'b0;
      end else begin : used
        VORKEL_MODEL_OUTPUT #(
            .START((2 * PHASE % (2 * DIVIDE) + 2 * DIVIDE) % (2 * DIVIDE)),
            .PERIOD(2 * DIVIDE),
            .HIGH(HALVES != 0 ? 8 * HALVES : DIVIDE),
            .SCALE(D),
            .DENOM(2 * M_EIGHTHS),
            .JITTER_RMS_FS(JITTER_RMS_FS),
            .SEED(JITTER_SEED + i)
        ) divider (
            .locked(locked),
            .locks(locks),
            .count(count),
            .stamp(stamp),
            .whole(whole),
            .rest(rest),
            .parts(parts),
            .clk(clkout[i])
        );
        VORKEL_MODEL_LIMIT #(
            .WHAT("the output"),
            .MUL(M_EIGHTHS),
            .DIV(D * DIVIDE),
            .MIN_NUM(i == 1 ? CLKOUT1_MIN_NUM : CLKOUT_MIN_NUM),
            .MIN_DEN(i == 1 ? CLKOUT1_MIN_DEN : CLKOUT_MIN_DEN),
            .MAX_NUM(i == 1 ? CLKOUT1_MAX_NUM : CLKOUT_MAX_NUM),
            .MAX_DEN(i == 1 ? CLKOUT1_MAX_DEN : CLKOUT_MAX_DEN)
        ) limit (
            .num(num),
            .den(den),
            .broken(output_is_off[i])
        );
      end
    end
  endgenerate

  // --- The settings that there are ---

  integer at;
  integer used;
  integer divide;
  integer phase;
  integer halves;
  reg is_fraction;
  reg is_off;

  // Fractions of eighths are those of a TSYN with up to five outputs; beside them nothing moves.
  task check_output;
    begin
      is_off = (divide != 8 && divide < 16) || divide > 8 * LARGEST_DIVIDE;
      if (divide % 8 != 0 && (at != 0 || IS_TSYN == 0 || used > 5)) is_off = 1'b1;
      if (is_fraction && (phase != 0 || halves != 0)) is_off = 1'b1;
      if (halves != 0 && divide == 8 && halves != 1) is_off = 1'b1;
      if (halves != 0 && divide != 8 && (halves < 2 || halves > divide / 4 - 1)) is_off = 1'b1;
      if (halves != 0 && MAX_COUNT != 0 && divide > 8 &&
          (halves > 2 * MAX_COUNT + 1 || divide / 4 - halves > 2 * MAX_COUNT)) is_off = 1'b1;
    end
  endtask

  initial begin
    is_wrong = 1'b0;
    has_no_feedback = 1'b0;
    used = 0;
    for (at = 0; at < 7; at = at + 1) begin
      divide = DIVIDES[32*at+:32];
      if (divide != 0) used = used + 1;
    end
    if (M_EIGHTHS < 8 || M_EIGHTHS > 512 || (M_EIGHTHS % 8 != 0 && (IS_TSYN == 0 || used > 5)) ||
        (IS_TSYN != 0 && M_EIGHTHS > 8 && M_EIGHTHS < 40)) begin
      $display("ERROR: %m: M is %0d/8", M_EIGHTHS);
      is_wrong = 1'b1;
    end
    if (D < 1 || D > 80) begin
      $display("ERROR: %m: D is %0d", D);
      is_wrong = 1'b1;
    end
    if (BANDWIDTH != "LOW" && BANDWIDTH != "HIGH" && BANDWIDTH != "OPTIMIZED") begin
      $display("ERROR: %m: the bandwidth is none of LOW, HIGH and OPTIMIZED");
      is_wrong = 1'b1;
    end
    is_fraction = M_EIGHTHS % 8 != 0 || DIVIDES[2:0] != 3'd0;
    for (at = 0; at < 7; at = at + 1) begin
      divide = DIVIDES[32*at+:32];
      phase = PHASES[32*at+:32];
      halves = HIGHS[32*at+:32];
      is_off = 1'b0;
      if (divide != 0) check_output;
      if (is_off) begin
        $display("ERROR: %m: output %0d: divide %0d/8, phase %0d/8, high time %0d/2", at, divide,
                 phase, halves);
        is_wrong = 1'b1;
      end
    end
  end

  // --- The feedback ---

  localparam [63:0] FEEDBACK_CYCLES = 64'd4 * wide(D);
  reg [63:0] returned;  // edges
  reg [63:0] session;
  reg [63:0] returned_before;
  reg [63:0] from;
  reg [63:0] resets_before;

  initial returned = 64'd0;
  initial forever begin
    @(posedge clkfbin);
    returned = returned + 64'd1;
  end

  initial forever begin
    wait (locked && !has_no_feedback);
    session = locks;
    returned_before = returned;
    from = count;
    wait (!locked || locks != session || count >= from + FEEDBACK_CYCLES);
    if (locked && locks == session && returned == returned_before) begin
      $display("ERROR: %m: no edge comes back at CLKFBIN, at %0d fs", $time);
      has_no_feedback = 1'b1;
      resets_before = resets;
      wait (resets != resets_before);
      has_no_feedback = 1'b0;
    end
  end
endmodule
`endif

// Holds the edges of a clock against their exact times, for testbenches.
//
// The clock has RATIO_NUM / RATIO_DEN cycles in one of the input, which has a frequency of MHZ_NUM
// / MHZ_DEN MHz. A cycle has SHAPE_DEN parts: the clock rises with part PHASE, counted from the
// edge of the input at which `run` rises, and is high for HIGH parts. Each edge may be off by 1 fs,
// not more: by as much as the rounding of that edge and of the one of the input before it. RISES
// rising edges are looked at, with the falling ones behind them. When `run` falls there must have
// been all.
//
// `source_time` and `source_rest` are those of a VORKEL_CLOCK_SOURCE.
`ifndef SYNTHESIS
`timescale 1fs/1fs
module VORKEL_CLOCK_CHECK #(
    parameter integer INDEX = 0,  // of the output, for what is printed
    parameter integer MHZ_NUM = 100,
    parameter integer MHZ_DEN = 1,
    parameter integer RATIO_NUM = 1,
    parameter integer RATIO_DEN = 1,
    parameter integer SHAPE_DEN = 2,
    parameter integer PHASE = 0,
    parameter integer HIGH = 1,
    parameter integer RISES = 100
) (
    input wire clk,
    input wire run,
    input wire [63:0] source_time,
    input wire [63:0] source_rest,
    output reg is_done,  // all edges have come
    output reg is_wrong  // one was not where it should be
);
  // A whole number in 64 bits.
  function [63:0] wide;
    input [31:0] number;
    wide = {32'd0, number};
  endfunction

  localparam [63:0] NUM = wide(RATIO_NUM);
  localparam [63:0] SHAPE = wide(SHAPE_DEN);
  localparam [63:0] IN_US = 64'd1_000_000_000 * wide(MHZ_DEN);
  localparam [63:0] IN_PARTS = wide(MHZ_NUM);
  // The part of a cycle, whole + rest / PARTS fs.
  localparam [63:0] PARTS = IN_PARTS * NUM * SHAPE;
  localparam [63:0] IN_WHOLE = (IN_US / IN_PARTS) * wide(RATIO_DEN);
  localparam [63:0] ALL_REST =
      (IN_WHOLE % (NUM * SHAPE)) * IN_PARTS + (IN_US % IN_PARTS) * wide(RATIO_DEN);
  localparam [63:0] PART_WHOLE = IN_WHOLE / (NUM * SHAPE) + ALL_REST / PARTS;
  localparam [63:0] PART_REST = ALL_REST % PARTS;
  localparam integer MOST_PRINTED = 3;

  reg [63:0] whole;  // the next edge: whole + rest / PARTS fs
  reg [63:0] rest;
  reg [63:0] high_whole;
  reg [63:0] high_rest;
  reg [63:0] low_whole;
  reg [63:0] low_rest;
  integer faults;
  reg is_active;
  reg [63:0] last;  // the latest edge before the start
  integer rises;
  reg [63:0] begun;
  reg [63:0] first;
  reg [63:0] rise;
  reg [63:0] high;

  initial begin
    is_wrong = 1'b0;
    faults = 0;
    is_done = 1'b0;
    is_active = 1'b0;
    last = 64'hFFFF_FFFF_FFFF_FFFF;
    rises = 0;
    high = 64'd0;
  end

  task advance;
    input [63:0] by_whole;
    input [63:0] by_rest;
    begin
      whole = whole + by_whole;
      rest = rest + by_rest;
      while (rest >= PARTS) begin
        rest = rest - PARTS;
        whole = whole + 64'd1;
      end
    end
  endtask

  // From the beginning so many parts of a cycle; one by one, for their rests can be too large to be
  // multiplied.
  task measure;
    input integer by;
    begin
      whole = 64'd0;
      rest = 64'd0;
      repeat (by) advance(PART_WHOLE, PART_REST);
    end
  endtask

  task fault;
    begin
      is_wrong = 1'b1;
      faults = faults + 1;
      if (faults <= MOST_PRINTED) begin
        $display("output %0d: edge %0d %0s at %0d fs, not at %0d + %0d/%0d fs", INDEX, rises,
                 clk ? "up" : "down", $time, whole, rest, PARTS);
      end
    end
  endtask

  task take_edge;
    begin
      if ($time > whole + 64'd1 || $time + (rest == 64'd0 ? 64'd1 : 64'd0) < whole) fault;
      if (clk) begin
        rise = $time;
        if (rises == 0) first = $time;
        rises = rises + 1;
        advance(high_whole, high_rest);
      end else begin
        high = high + $time - rise;
        advance(low_whole, low_rest);
        if (rises == RISES) begin
          is_active = 1'b0;
          is_done = 1'b1;
        end
      end
    end
  endtask

  initial forever begin
    @(clk);
    if (is_active) take_edge;
    else last = $time;
  end

  real period;
  real phase;
  real duty;

  task report_figures;
    begin
      period = rise - first;
      period = period / (rises - 1);
      phase = first - begun;
      duty = high;
      $display("output %0d: %0d rising edges, period %0.6f ps, phase %0.4f degrees, duty %0.4f %%",
               INDEX, rises, period / 1000.0, 360.0 * phase / period,
               100.0 * duty / rises / period);
    end
  endtask

  initial begin
    measure(HIGH);
    high_whole = whole;
    high_rest = rest;
    measure(SHAPE_DEN - HIGH);
    low_whole = whole;
    low_rest = rest;
    wait (run);
    begun = $time;
    measure(PHASE);
    advance(source_time, source_rest * NUM * SHAPE);
    is_active = 1'b1;
    if (last == $time && clk) take_edge;
    wait (!run);
    if (!is_done) begin
      is_wrong = 1'b1;
      $display("output %0d: %0d of %0d rising edges", INDEX, rises, RISES);
    end
    if (rises > 1) report_figures;
  end
endmodule
`endif

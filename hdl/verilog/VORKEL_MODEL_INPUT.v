// The input of a clock primitive: its period, and whether the primitive is locked to it.
//
// A period that is within 1 fs of the planned one is taken for that, exactly: an edge can come only
// at a whole femtosecond. Any other is taken as it is measured, cycle by cycle. So the outputs
// follow the clock that there is.
//
// The edges are counted from that with which the lock begins, which is edge 0. The lock is lost
// with a reset, with another input, when no edge comes for some periods, and while the period
// breaks a limit of the device (`bad`).
`ifndef SYNTHESIS
`timescale 1fs/1fs
module VORKEL_MODEL_INPUT #(
    parameter integer LOCK_CYCLES = 16
) (
    input wire clk,
    input wire rst,
    input wire select,              // a change begins from the start
    input wire [31:0] planned_num,  // MHz; 0: nothing is planned
    input wire [31:0] planned_den,
    input wire bad,
    output reg locked,
    output reg [63:0] locks,  // how many there have been
    output reg [63:0] resets,
    output reg [63:0] count,  // of the latest edge
    output reg [63:0] stamp,  // its time, fs
    output reg [63:0] whole,  // the period: whole + rest / parts fs
    output reg [63:0] rest,
    output reg [63:0] parts,
    output reg [63:0] num,    // the frequency, num / den MHz; 0 while it is not known
    output reg [63:0] den
);
  // A whole number in 64 bits.
  function [63:0] wide;
    input [31:0] number;
    wide = {32'd0, number};
  endfunction

  localparam [63:0] FS_IN_US = 64'd1_000_000_000;
  localparam [63:0] UNKNOWN_SPAN = FS_IN_US;
  localparam [63:0] PIECES = 64'd64;
  localparam [63:0] LOCK_EDGES = wide(LOCK_CYCLES);

  wire [63:0] plan_num = wide(planned_num);
  wire [63:0] plan_den = wide(planned_den);
  wire has_plan = planned_num != 32'd0;
  wire [63:0] plan_whole = has_plan ? FS_IN_US * plan_den / plan_num : 64'd0;
  // What may pass between the first edge and the second.
  wire [63:0] span = 64'd2 * plan_whole > UNKNOWN_SPAN ? 64'd2 * plan_whole : UNKNOWN_SPAN;
  wire [63:0] plan_rest = has_plan ? FS_IN_US * plan_den % plan_num : 64'd0;

  reg selected;
  reg [63:0] edges;    // since the start
  reg [63:0] total;    // since ever
  reg [63:0] good;     // periods in a row that break no limit
  reg [63:0] stops;    // how often the input has stopped
  reg [63:0] stopped;  // those that have been dealt with
  reg [63:0] measured;
  reg [63:0] seen;
  reg [63:0] pieces;

  initial begin
    locked = 1'b0;
    locks = 64'd0;
    resets = 64'd0;
    count = 64'd0;
    stamp = 64'd0;
    whole = 64'd0;
    rest = 64'd0;
    parts = 64'd1;
    num = 64'd0;
    den = 64'd1;
    selected = 1'b0;
    edges = 64'd0;
    total = 64'd0;
    good = 64'd0;
    stops = 64'd0;
    stopped = 64'd0;
  end

  task take_period;
    begin
      if (has_plan && measured <= plan_whole + 64'd1 &&
          measured + (plan_rest == 64'd0 ? 64'd1 : 64'd0) >= plan_whole) begin
        whole = plan_whole;
        rest = plan_rest;
        parts = plan_num;
        num = plan_num;
        den = plan_den;
      end else begin
        whole = measured;
        rest = 64'd0;
        parts = 64'd1;
        num = FS_IN_US;
        den = measured;
      end
    end
  endtask

  task take_edge;
    begin
      measured = $time - stamp;
      if (edges != 64'd0 && measured != 64'd0) begin
        take_period;
        good = bad ? 64'd0 : good + 64'd1;
      end
      stamp = $time;
      edges = edges + 64'd1;
      total = total + 64'd1;
      count = count + 64'd1;
      if (bad) begin
        locked = 1'b0;
      end else if (!locked && good >= LOCK_EDGES) begin
        count = 64'd0;
        locks = locks + 64'd1;
        locked = 1'b1;
      end
    end
  endtask

  initial forever begin
    @(posedge clk or posedge rst or select or stops);
    if (rst || select != selected || stops != stopped) begin
      locked = 1'b0;
      good = 64'd0;
      edges = 64'd0;
      num = 64'd0;
      if (rst) resets = resets + 64'd1;
      selected = select;
      stopped = stops;
    end else begin
      take_edge;
    end
  end

  // Looks every two periods whether there has been an edge. Before there is a period it waits for
  // longer, since the clock may be slower than the planned one.
  initial forever begin
    wait (edges != 64'd0);
    seen = total;
    if (edges > 64'd1) begin
      #(64'd2 * whole);
    end else begin
      pieces = 64'd0;
      while (edges == 64'd1 && pieces < PIECES) begin
        #(span / PIECES);
        pieces = pieces + 64'd1;
      end
    end
    if (total == seen && edges != 64'd0) stops = stops + 64'd1;
  end
endmodule
`endif

// An output of a clock primitive: edges at exact places between those of the input.
//
// A place is a number of units, of which DENOM / SCALE are one cycle of the input. Rising edges are
// at START, START + PERIOD, ...; falling ones HIGH units after them. What is carried from edge to
// edge are whole cycles and a remainder in parts of a cycle, both whole numbers: nothing is rounded
// but the time of each edge by itself, to the nearest femtosecond, counted from the edge of the
// input before it.
//
// With jitter each edge moves by a normal deviate of its own, which is never more than half of the
// shorter of high and low time, nor more than a cycle of the input. The uniform deviates are those
// of P. L'Ecuyer, "Efficient and portable combined random number generators", Communications of the
// ACM 31(6), 1988, as the VHDL package math_real has them; two of them make a normal one (G. Box,
// M. Muller, 1958).
`ifndef SYNTHESIS
`timescale 1fs/1fs
module VORKEL_MODEL_OUTPUT #(
    parameter integer START = 0,   // from 0 to below PERIOD
    parameter integer PERIOD = 2,
    parameter integer HIGH = 1,
    parameter integer SCALE = 1,
    parameter integer DENOM = 2,
    parameter integer JITTER_RMS_FS = 0,
    parameter integer SEED = 1
) (
    input wire locked,
    input wire [63:0] locks,
    input wire [63:0] count,
    input wire [63:0] stamp,
    input wire [63:0] whole,
    input wire [63:0] rest,
    input wire [63:0] parts,
    output wire clk
);
  // A whole number in 64 bits.
  function [63:0] wide;
    input [31:0] number;
    wide = {32'd0, number};
  endfunction

  localparam [63:0] UNIT = wide(SCALE);
  localparam [63:0] CYCLE = wide(DENOM);
  localparam [63:0] FIRST = wide(START) * UNIT;
  localparam [63:0] UP = wide(HIGH) * UNIT;
    localparam [63:0] DOWN = wide(PERIOD - HIGH) * UNIT;
  localparam [63:0] UP_CYCLES = UP / CYCLE;
  localparam [63:0] UP_PART = UP % CYCLE;
  localparam [63:0] DOWN_CYCLES = DOWN / CYCLE;
  localparam [63:0] DOWN_PART = DOWN % CYCLE;
  localparam [63:0] SHORTER = UP < DOWN ? UP : DOWN;
  // With jitter an edge is planned a cycle before.
  localparam real MOST_MOVE = 2.0e9;  // fs, what an integer holds
  localparam [63:0] LEAD = JITTER_RMS_FS != 0 ? 64'd1 : 64'd0;

  reg level;
  reg [63:0] session;  // the lock that this clock belongs to
  reg [63:0] cycle;    // the next edge: cycles of the input,
  reg [63:0] part;     // and parts of one
  reg [63:0] target;   // its time
  integer move;

  // The time of a part of a cycle from its beginning, to the nearest femtosecond.
  function [63:0] time_of;
    input [63:0] of_cycle;
    reg [63:0] product;
    reg [63:0] above;
    reg [63:0] below;
    begin
      product = whole * of_cycle;
      above = (product % CYCLE) * parts + rest * of_cycle;
      below = parts * CYCLE;
      time_of = product / CYCLE + (64'd2 * above + below) / (64'd2 * below);
    end
  endfunction

  integer one;
  integer two;
  real uniform;
  real radius;
  real spread;
  real most;
  real cycle_span;

  task draw_uniform;
    integer high;
    begin
      high = one / 53668;
      one = 40014 * (one - high * 53668) - high * 12211;
      if (one < 0) one = one + 2147483563;
      high = two / 52774;
      two = 40692 * (two - high * 52774) - high * 3791;
      if (two < 0) two = two + 2147483399;
      high = one - two;
      if (high < 1) high = high + 2147483562;
      uniform = high;
      uniform = uniform * 4.656613e-10;
    end
  endtask

  task draw_move;
    begin
      draw_uniform;
      radius = $sqrt(-2.0 * $ln(uniform));
      draw_uniform;
      spread = JITTER_RMS_FS;
      spread = spread * radius * $cos(6.283185307179586 * uniform);
      cycle_span = whole;
      most = SHORTER;
      most = most * cycle_span / DENOM / 2.0 - 1.0;
      if (most > cycle_span) most = cycle_span;
      if (most > MOST_MOVE) most = MOST_MOVE;
      if (spread > most) spread = most;
      if (spread < -most) spread = -most;
      move = $rtoi(spread < 0.0 ? spread - 0.5 : spread + 0.5);
    end
  endtask

  // By cycles of the input and by parts of one, less than one.
  task advance;
    input [63:0] cycles;
    input [63:0] parts_of_one;
    begin
      cycle = cycle + cycles;
      part = part + parts_of_one;
      if (part >= CYCLE) begin
        part = part - CYCLE;
        cycle = cycle + 64'd1;
      end
    end
  endtask

  task aim;
    begin
      target = stamp + time_of(part);
      if (LEAD != 64'd0) begin
        // From here to the cycle: one, or more when it is a late one.
        target = target + (cycle - count) * whole + rest * (cycle - count) / parts;
        draw_move;
        target = target + {{32{move[31]}}, move};
      end
    end
  endtask

  initial begin
    level = 1'b0;
    session = 64'd0;
    move = 0;
    one = SEED % 2147483562 + 1;
    two = SEED % 2147483398 + 1;
    repeat (16) draw_uniform;
  end

  assign clk = level && locked && session == locks;

  initial forever begin
    level = 1'b0;
    wait (locked && session != locks);
    session = locks;
    cycle = 64'd0;
    part = 64'd0;
    advance(FIRST / CYCLE, FIRST % CYCLE);
    while (locked && session == locks) begin
      wait (session != locks || !locked || count + LEAD >= cycle);
      if (locked && session == locks) begin
        aim;
        if (target > $time) #(target - $time);
        level = !level;
        if (level) advance(UP_CYCLES, UP_PART);
        else advance(DOWN_CYCLES, DOWN_PART);
      end
    end
  end
endmodule
`endif

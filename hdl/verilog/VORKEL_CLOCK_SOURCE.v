// A clock of an exact frequency for testbenches: MHZ_NUM / MHZ_DEN MHz, high for half of the time.
// It begins with a rising edge when `enable` rises. Each edge is at the femtosecond that is nearest
// to its exact time; the remainder is carried, so that nothing accumulates.
`ifndef SYNTHESIS
`timescale 1fs/1fs
module VORKEL_CLOCK_SOURCE #(
    parameter integer MHZ_NUM = 100,
    parameter integer MHZ_DEN = 1
) (
    input wire enable,
    output reg clk,
    // The exact time of the latest rising edge: edge_time + edge_rest / MHZ_NUM fs.
    output reg [63:0] edge_time,
    output reg [63:0] edge_rest
);
  // A whole number in 64 bits.
  function [63:0] wide;
    input [31:0] number;
    wide = {32'd0, number};
  endfunction

  localparam [63:0] PARTS = 64'd2 * wide(MHZ_NUM);  // of a femtosecond
  localparam [63:0] HALF = 64'd1_000_000_000 * wide(MHZ_DEN);  // of a period, in such parts

  reg [63:0] whole;  // the next edge: whole + rest / PARTS
  reg [63:0] rest;
  reg [63:0] nearest;

  initial begin
    clk = 1'b0;
    edge_time = 64'd0;
    edge_rest = 64'd0;
  end

  initial forever begin
    clk = 1'b0;
    wait (enable);
    whole = $time;
    rest = 64'd0;
    while (enable) begin
      if (!clk) begin
        edge_time = whole;
        edge_rest = rest / 64'd2;
      end
      clk = !clk;
      rest = rest + HALF;
      whole = whole + rest / PARTS;
      rest = rest % PARTS;
      nearest = whole + (rest >= PARTS / 64'd2 ? 64'd1 : 64'd0);
      #(nearest - $time);
    end
  end
endmodule
`endif

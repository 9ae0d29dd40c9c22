// A limit of the device: a frequency of a clock primitive must be from a minimum to a maximum. What
// breaks it is told once, when it begins. Frequencies are quotients, MHz, and compared exactly.
`ifndef SYNTHESIS
`timescale 1fs/1fs
module VORKEL_MODEL_LIMIT #(
    parameter WHAT = "clock",
    parameter integer MUL = 1,  // how many times of the input
    parameter integer DIV = 1,
    parameter integer MIN_NUM = 0,
    parameter integer MIN_DEN = 1,
    parameter integer MAX_NUM = 0,  // 0: there is none
    parameter integer MAX_DEN = 1
) (
    input wire [63:0] num,  // of the input; 0: not known
    input wire [63:0] den,
    output reg broken
);
  // A whole number in 64 bits.
  function [63:0] wide;
    input [31:0] number;
    wide = {32'd0, number};
  endfunction

  wire [63:0] above = num * wide(MUL);
  wire [63:0] below = den * wide(DIV);

  // Whether a / b < c / d, without products: by the whole parts, and where these are equal by the
  // rests, turned over.
  function is_less;
    input [63:0] a0;
    input [63:0] b0;
    input [63:0] c0;
    input [63:0] d0;
    reg [63:0] a;
    reg [63:0] b;
    reg [63:0] c;
    reg [63:0] d;
    reg [63:0] left;
    reg [63:0] right;
    reg known;
    begin
      a = a0;
      b = b0;
      c = c0;
      d = d0;
      is_less = 1'b0;
      known = 1'b0;
      while (!known) begin
        left = a % b;
        right = c % d;
        if (a / b != c / d) begin
          is_less = a / b < c / d;
          known = 1'b1;
        end else if (left == 64'd0 || right == 64'd0) begin
          is_less = right != 64'd0;
          known = 1'b1;
        end else begin
          a = d;
          c = b;
          b = right;
          d = left;
        end
      end
    end
  endfunction

  reg too_low;
  reg too_high;
  real mhz;
  real bound;

  initial broken = 1'b0;

  initial forever begin
    @(num or den);
    too_low = 1'b0;
    too_high = 1'b0;
    if (num != 64'd0) begin
      too_low = is_less(above, below, wide(MIN_NUM), wide(MIN_DEN));
      too_high = MAX_NUM != 0 && is_less(wide(MAX_NUM), wide(MAX_DEN), above, below);
    end
    if (!broken && too_low) begin
      mhz = above;
      mhz = mhz / below;
      bound = MIN_NUM;
      bound = bound / MIN_DEN;
      $display("ERROR: %m: %0s is at %0f MHz, below %0f MHz, at %0d fs", WHAT, mhz, bound, $time);
    end
    if (!broken && too_high) begin
      mhz = above;
      mhz = mhz / below;
      bound = MAX_NUM;
      bound = bound / MAX_DEN;
      $display("ERROR: %m: %0s is at %0f MHz, above %0f MHz, at %0d fs", WHAT, mhz, bound, $time);
    end
    broken = too_low || too_high;
  end
endmodule
`endif

// Counts pixels and frames with clocks from a crystal of 27 MHz.
`timescale 1ns/1ps
module video (
    input wire crystal,
    input wire reset,
    output reg [11:0] pixel,
    output reg [11:0] half
);
  wire clk_pixel;
  wire clk_half;
  wire unused_clk;
  wire unused_locked;

  video_clocks clocks (
      .clk_in1(crystal),
      .rst(reset),
      .clk_out0(clk_pixel),
      .clk_out1(clk_half),
      .clk_out2(unused_clk),
      .locked(unused_locked)
  );

  always @(posedge clk_pixel or posedge reset)
    if (reset) pixel <= 12'd0;
    else pixel <= pixel + 12'd1;

  always @(posedge clk_half or posedge reset)
    if (reset) half <= 12'd0;
    else half <= half + 12'd1;
endmodule

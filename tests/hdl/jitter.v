// Three PLLs with a jitter of 10 ps rms, two of them with the same seed: 27 MHz times 33 is 891
// MHz, and a twelfth of that 74.25 MHz. What it prints is compared with that of the model in VHDL.
`timescale 1fs/1fs
module jitter;
  reg enable;
  wire clk;
  wire [63:0] edge_time;
  wire [63:0] edge_rest;
  wire [2:0] fb;
  wire [2:0] clk0;
  wire [2:0] locked;
  reg [63:0] base;

  VORKEL_CLOCK_SOURCE #(
      .MHZ_NUM(27)
  ) source (
      .enable(enable),
      .clk(clk),
      .edge_time(edge_time),
      .edge_rest(edge_rest)
  );

  genvar g;
  generate
    for (g = 0; g < 3; g = g + 1) begin : plls
      VORKEL_PLL #(
          .CLKIN1_MHZ_NUM(27),
          .M_EIGHTHS(264),
          .CLKOUT0_DIVIDE_EIGHTHS(96),
          .JITTER_RMS_FS(10000),
          .JITTER_SEED(g == 2 ? 2026 : 1)
      ) pll (
          .CLKIN1(clk),
          .CLKIN2(1'b0),
          .CLKINSEL(1'b0),
          .CLKFBIN(fb[g]),
          .RST(1'b0),
          .CLKFBOUT(fb[g]),
          .CLKOUT0(clk0[g]),
          .CLKOUT1(),
          .CLKOUT2(),
          .CLKOUT3(),
          .CLKOUT4(),
          .CLKOUT5(),
          .CLKOUT6(),
          .LOCKED(locked[g])
      );
      integer n;
      real off;
      real sum;
      real squares;
      initial begin
        n = 0;
        sum = 0.0;
        squares = 0.0;
        // The first edges cannot be early: they come with the lock.
        wait (locked[g]);
        repeat (3) @(posedge clk0[g]);
        repeat (4000) begin
          @(posedge clk0[g]);
          n = n + 1;
          // A cycle of 74.25 MHz is 10^9 / 74.25 fs; n + 2 of them have gone by.
          off = $time - base;
          off = off - (n + 2) * 1.0e9 / 74.25;
          sum = sum + off;
          squares = squares + off * off;
          if (n <= 5) $display("%0d: edge %0d at %0d", g, n, $time);
        end
        $display("%0d: mean %0.0f, rms %0.0f", g, sum / 4000.0, $sqrt(squares / 4000.0));
      end
    end
  endgenerate

  initial begin
    wait (locked[0]);
    base = $time;
  end

  initial begin
    enable = 1'b0;
    #1;
    enable = 1'b1;
    #(64'd70_000_000_000);
    $finish;
  end
endmodule

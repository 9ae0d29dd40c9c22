// A PLL on the way through all that can happen to it. 100 MHz times 8 is 800 MHz, a fourth of which
// is clk0; the VCO goes from 380 to 1000 MHz. Says PASS when nothing was wrong. Times are in fs.
`timescale 1fs/1fs
module course;
  localparam [63:0] PS = 64'd1000;

  reg clk;
  reg rst;
  reg runs;
  reg is_through;
  reg [63:0] half;
  wire fb;
  wire clk0;
  wire clk1;
  wire [4:0] unused;
  wire locked;

  VORKEL_PLL #(
      .CLKIN1_MHZ_NUM(100),
      .CLKIN1_MHZ_DEN(1),
      .M_EIGHTHS(64),
      .CLKOUT0_DIVIDE_EIGHTHS(32),
      .CLKOUT1_DIVIDE_EIGHTHS(64),
      .CLKOUT1_PHASE_EIGHTHS(-16),
      .CLKOUT1_HIGH_HALVES(4),
      .VCO_MIN_NUM(380),
      .VCO_MAX_NUM(1000)
  ) pll (
      .CLKIN1(clk),
      .CLKIN2(1'b0),
      .CLKINSEL(1'b0),
      .CLKFBIN(fb),
      .RST(rst),
      .CLKFBOUT(fb),
      .CLKOUT0(clk0),
      .CLKOUT1(clk1),
      .CLKOUT2(unused[0]),
      .CLKOUT3(unused[1]),
      .CLKOUT4(unused[2]),
      .CLKOUT5(unused[3]),
      .CLKOUT6(unused[4]),
      .LOCKED(locked)
  );

  integer wrong;
  integer edges0;
  integer edges1;
  reg [63:0] from;
  reg [63:0] rise0;
  reg [63:0] rise1;
  integer i;

  initial forever begin
    @(posedge clk0);
    edges0 = edges0 + 1;
    rise0 = $time;
  end
  initial forever begin
    @(posedge clk1);
    edges1 = edges1 + 1;
    rise1 = $time;
  end

  // The clock rises when it is let run, and then every 2 x half.
  initial forever begin
    clk = 1'b0;
    wait (runs);
    while (runs) begin
      clk = 1'b1;
      #(half);
      clk = 1'b0;
      #(half);
    end
  end

  task expect_that;
    input condition;
    input [8*40-1:0] what;
    begin
      if (!condition) begin
        $display("not so at %0d fs: %0s", $time, what);
        wrong = wrong + 1;
      end
    end
  endtask

  // Where what is waited for does not come.
  initial begin
    #(64'd1000_000_000 * PS);
    if (!is_through) begin
      $display("LATE");
      $finish(1);
    end
  end

  initial begin
    is_through = 1'b0;
    wrong = 0;
    edges0 = 0;
    edges1 = 0;
    rst = 1'b0;
    runs = 1'b0;
    half = 64'd5000 * PS;
    #(64'd1000 * PS);

    // Sixteen good periods after the first edge.
    from = $time;
    runs = 1'b1;
    wait (locked);
    expect_that($time - from == 64'd160_000 * PS, "lock after 16 periods");
    #1;
    expect_that(edges0 == 1 && rise0 == $time - 64'd1, "clk0 rises with the lock");
    expect_that(edges1 == 0, "clk1 does not yet");
    // Two eighths of its 8 VCO periods of 1250 ps before the next cycle.
    #(64'd7499 * PS);
    expect_that(edges1 == 0, "clk1 not before its phase");
    #(64'd2 * PS);
    expect_that(edges1 == 1 && rise1 - from == 64'd167_500 * PS, "clk1 at its phase");
    expect_that(clk1, "clk1 is high");
    #(64'd2500 * PS);
    expect_that(!clk1, "clk1 is high for 2 VCO periods");

    // The input stops: the lock is lost within four periods, and the outputs are low.
    wait (clk);
    runs = 1'b0;
    #(64'd40_001 * PS);
    expect_that(!locked && !clk0 && !clk1, "no lock without an input");
    edges0 = 0;
    #(64'd1000_000 * PS);
    expect_that(edges0 == 0, "and no edges");

    // It comes back with less than half of the planned 100 MHz: 48, which are 384 of the VCO.
    half = 64'd10_416_666;
    runs = 1'b1;
    #(64'd18 * 64'd2 * half);
    expect_that(locked, "lock below half of the planned clock");
    wait (!clk);
    wait (clk);
    #(half / 64'd2);
    edges0 = 0;
    #(64'd100 * 64'd2 * half);
    expect_that(locked && edges0 == 200, "twice its edges");

    // It stops again.
    wait (clk);
    runs = 1'b0;
    #(64'd84_000 * PS);
    expect_that(!locked, "no lock without it");
    half = 64'd5000 * PS;

    // It comes back as it was.
    from = $time;
    runs = 1'b1;
    wait (locked);
    expect_that($time - from == 64'd160_000 * PS, "lock again after 16 periods");

    // 40 MHz are 320 MHz of the VCO.
    half = 64'd12_500 * PS;
    #(64'd100_000 * PS);
    expect_that(!locked && !clk0, "no lock below the range of the VCO");
    #(64'd1000_000 * PS);
    expect_that(!locked, "and none later");

    // 80 MHz are 640: a clock that was not planned is followed. The first period that is good ends
    // with the second edge.
    half = 64'd6250 * PS;
    #(64'd1000_000 * PS);
    expect_that(locked, "lock in the range");
    wait (!clk);
    wait (clk);
    #(half / 64'd2);
    edges0 = 0;
    edges1 = 0;
    #(64'd100 * 64'd2 * half);
    expect_that(edges0 == 200 && edges1 == 100, "twice and once the edges of the input");

    // A period of 12,347.001 ps, half of it 6173.5005.
    wait (clk);
    wait (!clk);
    half = 64'd6_173_500;
    #(half);
    for (i = 0; i < 100; i = i + 1) begin
      wait (clk);
      from = $time;
      #1;
      expect_that(i < 2 || rise0 == from, "clk0 rises with the input");
      #(half + 64'd1);
      expect_that(i < 2 || rise0 == from + half, "and in the middle of its cycle");
      wait (!clk);
    end

    // A reset takes the lock away at once.
    rst = 1'b1;
    #1;
    expect_that(!locked && !clk0 && !clk1, "no lock while there is a reset");
    #(64'd1000_000 * PS);
    expect_that(!locked, "however long");
    rst = 1'b0;
    #(64'd18 * 64'd2 * half);
    expect_that(locked, "lock after it");

    is_through = 1'b1;
    $display("%0s", wrong == 0 ? "PASS" : "FAIL");
    $finish;
  end
endmodule

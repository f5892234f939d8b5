// Plays a status read, a write and a read of one small core, and compares every bit that comes back.
`default_nettype none
`timescale 1ns / 1ps

module worked_example #(
    parameter EDGE_CAPTURE = 0
);

  reg        tck = 0, capture = 0, shift = 0, tdi = 0, clk = 0;
  wire       tdo;
  reg        async_in = 1'b0;
  reg  [1:0] sync_in = 2'b10;  // since power-up: no activity
  wire [1:0] async_out;
  wire       sync_out;

  wire [30:0] to_core;
  wire [6:0]  from_core;

  qor_hub hub (
      .tck(tck), .sel(1'b1), .capture(capture), .shift(shift), .tdi(tdi), .tdo(tdo),
      .to_cores(to_core), .from_cores(from_core)
  );

  qor_vio_core #(
      .ASYNC_IN(1), .SYNC_IN(2), .ASYNC_OUT(2), .SYNC_OUT(1), .EDGE_CAPTURE(EDGE_CAPTURE)
  ) core (
      .tck(tck), .to_core(to_core), .from_core(from_core),
      .clk(clk), .async_in(async_in), .sync_in(sync_in), .async_out(async_out), .sync_out(sync_out)
  );

  always #2 clk = ~clk;  // somewhat faster than TCK

  integer failures = 0;

  task expect_number(input [8*40:1] what, input [235:0] number, input [235:0] expected);
    if (number !== expected) begin
      $display("%0s: %h, expected %h", what, number, expected);
      failures = failures + 1;
    end
  endtask

  task pulse_tck;
    begin
      #5 tck = 1;
      #5 tck = 0;
    end
  endtask

  // A DR scan, bit 0 first, as a TAP makes it: TDO is sampled at the falling edge. TCK runs in Capture-DR and
  // Shift-DR only, and once more in Exit1-DR.
  task scan(input integer bits, input [235:0] out, output [235:0] in);
    integer i;
    begin
      in = 0;
      capture = 1;
      pulse_tck;
      capture = 0;
      shift = 1;
      for (i = 0; i < bits; i = i + 1) begin
        in[i] = tdo;
        tdi = out[i];
        pulse_tck;
        if (i == 110) expect_number("async outputs at the last bit of a write", async_out, before);
        if (i == 111) expect_number("async outputs a TCK later", async_out, after);
      end
      shift = 0;
      pulse_tck;
    end
  endtask

  reg [1:0]   before = 2'b00, after = 2'b00;  // async outputs, of a scan
  reg [235:0] in;

  initial begin
    #100;
    scan(236, 236'hFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFEB263E808004401, in);
    expect_number("status", in, 236'h00E23A6595000010002000200010000100000A0951D0000000000000001);

    after = 2'b01;
    scan(161, 161'h1FFFFFFFFFFFFDA199DEA400012BC70B9B0004409, in);
    expect_number("write", in, 161'h0010BBCD327A00000000000000000000000000001);

    before = 2'b01;

    // Two inputs rise, and one falls.
    async_in = 1'b1;
    sync_in = 2'b01;
    #100;
    scan(124, 124'hFFFFFFFFFFFFFFFFEBB79116C00440D, in);
    expect_number("read", in, 124'h00AC9466D8CD0AD0000000000000001);

    if (failures != 0) $fatal(1, "FAIL: %0d numbers differ", failures);
    $display("PASS");
    $finish;
  end

endmodule

`default_nettype wire

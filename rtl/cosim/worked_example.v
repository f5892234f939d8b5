// Plays a status read, a write and a read of one small core, and compares every number that comes back.
`default_nettype none
`timescale 1ns / 1ps

module worked_example #(
    parameter EDGE_CAPTURE = 0
);

  reg        tck = 0, capture = 0, shift = 0, update = 0, tdi = 0, clk = 0;
  wire       tdo;
  reg        async_in = 1'b0;
  reg  [1:0] sync_in = 2'b10;  // since power-up: no activity
  wire [1:0] async_out;
  wire       sync_out;

  wire [46:0] to_core;
  wire [6:0]  from_core;

  qor_hub hub (
      .tck(tck), .sel(1'b1), .capture(capture), .shift(shift), .update(update), .tdi(tdi), .tdo(tdo),
      .to_cores(to_core), .from_cores(from_core)
  );

  qor_vio_core #(
      .ASYNC_IN(1), .SYNC_IN(2), .ASYNC_OUT(2), .SYNC_OUT(1), .EDGE_CAPTURE(EDGE_CAPTURE)
  ) core (
      .tck(tck), .to_core(to_core), .from_core(from_core),
      .clk(clk), .async_in(async_in), .sync_in(sync_in), .async_out(async_out), .sync_out(sync_out)
  );

  integer failures = 0;

  task expect_number(input [8*24:1] what, input [159:0] number, input [159:0] expected);
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

  // A DR scan, bit 0 first, as a TAP makes it: TDO is sampled at the falling edge.
  task scan(input integer bits, input [159:0] out, output [159:0] in);
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
      end
      shift = 0;
      pulse_tck;  // Exit1-DR
      update = 1;
      pulse_tck;
      update = 0;
    end
  endtask

  // Eight TCKs in Run-Test/Idle, each with a tick of the design clock.
  task idle(output [7:0] train);
    integer i;
    for (i = 0; i < 8; i = i + 1) begin
      pulse_tck;
      #1 clk = 1;
      #1 clk = 0;
      train[i] = sync_out;
    end
  endtask

  reg [159:0] in;
  reg [7:0]   train;

  initial begin
    idle(train);

    scan(26, 160'h3C1E001, in);
    idle(train);
    scan(160, 160'h07F7F07FFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFF, in);
    expect_number("status", in, 160'hE2E0000010002000200010000100000A0951A000);
    idle(train);

    expect_number("outputs at power-up", {async_out, sync_out}, 3'b000);
    scan(47, 160'h623F90400011, in);
    expect_number("async outputs at the update", async_out, 2'b01);
    idle(train);
    scan(32, 160'h07F7F07F, in);
    expect_number("after the write", in, 160'h897EA020);
    idle(train);

    // Two inputs rise, and one falls.
    async_in = 1'b1;
    sync_in = 2'b01;
    scan(26, 160'h307ECC1, in);
    idle(train);
    scan(48, 160'hB27C407FFFFF, in);
    expect_number("read", in, 160'h5F72CD0AA030);
    idle(train);
    scan(32, 160'h07F7F07F, in);
    expect_number("after the acknowledgement", in, 160'hEC2BA040);

    if (failures != 0) $fatal(1, "FAIL: %0d numbers differ", failures);
    $display("PASS");
    $finish;
  end

endmodule

`default_nettype wire

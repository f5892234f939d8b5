// One device with one VIO core of any widths, whose ports are the bench's.
//
// What the simulated core does in its design clock n happens here in clock n + 2: pulse trains start two clocks later,
// and a snapshot shows what the inputs were two clocks later.
`default_nettype none

module qor_bench_top #(
    parameter ASYNC_IN = 8,
    parameter SYNC_IN = 8,
    parameter ASYNC_OUT = 8,
    parameter SYNC_OUT = 8,
    parameter EDGE_CAPTURE = 0,
    parameter GATED = 0,  // the core's TCK runs in Capture-DR and Shift-DR of its own user chain only
    parameter MAJOR = 10,
    parameter MINOR = 0
) (
    input  wire tck,
    input  wire tms,
    input  wire tdi,
    output wire tdo,
    input  wire clk,

    input  wire [ASYNC_IN == 0 ? 0 : ASYNC_IN-1 : 0]   async_in,
    input  wire [SYNC_IN == 0 ? 0 : SYNC_IN-1 : 0]     sync_in,
    output wire [ASYNC_OUT == 0 ? 0 : ASYNC_OUT-1 : 0] async_out,
    output wire [SYNC_OUT == 0 ? 0 : SYNC_OUT-1 : 0]   sync_out
);

  wire [3:0] user_sel;
  wire       capture, shift, hub_tdo;
  wire       unused = &{1'b0, user_sel[3:1]};

  qor_tap #(
      .IDCODE(32'h0A5F1093), .IR_LENGTH(6)
  ) tap (
      .tck(tck), .tms(tms), .tdi(tdi), .tdo(tdo), .user_sel(user_sel), .capture(capture), .shift(shift),
      .user_tdo({3'b000, hub_tdo})
  );

  reg  enable = 1'b0;
  wire hub_tck = tck & (GATED == 0 | enable);
  always @(negedge tck) enable <= user_sel[0] & (capture | shift);

  qor_vio #(
      .ASYNC_IN(ASYNC_IN), .SYNC_IN(SYNC_IN), .ASYNC_OUT(ASYNC_OUT), .SYNC_OUT(SYNC_OUT),
      .EDGE_CAPTURE(EDGE_CAPTURE), .MAJOR(MAJOR), .MINOR(MINOR)
  ) vio (
      .tck(hub_tck), .sel(user_sel[0]), .capture(capture), .shift(shift), .tdi(tdi), .tdo(hub_tdo),
      .clk(clk), .async_in(async_in), .sync_in(sync_in), .async_out(async_out), .sync_out(sync_out)
  );

endmodule

`default_nettype wire

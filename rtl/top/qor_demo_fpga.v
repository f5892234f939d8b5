// A device with two cores on user chain 1: a VIO core, whose outputs come back as inputs, and one of another type.
`default_nettype none

module qor_demo_fpga (
    input  wire tck,
    input  wire tms,
    input  wire tdi,
    output wire tdo,
    input  wire clk
);

  localparam WIDTH = 8;

  wire [3:0]       user_sel;
  wire             capture, shift, hub_tdo;
  wire             unused = &{1'b0, user_sel[3:1]};
  wire [30:0]      to_cores;
  wire [6:0]       from_core0, from_core1;
  wire [WIDTH-1:0] async_loop, sync_loop;

  qor_tap #(
      .IDCODE(32'h0A5F1093), .IR_LENGTH(6)
  ) tap (
      .tck(tck), .tms(tms), .tdi(tdi), .tdo(tdo), .user_sel(user_sel), .capture(capture), .shift(shift),
      .user_tdo({3'b000, hub_tdo})
  );

  qor_hub #(
      .CORES(2)
  ) hub (
      .tck(tck), .sel(user_sel[0]), .capture(capture), .shift(shift), .tdi(tdi), .tdo(hub_tdo),
      .to_cores(to_cores), .from_cores({from_core1, from_core0})
  );

  qor_vio_core #(
      .INDEX(0), .ASYNC_IN(WIDTH), .SYNC_IN(WIDTH), .ASYNC_OUT(WIDTH), .SYNC_OUT(WIDTH)
  ) core0 (
      .tck(tck), .to_core(to_cores), .from_core(from_core0), .clk(clk),
      .async_in(async_loop), .sync_in(sync_loop), .async_out(async_loop), .sync_out(sync_loop)
  );

  qor_other_core #(
      .INDEX(1), .TYPE(7)
  ) core1 (
      .tck(tck), .to_core(to_cores), .from_core(from_core1)
  );

endmodule

`default_nettype wire

// A TAP on four pins and a core with WIDTH bits of every port, for a trial of place and route: inputs come from a
// shift register, and outputs are folded, so that two more pins do.
`default_nettype none

module qor_pnr_top #(
    parameter WIDTH = 8
) (
    input  wire tck,
    input  wire tms,
    input  wire tdi,
    output wire tdo,
    input  wire clk,
    input  wire in,
    output wire out
);

  wire             user_tck, sel, capture, shift, user_tdi, user_tdo;
  wire [WIDTH-1:0] async_out, sync_out;
  reg  [WIDTH-1:0] async_in = 0, sync_in = 0, async_seen = 0, sync_seen = 0;

  qor_four_pins user (
      .pin_tck(tck), .pin_tms(tms), .pin_tdi(tdi), .pin_tdo(tdo),
      .tck(user_tck), .sel(sel), .capture(capture), .shift(shift), .tdi(user_tdi), .tdo(user_tdo)
  );

  qor_vio #(
      .ASYNC_IN(WIDTH), .SYNC_IN(WIDTH), .ASYNC_OUT(WIDTH), .SYNC_OUT(WIDTH)
  ) vio (
      .tck(user_tck), .sel(sel), .capture(capture), .shift(shift), .tdi(user_tdi), .tdo(user_tdo),
      .clk(clk), .async_in(async_in), .sync_in(sync_in), .async_out(async_out), .sync_out(sync_out)
  );

  always @(posedge clk) begin
    {sync_in, async_in} <= {sync_in[WIDTH-2:0], async_in, in};
    sync_seen <= sync_out ^ {sync_seen[WIDTH-2:0], async_seen[WIDTH-1]};
  end
  always @(posedge tck) async_seen <= async_out ^ {async_seen[WIDTH-2:0], 1'b0};

  assign out = sync_seen[WIDTH-1];

endmodule

`default_nettype wire

// A device with a VIO core of an older version, whose inputs count design clocks.
`default_nettype none

module qor_demo_cpld (
    input  wire tck,
    input  wire tms,
    input  wire tdi,
    output wire tdo,
    input  wire clk
);

  wire [3:0] user_sel;
  wire       capture, shift, hub_tdo;
  wire [3:0] async_out, sync_out;
  wire       unused = &{1'b0, user_sel[3:1], async_out, sync_out};

  // The simulated core has no synchronisers: what happens in its design clock happens here two clocks later. A count
  // that is two clocks late reads the same.
  reg [15:0] count = 16'd0, late = 16'd0, later = 16'd0;
  always @(posedge clk) begin
    count <= count + 16'd1;
    late <= count;
    later <= late;
  end

  qor_tap #(
      .IDCODE(32'h1234567B), .IR_LENGTH(8)
  ) tap (
      .tck(tck), .tms(tms), .tdi(tdi), .tdo(tdo), .user_sel(user_sel), .capture(capture), .shift(shift),
      .user_tdo({3'b000, hub_tdo})
  );

  qor_vio #(
      .MAJOR(6), .MINOR(1), .ASYNC_IN(16), .SYNC_IN(16), .ASYNC_OUT(4), .SYNC_OUT(4)
  ) vio (
      .tck(tck), .sel(user_sel[0]), .capture(capture), .shift(shift), .tdi(tdi), .tdo(hub_tdo),
      .clk(clk), .async_in(later), .sync_in(later), .async_out(async_out), .sync_out(sync_out)
  );

endmodule

`default_nettype wire

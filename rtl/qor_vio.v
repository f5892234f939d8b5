// A hub with one VIO core, for designs that need no more on a user chain.
`default_nettype none

module qor_vio #(
    parameter ASYNC_IN = 0,  // as those of qor_vio_core
    parameter SYNC_IN = 0,
    parameter ASYNC_OUT = 0,
    parameter SYNC_OUT = 0,
    parameter EDGE_CAPTURE = 0,
    parameter MANUFACTURER = 8'h51,
    parameter MAJOR = 10,
    parameter MINOR = 0,
    parameter REVISION = 0,
    parameter CG_MAJOR = 1,
    parameter CG_MINOR = 0,
    parameter CG_MINOR_ALPHA = 0
) (
    input  wire tck,  // the user register's
    input  wire sel,
    input  wire capture,
    input  wire shift,
    input  wire tdi,
    output wire tdo,

    input  wire                                         clk,        // design clock
    input  wire [ASYNC_IN == 0 ? 0 : ASYNC_IN-1 : 0]   async_in,
    input  wire [SYNC_IN == 0 ? 0 : SYNC_IN-1 : 0]     sync_in,    // synchronous to clk
    output wire [ASYNC_OUT == 0 ? 0 : ASYNC_OUT-1 : 0] async_out,  // changes on TCK
    output wire [SYNC_OUT == 0 ? 0 : SYNC_OUT-1 : 0]   sync_out    // synchronous to clk
);

  wire [30:0] to_core;
  wire [6:0]  from_core;

  qor_hub #(
      .CORES(1)
  ) hub (
      .tck(tck), .sel(sel), .capture(capture), .shift(shift), .tdi(tdi), .tdo(tdo),
      .to_cores(to_core), .from_cores(from_core)
  );

  qor_vio_core #(
      .INDEX(0), .ASYNC_IN(ASYNC_IN), .SYNC_IN(SYNC_IN), .ASYNC_OUT(ASYNC_OUT), .SYNC_OUT(SYNC_OUT),
      .EDGE_CAPTURE(EDGE_CAPTURE), .MANUFACTURER(MANUFACTURER), .MAJOR(MAJOR), .MINOR(MINOR), .REVISION(REVISION),
      .CG_MAJOR(CG_MAJOR), .CG_MINOR(CG_MINOR), .CG_MINOR_ALPHA(CG_MINOR_ALPHA)
  ) core (
      .tck(tck), .to_core(to_core), .from_core(from_core), .clk(clk),
      .async_in(async_in), .sync_in(sync_in), .async_out(async_out), .sync_out(sync_out)
  );

endmodule

`default_nettype wire

// A device with two cores on user chain 1: a VIO core, whose outputs come back as inputs, and one of another type.
`default_nettype none

module qor_demo_fpga #(
    parameter REGISTER = ""  // a primitive of ../families or "gated", modelled in ../cosim; or a TAP on four pins
) (
    input  wire tck,
    input  wire tms,
    input  wire tdi,
    output wire tdo,
    input  wire clk
);

  localparam WIDTH = 8;

  wire             user_tck, sel, capture, shift, user_tdi, user_tdo;
  wire [30:0]      to_cores;
  wire [6:0]       from_core0, from_core1;
  wire [WIDTH-1:0] async_loop, sync_loop;

  /* verilator lint_off WIDTH */  // names of different lengths are compared
  generate
    if (REGISTER == "JTAGG") begin : jtagg
      qor_jtagg #(
          .PRIMITIVE(REGISTER)
      ) user (
          .pin_tck(tck), .pin_tms(tms), .pin_tdi(tdi), .pin_tdo(tdo),
          .tck(user_tck), .sel(sel), .capture(capture), .shift(shift), .tdi(user_tdi), .tdo(user_tdo)
      );
    end else if (REGISTER == "EG_PHY_CONFIG") begin : eg_phy_config
      wire unused;
      qor_jtagg #(
          .PRIMITIVE(REGISTER)
      ) user (
          .pin_tck(1'b0), .pin_tms(1'b0), .pin_tdi(1'b0), .pin_tdo(unused),
          .tck(user_tck), .sel(sel), .capture(capture), .shift(shift), .tdi(user_tdi), .tdo(user_tdo)
      );
      assign tdo = user.eg_phy_config.register.pin_tdo;
    end else if (REGISTER == "BSCANE2") begin : bscane2
      qor_bscan user (
          .tck(user_tck), .sel(sel), .capture(capture), .shift(shift), .tdi(user_tdi), .tdo(user_tdo)
      );
      assign tdo = user.register.pin_tdo;
    end else if (REGISTER == "gated") begin : gated
      wire register_tck, register_select, register_shift, register_tdi, register_tdo;
      gated_register register (
          .gated_tck(register_tck), .select(register_select), .shift(register_shift), .tdi(register_tdi),
          .tdo(register_tdo)
      );
      qor_user_register #(
          .CAPTURE(0)
      ) adapter (
          .register_tck(register_tck), .register_select(register_select), .register_capture(1'b0),
          .register_shift(register_shift), .register_enable(register_select), .register_tdi(register_tdi),
          .register_tdo(register_tdo),
          .tck(user_tck), .sel(sel), .capture(capture), .shift(shift), .tdi(user_tdi), .tdo(user_tdo)
      );
      assign tdo = register.pin_tdo;
    end else begin : four_pins
      qor_four_pins user (
          .pin_tck(tck), .pin_tms(tms), .pin_tdi(tdi), .pin_tdo(tdo),
          .tck(user_tck), .sel(sel), .capture(capture), .shift(shift), .tdi(user_tdi), .tdo(user_tdo)
      );
    end
  endgenerate
  /* verilator lint_on WIDTH */

  qor_hub #(
      .CORES(2)
  ) hub (
      .tck(user_tck), .sel(sel), .capture(capture), .shift(shift), .tdi(user_tdi), .tdo(user_tdo),
      .to_cores(to_cores), .from_cores({from_core1, from_core0})
  );

  qor_vio_core #(
      .INDEX(0), .ASYNC_IN(WIDTH), .SYNC_IN(WIDTH), .ASYNC_OUT(WIDTH), .SYNC_OUT(WIDTH)
  ) core0 (
      .tck(user_tck), .to_core(to_cores), .from_core(from_core0), .clk(clk),
      .async_in(async_loop), .sync_in(sync_loop), .async_out(async_loop), .sync_out(sync_loop)
  );

  qor_other_core #(
      .INDEX(1), .TYPE(7)
  ) core1 (
      .tck(user_tck), .to_core(to_cores), .from_core(from_core1)
  );

endmodule

`default_nettype wire

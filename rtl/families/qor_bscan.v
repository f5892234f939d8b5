// The user register BSCANE2: TCK, SEL, CAPTURE, SHIFT, TDI and TDO of one chain, which JTAG_CHAIN chooses.
//
// Its description leaves open whether tools put TCK on a clock net by themselves: place a clock buffer if they say that
// they do not.
`default_nettype none

module qor_bscan #(
    parameter CHAIN = 1  // USER1 to USER4
) (
    output wire tck,
    output wire sel,
    output wire capture,
    output wire shift,
    output wire tdi,
    input  wire tdo
);

  wire register_tck, register_sel, register_capture, register_shift, register_tdi, register_tdo;

  // Most ports are not needed.
  /* verilator lint_off PINMISSING */
  BSCANE2 #(
      .JTAG_CHAIN(CHAIN)
  ) register (
      .TCK(register_tck), .SEL(register_sel), .CAPTURE(register_capture), .SHIFT(register_shift),
      .TDI(register_tdi), .TDO(register_tdo)
  );
  /* verilator lint_on PINMISSING */

  qor_user_register adapter (
      .register_tck(register_tck), .register_select(register_sel), .register_capture(register_capture),
      .register_shift(register_shift), .register_enable(1'b1), .register_tdi(register_tdi),
      .register_tdo(register_tdo),
      .tck(tck), .sel(sel), .capture(capture), .shift(shift), .tdi(tdi), .tdo(tdo)
  );

endmodule

`default_nettype wire

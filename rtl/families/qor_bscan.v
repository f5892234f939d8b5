// A user register of the BSCAN kind: BSCANE2 and those before it.
//
//   BSCANE2, BSCAN_VIRTEX6, BSCAN_SPARTAN6   TCK, SEL, CAPTURE, SHIFT of one chain, which JTAG_CHAIN chooses
//   BSCAN_VIRTEX5, BSCAN_VIRTEX4             the same without TCK: DRCK is TCK gated to Capture-DR and Shift-DR
//   BSCAN_SPARTAN3A, BSCAN_SPARTAN3          chains 1 and 2 in one primitive, with a SEL and a gated DRCK each
//
// There is one BSCAN_SPARTAN3A or BSCAN_SPARTAN3 in a device: what else needs the other chain shares it.
//
// Their descriptions leave open whether tools put TCK or DRCK on a clock net by themselves: place a clock buffer if
// they say that they do not. A gated DRCK may rest high or low, and has no edge between two scans: what the last bit
// of a scan starts waits for the next one then. Hosts send more bits than the frame has, so theirs never do.
`default_nettype none

module qor_bscan #(
    parameter PRIMITIVE = "BSCANE2",
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

  // Names of different lengths are compared, and most ports are not needed.
  /* verilator lint_off WIDTH */
  /* verilator lint_off PINMISSING */
  generate
    if (PRIMITIVE == "BSCANE2") begin : bscane2
      BSCANE2 #(
          .JTAG_CHAIN(CHAIN)
      ) register (
          .TCK(register_tck), .SEL(register_sel), .CAPTURE(register_capture), .SHIFT(register_shift),
          .TDI(register_tdi), .TDO(register_tdo)
      );
    end else if (PRIMITIVE == "BSCAN_VIRTEX6") begin : bscan_virtex6
      BSCAN_VIRTEX6 #(
          .JTAG_CHAIN(CHAIN)
      ) register (
          .TCK(register_tck), .SEL(register_sel), .CAPTURE(register_capture), .SHIFT(register_shift),
          .TDI(register_tdi), .TDO(register_tdo)
      );
    end else if (PRIMITIVE == "BSCAN_SPARTAN6") begin : bscan_spartan6
      BSCAN_SPARTAN6 #(
          .JTAG_CHAIN(CHAIN)
      ) register (
          .TCK(register_tck), .SEL(register_sel), .CAPTURE(register_capture), .SHIFT(register_shift),
          .TDI(register_tdi), .TDO(register_tdo)
      );
    end else if (PRIMITIVE == "BSCAN_VIRTEX5") begin : bscan_virtex5
      BSCAN_VIRTEX5 #(
          .JTAG_CHAIN(CHAIN)
      ) register (
          .DRCK(register_tck), .SEL(register_sel), .CAPTURE(register_capture), .SHIFT(register_shift),
          .TDI(register_tdi), .TDO(register_tdo)
      );
    end else if (PRIMITIVE == "BSCAN_VIRTEX4") begin : bscan_virtex4
      BSCAN_VIRTEX4 #(
          .JTAG_CHAIN(CHAIN)
      ) register (
          .DRCK(register_tck), .SEL(register_sel), .CAPTURE(register_capture), .SHIFT(register_shift),
          .TDI(register_tdi), .TDO(register_tdo)
      );
    end else begin : pair
      wire [2:1] drck, selects;
      assign register_tck = drck[CHAIN];
      assign register_sel = selects[CHAIN];
      wire unused = &{1'b0, drck, selects};
      if (PRIMITIVE == "BSCAN_SPARTAN3A") begin : bscan_spartan3a
        BSCAN_SPARTAN3A register (
            .DRCK1(drck[1]), .DRCK2(drck[2]), .SEL1(selects[1]), .SEL2(selects[2]), .CAPTURE(register_capture),
            .SHIFT(register_shift), .TDI(register_tdi), .TDO1(register_tdo), .TDO2(register_tdo)
        );
      end else begin : bscan_spartan3
        BSCAN_SPARTAN3 register (
            .DRCK1(drck[1]), .DRCK2(drck[2]), .SEL1(selects[1]), .SEL2(selects[2]), .CAPTURE(register_capture),
            .SHIFT(register_shift), .TDI(register_tdi), .TDO1(register_tdo), .TDO2(register_tdo)
        );
      end
    end
  endgenerate
  /* verilator lint_on PINMISSING */
  /* verilator lint_on WIDTH */

  qor_user_register adapter (
      .register_tck(register_tck), .register_select(register_sel), .register_capture(register_capture),
      .register_shift(register_shift), .register_enable(1'b1), .register_tdi(register_tdi),
      .register_tdo(register_tdo),
      .tck(tck), .sel(sel), .capture(capture), .shift(shift), .tdi(tdi), .tdo(tdo)
  );

endmodule

`default_nettype wire

// A user register of the JTAGG kind: two registers that share their shift line, with an enable each, and neither a line
// for the selection nor one for Capture-DR. What is high in Capture-DR and Shift-DR of register n:
//
//   JTAGG, JTAG     JCE1, JCE2
//   EG_PHY_CONFIG   jscanen[0], jscanen[1]
//
// Of JTAGG it is known that JTDI comes a TCK late. Left open by the descriptions: whether the enable of EG_PHY_CONFIG is
// high in Capture-DR as well as in Shift-DR, which this wrapper takes for granted, and whether its jtdi is late; qorvio
// doctor says how late it is, for LATE_TDI. There is one such primitive in a device: what else needs the other register
// shares it.
`default_nettype none

/* verilator lint_off WIDTH */  // names of different lengths are compared
module qor_jtagg #(
    parameter PRIMITIVE = "JTAGG",
    parameter USER = 1,  // ER1 or ER2: register 1 or 2
    parameter LATE_TDI = PRIMITIVE == "EG_PHY_CONFIG" ? 0 : 1
) (
    // Those of the pins, where the primitive wants them; leave them open or 0 elsewhere.
    input  wire pin_tck,
    input  wire pin_tms,
    input  wire pin_tdi,
    output wire pin_tdo,

    output wire tck,
    output wire sel,
    output wire capture,
    output wire shift,
    output wire tdi,
    input  wire tdo
);

  wire       register_tck, register_shift, register_tdi, register_tdo;
  wire [2:1] enables;

  // Most ports are not needed.
  /* verilator lint_off PINMISSING */
  generate
    if (PRIMITIVE == "JTAGG") begin : jtagg
      JTAGG #(
          .ER1("ENABLED"), .ER2("ENABLED")
      ) register (
          .TCK(pin_tck), .TMS(pin_tms), .TDI(pin_tdi), .TDO(pin_tdo), .JTCK(register_tck), .JSHIFT(register_shift),
          .JCE1(enables[1]), .JCE2(enables[2]), .JTDI(register_tdi), .JTDO1(register_tdo), .JTDO2(register_tdo)
      );
    end else if (PRIMITIVE == "JTAG") begin : jtag
      JTAG #(
          .MCER1EXIST(USER == 1 ? "EXIST" : "NEXIST"), .MCER2EXIST(USER == 2 ? "EXIST" : "NEXIST")
      ) register (
          .TCK(pin_tck), .TMS(pin_tms), .TDI(pin_tdi), .TDO(pin_tdo), .JTCK(register_tck), .JSHIFT(register_shift),
          .JCE1(enables[1]), .JCE2(enables[2]), .JTDI(register_tdi), .JTDO1(register_tdo), .JTDO2(register_tdo),
          .SMCLK(1'b0)
      );
    end else begin : eg_phy_config
      wire unused_pins = &{1'b0, pin_tck, pin_tms, pin_tdi};
      assign pin_tdo = 1'b0;
      EG_PHY_CONFIG register (
          .jtck(register_tck), .jshift(register_shift), .jscanen(enables), .jtdi(register_tdi),
          .jtdo({register_tdo, register_tdo}), .jtag8_ipa(8'b0),
          .jtag8_ipb(8'b0), .cclk_en(1'b1), .gsrn_sync_clk(1'b0), .usr_gsrn(1'b0), .dna_clk(1'b0), .dna_din(1'b0), .dna_shift_en(1'b0), .mboot_rebootn(1'b1),
          .mboot_dynamic_addr(8'b0)
      );
    end
  endgenerate
  /* verilator lint_on PINMISSING */

  qor_user_register #(
      .SELECT(0), .CAPTURE(0), .SHARED(1), .LATE_TDI(LATE_TDI)
  ) adapter (
      .register_tck(register_tck), .register_select(1'b1), .register_capture(1'b0), .register_shift(register_shift),
      .register_enable(enables[USER]), .register_tdi(register_tdi), .register_tdo(register_tdo),
      .tck(tck), .sel(sel), .capture(capture), .shift(shift), .tdi(tdi), .tdo(tdo)
  );

  wire unused = &{1'b0, enables};

endmodule
/* verilator lint_on WIDTH */

`default_nettype wire

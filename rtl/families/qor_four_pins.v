// For devices that give a design no user register: a whole TAP on four pins of its own. The cable sees one device with
// this IDCODE and IR length.
//
// The TAP powers up in Test-Logic-Reset. Pull pin_tms up, so that it stays there without a cable. tdo has no enable: a
// device whose pin is shared with others needs one of its own.
`default_nettype none

module qor_four_pins #(
    parameter [31:0] IDCODE = 32'h0A5F1093,
    parameter        IR_LENGTH = 6,
    parameter        USER = 1  // user chain, 1 to 4; instruction USER + 1
) (
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

  wire [3:0] user_sel;

  qor_tap #(
      .IDCODE(IDCODE), .IR_LENGTH(IR_LENGTH)
  ) tap (
      .tck(pin_tck), .tms(pin_tms), .tdi(pin_tdi), .tdo(pin_tdo), .user_sel(user_sel),
      .capture(capture), .shift(shift), .user_tdo({3'b000, tdo} << (USER - 1))
  );

  assign tck = pin_tck;
  assign sel = user_sel[USER-1];
  assign tdi = pin_tdi;

endmodule

`default_nettype wire

// Makes the six signals that a hub needs of those that a family's user register has. The wrappers beside it use it, and
// one for a primitive that they do not know is a few lines around it.
//
// What needs no adapting: tck may be gated to Capture-DR and Shift-DR, and tdi or tdo may be one or two TCKs late, which
// the host finds out.
`default_nettype none

module qor_user_register #(
    parameter SELECT = 1,   // 0: there is no line that says that the instruction is selected; `capture` and `shift`, or
                            // `enable`, are those of this register alone
    parameter CAPTURE = 1,  // 0: there is no capture line; `enable` is high in Capture-DR and Shift-DR
    parameter SHARED = 0    // 1: shift is that of every data register of the device, so `enable` has to be high too
) (
    input  wire register_tck,
    input  wire register_select,
    input  wire register_capture,
    input  wire register_shift,
    input  wire register_enable,
    input  wire register_tdi,
    output wire register_tdo,

    output wire tck,
    output wire sel,
    output wire capture,
    output wire shift,
    output wire tdi,
    input  wire tdo
);

  assign tck = register_tck;
  assign sel = SELECT == 0 | register_select;
  assign capture = CAPTURE != 0 ? register_capture : register_enable & ~register_shift;
  assign shift = register_shift & (SHARED == 0 | register_enable);
  assign tdi = register_tdi;
  assign register_tdo = tdo;

  wire unused = &{1'b0, register_select, register_capture, register_enable};

endmodule

`default_nettype wire

// Makes the six signals that a hub needs of those that a family's user register has. The wrappers beside it use it, and
// one for a primitive that they do not know is a few lines around it.
//
// What needs no adapting: tck may be gated to Capture-DR and Shift-DR, and tdo may be one or two TCKs late, which the host
// finds out. It finds out a late tdi, too; LATE_TDI only keeps what is of before the scan from the hub.
`default_nettype none

module qor_user_register #(
    parameter SELECT = 1,   // 0: there is no line that says that the instruction is selected; `capture` and `shift`, or
                            // `enable`, are those of this register alone
    parameter CAPTURE = 1,  // 0: there is no capture line; `enable` is high in Capture-DR and Shift-DR
    parameter SHARED = 0,   // 1: shift is that of every data register of the device, so `enable` has to be high too
    parameter LATE_TDI = 0  // how many TCKs tdi comes late, 0 to 2
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
  assign register_tdo = tdo;

  // So many first bits in Shift-DR were on TDI before it. A 1 there would make a start with the zero of a bypassed device.
  localparam [1:0] STALE = LATE_TDI == 2 ? 2'b11 : LATE_TDI == 1 ? 2'b01 : 2'b00;
  reg [1:0] stale = 2'b00;
  always @(posedge register_tck) stale <= capture ? STALE : {1'b0, stale[1]};
  assign tdi = register_tdi & ~stale[0];

  wire unused = &{1'b0, register_select, register_capture, register_enable};

endmodule

`default_nettype wire

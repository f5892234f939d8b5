// What the user registers of some families do, after their public descriptions, each with the whole TAP of its device.
// Those without pins of their own are device 0 of the demo board, and take its wires from there.
`default_nettype none
/* verilator lint_off UNUSED */
/* verilator lint_off DECLFILENAME */

// TCK runs always; capture and shift are levels of all chains.
module BSCANE2 #(
    parameter JTAG_CHAIN = 1
) (
    output wire CAPTURE,
    output wire DRCK,
    output wire RESET,
    output wire RUNTEST,
    output wire SEL,
    output wire SHIFT,
    output wire TCK,
    output wire TDI,
    output wire TMS,
    output wire UPDATE,
    input  wire TDO
);
  wire [3:0] sel;
  wire       pin_tdo;
  qor_tap #(
      .IDCODE(32'h0A5F1093)
  ) tap (
      .tck(qor_demo_top.device0.tck), .tms(qor_demo_top.device0.tms), .tdi(qor_demo_top.device0.tdi), .tdo(pin_tdo),
      .user_sel(sel), .capture(CAPTURE), .shift(SHIFT), .user_tdo({3'b000, TDO} << (JTAG_CHAIN - 1))
  );
  assign SEL = sel[JTAG_CHAIN-1];
  assign {TCK, TMS, TDI} = {qor_demo_top.device0.tck, qor_demo_top.device0.tms, qor_demo_top.device0.tdi};
  assign {DRCK, RESET, RUNTEST, UPDATE} = 4'b0;
endmodule

// TDI comes a TCK late; no select and no capture line.
module JTAGG #(
    parameter ER1 = "ENABLED",
    parameter ER2 = "ENABLED"
) (
    input  wire TCK,
    input  wire TMS,
    input  wire TDI,
    output wire TDO,
    input  wire JTDO1,
    input  wire JTDO2,
    output reg  JTDI,
    output wire JTCK,
    output wire JRTI1,
    output wire JRTI2,
    output wire JSHIFT,
    output wire JUPDATE,
    output wire JRSTN,
    output wire JCE1,
    output wire JCE2
);
  wire [3:0] sel;
  wire       capture;
  qor_tap #(
      .IDCODE(32'h0A5F1093)
  ) tap (
      .tck(TCK), .tms(TMS), .tdi(TDI), .tdo(TDO), .user_sel(sel), .capture(capture), .shift(JSHIFT),
      .user_tdo({2'b00, JTDO2, JTDO1})
  );
  assign JTCK = TCK;
  assign {JCE2, JCE1} = sel[1:0] & {2{capture | JSHIFT}};
  assign {JRTI1, JRTI2, JUPDATE, JRSTN} = 4'b0001;
  initial JTDI = 1'b0;
  always @(posedge TCK) JTDI <= TDI;
endmodule

// As far as a design sees it like JTAGG, with a register of a TCK in front of TDO instead. Only what is used is here.
module EG_PHY_CONFIG (
    output wire       jrstn,
    output wire [1:0] jrti,
    output wire       jshift,
    output wire       jtck,
    output wire       jtdi,
    output wire       jupdate,
    output wire [1:0] jscanen,
    output wire       jtms,
    input  wire [1:0] jtdo,
    input  wire [7:0] jtag8_ipa,
    input  wire [7:0] jtag8_ipb,
    output wire       done,
    output wire       highz,
    output wire       cclk,
    input  wire       cclk_en,
    input  wire       gsrn_sync_clk,
    input  wire       usr_gsrn,
    output wire       dna_dout,
    input  wire       dna_clk,
    input  wire       dna_din,
    input  wire       dna_shift_en,
    input  wire       mboot_rebootn,
    input  wire [7:0] mboot_dynamic_addr
);
  wire [3:0] sel;
  wire       capture, pin_tdo;
  reg  [1:0] late = 2'b00;
  qor_tap #(
      .IDCODE(32'h0A5F1093)
  ) tap (
      .tck(jtck), .tms(qor_demo_top.device0.tms), .tdi(jtdi), .tdo(pin_tdo), .user_sel(sel), .capture(capture),
      .shift(jshift), .user_tdo({2'b00, late})
  );
  assign jtck = qor_demo_top.device0.tck;
  assign jtdi = qor_demo_top.device0.tdi;
  assign jscanen = sel[1:0] & {2{capture | jshift}};
  assign {jrstn, jrti, jupdate, jtms, done, highz, cclk, dna_dout} = {1'b1, 8'b0};
  always @(posedge jtck) late <= jtdo;
endmodule

// No primitive, but the kind of those whose clock runs in Capture-DR and Shift-DR of their own instruction only. It has no
// capture line: a TCK without shift is that of Capture-DR.
module gated_register (
    output wire gated_tck,
    output wire select,
    output wire shift,
    output wire tdi,
    input  wire tdo
);
  wire [3:0] sel;
  wire       capture, tap_shift, pin_tdo;
  reg        runs = 1'b0;
  qor_tap #(
      .IDCODE(32'h0A5F1093)
  ) tap (
      .tck(qor_demo_top.device0.tck), .tms(qor_demo_top.device0.tms), .tdi(tdi), .tdo(pin_tdo), .user_sel(sel),
      .capture(capture), .shift(tap_shift), .user_tdo({3'b000, tdo})
  );
  always @(negedge qor_demo_top.device0.tck) runs <= sel[0] & (capture | tap_shift);
  assign gated_tck = qor_demo_top.device0.tck & runs;
  assign {select, shift, tdi} = {sel[0], tap_shift, qor_demo_top.device0.tdi};
endmodule

/* verilator lint_on DECLFILENAME */
/* verilator lint_on UNUSED */
`default_nettype wire

// The demo board: a chain of two devices, with the cores and designs of the simulated one.
`default_nettype none

module qor_demo_top #(
    parameter REGISTER = ""  // of device 0
) (
    input  wire tck,
    input  wire tms,
    input  wire tdi,
    output wire tdo,
    input  wire clk
);

  wire between;  // device 1 is nearest to TDI, device 0 to TDO

  qor_demo_cpld device1 (
      .tck(tck), .tms(tms), .tdi(tdi), .tdo(between), .clk(clk)
  );

  qor_demo_fpga #(
      .REGISTER(REGISTER)
  ) device0 (
      .tck(tck), .tms(tms), .tdi(between), .tdo(tdo), .clk(clk)
  );

endmodule

`default_nettype wire

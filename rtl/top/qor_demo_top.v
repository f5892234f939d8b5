// The demo board: a chain of two devices, with the cores and designs of the simulated one.
//
// Bench: tick `clk` once for every TCK that stays in Run-Test/Idle, and leave it alone otherwise; then every scan
// gives the bits of the simulated board.
`default_nettype none

module qor_demo_top (
    input  wire tck,
    input  wire tms,
    input  wire tdi,
    output wire tdo,
    input  wire clk,
    output wire run_test_idle
);

  wire between;  // device 1 is nearest to TDI, device 0 to TDO
  wire unused_run_test_idle;

  qor_demo_cpld device1 (
      .tck(tck), .tms(tms), .tdi(tdi), .tdo(between), .clk(clk), .run_test_idle(unused_run_test_idle)
  );

  qor_demo_fpga device0 (
      .tck(tck), .tms(tms), .tdi(between), .tdo(tdo), .clk(clk), .run_test_idle(run_test_idle)
  );

endmodule

`default_nettype wire

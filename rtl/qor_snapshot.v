// Asks the design clock for a snapshot of the inputs, on TCK, and times it, on clk.
`default_nettype none

module qor_snapshot (
    input  wire tck,
    input  wire request,       // a snapshot is wanted; if one is under way, that one serves
    input  wire always_merge,  // of the request: keep the activity of the record before
    input  wire delivered,     // the record is out; never while `pending`
    output wire pending,
    output reg  merging,       // the record may repeat activity of the one before

    input  wire clk,
    output wire take,          // for one clock
    output wire merge,         // with `take`: add to the activity of the record, rather than replace it
    output wire settled        // what the inputs were at power-up is known: from now on a change is activity
);

  // The snapshot is as many clocks after the request as a pulse train needs to come back from an output through a
  // design to a synchronous input, so that a read shows the same step of a train however it is timed.
  localparam DELAY = 6;

  // The inputs' own flip-flops need three clocks; flip-flops may leave power-up a clock apart.
  localparam SETTLING = 5;

  // Crossing to clk and back: a step of `asked` asks, the same step of the last flip-flop says that the snapshot was
  // taken. The record does not change from then to the next request, so TCK may read it when nothing is pending.
  reg                                         asked = 1'b0, undelivered = 1'b0;
  (* ASYNC_REG = "TRUE", keep *) reg [1:0]       taken_at_tck = 2'b0;
  (* ASYNC_REG = "TRUE", keep *) reg [DELAY-1:0] asked_at_clk = 0;
  assign pending = asked ^ taken_at_tck[1];
  assign take = asked_at_clk[DELAY-1] ^ asked_at_clk[DELAY-2];

  initial merging = 1'b0;

  always @(posedge tck) begin
    taken_at_tck <= {taken_at_tck[0], asked_at_clk[DELAY-1]};
    if (delivered) undelivered <= 1'b0;
    if (request) begin
      merging <= always_merge | (pending ? merging : undelivered);
      undelivered <= 1'b1;
      asked <= asked ^ ~pending;
    end
  end

  // Crossing to clk: `merging` has two flip-flops of its own, since a request that joins may raise it at any time. A
  // request that asks anew sets it together with `asked`, which takes longer.
  (* ASYNC_REG = "TRUE", keep *) reg [1:0] merging_at_clk = 2'b0;
  assign merge = merging_at_clk[1];

  reg [SETTLING-1:0] clocks = 0;  // since power-up, as ones
  assign settled = clocks[SETTLING-1];

  always @(posedge clk) begin
    asked_at_clk <= {asked_at_clk[DELAY-2:0], asked};
    merging_at_clk <= {merging_at_clk[0], merging};
    clocks <= {clocks[SETTLING-2:0], 1'b1};
  end

endmodule

`default_nettype wire

// Asks the design clock for a snapshot of the inputs, on TCK, and times it, on clk.
`default_nettype none

module qor_snapshot (
    input  wire tck,
    input  wire request,       // a snapshot is wanted
    input  wire always_merge,  // of the request: keep the activity that was delivered before
    input  wire acknowledge,   // the activity that was delivered has arrived; never while `pending`
    output wire pending,

    input  wire clk,
    output wire take,          // for one clock
    output wire merge,         // with `take`: add to the delivered activity, rather than replace it
    output wire sync_settled,  // what the inputs were at power-up is known: from now on a change is activity
    output wire async_settled
);

  // The snapshot is as many clocks after the request as a pulse train needs to come back from an output through a
  // design to a synchronous input, so that a read shows the same step of a train however it is timed.
  localparam DELAY = 6;

  // A step of `asked` asks, and the same step of the last flip-flop tells that the snapshot was taken. Crossing to
  // clk and back: one bit each, two flip-flops before it is used. What is delivered stands still from the answer to
  // the next request, so TCK may read it when nothing is pending.
  reg             asked = 1'b0, acknowledged = 1'b0, merging = 1'b0;
  reg             to_tck = 1'b0, at_tck = 1'b0;
  reg [DELAY-1:0] asked_at_clk = 0;
  assign pending = asked ^ at_tck;
  assign take = asked_at_clk[DELAY-1] ^ asked_at_clk[DELAY-2];

  // A request during another one joins it. If that has just been taken, and the answer is on its way, the snapshot
  // is older than the request by two TCKs at most, less than the scan before.
  always @(posedge tck) begin
    {at_tck, to_tck} <= {to_tck, asked_at_clk[DELAY-1]};
    if (acknowledge) acknowledged <= 1'b1;
    if (request) begin
      merging <= always_merge | (pending ? merging : ~acknowledged);
      if (!pending) begin
        asked <= ~asked;
        acknowledged <= 1'b0;
      end
    end
  end

  // Crossing to clk: `merging` has its own two flip-flops, since a request that joins may raise it at any time. A
  // request that asks anew sets it together with `asked`, which takes longer.
  reg [1:0] merging_at_clk = 2'b0;
  assign merge = merging_at_clk[1];

  reg [2:0] clocks = 3'b0;  // since power-up, as ones
  assign sync_settled = clocks[1];
  assign async_settled = clocks[2];

  always @(posedge clk) begin
    asked_at_clk <= {asked_at_clk[DELAY-2:0], asked};
    merging_at_clk <= {merging_at_clk[0], merging};
    clocks <= {clocks[1:0], 1'b1};
  end

endmodule

`default_nettype wire

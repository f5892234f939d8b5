// The outputs of a VIO core: takes the payload of a write, and plays its pulse trains.
//
// Digit k of the payload is its bit BITS-1-k. Digits: asynchronous values, pulse trains of 16 digits an output,
// asynchronous mask, synchronous mask.
`default_nettype none

module qor_outputs #(
    parameter ASYNC = 0,
    parameter SYNC = 0
) (
    input  wire tck,
    input  wire payload_shift,  // never while `busy`
    input  wire payload_bit,
    input  wire write,          // the payload is obeyed
    output wire busy,           // pulse trains wait for the design clock, or are played

    input  wire                               clk,
    output wire [ASYNC == 0 ? 0 : ASYNC-1 : 0] async_out,  // changes on TCK
    output wire [SYNC == 0 ? 0 : SYNC-1 : 0]   sync_out    // changes on clk
);

  localparam STEPS = 16;
  localparam BITS = 2 * ASYNC + (STEPS + 1) * SYNC;
  localparam TOP = BITS == 0 ? 0 : BITS - 1;

  // Crossing to clk: trains are played from here. They stand still from the request to its answer, since a write is
  // refused until then.
  reg [TOP:0] payload = 0;

  always @(posedge tck)
    if (payload_shift) begin
      payload <= payload >> 1;
      payload[TOP] <= payload_bit;
    end

  function step_of(input [STEPS-1:0] train, input [3:0] step);
    step_of = train[~step];
  endfunction

  generate
    if (ASYNC == 0) begin : without_async
      assign async_out = 1'b0;
    end else begin : async
      localparam MASK_TOP = TOP - ASYNC - STEPS * SYNC;
      reg [ASYNC-1:0] values = 0;
      integer         i;
      always @(posedge tck)
        if (write)
          for (i = 0; i < ASYNC; i = i + 1) if (payload[MASK_TOP-i]) values[i] <= payload[TOP-i];
      assign async_out = values;
    end

    if (SYNC == 0) begin : without_sync
      wire unused = &{1'b0, clk, write};
      assign busy = 1'b0;
      assign sync_out = 1'b0;
    end else begin : sync
      // Crossing to clk and back: a step of `request` asks, the same step of `answer` says that the last step of the
      // trains is out.
      reg                                 request = 1'b0, answer = 1'b0;
      (* ASYNC_REG = "TRUE", keep *) reg [1:0] request_at_clk = 2'b0, answer_at_tck = 2'b0;
      assign busy = request ^ answer_at_tck[1];

      always @(posedge tck) begin
        answer_at_tck <= {answer_at_tck[0], answer};
        if (write) request <= request ^ |payload[SYNC-1:0];
      end

      localparam TRAINS_TOP = TOP - ASYNC;
      reg [SYNC-1:0] values = 0;
      reg [3:0]      step = 4'd0;
      integer        i;
      always @(posedge clk) begin
        request_at_clk <= {request_at_clk[0], request};
        if (request_at_clk[1] ^ answer) begin
          for (i = 0; i < SYNC; i = i + 1)
            if (payload[SYNC-1-i]) values[i] <= step_of(payload[TRAINS_TOP-STEPS*i-:STEPS], step);
          step <= step + 4'd1;
          answer <= answer ^ &step;
        end
      end
      assign sync_out = values;
    end
  endgenerate

endmodule

`default_nettype wire

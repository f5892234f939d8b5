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
    input  wire capturing,
    input  wire shifting,
    input  wire payload_bit,
    input  wire write,       // the payload is obeyed; only when not `blocked`
    output reg  blocked,     // a write of this scan is refused
    output wire pending,     // pulse trains wait for the design clock

    input  wire                               clk,
    output wire [ASYNC == 0 ? 0 : ASYNC-1 : 0] async_out,  // changes on TCK
    output wire [SYNC == 0 ? 0 : SYNC-1 : 0]   sync_out    // changes on clk
);

  localparam STEPS = 16;
  localparam BITS = 2 * ASYNC + (STEPS + 1) * SYNC;
  localparam TRAINS_AT = ASYNC, ASYNC_MASK_AT = ASYNC + STEPS * SYNC, SYNC_MASK_AT = 2 * ASYNC + STEPS * SYNC;

  initial blocked = 1'b0;

  generate
    if (BITS == 0) begin : without_payload
      wire unused = &{1'b0, tck, shifting, payload_bit};
    end else begin : payload
      // Crossing to clk: trains and their mask are taken from here by the design clock. They stand still from the
      // request to its answer, since a scan that begins in between is blocked from shifting.
      reg [BITS-1:0] digits = 0;
      always @(posedge tck)
        if (shifting & ~blocked) begin
          digits <= digits >> 1;
          digits[BITS-1] <= payload_bit;
        end
    end

    if (ASYNC == 0) begin : without_async
      assign async_out = 1'b0;
    end else begin : async
      reg [ASYNC-1:0] values = 0;
      always @(posedge tck)
        if (write)
          values <= written(values, payload.digits[BITS-1-:ASYNC], payload.digits[BITS-1-ASYNC_MASK_AT-:ASYNC]);
      assign async_out = values;

      function [ASYNC-1:0] written(input [ASYNC-1:0] old, input [ASYNC-1:0] digits, input [ASYNC-1:0] mask);
        integer i;
        for (i = 0; i < ASYNC; i = i + 1) written[i] = mask[ASYNC-1-i] ? digits[ASYNC-1-i] : old[i];
      endfunction
    end

    if (SYNC == 0) begin : without_sync
      wire unused = &{1'b0, clk, write, capturing};
      assign pending = 1'b0;
      assign sync_out = 1'b0;
    end else begin : sync
      // A step of `request` asks, and the same step of `answer` tells that the trains were taken. Crossing to clk
      // and back: one bit each, two flip-flops before it is used, so that it may change at any time.
      reg  request = 1'b0;
      reg  to_clk = 1'b0, at_clk = 1'b0, answer = 1'b0;
      reg  to_tck = 1'b0, at_tck = 1'b0;
      wire start = at_clk ^ answer;
      assign pending = request ^ at_tck;

      always @(posedge tck) begin
        {at_tck, to_tck} <= {to_tck, answer};
        if (capturing) blocked <= pending;
        if (write) request <= request ^ |payload.digits[BITS-1-SYNC_MASK_AT-:SYNC];
      end

      // Step-major: bit step * SYNC + output. The first SYNC bits are out.
      reg [STEPS*SYNC-1:0] trains = 0;
      integer              i, step;
      always @(posedge clk) begin
        {answer, at_clk, to_clk} <= {at_clk, to_clk, request};
        trains[(STEPS-1)*SYNC-1:0] <= trains[STEPS*SYNC-1:SYNC];  // the last step stays
        if (start)
          for (i = 0; i < SYNC; i = i + 1)
            if (payload.digits[BITS-1-SYNC_MASK_AT-i])
              for (step = 0; step < STEPS; step = step + 1)
                trains[step*SYNC+i] <= payload.digits[BITS-1-TRAINS_AT-STEPS*i-step];
      end
      assign sync_out = trains[SYNC-1:0];
    end
  endgenerate

endmodule

`default_nettype wire

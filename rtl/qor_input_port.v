// One input port of a VIO core: samples its pins, collects activity on them, and gives both to a take.
//
// A take at clock edge n delivers the values that the pins had after edge n - 3, and all activity up to then. This
// holds for both kinds of port, so that a snapshot shows one moment.
`default_nettype none

module qor_input_port #(
    parameter WIDTH = 1,        // at least 1
    parameter SYNCHRONOUS = 0,  // the pins change on clk
    parameter EDGE_CAPTURE = 0  // see pulses shorter than a clock: two flip-flops an input that the pin clocks
) (
    input  wire             clk,
    input  wire             settled,
    input  wire             take,
    input  wire [WIDTH-1:0] pins,

    // What a take delivers, beside the activity that it is to keep.
    output wire [WIDTH-1:0] value,
    output wire [WIDTH-1:0] up,
    output wire [WIDTH-1:0] down,
    output wire [WIDTH-1:0] clocked_up,   // as clk samples it
    output wire [WIDTH-1:0] clocked_down
);

  wire [WIDTH-1:0] now;
  reg  [WIDTH-1:0] earlier = 0;
  wire [WIDTH-1:0] rise = now & ~earlier, fall = ~now & earlier;

  reg  [WIDTH-1:0] live_up = 0, live_down = 0;

  always @(posedge clk) earlier <= now;

  generate
    if (SYNCHRONOUS != 0) begin : direct
      reg [WIDTH-1:0] sampled = 0;
      always @(posedge clk) sampled <= pins;
      assign now = sampled;
    end else begin : synchronised
      // Crossing to clk: two flip-flops, of which only the second is used. Bits of a port may arrive a clock apart.
      (* ASYNC_REG = "TRUE", keep *) reg [WIDTH-1:0] first = 0, second = 0;
      always @(posedge clk) {second, first} <= {first, pins};
      assign now = second;
    end

    // Activity as the design clock samples it. A change in the clock of a take is not lost: it is either delivered
    // in that clock or begins the next collection.
    if (SYNCHRONOUS != 0) begin : one_clock_late
      always @(posedge clk)
        if (!settled) begin
          live_up <= 0;
          live_down <= 0;
        end else begin
          live_up <= take ? rise : rise | live_up;
          live_down <= take ? fall : fall | live_down;
        end
      assign value = earlier;
      assign clocked_up = live_up;
      assign clocked_down = live_down;
    end else begin : at_once
      always @(posedge clk)
        if (!settled | take) begin
          live_up <= 0;
          live_down <= 0;
        end else begin
          live_up <= live_up | rise;
          live_down <= live_down | fall;
        end
      assign value = now;
      assign clocked_up = live_up | rise;
      assign clocked_down = live_down | fall;
    end

    if (EDGE_CAPTURE != 0) begin : edges
      // Each flip-flop that a pin clocks takes the opposite of the state that clk has seen: the first edge after a
      // take steps it, and others change nothing. Crossing to clk: two flip-flops. Crossing to the pin's clock:
      // `seen` changes at a take only. An edge at that very moment may step the flip-flop or not; if not, it came
      // before the take, whose flag reports it. So there is nothing to clear. An edge on its way to clk during a take
      // that reports an earlier one changes nothing either; if it lasts, the sampled activity reports it next time.
      wire [WIDTH-1:0] rose, fell;
      (* ASYNC_REG = "TRUE", keep *) reg [WIDTH-1:0] rose_first = 0, rose_now = 0, fell_first = 0, fell_now = 0;
      reg [WIDTH-1:0] rose_seen = 0, fell_seen = 0;
      genvar           i;
      for (i = 0; i < WIDTH; i = i + 1) begin : pin
        reg rise_step = 1'b0, fall_step = 1'b0;
        always @(posedge pins[i]) rise_step <= ~rose_seen[i];
        always @(negedge pins[i]) fall_step <= ~fell_seen[i];
        assign rose[i] = rise_step;
        assign fell[i] = fall_step;
      end
      always @(posedge clk) begin
        {rose_now, rose_first} <= {rose_first, rose};
        {fell_now, fell_first} <= {fell_first, fell};
        if (take | ~settled) begin
          rose_seen <= rose_now;
          fell_seen <= fell_now;
        end
      end
      assign up = clocked_up | rose_now ^ rose_seen;
      assign down = clocked_down | fell_now ^ fell_seen;
    end else begin : no_edges
      assign up = clocked_up;
      assign down = clocked_down;
    end
  endgenerate

endmodule

`default_nettype wire

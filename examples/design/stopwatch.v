// A design of one page with virtual inputs and outputs: a stopwatch with two buttons, four LEDs and a state machine.
// stopwatch.toml has the names of its signals.
//
// The host presses buttons that the board has not got, reads what the LEDs show, and sees every state and the count. On
// an FPGA replace qor_four_pins by the wrapper of its user register, see rtl/README.md.
`default_nettype none

module stopwatch (
    input  wire       clk,
    input  wire       tck,
    input  wire       tms,
    input  wire       tdi,
    output wire       tdo,
    input  wire [1:0] buttons,  // start or stop, clear; pressed is 1
    output wire [3:0] leds
);

  localparam [1:0] CLEARED = 0, RUNNING = 1, STOPPED = 2;

  // --- What the host presses, as if it were the buttons. ---

  wire [1:0] pressed;      // each train of pulses is a press
  wire [3:0] slowdown;     // clocks per count, less one
  reg  [1:0] button_first = 2'b0, button_now = 2'b0, button_before = 2'b0;
  wire [1:0] pushed = button_now & ~button_before;
  always @(posedge clk) begin
    {button_now, button_first} <= {button_first, buttons};
    button_before <= button_now | pressed;
  end
  wire start_or_stop = pushed[0] | pressed[0] & ~button_before[0];
  wire clear = pushed[1] | pressed[1] & ~button_before[1];

  // --- The state machine and its count. ---

  reg [1:0]  state = CLEARED;
  reg [15:0] count = 16'd0;
  reg [3:0]  prescaler = 4'd0;

  always @(posedge clk) begin
    case (state)
      RUNNING: if (start_or_stop) state <= STOPPED;
      default: if (start_or_stop) state <= RUNNING;
               else if (clear) state <= CLEARED;
    endcase
    prescaler <= prescaler == slowdown ? 4'd0 : prescaler + 4'd1;
    if (state == CLEARED) count <= 16'd0;
    else if (state == RUNNING && prescaler == slowdown) count <= count + 16'd1;
  end

  assign leds = {state == RUNNING, count[2:0]};

  // --- The virtual inputs and outputs: one line more than the signals. ---

  wire user_tck, sel, capture, shift, user_tdi, user_tdo;

  qor_four_pins user (
      .pin_tck(tck), .pin_tms(tms), .pin_tdi(tdi), .pin_tdo(tdo),
      .tck(user_tck), .sel(sel), .capture(capture), .shift(shift), .tdi(user_tdi), .tdo(user_tdo)
  );

  wire [3:0] slowdown_tck;  // changes on TCK: two flip-flops before it is used
  reg  [3:0] slowdown_first = 4'd0, slowdown_now = 4'd0;
  always @(posedge clk) {slowdown_now, slowdown_first} <= {slowdown_first, slowdown_tck};
  assign slowdown = slowdown_now;

  qor_vio #(
      .ASYNC_IN(2), .SYNC_IN(22), .ASYNC_OUT(4), .SYNC_OUT(2)
  ) vio (
      .tck(user_tck), .sel(sel), .capture(capture), .shift(shift), .tdi(user_tdi), .tdo(user_tdo),
      .clk(clk), .async_in(buttons), .sync_in({leds, state, count}), .async_out(slowdown_tck), .sync_out(pressed)
  );

endmodule

`default_nettype wire

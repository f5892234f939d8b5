// A TAP after IEEE 1149.1, for devices that give a design none and for simulation: IDCODE, BYPASS and four user chains.
// Powers up in Test-Logic-Reset; there is no TRST.
//
// Instructions: 1 is IDCODE, n + 1 is USERn, all others are BYPASS. An IDCODE parameter of 0 makes a device without
// one, which starts in BYPASS.
`default_nettype none

module qor_tap #(
    parameter [31:0] IDCODE = 32'h0,
    parameter        IR_LENGTH = 6  // 4 to 32
) (
    input  wire       tck,
    input  wire       tms,
    input  wire       tdi,
    output reg        tdo,            // changes at the falling edge of TCK
    output reg  [3:0] user_sel,       // bit n-1: USERn is selected
    output wire       capture,        // levels, for all user chains alike
    output wire       shift,
    input  wire [3:0] user_tdo        // 0 of a chain that is not there
);

  localparam [3:0] TEST_LOGIC_RESET = 0, RUN_TEST_IDLE = 1,
                   SELECT_DR = 2, CAPTURE_DR = 3, SHIFT_DR = 4, EXIT1_DR = 5, PAUSE_DR = 6, EXIT2_DR = 7, UPDATE_DR = 8,
                   SELECT_IR = 9, CAPTURE_IR = 10, SHIFT_IR = 11, EXIT1_IR = 12, PAUSE_IR = 13, EXIT2_IR = 14,
                   UPDATE_IR = 15;

  localparam [IR_LENGTH-1:0] OPCODE_IDCODE = 1, CAPTURED_IR = 1;
  localparam [IR_LENGTH-1:0] AT_RESET = IDCODE != 0 ? OPCODE_IDCODE : {IR_LENGTH{1'b1}};

  reg [3:0] state = TEST_LOGIC_RESET;

  always @(posedge tck)
    case (state)
      TEST_LOGIC_RESET: state <= tms ? TEST_LOGIC_RESET : RUN_TEST_IDLE;
      RUN_TEST_IDLE:    state <= tms ? SELECT_DR : RUN_TEST_IDLE;
      SELECT_DR:        state <= tms ? SELECT_IR : CAPTURE_DR;
      CAPTURE_DR:       state <= tms ? EXIT1_DR : SHIFT_DR;
      SHIFT_DR:         state <= tms ? EXIT1_DR : SHIFT_DR;
      EXIT1_DR:         state <= tms ? UPDATE_DR : PAUSE_DR;
      PAUSE_DR:         state <= tms ? EXIT2_DR : PAUSE_DR;
      EXIT2_DR:         state <= tms ? UPDATE_DR : SHIFT_DR;
      UPDATE_DR:        state <= tms ? SELECT_DR : RUN_TEST_IDLE;
      SELECT_IR:        state <= tms ? TEST_LOGIC_RESET : CAPTURE_IR;
      CAPTURE_IR:       state <= tms ? EXIT1_IR : SHIFT_IR;
      SHIFT_IR:         state <= tms ? EXIT1_IR : SHIFT_IR;
      EXIT1_IR:         state <= tms ? UPDATE_IR : PAUSE_IR;
      PAUSE_IR:         state <= tms ? EXIT2_IR : PAUSE_IR;
      EXIT2_IR:         state <= tms ? UPDATE_IR : SHIFT_IR;
      UPDATE_IR:        state <= tms ? SELECT_DR : RUN_TEST_IDLE;
    endcase

  assign capture = state == CAPTURE_DR;
  assign shift = state == SHIFT_DR;

  reg [IR_LENGTH-1:0] shifted_ir = CAPTURED_IR;
  reg [IR_LENGTH-1:0] instruction = AT_RESET;

  always @(posedge tck)
    if (state == CAPTURE_IR) shifted_ir <= CAPTURED_IR;
    else if (state == SHIFT_IR) shifted_ir <= {tdi, shifted_ir[IR_LENGTH-1:1]};

  always @(negedge tck)
    if (state == TEST_LOGIC_RESET) instruction <= AT_RESET;
    else if (state == UPDATE_IR) instruction <= shifted_ir;

  // In time for Capture-DR, and without the half TCK that the instruction itself leaves.
  reg     is_idcode = IDCODE != 0, is_user = 1'b0;
  integer n;
  initial user_sel = 4'b0;
  always @(posedge tck) begin
    for (n = 1; n <= 4; n = n + 1) user_sel[n-1] <= instruction == n[IR_LENGTH-1:0] + 1;
    is_user <= instruction >= 2 && instruction <= 5;
    is_idcode <= IDCODE != 0 && instruction == OPCODE_IDCODE;
  end

  // IDCODE, or BYPASS in its lowest bit.
  reg [31:0] shifted_dr = IDCODE;
  always @(posedge tck)
    if (capture) shifted_dr <= is_idcode ? IDCODE : 32'b0;
    else if (shift) shifted_dr <= {tdi, shifted_dr[31:2], is_idcode ? shifted_dr[1] : tdi};

  initial tdo = 1'b0;

  always @(negedge tck)
    if (state == SHIFT_IR) tdo <= shifted_ir[0];
    else tdo <= is_user ? |(user_sel & user_tdo) : shifted_dr[0];

endmodule

`default_nettype wire

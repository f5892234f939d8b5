// The core's end of the bus of a hub: finds out whether the core is meant, and delivers its data bit by bit.
`default_nettype none

module qor_core_link #(
    parameter         INDEX = 0,         // of the core on its user chain, 0 to 15
    parameter [127:0] STATUS_WORD = 0,   // what code 00 delivers
    parameter         PAYLOAD_BITS = 0,  // of a write
    parameter         RECORD_BITS = 0    // what codes 03 and 05 deliver
) (
    input  wire        tck,
    input  wire [30:0] to_core,
    output wire [6:0]  from_core,

    // The frame. What follows it happens at TCK.
    output wire [3:0]  code,
    output wire [15:0] tag,
    output wire        payload_bit,
    output wire        payload_shift,  // the payload bit is one of this core
    output wire        accepted,       // for one TCK: the header is for this core, and whole
    output wire        obeyed,         // for one TCK: so is the payload
    output wire        sent,           // for one TCK: the answer is out

    // What the core says of it, at once.
    input  wire        knows_code,     // beside 00 and 0F, which every core knows
    input  wire        takes,          // the payload
    input  wire        refuses,
    input  wire        waits,          // for the design clock
    input  wire        overlaps,       // flag 3

    input  wire [RECORD_BITS == 0 ? 0 : RECORD_BITS-1 : 0] records
);

  localparam [3:0] CODE_STATUS = 4'h0, CODE_NOTHING = 4'hF;
  localparam       LONGEST = PAYLOAD_BITS > RECORD_BITS ? PAYLOAD_BITS : RECORD_BITS;
  localparam       PLACE_BITS = LONGEST < 256 ? 8 : $clog2(LONGEST + 1);

  wire       shifting, answering, streaming, any_accepted, any_obeyed, any_sent;
  wire [3:0] core;
  assign {tag, core, code, payload_bit, shifting, answering, streaming, any_accepted, any_obeyed, any_sent} = to_core;

  wire meant = core == INDEX[3:0];
  wire is_status = code == CODE_STATUS;
  wire is_read = code[2:0] == 3'd3 | code[2:0] == 3'd5;
  wire knows = knows_code | is_status | code == CODE_NOTHING;
  assign accepted = any_accepted & meant;
  assign obeyed = any_obeyed & meant;
  assign sent = any_sent & meant;

  // The bit of payload or data that is next, and whether there is one, are found out a TCK before they are needed: so
  // `place` is that of the bit after it, and before the first bit 0 is looked up. The status word is a table, not
  // registers; the records are delivered from where they are kept.
  reg  [PLACE_BITS-1:0] place = 1;
  reg                   more = 1'b0, data = 1'b0;
  wire [PLACE_BITS-1:0] looked_up = {place[PLACE_BITS-1:1], place[0] & streaming};
  wire                  record_bit;
  assign payload_shift = shifting & streaming & ~answering & more;

  always @(posedge tck)
    if (~streaming | shifting & more) begin
      place <= streaming ? place + 1'b1 : 1;
      more <= meant & (~answering ? looked_up != PAYLOAD_BITS[PLACE_BITS-1:0] :
                       is_status ? ~looked_up[7] : is_read & looked_up != RECORD_BITS[PLACE_BITS-1:0]);
      data <= meant & (is_status ? STATUS_WORD[looked_up[6:0]] : record_bit);
    end

  generate
    if (RECORD_BITS < 2) begin : at_most_one
      assign record_bit = records[0];
    end else begin : several
      assign record_bit = records[looked_up[$clog2(RECORD_BITS)-1:0]];
    end
  endgenerate

  assign from_core = {data, more, {5{meant}} & {overlaps, waits, refuses, takes, knows}};

endmodule

`default_nettype wire

// The core's end of the bus behind a hub: knows when the core is meant, and delivers its results bit by bit.
`default_nettype none

module qor_core_link #(
    parameter         INDEX = 0,          // of the core on its user chain, 0 to 15
    parameter [127:0] STATUS_WORD = 0,    // what code 00 delivers
    parameter         RECORD_BITS = 0     // what codes 03 and 05 deliver
) (
    input  wire        tck,
    input  wire [46:0] to_core,
    output wire [6:0]  from_core,

    // The frame that the hub has received. The core answers at once; it acts on TCK when `obey` is high.
    output wire        capturing,
    output wire        shifting,
    output wire        payload_bit,
    output wire [20:0] frame_length,  // of the payload
    output wire [3:0]  frame_code,
    output wire        obey,          // the frame is for this core, and whole
    output wire        result_seen,   // this scan delivers a finished snapshot of this core
    input  wire        knows_code,    // beside 00 and 0F, which every core knows
    input  wire        rejects,
    input  wire        refuses,

    input  wire                                           pending,
    input  wire [RECORD_BITS == 0 ? 0 : RECORD_BITS-1 : 0] records
);

  localparam [3:0] CODE_STATUS = 4'h0, CODE_READ = 4'h3, CODE_READ_AGAIN = 4'h5, CODE_NOTHING = 4'hF;
  localparam       PLACE_BITS = RECORD_BITS < 256 ? 8 : $clog2(RECORD_BITS + 1);

  wire       any_obey, last_pending, behind_head;
  wire [3:0] frame_core, last_core, last_code, length_place;
  assign {capturing, shifting, payload_bit, any_obey, frame_core, frame_code, frame_length,
          last_core, last_code, last_pending, behind_head, length_place} = to_core;

  wire meant = frame_core == INDEX[3:0];
  wire selected = last_core == INDEX[3:0];
  wire delivers_status = selected & last_code == CODE_STATUS;
  wire delivers_records = selected & (last_code == CODE_READ | last_code == CODE_READ_AGAIN);

  assign obey = any_obey & meant;
  assign result_seen = delivers_records & ~last_pending;

  // The status word is a table, not registers; the records are delivered from where they are kept.
  reg  [PLACE_BITS-1:0] place = 0;
  wire                  more_status = delivers_status & ~place[7];
  wire                  more_records, record_bit;
  wire                  more = more_status | more_records;
  wire [15:0]           record_count = RECORD_BITS[15:0];
  wire                  length_bit = delivers_status & length_place == 4'd7 |
                                     delivers_records & record_count[length_place];

  always @(posedge tck)
    if (capturing) place <= 0;
    else if (shifting & behind_head & more) place <= place + 1'b1;

  generate
    if (RECORD_BITS == 0) begin : without_records
      wire unused = records;
      assign more_records = 1'b0;
      assign record_bit = 1'b0;
    end else begin : with_records
      localparam INDEX_BITS = RECORD_BITS == 1 ? 1 : $clog2(RECORD_BITS);
      assign more_records = delivers_records & place != RECORD_BITS[PLACE_BITS-1:0];
      assign record_bit = records[place[INDEX_BITS-1:0]];
    end
  endgenerate

  wire data = more_status & STATUS_WORD[place[6:0]] | more_records & record_bit;
  wire takes = knows_code | frame_code == CODE_STATUS | frame_code == CODE_NOTHING;

  assign from_core = {length_bit, more, data, selected & pending, meant & refuses, meant & rejects, meant & takes};

endmodule

`default_nettype wire

// The hub at the end of a user chain: takes frames to its cores and brings their results back.
//
// Everything here is on TCK. capture, shift and update are levels, sampled at its rising edge; tdo changes at the
// rising edge too, so it is stable when a TAP samples it at the falling one.
`default_nettype none

module qor_hub #(
    parameter CORES = 1,        // how many cores stand behind this hub, 1 to 16
    parameter LENGTH_BITS = 16  // the longest payload, 2 * ASYNC_OUT + 17 * SYNC_OUT, fits in these: 16 to 21
) (
    input  wire               tck,
    input  wire               sel,
    input  wire               capture,
    input  wire               shift,
    input  wire               update,
    input  wire               tdi,
    output reg                tdo,
    output wire [46:0]        to_cores,   // to every core alike
    input  wire [7*CORES-1:0] from_cores  // 7 bits a core, in any order
);

  localparam [3:0] CODE_WRITE = 4'h2, CODE_NOTHING = 4'hF;
  localparam [3:0] SIGNATURE = 4'hA;

  wire capturing = sel & capture;
  wire shifting = sel & shift;
  wire updating = sel & update;

  // CRC-16/X-25, one bit.
  function [15:0] crc_step(input [15:0] crc, input data);
    crc_step = {1'b0, crc[15:1]} ^ (crc[0] ^ data ? 16'h8408 : 16'h0000);
  endfunction

  // --- What the cores say: a core that is not meant says 0, so they are ORed. ---

  reg [6:0] reply;
  integer   i;
  always @* begin
    reply = 7'b0;
    for (i = 0; i < CORES; i = i + 1) reply = reply | from_cores[7*i+:7];
  end

  wire takes, rejects, refuses;         // of the frame that is in the receiver
  wire waits;                           // a command of the last accepted frame's core waits for the design clock
  wire data, more, length_bit;          // of its result: this bit, whether there is one, a bit of the length
  assign {length_bit, more, data, waits, refuses, rejects, takes} = reply;

  // --- Receiver. The last 24 bits stand in `tail`, so that a payload comes out of it just in time for a core to
  // hold all of it at Update-DR. The CRC runs 16 bits late: at Update-DR it covers all but the CRC itself. ---

  reg  [23:0]          tail = 24'b0;
  reg  [15:0]          crc = 16'hFFFF;
  reg                  in_frame = 1'b0;
  reg  [LENGTH_BITS:0] length = {LENGTH_BITS + 1{1'b0}};  // of the payload, negative while the frame is too short

  wire [3:0] frame_core = tail[3:0];
  wire [3:0] frame_code = tail[7:4];
  wire       length_is_full = length[LENGTH_BITS] & ~length[LENGTH_BITS-1];  // longer than any payload: stays

  always @(posedge tck)
    if (capturing) begin
      tail <= 24'b0;
      crc <= 16'hFFFF;
      in_frame <= 1'b0;
      length <= ~{{LENGTH_BITS - 2{1'b0}}, 3'd7};  // -8: the core and the code are counted too
    end else if (shifting) begin
      tail <= {tdi, tail[23:1]};
      if (tail[7] & ~tail[8]) in_frame <= 1'b1;
      if (in_frame) crc <= crc_step(crc, tail[8]);
      if (in_frame & ~length_is_full) length <= length + 1'b1;
    end

  wire crc_holds = ~length[LENGTH_BITS] & (tail[23:8] == (~crc ^ length[15:0]));
  wire well_formed = crc_holds & (frame_code == CODE_WRITE | length == {LENGTH_BITS + 1{1'b0}});
  wire obey = updating & well_formed;

  // --- The fate of the last frame, and the last accepted one. A frame that finds no core, or no such code, is
  // accepted too, and returns nothing. ---

  reg       rejected = 1'b0, no_such = 1'b0, refused = 1'b0;
  reg [3:0] last_core = 4'h0;
  reg [3:0] last_code = CODE_NOTHING;

  always @(posedge tck)
    if (updating) begin
      rejected <= ~well_formed | rejects;
      no_such <= well_formed & ~(takes | rejects | refuses);
      refused <= well_formed & refuses;
      if (well_formed & ~rejects & ~refuses) begin
        last_core <= frame_core;
        last_code <= frame_code;
      end
    end

  // --- Sender: head, data, CRC, zeros. `place` counts the bits of the head, stands still at 16 during the data
  // and goes on through the CRC. The CRC is made of what went out, so it holds whatever came from the cores. ---

  reg  [5:0]  place = 6'd0;
  reg  [15:0] answer_crc = 16'hFFFF;
  reg         pending = 1'b0;  // as of Capture-DR

  wire [15:0] head = {SIGNATURE, last_core, last_code, pending, refused, no_such, rejected};
  wire        in_head = place[5:4] == 2'd0;
  wire        behind_head = place[5:4] == 2'd1;
  wire        in_data = behind_head & more;
  wire        in_crc = behind_head & ~more;
  wire        tdo_is_covered = in_head | place[3:0] == 4'd0;

  always @(posedge tck)
    if (capturing) begin
      pending <= waits;
      tdo <= head[0];
      place <= 6'd1;
      answer_crc <= 16'hFFFF;
    end else if (shifting) begin
      tdo <= in_head & head[place[3:0]] | in_data & data | in_crc & (~answer_crc[1] ^ length_bit);
      if (in_head | in_crc) place <= place + 6'd1;
      answer_crc <= tdo_is_covered ? crc_step(answer_crc, tdo) : {1'b0, answer_crc[15:1]};
    end

  initial tdo = 1'b0;

  wire [20:0] frame_length;
  wire        unused_bit;
  assign {unused_bit, frame_length} = {{22 - LENGTH_BITS{1'b0}}, length[LENGTH_BITS-1:0]};
  assign to_cores = {capturing, shifting, tail[0], obey, frame_core, frame_code, frame_length,
                     last_core, last_code, pending, behind_head, place[3:0]};

endmodule

`default_nettype wire

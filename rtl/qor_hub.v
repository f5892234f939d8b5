// The hub at the end of a user chain: it understands a frame while it is shifted in, and answers in the same scan.
//
// Everything here is on TCK. capture and shift are levels, sampled at its rising edge; tdo changes at the rising edge
// too, so it is stable when a TAP samples it at the falling one. TCK may stand still in all other states of the TAP.
`default_nettype none

module qor_hub #(
    parameter CORES = 1  // how many cores this hub has, 1 to 16
) (
    input  wire               tck,
    input  wire               sel,
    input  wire               capture,
    input  wire               shift,
    input  wire               tdi,
    output reg                tdo,
    output wire [30:0]        to_cores,   // to every core alike
    input  wire [7*CORES-1:0] from_cores  // 7 bits per core, in any order
);

  // SEARCH: for the start of the frame. HEADER and PAYLOAD: with the CRC after each. WAIT: until the core has done
  // what it was asked. DATA: with the CRC after it. SENT: the last bit is on tdo. SILENT: zeros until Capture-DR.
  localparam [2:0] SEARCH = 0, HEADER = 1, PAYLOAD = 2, SILENT = 3, HEAD = 4, WAIT = 5, DATA = 6, SENT = 7;

  reg [2:0] state = SILENT;
  wire      answering = state[2];
  wire      in_header = state == HEADER, in_payload = state == PAYLOAD, in_head = state == HEAD, in_data = state == DATA;

  wire capturing = sel & capture;
  wire shifting = sel & shift;

  // --- What the cores say. A core that is not meant says 0, so all are ORed; if two are meant, neither is obeyed. ---

  reg [6:0] reply;
  reg       clash;
  integer   i;
  always @* begin
    reply = 7'b0;
    clash = 1'b0;
    for (i = 0; i < CORES; i = i + 1) begin
      clash = clash | reply[0] & from_cores[7*i];
      reply = reply | from_cores[7*i+:7];
    end
  end

  wire knows, takes, refuses;     // the header: a core has this index and code; wants the payload; will not obey
  wire waits, overlaps;           // the answer has to wait for the design clock; flag 3
  wire more, data;                // payload or data: there is a bit more; that bit, of data
  assign {data, more, overlaps, waits, refuses, takes, knows} = reply & {7{~clash}};

  // --- Counter: 24 bits of header from 8, then 32 of CRC from 32; 32 of the other CRCs, and 8 of the head, from 0
  // or 32. The core counts payload and data. ---

  reg  [5:0] count = 6'd0;
  wire       at_crc = in_header ? count[5] : (in_payload | in_data) & ~more;
  wire       crc_ends = &count[4:0] & (count[5] | ~in_header);

  always @(posedge tck)
    if (shifting)
      case (state)
        SEARCH:        count <= 6'd8;
        WAIT:          count <= 6'd0;
        PAYLOAD, DATA: if (at_crc) count <= count + 6'd1;
        default:       count <= count + 6'd1;
      endcase

  // --- CRC-32: one for the whole scan. It goes round once during each CRC, so it is what it was when that ends. ---

  reg  [31:0] crc = 32'b0;
  wire        head_bit;
  wire        covered = in_head ? head_bit : in_data ? data : tdi;
  wire        agrees = tdi != crc[0];

  always @(posedge tck)
    if (shifting)
      if (state == SEARCH) crc <= 32'hFFFFFFFF;
      else if (at_crc) crc <= {crc[0], crc[31:1]};
      else if (state != WAIT) crc <= {1'b0, crc[31:1]} ^ (crc[0] ^ covered ? 32'hEDB88320 : 32'h0);

  // --- Receiver. While the start is searched for, the last bit of the header is the bit before this one. ---

  reg [23:0] header = 24'b0;  // tag (16), core (4), code (4)
  reg        refused = 1'b0;

  // One TCK after the last bit of a CRC that holds, in whatever state the TAP is then.
  reg        accepted = 1'b0;  // of the header
  reg        obeyed = 1'b0;    // of the payload

  always @(posedge tck) begin
    accepted <= shifting & in_header & crc_ends & agrees;
    obeyed <= shifting & in_payload & crc_ends & agrees;
    if (capturing) header[23] <= 1'b0;
    else if (shifting & (state == SEARCH | in_header & ~count[5])) header <= {tdi, header[23:1]};
    if (shifting & in_header) refused <= refuses | clash;
  end

  always @(posedge tck)
    if (capturing) state <= SEARCH;
    else if (shifting)
      case (state)
        SEARCH:  if (header[23] & ~tdi) state <= HEADER;
        HEADER:  if (at_crc & ~agrees) state <= SILENT;
                 else if (crc_ends) state <= takes ? PAYLOAD : HEAD;
        PAYLOAD: if (at_crc & ~agrees) state <= SILENT;
                 else if (crc_ends) state <= HEAD;
        HEAD:    if (&count[2:0]) state <= WAIT;
        WAIT:    if (~waits) state <= DATA;
        DATA:    if (crc_ends) state <= SENT;
        default: state <= SILENT;
      endcase

  // --- Sender ---

  wire [7:0] head = {4'hA, overlaps, refused, ~knows, 1'b0};
  assign head_bit = head[count[2:0]];

  initial tdo = 1'b0;

  always @(posedge tck)
    if (capturing) tdo <= 1'b1;
    else if (shifting) tdo <= in_head & head_bit | state == WAIT & ~waits | in_data & (more ? data : ~crc[0]);

  assign to_cores = {header, tdi, shifting, answering, in_payload | in_data, accepted, obeyed, shifting & state == SENT};

endmodule

`default_nettype wire

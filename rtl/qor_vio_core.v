// A VIO core: virtual inputs and outputs of a design, on a hub.
//
// Codes 02 and 0A (write), 03, 05, 0B and 0D (read), beside those that every core knows. All registers are 0 at
// power-up; there is no reset, and a reset of the TAP leaves the outputs as they are.
`default_nettype none

module qor_vio_core #(
    parameter INDEX = 0,         // on its user chain, 0 to 15; no two cores of a hub have the same
    parameter ASYNC_IN = 0,      // port widths, 0 to 65535 (255 before version 6.2); of a port of width 0 there
    parameter SYNC_IN = 0,       // is one bit here, which means nothing
    parameter ASYNC_OUT = 0,
    parameter SYNC_OUT = 0,
    parameter EDGE_CAPTURE = 0,  // see pulses on inputs that are shorter than a clock

    parameter MANUFACTURER = 8'h51,  // the rest of the status word
    parameter TYPE = 9,
    parameter MAJOR = 10,
    parameter MINOR = 0,
    parameter REVISION = 0,
    parameter CG_MAJOR = 1,
    parameter CG_MINOR = 0,
    parameter CG_MINOR_ALPHA = 0
) (
    input  wire        tck,
    input  wire [30:0] to_core,
    output wire [6:0]  from_core,

    input  wire                                         clk,        // design clock
    input  wire [ASYNC_IN == 0 ? 0 : ASYNC_IN-1 : 0]   async_in,
    input  wire [SYNC_IN == 0 ? 0 : SYNC_IN-1 : 0]     sync_in,    // synchronous to clk
    output wire [ASYNC_OUT == 0 ? 0 : ASYNC_OUT-1 : 0] async_out,  // changes on TCK
    output wire [SYNC_OUT == 0 ? 0 : SYNC_OUT-1 : 0]   sync_out    // synchronous to clk
);

  localparam [2:0]  WRITE = 3'd2, READ = 3'd3, READ_AGAIN = 3'd5;  // of a code; its bit 3 is set in a repeat
  localparam        PAYLOAD_BITS = 2 * ASYNC_OUT + 17 * SYNC_OUT;
  localparam        ASYNC_RECORD = 4, SYNC_RECORD = 6;  // bits an input
  localparam        RECORD_BITS = ASYNC_RECORD * ASYNC_IN + SYNC_RECORD * SYNC_IN;

  // Where the widths stand in the status word depends on the version.
  localparam        VERSION = MAJOR * 16 + MINOR;
  localparam [39:0] HEAD = {REVISION[7:0], MINOR[7:0], MAJOR[7:0], TYPE[7:0], MANUFACTURER[7:0]};
  localparam [31:0] NARROW = {SYNC_OUT[7:0], ASYNC_OUT[7:0], SYNC_IN[7:0], ASYNC_IN[7:0]};
  localparam [63:0] WIDE = {SYNC_OUT[15:0], ASYNC_OUT[15:0], SYNC_IN[15:0], ASYNC_IN[15:0]};
  localparam [19:0] CG = {CG_MINOR_ALPHA[7:0], CG_MINOR[7:0], CG_MAJOR[3:0]};
  localparam [127:0] STATUS_WORD = VERSION < 8'h62 ? {56'b0, NARROW, HEAD} :
                                   VERSION < 8'hA0 ? {24'b0, WIDE, HEAD} : {4'b0, WIDE, CG, HEAD};

  wire [3:0]  code;
  wire [15:0] tag;
  wire        payload_bit, payload_shift, accepted, obeyed, sent;
  wire        playing, pending, merging;  // trains; a snapshot; with the activity of the record before

  // A repeat of what was done already, by the same tag, is not done again.
  reg  [15:0] written = 16'h0, asked = 16'h0;
  wire        is_write = code[2:0] == WRITE;
  wire        is_read = code[2:0] == READ | code[2:0] == READ_AGAIN;
  wire        was_written = code[3] & tag == written;
  wire        was_asked = code[3] & tag == asked;
  wire        of_another_host = code[3] & tag[15:4] != written[15:4];
  wire        refuses = is_write & ~was_written & (playing | of_another_host);
  wire        asks = accepted & is_read & ~was_asked;

  always @(posedge tck) begin
    if (obeyed) written <= tag;
    if (asks) asked <= tag;
  end

  reg [RECORD_BITS == 0 ? 0 : RECORD_BITS-1 : 0] records = 0;  // what a read delivers, on clk

  qor_core_link #(
      .INDEX(INDEX), .STATUS_WORD(STATUS_WORD), .PAYLOAD_BITS(PAYLOAD_BITS), .RECORD_BITS(RECORD_BITS)
  ) link (
      .tck(tck), .to_core(to_core), .from_core(from_core), .code(code), .tag(tag),
      .payload_bit(payload_bit), .payload_shift(payload_shift), .accepted(accepted), .obeyed(obeyed), .sent(sent),
      .knows_code(is_write | is_read), .takes(is_write & ~was_written & ~refuses), .refuses(refuses),
      .waits(is_write & playing | is_read & pending), .overlaps(is_read & merging), .records(records)
  );

  qor_outputs #(
      .ASYNC(ASYNC_OUT), .SYNC(SYNC_OUT)
  ) outputs (
      .tck(tck), .payload_shift(payload_shift), .payload_bit(payload_bit), .write(obeyed), .busy(playing),
      .clk(clk), .async_out(async_out), .sync_out(sync_out)
  );

  wire take, merge, settled;

  qor_snapshot snapshot (
      .tck(tck), .request(asks), .always_merge(code[2:0] == READ_AGAIN), .delivered(sent & is_read),
      .pending(pending), .merging(merging), .clk(clk), .take(take), .merge(merge), .settled(settled)
  );

  // The record of input 0 is the last to be delivered: digit k of the records is bit RECORD_BITS-1-k.
  generate
    if (RECORD_BITS == 0) begin : without_records
      wire unused = &{1'b0, take, merge, settled};
    end

    if (ASYNC_IN == 0) begin : without_async_in
      wire unused = async_in;
    end else begin : async_port
      localparam TOP = RECORD_BITS - 1;
      wire [ASYNC_IN-1:0] value, up, down, unused_up, unused_down;
      integer             i;
      qor_input_port #(
          .WIDTH(ASYNC_IN), .SYNCHRONOUS(0), .EDGE_CAPTURE(EDGE_CAPTURE)
      ) port (
          .clk(clk), .settled(settled), .take(take),
          .pins(async_in), .value(value), .up(up), .down(down),
          .clocked_up(unused_up), .clocked_down(unused_down)
      );
      always @(posedge clk)
        if (take)
          for (i = 0; i < ASYNC_IN; i = i + 1)
            records[TOP-ASYNC_RECORD*i-:ASYNC_RECORD] <= {
              value[i],
              up[i] | merge & records[TOP-ASYNC_RECORD*i-1],
              down[i] | merge & records[TOP-ASYNC_RECORD*i-2],
              1'b0
            };
    end

    if (SYNC_IN == 0) begin : without_sync_in
      wire unused = sync_in;
    end else begin : sync_port
      // Without edge capture the activity that clk samples is all there is: the same flip-flops.
      localparam TOP = SYNC_RECORD * SYNC_IN - 1, CLOCKED = EDGE_CAPTURE != 0 ? 3 : 1;
      wire [SYNC_IN-1:0] value, up, down, clocked_up, clocked_down;
      integer            i;
      qor_input_port #(
          .WIDTH(SYNC_IN), .SYNCHRONOUS(1), .EDGE_CAPTURE(EDGE_CAPTURE)
      ) port (
          .clk(clk), .settled(settled), .take(take),
          .pins(sync_in), .value(value), .up(up), .down(down),
          .clocked_up(clocked_up), .clocked_down(clocked_down)
      );
      always @(posedge clk)
        if (take)
          for (i = 0; i < SYNC_IN; i = i + 1)
            records[TOP-SYNC_RECORD*i-:SYNC_RECORD] <= {
              value[i],
              up[i] | merge & records[TOP-SYNC_RECORD*i-1],
              down[i] | merge & records[TOP-SYNC_RECORD*i-2],
              clocked_up[i] | merge & records[TOP-SYNC_RECORD*i-CLOCKED],
              clocked_down[i] | merge & records[TOP-SYNC_RECORD*i-CLOCKED-1],
              1'b0
            };
    end
  endgenerate

endmodule

`default_nettype wire

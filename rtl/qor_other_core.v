// A core that delivers its status word and knows nothing else, to keep a place behind a hub for another type.
`default_nettype none

module qor_other_core #(
    parameter INDEX = 0,  // on its user chain, 0 to 15
    parameter TYPE = 7,
    parameter MANUFACTURER = 8'h51,
    parameter MAJOR = 10,
    parameter MINOR = 0,
    parameter REVISION = 0
) (
    input  wire        tck,
    input  wire [46:0] to_core,
    output wire [6:0]  from_core
);

  localparam [39:0] HEAD = {REVISION[7:0], MINOR[7:0], MAJOR[7:0], TYPE[7:0], MANUFACTURER[7:0]};

  wire        unused_capturing, unused_shifting, unused_payload_bit, unused_obey, unused_result_seen;
  wire [20:0] unused_frame_length;
  wire [3:0]  unused_frame_code;

  qor_core_link #(
      .INDEX(INDEX), .STATUS_WORD({88'b0, HEAD}), .RECORD_BITS(0)
  ) link (
      .tck(tck), .to_core(to_core), .from_core(from_core),
      .capturing(unused_capturing), .shifting(unused_shifting), .payload_bit(unused_payload_bit),
      .frame_length(unused_frame_length), .frame_code(unused_frame_code), .obey(unused_obey),
      .result_seen(unused_result_seen), .knows_code(1'b0), .rejects(1'b0), .refuses(1'b0),
      .pending(1'b0), .records(1'b0)
  );

endmodule

`default_nettype wire

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
    input  wire [30:0] to_core,
    output wire [6:0]  from_core
);

  localparam [39:0] HEAD = {REVISION[7:0], MINOR[7:0], MAJOR[7:0], TYPE[7:0], MANUFACTURER[7:0]};

  wire        unused_bit, unused_shift, unused_accepted, unused_obeyed, unused_sent;
  wire [3:0]  unused_code;
  wire [15:0] unused_tag;

  qor_core_link #(
      .INDEX(INDEX), .STATUS_WORD({88'b0, HEAD})
  ) link (
      .tck(tck), .to_core(to_core), .from_core(from_core), .code(unused_code), .tag(unused_tag),
      .payload_bit(unused_bit), .payload_shift(unused_shift), .accepted(unused_accepted), .obeyed(unused_obeyed),
      .sent(unused_sent), .knows_code(1'b0), .takes(1'b0), .refuses(1'b0), .waits(1'b0), .overlaps(1'b0),
      .records(1'b0)
  );

endmodule

`default_nettype wire

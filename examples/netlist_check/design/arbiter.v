// Bus arbiter: of four requesters the one with the lowest number wins; a masked one does not ask.
// 'lock' keeps the bus for requester 'owner' as long as that one asks. 'alarm' reports a parity
// error in the requests.
module arbiter (
    input  [3:0] req,
    input  [3:0] mask,
    input        lock,
    input  [1:0] owner,
    input        parity,
    output [3:0] grant,
    output       busy,
    output       alarm
);
    wire [3:0] ask = req & ~mask;
    wire [3:0] first = {ask[3] & ~|ask[2:0], ask[2] & ~|ask[1:0], ask[1] & ~ask[0], ask[0]};
    wire       keep = lock & ask[owner];

    assign grant = keep ? 4'b0001 << owner : first;
    assign busy  = |ask;
    assign alarm = busy & (^req ^ parity);
endmodule

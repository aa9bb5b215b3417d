// An eight-bit processor: an accumulator, four registers, and a program of sixteen instructions in
// look-up tables. It looks for the primes below 256 and shows the last one that it found.
module processor(input clk, input reset, input [3:0] keys, output reg [7:0] shown, output busy);
    localparam LOAD = 3'd0, ADD = 3'd1, SUBTRACT = 3'd2, STORE = 3'd3;
    localparam JUMP_CARRY = 3'd4, JUMP_ZERO = 3'd5, JUMP = 3'd6, SHOW = 3'd7;

    reg [3:0] counter;
    reg [7:0] accumulator, candidate, divisor, rest, keyed;
    reg carry, zero;

    // operation, register or target of a jump
    reg [6:0] instruction;
    always @* case (counter)
        4'd0: instruction = {LOAD, 4'd0};        // the next candidate
        4'd1: instruction = {ADD, 4'd4};
        4'd2: instruction = {STORE, 4'd0};
        4'd3: instruction = {LOAD, 4'd5};        // divisors from 2 on
        4'd4: instruction = {STORE, 4'd1};
        4'd5: instruction = {LOAD, 4'd0};
        4'd6: instruction = {SUBTRACT, 4'd1};    // the rest, by subtracting
        4'd7: instruction = {JUMP_ZERO, 4'd14};
        4'd8: instruction = {JUMP_CARRY, 4'd6};
        4'd9: instruction = {LOAD, 4'd1};
        4'd10: instruction = {ADD, 4'd4};
        4'd11: instruction = {STORE, 4'd1};
        4'd12: instruction = {JUMP, 4'd5};
        4'd13: instruction = {JUMP, 4'd0};
        4'd14: instruction = {LOAD, 4'd1};       // the first divisor; itself for a prime
        default: instruction = {SHOW, 4'd0};
    endcase

    reg [7:0] operand;
    always @* case (instruction[2:0])
        3'd0: operand = candidate;
        3'd1: operand = divisor;
        3'd2: operand = rest;
        3'd3: operand = keyed;
        3'd4: operand = 8'd1;
        default: operand = 8'd2;
    endcase

    wire [8:0] sum = instruction[6:4] == SUBTRACT ? {1'b0, accumulator} + {1'b0, ~operand} + 9'd1
                                                  : {1'b0, accumulator} + {1'b0, operand};
    wire isJump = instruction[6:4] == JUMP || (instruction[6:4] == JUMP_CARRY && carry) ||
                  (instruction[6:4] == JUMP_ZERO && zero);
    assign busy = isJump ^ ^keyed;

    always @(posedge clk)
        if (reset) begin
            counter <= 0;
            candidate <= 1;
            shown <= 0;
            keyed <= 0;
        end else begin
            counter <= isJump ? instruction[3:0] : counter + 4'd1;
            keyed <= {keyed[3:0] ^ keyed[7:4], keys};
            case (instruction[6:4])
                LOAD: accumulator <= operand;
                ADD, SUBTRACT: begin
                    accumulator <= sum[7:0];
                    carry <= sum[8];
                    zero <= sum[7:0] == 0;
                end
                STORE: case (instruction[1:0])
                    2'd0: candidate <= accumulator;
                    2'd1: divisor <= accumulator;
                    default: rest <= accumulator;
                endcase
                SHOW: if (accumulator == candidate) shown <= accumulator;
                default: ;
            endcase
        end
endmodule

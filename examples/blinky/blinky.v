// A light that runs to and fro over five LEDs.

`include "blinky.vh"

// Raises `tick` for one clock in every PERIOD clocks.
module prescaler #(
    parameter PERIOD = 2
) (
    input  clk,
    output tick
);
  reg [$clog2(PERIOD)-1:0] count = 0;
  assign tick = count == PERIOD - 1;
  always @(posedge clk) count <= tick ? 0 : count + 1;
endmodule

module blinky (
    input            clk,
    output reg [4:0] led = 5'b00001
);
  reg  back = 0;
  wire step;

  prescaler #(`CLOCK_HZ / `STEPS_PER_SECOND) pace (clk, step);

  always @(posedge clk)
    if (step) begin
      led <= back ? led >> 1 : led << 1;
      if (led[3] & !back) back <= 1;
      if (led[1] & back) back <= 0;
    end
endmodule

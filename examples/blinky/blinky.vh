// The board: clock in hertz, and how many steps the light takes in a second.
`define CLOCK_HZ 12_000_000
`define STEPS_PER_SECOND 8

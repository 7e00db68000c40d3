// A pedestrian crossing: cars go until somebody presses the button, then wait their turn.

// Counts seconds down to zero and stays there until it is loaded again.
module timer #(
    parameter int WIDTH = 4
) (
    input  logic             clk,
    input  logic             second,
    input  logic             load,
    input  logic [WIDTH-1:0] value,
    output logic             done
);
  logic [WIDTH-1:0] left;
  assign done = left == '0;
  always_ff @(posedge clk)
    if (load) left <= value;
    else if (second & !done) left <= left - 1'b1;
endmodule

module crossing (
    input  logic       clk,
    input  logic       rst,
    input  logic       second,     // high for one clock in each second
    input  logic       button,
    output logic [2:0] cars,       // red, amber, green
    output logic       walk,
    output logic       wait_lamp   // "your wish is known"
);
  typedef enum logic [2:0] {CARS, AMBER, CLEAR, WALK, HURRY, READY} phase_t;
  typedef struct packed {
    logic red, amber, green;
  } lights_t;

  phase_t phase, next;
  lights_t lights;
  logic [3:0] seconds;             // that the next phase lasts
  logic wanted, done, advance;

  timer #(.WIDTH(4)) clockwork (.clk, .second, .done, .load(rst | advance), .value(seconds));

  always_comb begin
    unique case (phase)
      CARS:  begin next = AMBER; seconds = 3; end
      AMBER: begin next = CLEAR; seconds = 2; end
      CLEAR: begin next = WALK; seconds = 8; end
      WALK:  begin next = HURRY; seconds = 4; end
      HURRY: begin next = READY; seconds = 2; end
      default: begin next = CARS; seconds = 15; end   // at the least, between two walks
    endcase
    advance = done & (wanted | phase != CARS);
  end

  always_ff @(posedge clk)
    if (rst) begin
      phase  <= CARS;
      wanted <= 1'b0;
    end else begin
      if (advance) phase <= next;
      wanted <= (wanted & !walk) | button;
    end

  assign lights.green = phase == CARS;
  assign lights.amber = phase == AMBER | phase == READY;
  assign lights.red   = phase != CARS & phase != AMBER;
  assign cars         = lights;
  assign walk         = phase == WALK;
  assign wait_lamp    = wanted & !walk;
endmodule

-- What the models of the clock primitives share: whole numbers of 64 bits, and the wires between
-- their parts.
--
-- A number that needs more than 31 bits is a time, so many femtoseconds: VHDL-93 has no other whole
-- numbers of 64 bits. The simulator must count in femtoseconds.
use std.textio.all;

package vorkel_model is
  -- The state of an input, see vorkel_model_input.
  type input_state is record
    locked : boolean;
    locks : natural;   -- how many there have been
    count : natural;   -- of the latest edge, modulo COUNTS
    stamp : time;      -- its time
    whole : time;      -- the period: whole + rest / parts fs
    rest : natural;
    parts : positive;
    num : natural;     -- the frequency, num / den MHz; 0 while it is not known
    den : time;
  end record;

  -- A number for each output of a loop.
  type output_numbers is array (0 to 6) of integer;

  constant UNKNOWN : input_state := (false, 0, 0, 0 fs, 0 fs, 0, 1, 0, 1 fs);

  -- Edges are counted up to here and then from 0 again.
  constant COUNTS : positive := 2 ** 30;
  -- How many edges `to_edge` is behind `from_edge`; negative when it is before it.
  function edges_between(from_edge, to_edge : natural) return integer;
  function next_edge(edge : natural; by : natural) return natural;

  -- Quotient and remainder; `b` is above 0.
  procedure divide(a, b : in time; quotient, remainder : out time);
  function to_natural(value : time) return natural;
  function to_real(value : time) return real;
  -- With so many decimals.
  function fixed(value : real; decimals : natural) return string;

  -- Whether a / b < c / d.
  function is_less(a, b, c, d : time) return boolean;

  -- What an instance says of an attribute or a limit.
  function choose(condition : boolean; one, other : integer) return integer;
end package;

package body vorkel_model is
  function edges_between(from_edge, to_edge : natural) return integer is
    variable between : integer;
  begin
    between := to_edge - from_edge;
    if between >= COUNTS / 2 then
      between := between - COUNTS;
    elsif between < -(COUNTS / 2) then
      between := between + COUNTS;
    end if;
    return between;
  end function;

  function next_edge(edge : natural; by : natural) return natural is
  begin
    return (edge + by mod COUNTS) mod COUNTS;
  end function;

  -- Digit by digit: a quotient of two times is an integer of 32 bits for some simulators.
  procedure divide(a, b : in time; quotient, remainder : out time) is
    variable step : time := b;
    variable weight : time := 1 fs;
    variable rest : time := a;
    variable result : time := 0 fs;
  begin
    while step <= rest / 2 loop
      step := step * 2;
      weight := weight * 2;
    end loop;
    while weight >= 1 fs loop
      if rest >= step then
        rest := rest - step;
        result := result + weight;
      end if;
      step := step / 2;
      weight := weight / 2;
    end loop;
    quotient := result;
    remainder := rest;
  end procedure;

  function to_natural(value : time) return natural is
  begin
    return value / 1 fs;
  end function;

  function to_real(value : time) return real is
    variable high : time;
    variable low : time;
  begin
    divide(value, 1 us, high, low);
    return real(high / 1 fs) * 1.0e9 + real(low / 1 fs);
  end function;

  function fixed(value : real; decimals : natural) return string is
    variable text : line;
  begin
    write(text, value, right, 0, decimals);
    return text.all;
  end function;

  -- By the whole parts, and where these are equal by the rests, turned over.
  function is_less(a, b, c, d : time) return boolean is
    variable a1 : time := a;
    variable b1 : time := b;
    variable c1 : time := c;
    variable d1 : time := d;
    variable left_whole, left_rest, right_whole, right_rest : time;
  begin
    loop
      divide(a1, b1, left_whole, left_rest);
      divide(c1, d1, right_whole, right_rest);
      if left_whole /= right_whole then
        return left_whole < right_whole;
      end if;
      if left_rest = 0 fs or right_rest = 0 fs then
        return right_rest /= 0 fs;
      end if;
      a1 := d1;
      c1 := b1;
      b1 := right_rest;
      d1 := left_rest;
    end loop;
  end function;

  function choose(condition : boolean; one, other : integer) return integer is
  begin
    if condition then
      return one;
    end if;
    return other;
  end function;
end package body;

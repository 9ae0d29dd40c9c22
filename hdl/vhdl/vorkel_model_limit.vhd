-- A limit of the device: a frequency of a clock primitive must be from a minimum to a maximum. What
-- breaks it is told once, when it begins. Frequencies are quotients, MHz, and compared exactly.
use work.vorkel_model.all;

entity vorkel_model_limit is
  generic (
    WHAT : string := "the clock";
    MUL : positive := 1;  -- how many times of the input
    DIV : positive := 1;
    MIN_NUM : natural := 0;
    MIN_DEN : positive := 1;
    MAX_NUM : natural := 0;  -- 0: there is none
    MAX_DEN : positive := 1
  );
  port (
    num : in natural;  -- of the input; 0: not known
    den : in time;
    broken : out boolean := false
  );
end entity;

architecture simulation of vorkel_model_limit is
begin
  process (num, den)
    variable was_broken : boolean := false;
    variable above, below : time;
    variable too_low, too_high : boolean;

    procedure tell(bound_words : string; bound_num, bound_den : natural) is
    begin
      assert false
        report WHAT & " is at " & fixed(to_real(above) / to_real(below), 6) & " MHz, " &
               bound_words & fixed(real(bound_num) / real(bound_den), 6) & " MHz"
        severity error;
    end procedure;
  begin
    too_low := false;
    too_high := false;
    if num /= 0 then
      above := (num * 1 fs) * MUL;
      below := den * DIV;
      too_low := is_less(above, below, MIN_NUM * 1 fs, MIN_DEN * 1 fs);
      too_high := MAX_NUM /= 0 and is_less(MAX_NUM * 1 fs, MAX_DEN * 1 fs, above, below);
    end if;
    if too_low and not was_broken then
      tell("below ", MIN_NUM, MIN_DEN);
    elsif too_high and not was_broken then
      tell("above ", MAX_NUM, MAX_DEN);
    end if;
    was_broken := too_low or too_high;
    broken <= was_broken;
  end process;
end architecture;

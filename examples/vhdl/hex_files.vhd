-- SPDX-License-Identifier: MIT
-- The words of the .hex files of `quarzel vectors`.

use std.textio.all;

package hex_files is
  -- Go to the next line that holds words, and not a comment alone.
  procedure next_line(file words : text; variable words_of_line : inout line);
  -- Take the next word of a line.
  procedure read_word(variable words_of_line : inout line; word : out natural);
  -- The word of the next line, where there is one a line.
  procedure next_word(file words : text; word : out natural);
end package;


package body hex_files is

  procedure next_line(file words : text; variable words_of_line : inout line) is
  begin
    loop
      assert not endfile(words) report "the file has too few words" severity failure;
      readline(words, words_of_line);
      exit when words_of_line'length > 0 and words_of_line(words_of_line'left) /= '/';
    end loop;
  end;

  procedure read_word(variable words_of_line : inout line; word : out natural) is
    variable digit : character;
    variable good : boolean;
    variable value : natural := 0;
  begin
    loop
      read(words_of_line, digit, good);
      exit when not good or digit = ' ';
      case digit is
        when '0' to '9' => value := 16 * value + character'pos(digit) - character'pos('0');
        when 'a' to 'f' => value := 16 * value + character'pos(digit) - character'pos('a') + 10;
        when others => report "this is no hexadecimal word" severity failure;
      end case;
    end loop;
    word := value;
  end;

  procedure next_word(file words : text; word : out natural) is
    variable words_of_line : line;
  begin
    next_line(words, words_of_line);
    read_word(words_of_line, word);
    deallocate(words_of_line);
  end;

end package body;

-- Compiled into the library "util": a package with its body.
package util_pkg is
  constant DEPTH : natural := 4;
  function twice(v : natural) return natural;
end package util_pkg;

package body util_pkg is
  function twice(v : natural) return natural is
  begin
    return 2 * v;
  end function;
end package body util_pkg;

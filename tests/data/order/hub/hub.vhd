use work.a.all;
use work.b.all;
use work.c.all;
package hub is
end package hub;

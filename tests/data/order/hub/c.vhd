use work.hub.all;
use work.d.all;
package c is
end package c;

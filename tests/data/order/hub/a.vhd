use work.hub.all;
package a is
end package a;

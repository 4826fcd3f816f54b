use work.hub.all;
package b is
end package b;

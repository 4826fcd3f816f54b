use work.c.all;
package d is
end package d;

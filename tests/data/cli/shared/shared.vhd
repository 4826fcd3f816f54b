package base is
end package;
use work.base.all;
package common is
end package;
use work.common.all;
package user_a is
end package;
use work.common.all;
package user_b is
end package;

// Object types, relations and properties of the Verilog procedural interface, with the values
// of IEEE 1364.
#pragma once

inline constexpr int vpiUndefined = -1;  // an integer property that the object does not have

inline constexpr int vpiName = 2;
inline constexpr int vpiLineNo = 6;
inline constexpr int vpiDefName = 9;
inline constexpr int vpiModule = 32;
inline constexpr int vpiNet = 36;
inline constexpr int vpiPort = 44;
inline constexpr int vpiLowConn = 80;

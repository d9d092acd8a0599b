#pragma once

namespace varnel {

/// Writes a number with `precision` decimals and rounds like `%.pf`: from the number's exact binary value to
/// the nearest decimal, a half to the even one. Returns the end of the text, which has no terminating zero.
/// There must be enough room for the number and its decimals.
char* putDecimal(char* out, char* end, double number, int precision);

}  // namespace varnel

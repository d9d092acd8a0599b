#pragma once

namespace varnel {

/// Writes a number with so many decimals, rounded as `%.pf` does: the number's exact binary value to the
/// nearest decimal, a half to the even one. Returns the end of what was written, which has no terminating
/// zero; the room must do for the number and its decimals.
char* putDecimal(char* out, char* end, double number, int precision);

}  // namespace varnel

#pragma once

namespace varnel {

/// Every program calls this first. If standard input, output, or error is closed, opens it on /dev/null,
/// since otherwise the next opened file would get its number. Writing to a standard output that was closed
/// stays an error. A file that grows too long becomes an error of the write call, not a signal that ends the
/// program.
void startProgram();

}  // namespace varnel

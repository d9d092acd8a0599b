#pragma once

namespace varnel {

/// What every program does before anything else. Standard input, output or error that came closed is opened
/// on /dev/null, for the next file that is opened would take its place; writing to a standard output that
/// came closed stays an error. A file that grows too long is an error of whoever writes it, not the end by a
/// signal.
void startProgram();

}  // namespace varnel

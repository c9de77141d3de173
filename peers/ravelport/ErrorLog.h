#pragma once
// Where reports are kept: one JSON object per line, appended, in a file private to the
// user (errors can carry data of the ledger).

#include <string>

namespace ravelport {

// $POC_ERROR_LOG, else $XDG_STATE_HOME/poc-dorvantos/errors.log, with ~/.local/state
// when XDG_STATE_HOME is unset or not absolute.
std::string ErrorLogPath();

// Appends one line (a newline is added) with a single write, so that lines of several
// processes never interleave. Creates the file with mode 0600 and, for the default
// place, its directories with mode 0700. Throws std::runtime_error naming the file.
void AppendLine(const std::string& path, const std::string& line);

}  // namespace ravelport

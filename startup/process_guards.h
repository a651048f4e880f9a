#pragma once

namespace initialiser {

// Makes the process independent of how it was started, before anything is opened or printed:
// - messages carry the program's own name, and a line of usual length is one write;
// - a message can't end the process when nobody reads it, nor land in a file that was opened under
//   the number of a closed standard error;
// - a limit on the size of files fails a write instead of ending the process.
// What can't be set stays as it was.
void guard_process() noexcept;

} // namespace initialiser

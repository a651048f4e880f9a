#pragma once

namespace initialiser {

// Makes the process independent of how it was started, before anything is opened or printed:
// - messages carry the program's own name, and a line of usual length is one write;
// - a message that nobody reads can't end the process;
// - where standard error is closed, no file gets its number, so no message lands in a file;
// - a limit on the size of files fails a write instead of ending the process.
// What can't be set stays as it was.
void guard_process() noexcept;

} // namespace initialiser

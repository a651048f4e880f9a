#include "device.h"

#include <fcntl.h>
#include <unistd.h>

#include <cstdlib>

// on_a_device SCRIPT ARGUMENT: runs a bash script on a device of its own, new from the factory. The
// script finds the program at $program. Both are opened first: the device may hide them.
int main(int /*count*/, char** arguments) {
    const std::string script = "/proc/self/fd/" + std::to_string(open(arguments[1], O_RDONLY));
    const initialiser::vorl_device device;
    setenv("program", device.program().c_str(), 1);
    return execlp("bash", "bash", script.c_str(), arguments[2], nullptr);
}

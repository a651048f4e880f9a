#include "startup/process_guards.h"
#include "startup/start_up.h"

int main() {
    initialiser::guard_process();
    return initialiser::run_start_up();
}

#include "foundation/file_system.h"
#include "foundation/paths.h"
#include "startup/dataset_phase.h"
#include "startup/localtime_link.h"
#include "startup/process_guards.h"
#include "startup/storage.h"

#include <err.h>

#include <cstdlib>

namespace initialiser {
namespace {

// One start-up: six phases in a fixed order, each working on what the ones before left on disk.
// Returns the exit status. It is 0 at the end, whatever was found and corrected on the way.
int start_up() noexcept {
    prepare_storage();
    migrate_legacy_icutz();
    discard(cleanup_marker);
    discard(legacy_item);
    try {
        select_and_activate_dataset();
    } catch (...) {
        warn("The time-zone links could not be reset");
        // Stop here: without a zoneinfo link, the zone of a localtime link in the old place looks
        // missing, and the repair would set the default zone.
        return EXIT_FAILURE;
    }
    try {
        repair_localtime_link();
    } catch (...) {
        warn("The localtime link could not be set");
        return EXIT_FAILURE;
    }
    return EXIT_SUCCESS;
}

} // namespace
} // namespace initialiser

int main() {
    initialiser::guard_process();
    return initialiser::start_up();
}

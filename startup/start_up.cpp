#include "startup/start_up.h"

#include "foundation/file_system.h"
#include "foundation/paths.h"
#include "startup/cleanup_marker.h"
#include "startup/dataset_phase.h"
#include "startup/legacy_icu_link.h"
#include "startup/localtime_link.h"
#include "startup/storage.h"

#include <err.h>

#include <cstdlib>

namespace initialiser {

int run_start_up() noexcept {
    try {
        prepare_storage();
        migrate_legacy_icutz();
        remove_cleanup_marker();
        discard(legacy_item);
        select_and_activate_dataset();
    } catch (...) {
        warn("The time-zone links could not be reset");
        // Not the localtime link as well: seen through a zoneinfo link that isn't there, the user's
        // zone would look invalid and be lost. The next start-up tries again.
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

} // namespace initialiser

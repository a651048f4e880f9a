#include "startup/legacy_icu_link.h"

#include "foundation/file_system.h"
#include "foundation/paths.h"

#include <err.h>

namespace initialiser {

void migrate_legacy_icutz() {
    if (exists(legacy_icu_link) && !exists(icu_link)) {
        try {
            create_symlink(read_symlink(legacy_icu_link), icu_link);
        } catch (...) {
            warn("Could not migrate %s to %s", legacy_icu_link.c_str(), icu_link.c_str());
        }
    }
    if (exists(legacy_icu_link)) {
        try {
            remove(legacy_icu_link);
        } catch (...) {
            warn("Could not remove %s", legacy_icu_link.c_str());
        }
    }
}

} // namespace initialiser

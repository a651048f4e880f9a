#include "startup/storage.h"

#include "foundation/data_protection.h"
#include "foundation/descriptor.h"
#include "foundation/file_system.h"
#include "foundation/paths.h"
#include "foundation/repeat_interrupted.h"

#include <err.h>
#include <fcntl.h>

#include <string>

namespace initialiser {
namespace {

void set_directory_protection(const std::string& path) noexcept {
    const vorl_descriptor directory{
        repeat_interrupted([&] { return ::open(path.c_str(), O_RDONLY | O_CLOEXEC); })};
    if (directory.is_open()) {
        control_protection(directory.number(), set_class_command, always_readable);
    }
}

} // namespace

void prepare_storage() noexcept {
    set_directory_protection(storage_area);
    set_directory_protection(stored_datasets);
}

void migrate_legacy_icutz() noexcept {
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

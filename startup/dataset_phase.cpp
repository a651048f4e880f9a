#include "startup/dataset_phase.h"

#include "dataset/dataset.h"
#include "startup/cleanup_marker.h"
#include "startup/current_links.h"
#include "startup/version_diff_record.h"

#include <err.h>

#include <string>

namespace initialiser {
namespace {

std::string current_path_or_reset() {
    try {
        return read_current_dataset_path();
    } catch (...) {
        warn("Invalid current symlinks; resetting to system partition");
        vorl_dataset::reset_to_system();
        return {};
    }
}

bool usable(const vorl_dataset& current, const vorl_dataset& system) {
    return current.compatible_with(system) && !system.newer_than(current);
}

void select_and_activate() {
    const vorl_dataset system;
    const std::string latest_path = read_latest_dataset_path();
    const vorl_dataset current{current_path_or_reset()};

    const bool current_is_usable = usable(current, system);
    if (!current_is_usable) {
        warn("Symlink points at data incompatible with installed system");
        vorl_dataset::reset_to_system();
        touch_cleanup_marker();
    }
    if (latest_path.empty()) {
        return;
    }

    // `current` is what the links named at the start-up. It stays the measure of an update even
    // when it has just been rejected; what the update then replaces is `active`.
    const vorl_dataset& active = current_is_usable ? current : system;
    const vorl_dataset latest{latest_path};
    if (!latest.compatible_with(system) || !latest.newer_than(current)) {
        warn("New update not compatible or older version: %s vs. %s", latest.version_text().c_str(),
             current.version_text().c_str());
        return;
    }
    latest.activate();
    if (!active.same_path(system)) {
        touch_cleanup_marker();
    }
    write_version_diff_record(active.version_text(), latest.version_text());
}

} // namespace

void select_and_activate_dataset() {
    try {
        select_and_activate();
    } catch (...) {
        warn("Unable to locate data; resetting to system partition");
        vorl_dataset::reset_to_system();
    }
}

} // namespace initialiser

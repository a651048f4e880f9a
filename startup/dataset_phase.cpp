#include "startup/dataset_phase.h"

#include "dataset/dataset.h"
#include "foundation/file_system.h"
#include "foundation/paths.h"
#include "startup/notices.h"

#include <err.h>

#include <string>

namespace initialiser {

std::string dataset_path_of_zoneinfo_link(const std::string& target) {
    if (target == system_zoneinfo) {
        return {};
    }
    if (target.starts_with(stored_datasets)) {
        const std::string::size_type end_of_path = target.rfind('/');
        // The data set's own name has at least one byte.
        if (end_of_path > stored_datasets.size()) {
            return target.substr(0, end_of_path);
        }
    }
    warn("Bad zoneinfo link %s", target.c_str());
    throw no_error_number;
}

namespace {

std::string read_latest_dataset_path() {
    return read_symlink(latest_link);
}

std::string read_current_dataset_path() {
    return dataset_path_of_zoneinfo_link(read_symlink(zoneinfo_link));
}

std::string read_current_dataset_path_or_reset_links() {
    try {
        return read_current_dataset_path();
    } catch (...) {
        warn("Invalid current symlinks; resetting to system partition");
        vorl_dataset::reset_to_system();
        return {};
    }
}

void install_update(const vorl_dataset& update, const vorl_dataset& replaced,
                    const vorl_dataset& system) {
    update.activate();
    if (!replaced.same_path(system)) {
        touch_cleanup_marker();
    }
    write_version_diff_record(replaced.version_text(), update.version_text());
}

void select_and_activate() {
    const vorl_dataset system;
    const std::string latest_path = read_latest_dataset_path();
    const vorl_dataset current{read_current_dataset_path_or_reset_links()};

    const bool current_is_usable = current.compatible_with(system) && !system.newer_than(current);
    if (!current_is_usable) {
        warn("Symlink points at data incompatible with installed system");
        vorl_dataset::reset_to_system();
        touch_cleanup_marker();
    }
    if (latest_path.empty()) {
        return;
    }

    // An update must be newer than the data set that the zoneinfo link named when the start-up
    // began, even when that data set has just been rejected. In that case the update replaces the
    // system data set.
    const vorl_dataset update{latest_path};
    if (!update.compatible_with(system) || !update.newer_than(current)) {
        warn("New update not compatible or older version: %s vs. %s", update.version_text().c_str(),
             current.version_text().c_str());
        return;
    }
    install_update(update, current_is_usable ? current : system, system);
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

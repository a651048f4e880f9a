#include "startup/current_links.h"

#include "foundation/file_system.h"
#include "foundation/paths.h"

#include <err.h>

namespace initialiser {
namespace {

constexpr int bad_link = -1; // no system call failed: there is no error number

} // namespace

std::string read_latest_dataset_path() {
    return read_symlink(latest_link);
}

std::string read_current_dataset_path() {
    return dataset_path_of_zoneinfo_link(read_symlink(zoneinfo_link));
}

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
    throw bad_link;
}

} // namespace initialiser

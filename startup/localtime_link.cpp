#include "startup/localtime_link.h"

#include "foundation/file_system.h"
#include "foundation/paths.h"

#include <err.h>

#include <string>

namespace initialiser {
namespace {

void replace_localtime_link(const std::string& target) {
    discard(localtime_link);
    create_symlink(target, localtime_link);
}

void accept_or_correct() {
    std::string target = read_symlink(localtime_link);
    if (target.starts_with(zoneinfo_link)) {
        return;
    }
    if (!target.starts_with(old_zoneinfo)) {
        throw no_error_number;
    }
    target.replace(0, old_zoneinfo.size(), zoneinfo_link);
    warn("Correcting localtime link to %s", target.c_str());
    if (!exists(target)) {
        throw no_error_number;
    }
    replace_localtime_link(target);
}

} // namespace

void repair_localtime_link() {
    try {
        accept_or_correct();
    } catch (...) {
        warn("localtime link invalid; resetting to %s", default_zone.c_str());
        replace_localtime_link(default_localtime);
    }
}

} // namespace initialiser

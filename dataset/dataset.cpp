#include "dataset/dataset.h"

#include "dataset/icu.h"
#include "dataset/zoneinfo.h"
#include "foundation/paths.h"

#include <err.h>

#include <algorithm>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>

namespace initialiser {
namespace {

// The system's tz database names only its tz release, such as 2019c. An updater numbers the data
// sets of a release from 1.0 on, and the system's counts as the first of them.
constexpr auto system_version_suffix = ".1.0";

bool is_among_stored_datasets(const std::string& path) {
    return path.size() > stored_datasets.size() && path.starts_with(stored_datasets);
}

} // namespace

vorl_dataset::vorl_dataset(std::string path) : path_(std::move(path)) {
    create_components();
}

void vorl_dataset::create_components() {
    const auto zoneinfo = std::make_shared<vorl_zoneinfo>(path_);
    if (path_.empty()) {
        version_text_ = zoneinfo->version_text() + system_version_suffix;
    } else if (is_among_stored_datasets(path_)) {
        version_text_ = path_.substr(stored_datasets.size());
    } else {
        warn("vorl_dataset::create_components: bad path %s", path_.c_str());
        throw std::invalid_argument("badpath");
    }
    version_.parse(version_text_);
    components_.push_back(zoneinfo);
    components_.push_back(std::make_shared<vorl_icu>(path_));
}

bool vorl_dataset::compatible_with(const vorl_dataset& other) const {
    return std::ranges::equal(
        components_, other.components_,
        [](const auto& own, const auto& others) { return own->compatible_schema(*others); });
}

bool vorl_dataset::newer_than(const vorl_dataset& other) const {
    return version_.newer_than(other.version_);
}

bool vorl_dataset::same_path(const vorl_dataset& other) const {
    return path_ == other.path_;
}

void vorl_dataset::activate() const {
    for (const auto& component : components_) {
        component->install_links();
    }
}

void vorl_dataset::reset_to_system() {
    vorl_dataset{}.activate();
}

} // namespace initialiser

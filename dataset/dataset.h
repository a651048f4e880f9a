#pragma once

#include "dataset/component.h"
#include "foundation/version.h"

#include <memory>
#include <string>
#include <vector>

namespace initialiser {

// One complete set of time-zone data: where it lies, its version, and its two components. The empty
// path is the system data set. Any other is a stored data set's directory, named by its version
// text. After its construction a data set never changes, and it is never copied.
class vorl_dataset {
public:
    // Builds the data set at `path`, or the system data set. For a path that is neither empty nor
    // below the directory of the stored data sets, prints "vorl_dataset::create_components: bad
    // path PATH" and throws std::invalid_argument ("badpath"). Prints and throws what building the
    // version and the components does.
    explicit vorl_dataset(std::string path = {});
    vorl_dataset(const vorl_dataset&) = delete;
    vorl_dataset& operator=(const vorl_dataset&) = delete;

    // True when each component is compatible with the other data set's component of its kind.
    bool compatible_with(const vorl_dataset& other) const;
    bool newer_than(const vorl_dataset& other) const;
    bool same_path(const vorl_dataset& other) const;

    // Points the system's links at this data set: the zoneinfo link, then the ICU link. Throws the
    // error number of the first link that can't be made; what was done before it stays done.
    void activate() const;

    // The version as text, for messages and the record: a stored data set's directory name, or the
    // system's tz release followed by ".1.0".
    std::string version_text() const { return version_text_; }

    // Builds a fresh system data set and activates it. Throws what either throws.
    static void reset_to_system();

private:
    void create_components();

    vorl_version version_;
    std::string version_text_;
    std::string path_;
    std::vector<std::shared_ptr<vorl_dataset_component>> components_;
};

} // namespace initialiser

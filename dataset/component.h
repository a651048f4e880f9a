#pragma once

#include <string>
#include <utility>

namespace initialiser {

// One kind of time-zone data in a data set. It knows the data set's directory and whether its data
// fit the installed system. It can point the system's links for its kind of data at itself.
class vorl_dataset_component {
public:
    // True when this component's data can be used with those of `other`, the system data set's
    // component of the same kind. Changes nothing; may print; never throws.
    virtual bool compatible_schema(const vorl_dataset_component& other) const = 0;

    // Removes the old links for this kind of data, then makes the new one; the system data set has
    // no ICU link. A failed removal is printed and ends the removals. A failed creation throws its
    // error number; what was done before it stays done.
    virtual void install_links() const = 0;

    vorl_dataset_component(const vorl_dataset_component&) = delete;
    vorl_dataset_component& operator=(const vorl_dataset_component&) = delete;

protected:
    explicit vorl_dataset_component(std::string path = {}) : dataset_path_(std::move(path)) {}

    // Not virtual: a component is never destroyed through this class. The shared pointer that was
    // made for a vorl_zoneinfo or a vorl_icu calls the destructor of that class.
    ~vorl_dataset_component() = default;

    // The data set's directory, as it was given; empty for the system data set.
    const std::string dataset_path_;
};

} // namespace initialiser

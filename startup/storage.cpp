#include "startup/storage.h"

#include "foundation/data_protection.h"
#include "foundation/descriptor.h"
#include "foundation/paths.h"

#include <fcntl.h>

namespace initialiser {

void prepare_storage() noexcept {
    set_directory_protection(storage_area);
    set_directory_protection(stored_datasets);
}

void set_directory_protection(const std::string& path) noexcept {
    const vorl_descriptor directory{::open(path.c_str(), O_RDONLY | O_CLOEXEC)};
    if (directory.is_open()) {
        control_protection(directory.number(), set_class_command, always_readable);
    }
}

} // namespace initialiser

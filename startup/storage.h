#pragma once

#include <string>

namespace initialiser {

// Gives the storage area and the folder of the stored data sets the data-protection class that can
// be read at start-up. A missing folder is no error and is not made; nothing is printed.
void prepare_storage() noexcept;

// The same for the folder at `path`.
void set_directory_protection(const std::string& path) noexcept;

} // namespace initialiser

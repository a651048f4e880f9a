#include "dataset/zoneinfo.h"

#include "dataset/component.h"
#include "foundation/file_system.h"
#include "foundation/paths.h"
#include "foundation/text_file.h"

#include <err.h>

#include <string>

namespace initialiser {

vorl_zoneinfo::vorl_zoneinfo(const std::string& path)
    : vorl_dataset_component(path),
      zoneinfo_path_(path.empty() ? system_zoneinfo : path + "/" + zoneinfo_directory) {
    read_version();
}

void vorl_zoneinfo::read_version() {
    version_text_ = read_first_word(zoneinfo_path_ + "/" + version_file);
}

bool vorl_zoneinfo::compatible_schema(const vorl_dataset_component& /*other*/) const {
    return true;
}

void vorl_zoneinfo::install_links() const {
    try {
        remove(zoneinfo_link);
    } catch (...) {
        warn("Unlink of zoneinfo softlink failed");
    }
    create_symlink(zoneinfo_path_, zoneinfo_link);
}

} // namespace initialiser

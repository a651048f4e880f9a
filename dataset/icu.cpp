#include "dataset/icu.h"

#include "foundation/expression.h"
#include "foundation/file_system.h"
#include "foundation/folder_walk.h"
#include "foundation/paths.h"
#include "foundation/text_file.h"

#include <err.h>

#include <cerrno>
#include <cstring>
#include <vector>

namespace initialiser {
namespace {

// Names that carry a schema: digits, then l, b or e, the byte order and character set of the files.
constexpr auto icu_file_expression = R"(icutz([0-9]+[lbe])\.dat)";

} // namespace

vorl_icu::vorl_icu() : vorl_icu(std::string{}) {}

vorl_icu::vorl_icu(const std::string& path)
    : vorl_dataset_component(path), icu_path(path.empty() ? system_icu : path + "/" + icu_folder) {
    initialize();
}

void vorl_icu::initialize() {
    if (dataset_path.empty()) {
        schema = read_first_word(icu_path + "/" + schema_file);
        return;
    }
    find_schema_of_files();
    if (schema.empty()) {
        warn("No ICU schema found for %s", dataset_path.c_str());
    }
}

void vorl_icu::find_schema_of_files() {
    const vorl_expression expression{icu_file_expression};
    vorl_folder_walk walk{icu_path};
    if (!walk.is_open()) {
        const int error = errno;
        warn("tz_icu::initialize: fts_open of %s failed, %s", icu_path.c_str(), strerror(error));
        throw error;
    }
    while (const char* const name = walk.next()) {
        const std::vector<std::string> groups = expression.match_whole(name);
        if (!groups.empty() && walk.is_public_file(name)) {
            schema = groups[1];
            return;
        }
    }
}

bool vorl_icu::compatible_schema(const vorl_dataset_component& other) const {
    const auto* const other_icu = dynamic_cast<const vorl_icu*>(&other);
    if (other_icu == nullptr) {
        warn("vorl_icu::compatible_schema: could not dynamic_cast other component");
        return false;
    }
    return schema == other_icu->schema;
}

void vorl_icu::install_links() const {
    try {
        remove(icu_link);
        remove(legacy_icu_link);
    } catch (...) {
        warn("unlink of ICU softlink failed");
    }
    if (!dataset_path.empty()) {
        create_symlink(icu_path, icu_link);
    }
}

} // namespace initialiser

#include "dataset/icu.h"

#include "foundation/directory_walk.h"
#include "foundation/expression.h"
#include "foundation/file_system.h"
#include "foundation/paths.h"
#include "foundation/text_file.h"

#include <err.h>

#include <cerrno>
#include <cstring>
#include <vector>

namespace initialiser {
namespace {

// Names that tell the schema: digits and one letter, which stands for the byte order and character
// set of the files.
constexpr auto icu_file_expression = R"(icutz([0-9]+[lbe])\.dat)";

} // namespace

vorl_icu::vorl_icu(const std::string& path)
    : vorl_dataset_component(path),
      icu_path_(path.empty() ? system_icu : path + "/" + icu_directory) {
    initialize();
}

void vorl_icu::initialize() {
    if (dataset_path_.empty()) {
        schema_ = read_first_word(icu_path_ + "/" + schema_file);
        return;
    }
    find_schema_of_files();
    if (schema_.empty()) {
        warn("No ICU schema found for %s", dataset_path_.c_str());
    }
}

void vorl_icu::find_schema_of_files() {
    static const vorl_expression expression{icu_file_expression};
    vorl_directory_walk walk{icu_path_};
    if (const int error = walk.opening_error(); error != 0) {
        errno = error;
        // Other programs look for this text, so it keeps its names.
        warn("tz_icu::initialize: fts_open of %s failed, %s", icu_path_.c_str(), strerror(error));
        throw error;
    }
    while (const char* const name = walk.next()) {
        const std::vector<std::string> groups = expression.match_whole(name);
        if (!groups.empty() && walk.is_public_file(name)) {
            schema_ = groups[1];
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
    return schema_ == other_icu->schema_;
}

void vorl_icu::install_links() const {
    try {
        remove(icu_link);
        remove(legacy_icu_link);
    } catch (...) {
        // Other programs look for this text, so it stays in lower case.
        warn("unlink of ICU softlink failed");
    }
    if (!dataset_path_.empty()) {
        create_symlink(icu_path_, icu_link);
    }
}

} // namespace initialiser

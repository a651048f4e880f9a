#include "dataset/icu.h"

#include "dataset/component.h"
#include "foundation/directory_walk.h"
#include "foundation/file_system.h"
#include "foundation/paths.h"
#include "foundation/text_file.h"
#include "foundation/text_reader.h"

#include <err.h>

#include <cerrno>
#include <cstring>
#include <string>
#include <string_view>

namespace initialiser {

std::string schema_of_icu_file(std::string_view name) {
    // icutz([0-9]+[lbe])\.dat
    vorl_text_reader reader{name};
    if (!reader.take("icutz")) {
        return {};
    }
    const std::string_view digits = reader.take_digits();
    const std::string_view letter = reader.take_all_of("lbe");
    if (digits.empty() || letter.size() != 1 || !reader.take(".dat") || !reader.is_at_end()) {
        return {};
    }
    return std::string{digits} + std::string{letter};
}

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
    vorl_directory_walk walk{icu_path_};
    if (const int error = walk.opening_error(); error != 0) {
        errno = error;
        // Other programs look for this text, so it keeps its names.
        warn("tz_icu::initialize: fts_open of %s failed, %s", icu_path_.c_str(), strerror(error));
        throw error;
    }
    while (const char* const name = walk.next()) {
        const std::string schema = schema_of_icu_file(name);
        if (!schema.empty() && walk.is_public_file(name)) {
            schema_ = schema;
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

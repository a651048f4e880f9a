#pragma once

#include "dataset/component.h"

#include <string>
#include <string_view>

namespace initialiser {

// A data set's ICU time-zone files. Their schema, such as 44l, decides whether a stored data set
// can be used with the installed system.
class vorl_icu final : public vorl_dataset_component {
public:
    // Finds the schema of the ICU files of the data set at `path`; the empty path is the system
    // data set. When there is no schema, it is empty, and for a stored data set "No ICU schema
    // found for PATH" is printed. Without memory to walk the directory, prints "tz_icu::initialize:
    // fts_open of DIRECTORY failed, REASON" and throws the error number. Throws no_error_number
    // when the system's schema is too long (see read_first_word).
    explicit vorl_icu(const std::string& path = {});

    // True when both schemas are the same text, the empty one included. For a component of another
    // kind, prints "vorl_icu::compatible_schema: could not dynamic_cast other component" and
    // returns false.
    bool compatible_schema(const vorl_dataset_component& other) const override;

    // Removes the ICU link, then the legacy one. For a stored data set, points the ICU link at its
    // files; the system data set has no ICU link. Where one can't be removed, prints "unlink of ICU
    // softlink failed" and removes no other.
    void install_links() const override;

private:
    void initialize();
    void find_schema_of_files();

    std::string schema_;
    std::string icu_path_;
};

// The schema that the name of an ICU file tells: digits and one letter, which stands for the byte
// order and the character set of the files. Empty for any other name.
std::string schema_of_icu_file(std::string_view name);

} // namespace initialiser

#pragma once

#include "dataset/component.h"

#include <string>

namespace initialiser {

// A data set's compiled tz database: a directory of zone files with a "+VERSION" file at its top.
class vorl_zoneinfo final : public vorl_dataset_component {
public:
    // Finds the database of the data set at `path` and reads its version; the empty path is the
    // system data set. A missing or unreadable database has the empty version. Throws
    // no_error_number when the version is too long (see read_first_word).
    explicit vorl_zoneinfo(const std::string& path = {});

    // Always true: compiled zone files have one format.
    bool compatible_schema(const vorl_dataset_component& other) const override;

    // Points the zoneinfo link at the database, which need not exist. Prints "Unlink of zoneinfo
    // softlink failed" when the old link can't be removed.
    void install_links() const override;

    // The first word of the "+VERSION" file, a tz release such as 2019c; empty when there is none.
    std::string version_text() const { return version_text_; }

private:
    void read_version();

    std::string zoneinfo_path_;
    std::string version_text_;
};

} // namespace initialiser

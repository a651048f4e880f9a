#pragma once

#include <string>

// Every fixed path and name on the device. No other file spells one out.
namespace initialiser {

// The storage area: what the updater and the initialiser keep, and the rest of the system reads.
inline const std::string storage_area = "/var/db/timezone/";
inline const std::string stored_datasets = "/var/db/timezone/tz/"; // one directory for each

// The latest link, by which the updater names an update.
inline const std::string latest_link = "/var/db/timezone/tz_latest";

// The links through which the system reads its time-zone data.
inline const std::string zoneinfo_link = "/var/db/timezone/zoneinfo";
inline const std::string icu_link = "/var/db/timezone/icutz"; // missing for the system data set
inline const std::string localtime_link = "/var/db/timezone/localtime";

// What a start-up leaves for the programs that clean up and report.
inline const std::string cleanup_marker = "/var/db/timezone/needs_cleanup";
inline const std::string version_diff_record = "/var/db/timezone/TZVersionDiffRecord";

// Left behind by older systems.
inline const std::string legacy_icu_link = "/var/db/icutz";
inline const std::string legacy_item = "/var/db/icu";

// The system data set, read-only and installed with the operating system.
inline const std::string system_zoneinfo = "/usr/share/zoneinfo.default";
inline const std::string system_icu = "/usr/share/icu";

// In the system's ICU directory: a file that begins with its schema.
inline const std::string schema_file = "icutzformat.txt";

// In any tz database: a file that begins with its tz release.
inline const std::string version_file = "+VERSION";

// The two directories of a stored data set.
inline const std::string zoneinfo_directory = "zoneinfo";
inline const std::string icu_directory = "icutz";

// The default zone, and the localtime link's target for it.
inline const std::string default_zone = "America/Los_Angeles";
inline const std::string default_localtime = "/var/db/timezone/zoneinfo/America/Los_Angeles";

// The old place: where zones were looked up before the storage area existed.
inline const std::string old_zoneinfo = "/usr/share/zoneinfo";

} // namespace initialiser

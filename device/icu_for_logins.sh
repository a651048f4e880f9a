# shellcheck shell=sh
# Programs of a login find the ICU files in use by this variable.
export ICU_TIMEZONE_FILES_DIR=/var/db/timezone/icutz

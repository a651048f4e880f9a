export ICU_TIMEZONE_FILES_DIR=/var/db/timezone/icutz

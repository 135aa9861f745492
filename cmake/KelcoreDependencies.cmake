# Every dependency comes from the system (Debian packages); scripts/install-deps.sh
# installs what is missing.
find_package(Threads REQUIRED)
find_package(Boost 1.74 REQUIRED)
find_package(ICU 72 REQUIRED COMPONENTS uc i18n)
find_package(EXPAT REQUIRED)

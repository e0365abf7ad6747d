# Sourced first by every transcript: each test gets a host database of its
# own in its scratch directory, and no library tracing.
export TARN_HOST_DB="$PWD/host.db"
unset TARN_TRACE

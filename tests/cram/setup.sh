# Sourced first by every transcript: each test gets a host database of its
# own in its scratch directory, and no library tracing.
export TARN_HOST_DB="$PWD/host.db"
unset TARN_TRACE TARN_TRACE_FORMAT
# Words after the script's name, in their order: "init" makes the default
# host (silently), "trace" turns the library's trace on into ./trace.
for word; do
  case $word in
    init) tarnhost init 2> /dev/null ;;
    trace) export TARN_TRACE=$PWD/trace ;;
  esac
done
# The trace's lines of the calls matching the pattern $1 since the last
# look (status 1 when none), for transcripts that turn the trace on.
calls() { grep -E "^($1)\(" trace; local found=$?; : > trace; return $found; }

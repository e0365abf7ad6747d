#!/usr/bin/env bash
# Installs a built tree into a scratch prefix and checks what a system
# install gets: the files and where they land, that the installed programs
# run, that the man pages render without warnings and document every option
# the parser accepts, and that the bash completions load and complete. Then,
# when lintian is installed, builds the Debian package and checks it.
#
# Usage: install_test.sh BUILD_DIR SOURCE_DIR VERSION SANITIZED(1|0)
set -uo pipefail
build=$(cd "$1" && pwd)
source_dir=$(cd "$2" && pwd)
version=$3
sanitized=$4
tmp=$(mktemp -d)
trap 'rm -rf "$tmp"' EXIT
root=$tmp/root
failures=0

fail() {
    echo "FAIL: $*" >&2
    failures=$((failures + 1))
}

if ! cmake --install "$build" --prefix "$root" >"$tmp/install.log" 2>&1; then
    cat "$tmp/install.log" >&2
    echo "FAIL: cmake --install" >&2
    exit 1
fi

# tarnhost and its page and completion come with its target. orvocfg-vswitch
# is a system tool (sbin); tarnhost also serves users' own hosts (bin).
commands=(orvocfg-vswitch)
declare -A program=([orvocfg-vswitch]=sbin/orvocfg-vswitch [tarnhost]=bin/tarnhost)
[ -x "$build/bin/tarnhost" ] && commands+=(tarnhost)

doc=share/doc/orvocfg-vswitch
expected=("$doc/README.md" "$doc/copyright" "$doc/changelog.gz")
for c in "${commands[@]}"; do
    expected+=("${program[$c]}" "share/man/man8/$c.8.gz" "share/bash-completion/completions/$c")
done
for f in "${expected[@]}"; do
    [ -f "$root/$f" ] || fail "not installed: $f"
    [[ $f != *bin/* || -x "$root/$f" ]] || fail "not executable: $f"
done
# Nothing else: no libraries, test programs or man sources among the docs.
while IFS= read -r f; do
    case " ${expected[*]} " in *" $f "*) continue ;; esac
    case $f in share/doc/orvocfg-vswitch/man/*) ;; share/doc/orvocfg-vswitch/*) continue ;; esac
    fail "unexpected file installed: $f"
done < <(cd "$root" && find . -type f | sed 's|^\./||')

# The installed programs run, and work on a host of their own (what -h
# prints: the usage transcript).
export TARN_HOST_DB=$tmp/host.db
unset TARN_TRACE
[ ! -x "$root/${program[tarnhost]}" ] || "$root/${program[tarnhost]}" init >/dev/null ||
    fail "installed tarnhost init failed"
answer=$("$root/${program[orvocfg-vswitch]}" -c vswitch0 2>/dev/null)
[ "$answer" = 1 ] || fail "installed orvocfg-vswitch -c vswitch0 printed '$answer'"

# Compressed files: their source (the man pages with the version on the .TH
# line, in place of the sources' placeholder), compressed with gzip -n so
# that they are the same from build to build.
compressed=("$doc/changelog.gz|$source_dir/packaging/changelog")
for c in "${commands[@]}"; do
    compressed+=("share/man/man8/$c.8.gz|$source_dir/docs/man/$c.8.in")
    th=$(sed -n '/^\.TH /p' "$source_dir/docs/man/$c.8.in")
    [[ $th == *' "orvocfg-vswitch @PROJECT_VERSION@" '* ]] ||
        fail "docs/man/$c.8.in: no version placeholder on the .TH line: $th"
done
for pair in "${compressed[@]}"; do
    file=${pair%%|*} source=${pair#*|}
    [ -f "$root/$file" ] || continue
    cmp -s <(sed "s/@PROJECT_VERSION@/$version/" "$source" | gzip -9 -n) "$root/$file" ||
        fail "$file is not ${source#"$source_dir"/}, version $version, compressed with gzip -n"
done
# The changelog's latest entry is this version's.
latest=$(dpkg-parsechangelog -l "$source_dir/packaging/changelog" -S Version 2>&1)
[ "$latest" = "$version" ] || fail "packaging/changelog: latest entry is '$latest', not $version"

# Man pages: no warnings from man nor from groff, and the rendered page is
# the right one.
for c in "${commands[@]}"; do
    page=$root/share/man/man8/$c.8.gz
    [ -f "$page" ] || continue
    out=$(MANWIDTH=80 man --warnings -l "$page" 2>"$tmp/man.err")
    [ $? -eq 0 ] && [ ! -s "$tmp/man.err" ] ||
        fail "man --warnings -l $c.8.gz: $(cat "$tmp/man.err")"
    grep -q "^${c^^}(8)" <<<"$out" || fail "$c.8.gz does not render as ${c^^}(8)"
    zcat "$page" | groff -man -ww -z 2>"$tmp/groff.err"
    [ -s "$tmp/groff.err" ] && fail "groff -man -ww -z $c.8: $(cat "$tmp/groff.err")"
done

# Completion of the installed files, in a shell of its own (tarnhost's asks
# the installed tarnhost). Prints the replies one a line.
complete_words() { # command file words...
    local file=$1
    shift
    PATH=$root/bin:$root/sbin:$PATH bash --norc --noprofile -c '
        source "$1" || exit 1
        shift
        COMP_WORDS=("$@")
        COMP_CWORD=$(($# - 1))
        fn=$(complete -p "$1" | sed -E "s/.*-F ([^ ]+).*/\1/")
        "$fn"
        printf "%s\n" "${COMPREPLY[@]}"' _ "$file" "$@"
}
completions=$root/share/bash-completion/completions
for c in "${commands[@]}"; do
    bash -n "$completions/$c" || fail "bash -n $c completion"
done

# Every option of the parser's table: in the man page and offered by the
# completion, and nothing else offered.
mapfile -t rows < <(grep -oE "\{'[A-Za-z]', +\"[a-z-]+\"" "$source_dir/src/cli/options.cc" |
    sed -E "s/\{'(.)', +\"(.*)\"/\1 \2/")
[ "${#rows[@]}" -eq 44 ] || fail "found ${#rows[@]} options in src/cli/options.cc, not 44"
rendered=$(zcat "$root/share/man/man8/orvocfg-vswitch.8.gz" |
    groff -man -Tascii -rLL=300n -rHY=0 -P-cbou 2>/dev/null)
offered_long=$(complete_words "$completions/orvocfg-vswitch" orvocfg-vswitch -- | sort)
offered_all=$(complete_words "$completions/orvocfg-vswitch" orvocfg-vswitch - | sort)
long_names=
for row in "${rows[@]}"; do
    letter=${row%% *} name=${row#* }
    long_names+="--$name"$'\n'
    grep -qE -- "(^|[ ,])--$name([=, ]|$)" <<<"$rendered" || fail "man page lacks --$name"
    grep -qE -- "(^|[ ,])-$letter([ ,]|$)" <<<"$rendered" || fail "man page lacks -$letter"
    grep -qx -- "-$letter" <<<"$offered_all" || fail "completion does not offer -$letter"
done
[ "$offered_long" = "$(sort <<<"${long_names%$'\n'}")" ] ||
    fail "completion of -- offers: $(tr '\n' ' ' <<<"$offered_long")"

# Smoke cases: command line | replies that must be there | replies that must not.
# (Each prefix of tarnhost's command words: tarnhost_table.py in the cram tests.)
cases=(
    "orvocfg-vswitch -B li|listen|down"
    "orvocfg-vswitch --set-cdp=a|--set-cdp=advertise|advertise"
    "tarnhost dvs add dvs0 --ports = 8 --p|--portset|--ports --used"
)
for case in "${cases[@]}"; do
    IFS='|' read -r line want refuse <<<"$case"
    cmd=${line%% *}
    [[ " ${commands[*]} " == *" $cmd "* ]] || continue
    eval "words=($line)"
    got=$(complete_words "$completions/$cmd" "${words[@]}")
    for w in $want; do
        grep -qx -- "$w" <<<"$got" || fail "[$line] lacks $w; got: $(tr '\n' ' ' <<<"$got")"
    done
    for w in $refuse; do
        grep -qx -- "$w" <<<"$got" && fail "[$line] offers $w"
    done
done

# The Debian package, checked by lintian. Not on the sanitizer build: its
# programs are instrumented Debug builds without hardening, which no package
# ships and lintian would rightly refuse.
if [ "$sanitized" = 1 ]; then
    echo "sanitizer build: Debian package not built"
elif ! command -v lintian >/dev/null; then
    echo "lintian not installed: Debian package not built"
else
    deb=$tmp/deb/orvocfg-vswitch_${version}_amd64.deb
    if ! cpack -G DEB --config "$build/CPackConfig.cmake" -B "$tmp/deb" >"$tmp/cpack.log" 2>&1 ||
        [ ! -f "$deb" ]; then
        cat "$tmp/cpack.log" >&2
        fail "cpack -G DEB"
    else
        # Infos too: missing hardening and unstripped sections are infos.
        lintian --fail-on error,warning,info --display-info "$deb" >"$tmp/lintian.log" 2>&1 ||
            fail "lintian: $(grep -v 'running with root privileges' "$tmp/lintian.log")"
        listing=$(dpkg-deb -c "$deb" | awk '{print $1, $NF}')
        for c in "${commands[@]}"; do
            grep -qx -- "-rwxr-xr-x ./usr/${program[$c]}" <<<"$listing" ||
                fail "package lacks /usr/${program[$c]}"
        done
        grep -qx "drwxr-xr-x ./var/lib/tarnhost/" <<<"$listing" ||
            fail "package lacks /var/lib/tarnhost"
        [ "$(dpkg-deb -f "$deb" Suggests)" = bash-completion ] ||
            fail "package does not suggest bash-completion"
        # postrm removes root's host with its directory on purge only.
        dpkg-deb -e "$deb" "$tmp/control"
        state=$tmp/dpkg-root/var/lib/tarnhost
        mkdir -p "$state" && : >"$state/host.db"
        DPKG_ROOT=$tmp/dpkg-root "$tmp/control/postrm" remove && [ -e "$state/host.db" ] ||
            fail "postrm remove failed or removed the host"
        DPKG_ROOT=$tmp/dpkg-root "$tmp/control/postrm" purge && [ ! -e "$state" ] ||
            fail "postrm purge failed or left /var/lib/tarnhost"
    fi
fi

echo "install_test: $failures failures"
[ "$failures" -eq 0 ]

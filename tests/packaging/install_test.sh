#!/usr/bin/env bash
# Installs a built tree into a scratch prefix and checks what a system
# install gets: the files and where they land, that the installed programs
# run, that the man pages render without warnings and document every option
# the parser accepts, and that the bash completions load and complete.
#
# Usage: install_test.sh BUILD_DIR SOURCE_DIR
set -uo pipefail
build=$(cd "$1" && pwd)
source_dir=$(cd "$2" && pwd)
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

# tarnhost and its page and completion come with its target.
commands=(orvocfg-vswitch)
[ -x "$build/bin/tarnhost" ] && commands+=(tarnhost)

expected=("share/doc/orvocfg-vswitch/README.md")
for c in "${commands[@]}"; do
    expected+=("sbin/$c" "share/man/man8/$c.8.gz" "share/bash-completion/completions/$c")
done
for f in "${expected[@]}"; do
    [ -f "$root/$f" ] || fail "not installed: $f"
    [[ $f != sbin/* || -x "$root/$f" ]] || fail "not executable: $f"
done
# Nothing else: no libraries, test programs or man sources among the docs.
while IFS= read -r f; do
    case " ${expected[*]} " in *" $f "*) continue ;; esac
    case $f in share/doc/orvocfg-vswitch/man/*) ;; share/doc/orvocfg-vswitch/*) continue ;; esac
    fail "unexpected file installed: $f"
done < <(cd "$root" && find . -type f | sed 's|^\./||')

# The installed programs run, and work on a host of their own.
usage=$("$root/sbin/orvocfg-vswitch" -h)
[ $? -eq 0 ] || fail "orvocfg-vswitch -h did not exit with 0"
first=${usage%%$'\n'*}
[ "$first" = "orvocfg-vswitch [options] [vswitch[:ports]]" ] ||
    fail "orvocfg-vswitch -h printed '$first' first"
if [ -x "$root/sbin/tarnhost" ]; then
    export TARN_HOST_DB=$tmp/host.db
    unset TARN_TRACE
    "$root/sbin/tarnhost" init >/dev/null || fail "installed tarnhost init failed"
    answer=$("$root/sbin/orvocfg-vswitch" -c vswitch0)
    [ "$answer" = 1 ] || fail "installed orvocfg-vswitch -c vswitch0 printed '$answer'"
fi

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
    cmp -s <(zcat "$page") "$source_dir/docs/man/$c.8" || fail "$c.8.gz is not docs/man/$c.8"
done

# Completion of the installed files, in a shell of its own (tarnhost's asks
# the installed tarnhost). Prints the replies one a line.
complete_words() { # command file words...
    local file=$1
    shift
    PATH=$root/sbin:$PATH bash --norc --noprofile -c '
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
cases=(
    "orvocfg-vswitch --ad|--add --add-pg --add-pg-uplink --add-dvp-uplink|--delete"
    "orvocfg-vswitch -B li|listen|down"
    "orvocfg-vswitch --set-cdp=a|--set-cdp=advertise|advertise"
    "orvocfg-vswitch -L pn||--add"
    "tarnhost d|dump dvs dvport|init"
    "tarnhost dvs add dvs0 --ports = 8 --p|--portset|--ports --used"
    "tarnhost load /et|/etc|"
    "tarnhost fault ''|add clear|"
    "tarnhost fault add SetV|SetVlanId|--on"
    "tarnhost timeout ''|add|uplink lag"
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

echo "install_test: $failures failures"
[ "$failures" -eq 0 ]

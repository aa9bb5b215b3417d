#!/usr/bin/env bash
# Tests Debian packages and a fresh clone in clean Debian 12 roots, as people use them:
#   user       nothing but the packages, installed by apt
#   developer  programs built against them; when they are purged, no file is left behind
#   newcomer   the two commands of README and its lines for pip in a fresh clone, on Debian's minimal
#              system, as a user whose sudo asks for a password
# piuparts would check only purging, in one more root; here a list of files before and after does
# that. The same commit packed elsewhere must give the same bytes. Everything runs in its own
# namespace: however this script ends, nothing stays mounted or running.
# usage: test_packages.sh REPOSITORY PACKAGES DIRECTORY   as root; roots and logs go to DIRECTORY
set -euo pipefail

repository=$1 packages=$2 directory=$3

say() { printf 'test-packages: %s\n' "$*" >&2; }

die() {
    say "$*"
    exit 1
}

# --- the namespace ----------------------------------------------------------------------------

# Outside the namespace, the script only waits; if it is killed, the namespace ends with it.
if [ "${KQ_NAMESPACE:-}" != inside ]; then
    [ "$(id -u)" -eq 0 ] || die "only root can change roots and mount: sudo ./dev test-packages"
    KQ_NAMESPACE=inside setpriv --pdeathsig KILL unshare --mount --pid --fork --kill-child \
        --mount-proc --propagation private -- "${BASH_SOURCE[0]}" "$@" </dev/null &
    child=$!
    trap 'kill -KILL "$child" 2>/dev/null || true' EXIT
    trap 'exit 130' INT
    trap 'exit 143' TERM
    status=0
    wait "$child" || status=$?
    # The mounts are gone now. After a failure the roots stay for inspection.
    [ "$status" -ne 0 ] ||
        rm -rf --one-file-system -- "$directory"/{user,developer,newcomer,clone}
    exit "$status"
fi

# --- roots ------------------------------------------------------------------------------------

base=$directory/base
logs=$directory/logs
password=seventeen-herons # of the newcomer, whose root is deleted

# Where this machine gets Debian 12 from: one line "URI SUITE" for each part.
debian_sources() {
    # shellcheck disable=SC2016 # apt-get expands these
    apt-get indextargets --format '$(ORIGIN) $(COMPONENT) $(REPO_URI) $(CODENAME)' \
        'Created-By: Packages' |
        awk '$1 == "Debian" && $2 == "main" && $4 ~ /^bookworm/ { print $3, $4 }' | sort -u
}

make_base() {
    [ ! -d "$base" ] || return 0
    local sources mirror
    sources=$(debian_sources)
    if [ -z "$sources" ]; then
        apt-get -q update >"$logs/update.log" 2>&1 || true
        sources=$(debian_sources)
    fi
    mirror=$(awk '$2 == "bookworm" { print $1; exit }' <<<"$sources")
    [ -n "$mirror" ] || die "/etc/apt of this machine names no mirror of Debian 12 (bookworm)"

    say "making a clean root with debootstrap"
    rm -rf --one-file-system -- "$base.new"
    timeout 900 debootstrap --variant=minbase bookworm "$base.new" "$mirror" \
        >"$logs/debootstrap.log" 2>&1 || {
        tail -n 20 -- "$logs/debootstrap.log" >&2
        die "debootstrap failed; all it said is in $logs/debootstrap.log"
    }
    awk '{ print "deb", $1, $2, "main" }' <<<"$sources" >"$base.new/etc/apt/sources.list"
    mv -- "$base.new" "$base"
}

# A fresh copy of the base, with the mounts that programs expect. Fetched packages are kept outside.
make_root() {
    local root=$directory/$1
    rm -rf --one-file-system -- "$root"
    cp -a -- "$base" "$root"
    cp -- /etc/resolv.conf "$root/etc/resolv.conf"
    mount -t proc proc "$root/proc"
    mount -t sysfs -o ro sysfs "$root/sys"
    mount -t devpts -o newinstance,ptmxmode=0666 devpts "$root/dev/pts"
    mount -t tmpfs tmpfs "$root/dev/shm"
    mkdir -p -- "$directory/archives/partial" "$root/packages"
    mount --bind "$directory/archives" "$root/var/cache/apt/archives"
    cp -- "$packages"/*.deb "$root/packages"
}

# Arguments: name of the root, seconds, command.
in_root() {
    local root=$directory/$1 seconds=$2
    shift 2
    timeout -k 10 "$seconds" chroot "$root" /usr/bin/env -i HOME=/root LC_ALL=C.UTF-8 \
        PATH=/usr/local/sbin:/usr/local/bin:/usr/sbin:/usr/bin:/sbin:/bin \
        DEBIAN_FRONTEND=noninteractive "$@"
}

# Arguments: name of the root, what to install.
apt_get_install() { in_root "$1" 900 apt-get -q -y install "${@:2}"; }

# Every file of a root except what apt, dpkg and caches write for themselves.
file_list() {
    (cd -- "$directory/$1" && find . -xdev \( -path ./var/cache -o -path ./var/log -o -path ./tmp \
        -o -path ./var/lib/apt -o -path ./var/lib/dpkg -o -path ./packages \) -prune \
        -o -print | sort)
}

# --- tests ------------------------------------------------------------------------------------

passed=0
failed=0
skipped=0

# Arguments: name, command. A failed test shows the end of its output; 'status' tells callers. Do
# not call it in a condition: the command would continue after an error inside it.
status=0
try() {
    local name=$1 log=$logs/${1//[^A-Za-z0-9]/-}.log started=$SECONDS
    shift
    set +e
    (
        set -e
        "$@"
    ) >"$log" 2>&1
    status=$?
    set -e
    if [ "$status" -eq 0 ]; then
        printf 'pass  %s (%d s)\n' "$name" $((SECONDS - started))
        passed=$((passed + 1))
    else
        printf 'FAIL  %s (%d s, status %d); from %s:\n' "$name" $((SECONDS - started)) "$status" \
            "$log"
        tail -n 30 -- "$log"
        failed=$((failed + 1))
    fi
}

is_ours() { printf '%s\n' "${names[@]}" | grep -qxF -- "$1"; }

# Whether the package contains the file.
belongs_to() {
    local root=$1 file=$2 package=$3
    local owner
    owner=$(in_root "$root" 60 dpkg -S "$(in_root "$root" 60 realpath "$file")")
    printf '%s\n' "$owner"
    [[ $owner =~ ^$package(:[a-z0-9]+)?: ]]
}

install_packages() { (cd -- "$directory/$1" && apt_get_install "$1" ./packages/*.deb); }

# What programs are built with, and what our packages depend on: neither counts as left behind.
install_tools() {
    local name dependencies=()
    cd -- "$directory/developer"
    for name in $(in_root developer 300 apt-get -s install ./packages/*.deb |
        awk '$1 == "Inst" { print $2 }'); do
        is_ours "$name" || dependencies+=("$name")
    done
    apt_get_install developer g++ cmake ninja-build pkg-config python3 man-db bash-completion \
        "${dependencies[@]}"
}

purge_packages() { in_root "$1" 300 apt-get -q -y purge "${names[@]}"; }

files_are_intact() {
    local changed
    changed=$(in_root "$1" 60 dpkg --verify "${names[@]}")
    printf '%s\n' "$changed"
    [ -z "$changed" ]
}

tool_answers() {
    in_root user 60 booleq 'A & ~B' | grep -x 'init value hex  0x4'
    in_root user 60 booleq equal 'A & ~B' '~(~A | B)'
    local status=0
    in_root user 60 booleq 'A && B' || status=$?
    [ "$status" -eq 3 ]
}

tool_finds_library() {
    local library
    library=$(in_root user 60 ldd /usr/bin/booleq |
        awk '$1 ~ /^libkq_boolequation[.]so[.]/ { print $3 }')
    belongs_to user "$library" 'libkq-boolequation[0-9]+'
    in_root user 60 ldconfig -p | grep -F "${library##*/} "
}

module_answers() {
    in_root user 60 python3 -c 'from booleq import Equation; print(Equation("A & ~B").hex_init())' |
        grep -x 0x4
}

man_page_shows() {
    in_root developer 60 man -P cat booleq | grep -x NAME
}

completion_loads() {
    in_root developer 60 bash -c '. /usr/share/bash-completion/bash_completion
        _completion_loader booleq
        complete -p booleq' | grep -e '-F _booleq '
}

readme_commands() {
    in_root developer 300 python3 /source/tests/readme/check_readme.py --tool /usr/bin/booleq \
        --readme "/source/$1"
}

readme_program() {
    in_root developer 300 python3 /source/tests/readme/check_readme.py --compiler c++ \
        --readme /source/README.md
}

nothing_left() {
    file_list developer >"$logs/files-after.txt"
    diff -- "$logs/files-before.txt" "$logs/files-after.txt"
}

same_bytes() {
    git clone -q -- "$repository" "$directory/clone"
    env -u SOURCE_DATE_EPOCH -u CMAKE_CXX_COMPILER_LAUNCHER "$directory/clone/dev" packages
    local package
    for package in "$packages"/*.deb; do
        cmp -- "$package" "$directory/clone/build/packages/${package##*/}"
    done
}

# An ordinary user, who may use sudo with a password. Removes the package lists, because a minimal
# system has none.
add_newcomer() {
    in_root newcomer 300 apt-get -q update
    apt_get_install newcomer sudo
    rm -rf -- "$directory"/newcomer/var/lib/apt/lists/*
    in_root newcomer 60 useradd --create-home --groups sudo --shell /bin/bash newcomer
    echo "newcomer:$password" | in_root newcomer 60 chpasswd
    git clone -q -- "$repository" "$directory/newcomer/home/newcomer/repository"
    in_root newcomer 60 chown -R newcomer: /home/newcomer
}

# Arguments: seconds, command. Runs it on a terminal, where the password is typed when asked for.
as_newcomer() {
    local seconds=$1
    shift
    KQ_PASSWORD=$password python3 "$repository/scripts/type_password.py" "$seconds" \
        chroot --userspec=newcomer:newcomer "$directory/newcomer" /usr/bin/env -i TERM=dumb \
        HOME=/home/newcomer PATH=/usr/local/bin:/usr/bin:/bin LC_ALL=C.UTF-8 "$@"
}

# With nobody to type the password, the command must end with a clear message, not wait.
newcomer_is_refused() {
    local status=0
    timeout -k 10 60 setsid chroot --userspec=newcomer:newcomer "$directory/newcomer" \
        /usr/bin/env -i HOME=/home/newcomer PATH=/usr/local/bin:/usr/bin:/bin \
        /home/newcomer/repository/dev run 'A & ~B' >"$logs/refused.txt" 2>&1 || status=$?
    cat -- "$logs/refused.txt"
    [ "$status" -eq 125 ]
    grep -F 'sudo: a password is required' "$logs/refused.txt"
    grep -F 'could not install' "$logs/refused.txt"
}

# Arguments: seconds, a verb of ./dev and its arguments. Prints the two figures that README gives.
newcomer_dev() {
    local seconds=$1 before start=$SECONDS
    shift
    before=$(du -smx -- "$directory/newcomer" | cut -f 1)
    as_newcomer "$seconds" /home/newcomer/repository/dev "$@"
    printf './dev %s: %d s, %d MB\n' "$1" $((SECONDS - start)) \
        $(($(du -smx -- "$directory/newcomer" | cut -f 1) - before)) >>"$logs/newcomer-cost.txt"
}

newcomer_runs() {
    rm -f -- "$logs/newcomer-cost.txt"
    as_newcomer 60 sudo -K
    newcomer_dev 1200 run 'A & ~B' | tee "$logs/newcomer-run.txt"
    grep -x 'init value hex  0x4' "$logs/newcomer-run.txt"
    grep -x 'type_password: prompts answered: 1' "$logs/newcomer-run.txt"
}

newcomer_tests() {
    newcomer_dev 3600 test >"$logs/newcomer.all"
    cat -- "$logs/newcomer.all"
    grep -v '^type_password: ' "$logs/newcomer.all" >"$logs/newcomer.txt"
    tail -n 1 -- "$logs/newcomer.txt" | grep -E '^[0-9]+ passed, 0 failed'
}

# README's lines for pip, unchanged, in a virtual environment; apt's question is answered.
newcomer_uses_pip() {
    local lines
    # shellcheck disable=SC2016 # these are README's markers
    lines=$(sed -n '/^```sh pip$/,/^```$/p' "$repository/README.md" | sed '1d; $d')
    [ -n "$lines" ]
    as_newcomer 1800 /bin/bash -ec "cd ~/repository; ${lines/apt install/apt install -y}
        ~/venv/bin/python -c 'import booleq; print(booleq.Equation(\"A & ~B\").hex_init())'" |
        tee "$logs/newcomer-pip.txt"
    grep '^0x4' "$logs/newcomer-pip.txt"
}

test_user() {
    make_root user
    in_root user 300 apt-get -q update >"$logs/update.log" 2>&1 || die "no lists of packages"
    try "apt installs the packages and what they depend on" install_packages user
    [ "$status" -eq 0 ] || return 0
    try "installed files are those packed" files_are_intact user
    try "the tool answers" tool_answers
    try "the tool runs with the packaged library" tool_finds_library
    if is_ours python3-booleq; then
        try "the module for Python answers" module_answers
    fi
}

test_developer() {
    local document
    make_root developer
    in_root developer 300 apt-get -q update >"$logs/update.log" 2>&1 || die "no lists of packages"
    try "Debian's own packages for developers" install_tools
    [ "$status" -eq 0 ] || return 0
    file_list developer >"$logs/files-before.txt"
    try "apt installs the packages for developers" install_packages developer
    [ "$status" -eq 0 ] || return 0
    mkdir -p -- "$directory/developer/source"
    mount --bind -o ro "$repository" "$directory/developer/source"
    try "the man page shows" man_page_shows
    try "the completion loads" completion_loads
    for document in $(cd -- "$repository" && grep -lx '```console' -- README.md docs/*.md); do
        try "commands of $document" readme_commands "$document"
    done
    try "program of README, with CMake and with pkg-config" readme_program
    umount -- "$directory/developer/source"
    rmdir -- "$directory/developer/source"
    try "the packages are purged" purge_packages developer
    try "no file is left behind" nothing_left
}

test_same_bytes() {
    if [ -n "$(git -C "$repository" status --porcelain)" ]; then
        say "not compared with packages of the commit: there are changes that are not committed"
        skipped=$((skipped + 1))
        return
    fi
    rm -rf -- "$directory/clone"
    try "the same commit packed elsewhere gives the same bytes" same_bytes
}

test_newcomer() {
    make_root newcomer
    try "an ordinary user with a password for sudo" add_newcomer
    [ "$status" -eq 0 ] || return 0
    try "without a terminal ./dev says what is missing" newcomer_is_refused
    try "a newcomer's ./dev run asks for sudo's password" newcomer_runs
    try "a newcomer's ./dev test" newcomer_tests
    try "README's lines for pip" newcomer_uses_pip
    cat -- "$logs/newcomer-cost.txt"
}

mkdir -p -- "$logs"
mapfile -t names < <(for package in "$packages"/*.deb; do dpkg-deb -f "$package" Package; done)
[ "${#names[@]}" -gt 0 ] || die "no packages in $packages; ./dev packages makes them"
make_base
test_user
test_developer
test_same_bytes
test_newcomer

rest=
[ "$skipped" -eq 0 ] || rest=", $skipped skipped"
printf '%d passed, %d failed%s\n' "$passed" "$failed" "$rest"
[ "$failed" -eq 0 ]

# SPDX-License-Identifier: Apache-2.0
# Fresh Debian systems below $work for packaging/verify, and how to run something in them.

suite=bookworm

# Where this machine gets Debian from; "SUITE COMPONENT URI" lines.
debian_archives() {
    apt-get indextargets --format '$(CODENAME) $(COMPONENT) $(REPO_URI)' 'Created-By: Packages' |
        awk -v suite="$suite" '$1 ~ "^" suite "(-updates|-security)?$" && $2 == "main"' | sort -u
}

make_base() {
    local mirror keyring=/usr/share/keyrings/debian-archive-keyring.gpg settings
    mirror=$(debian_archives | awk -v suite="$suite" '$1 == suite { print $3; exit }')
    debootstrap --variant=minbase --keyring="$keyring" "$suite" "$work/base" "$mirror"

    debian_archives | sed -E "s,^([^ ]+) ([^ ]+) (.+),deb [signed-by=$keyring] \\3 \\1 \\2," >"$work/base/etc/apt/sources.list"
    # How this machine reaches it.
    for settings in $(grep -lE '^[[:space:]]*Acquire' /etc/apt/apt.conf /etc/apt/apt.conf.d/* 2>/dev/null); do
        cp "$settings" "$work/base/etc/apt/apt.conf.d/"
    done
    cp /etc/resolv.conf "$work/base/etc/resolv.conf"
    # No service is started in a root.
    printf '#!/bin/sh\nexit 101\n' >"$work/base/usr/sbin/policy-rc.d"
    chmod +x "$work/base/usr/sbin/policy-rc.d"
    chroot "$work/base" useradd --no-create-home --home-dir /tmp/home-of-tester --shell /bin/sh tester
    in_root base pivot apt-get -qq update
}

# make_copy NAME: one more root, like the first.
make_copy() {
    rm -rf --one-file-system "${work:?}/$1"
    cp -a "$work/base" "$work/$1"
}

# in_root NAME pivot|chroot COMMAND...: runs COMMAND there as root, with namespaces of its own for mounts, processes and
# the host name. "pivot" makes the root that of the whole namespace, as on a machine; in a "chroot" the kernel grants
# nobody but root a namespace. All mounts and processes end with COMMAND.
in_root() {
    local root=$work/$1 way=$2
    shift 2
    ROOT=$root WAY=$way EXCHANGE=$exchange unshare --mount --pid --uts --ipc --fork --kill-child bash -euc '
        mount --make-rprivate /
        mount --bind "$ROOT" "$ROOT"
        mount -t proc proc "$ROOT/proc"
        mount -t sysfs -o ro sysfs "$ROOT/sys"
        mount --rbind /dev "$ROOT/dev"
        mount -t tmpfs -o mode=1777 tmpfs "$ROOT/tmp"
        mount -t tmpfs -o mode=755 tmpfs "$ROOT/run"
        mount --bind "$EXCHANGE" "$ROOT/mnt"
        cd "$ROOT"
        enter="chroot ."
        if [ "$WAY" = pivot ]; then
            pivot_root . .
            umount -l .
            enter=
        fi
        exec $enter env -i PATH=/usr/local/sbin:/usr/local/bin:/usr/sbin:/usr/bin:/sbin:/bin HOME=/root LC_ALL=C.UTF-8 \
            DEBIAN_FRONTEND=noninteractive http_proxy="${http_proxy:-}" https_proxy="${https_proxy:-}" "$@"
    ' in_root "$@"
}

make_build_root() {
    make_copy build
    git clone -q "$work/source" "$exchange/source-first"
    in_root build pivot /mnt/scripts/install-build-dependencies "$1"
}

build_elsewhere() {
    # Modes of a checkout are part of a source package; the other umask is for what the build makes.
    git clone -q "$work/source" "$exchange/source-second"
    in_root build pivot /mnt/scripts/build second nocheck
}

# list_files NAME: type, mode, owner, path and content of all that a root holds, less what packages never own: the
# records, caches and logs of dpkg, apt and the tools that they trigger.
list_files() {
    (
        cd "$work/$1"
        find . -xdev \( -path ./var/lib/dpkg -o -path ./var/lib/apt -o -path ./var/cache -o -path ./var/log \
            -o -path ./tmp -o -path ./run -o -path ./mnt -o -path ./proc -o -path ./sys -o -path ./dev \) -prune \
            -o -printf '%y %m %u:%g %p %l\n' -type f -fprint0 "$work/plain-files" | LC_ALL=C sort
        LC_ALL=C sort -z "$work/plain-files" | xargs -0 sha256sum
    )
}

# Sourced by the scripts at the top: what must be on the machine before anything can be built.
# Everything is Debian's; nothing is fetched when nothing is missing.

# Prints the package behind each thing that is not there. Arguments: "test" adds what
# only tests need.
missing_packages() {
    local tool
    for tool in g++ cmake pkg-config; do
        command -v "$tool" >/dev/null || echo "$tool"
    done
    command -v ninja >/dev/null || echo ninja-build
    if command -v pkg-config >/dev/null; then
        pkg-config --exists libpng || echo libpng-dev
        pkg-config --exists libgif || echo libgif-dev
        pkg-config --exists zlib || echo zlib1g-dev
        pkg-config --exists libjpeg || echo libjpeg-dev
        pkg-config --exists libmpg123 || echo libmpg123-dev
        pkg-config --exists libcurl || echo libcurl4-openssl-dev
        pkg-config --exists freetype2 || echo libfreetype-dev
        [[ ${1:-} != test ]] || pkg-config --exists gtest || echo libgtest-dev
        [[ ${1:-} != test ]] || pkg-config --exists sdl2 || echo libsdl2-dev
    else
        echo libpng-dev libgif-dev zlib1g-dev libjpeg-dev libmpg123-dev libcurl4-openssl-dev \
            libfreetype-dev ${1:+libgtest-dev libsdl2-dev}
    fi
    # Those under the open font license; from Debian 13 on they have the older package's name.
    grep -qs "SIL OPEN FONT LICENSE" /usr/share/doc/fonts-liberation{2,}/copyright ||
        echo fonts-liberation2
}

# Installs what is missing, or says what to install. All words go to stderr.
need_packages() {
    local packages
    packages=$(missing_packages "$@" | tr '\n' ' ')
    [[ -n $packages ]] || return 0
    if [[ $(id -u) != 0 ]] || ! command -v apt-get >/dev/null; then
        echo "vexel: please install: $packages" >&2
        return 1
    fi
    echo "vexel: installing $packages" >&2
    export DEBIAN_FRONTEND=noninteractive
    # shellcheck disable=SC2086
    apt-get install -y --no-install-recommends $packages >&2 </dev/null ||
        { apt-get update >&2 </dev/null &&
            apt-get install -y --no-install-recommends $packages >&2 </dev/null; }
}

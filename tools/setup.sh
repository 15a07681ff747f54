# Sourced by run, test and the tools: installs what packages.txt lists and configures the build.
# Expects the working directory to be the checkout.

if [ "$(id -u)" = 0 ]; then as_root=; else as_root=sudo; fi

# install_packages [LIST]: packages.txt without one.
install_packages() {
    local wanted missing
    wanted=$(sed -e 's/#.*//' -e '/^[[:space:]]*$/d' "${1:-packages.txt}")
    # shellcheck disable=SC2086
    missing=$(comm -23 <(printf '%s\n' $wanted | sort -u) \
        <(dpkg-query -W -f='${db:Status-Status} ${Package}\n' | sed -n 's/^installed //p' | sort -u))
    [ -n "$missing" ] || return 0
    echo "Installing:" $missing
    $as_root apt-get update -qq
    # shellcheck disable=SC2086
    DEBIAN_FRONTEND=noninteractive $as_root apt-get install -y -qq --no-install-recommends \
        -o Dpkg::Use-Pty=0 $missing >/dev/null
}

# configure PRESET: only when the build folder is new; afterwards the build itself looks after it.
configure() {
    [ -f "build/$1/build.ninja" ] || cmake --preset "$1" >/dev/null
}

#!/usr/bin/env bash
# installed.sh: run by check_packages.sh inside a fresh Debian, in the folder with the packages and with
# the programs of the README.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")"
export DEBIAN_FRONTEND=noninteractive LC_ALL=C.UTF-8
names=$(for package in *.deb; do dpkg-deb --field "$package" Package; done)

expect() {  # expect WHAT "WANTED" "GOT"
  [[ $2 == "$3" ]] || { printf '%s:\nwanted: %s\ngot: %s\n' "$1" "$2" "$3"; exit 1; }
  echo "$1: as expected"
}

# Every file, folder and link, with what is in it, but for what package managers note down.
everything() {
  find / -xdev \( -path /proc -o -path /sys -o -path /dev -o -path /run -o -path /tmp -o -path "$PWD" \
    -o -path /var/lib/dpkg -o -path /var/lib/apt -o -path /var/cache -o -path /var/log \) -prune \
    -o \( -type f -exec sha256sum {} + \) -o -printf '%y %p %l\n' | sort
}

# What the packages say that they need, and nothing else.
needed=$(apt-get --simulate install --no-install-recommends ./*.deb | awk '$1 == "Inst" { print $2 }' |
  grep -vxF "$names")
mapfile -t needed <<<"$needed"
apt-get -q -y install --no-install-recommends "${needed[@]}" >apt.log
everything >before.txt
dpkg --install ./*.deb >dpkg.log
expect "the linker's cache" libtevpf.so.1 "$(ldconfig -p | awk '/libtevpf\.so\.1 / { print $1 }')"

mkdir work && cd work
said='Thrust is 480 kN
900 kN is out of range; the value is as before'
read -ra flags <<<"$(pkg-config --cflags --libs tevpf)"
cc ../engine.c "${flags[@]}" -o engine
expect "the README's program in C" "$said" "$(./engine)"
mkdir debian && touch debian/control
expect "what a program depends on" "libtevpf1 (>= 1.0.0)" \
  "$(dpkg-shlibdeps -O engine | grep -o 'libtevpf[^,]*')"
for linkage in shared static; do
  cmake -S .. -B "$linkage" -DLINKAGE="$linkage" -DPROGRAM="$PWD/../engine.cpp" >cmake.log
  cmake --build "$linkage" >>cmake.log
  expect "the README's program in C++, $linkage" "The second one took 168 s" \
    "$(cd "$linkage" && ./consumer | tail -1)"
done

expect "the tool" 480 "$(tevpf get engine.pf Engine Thrust)"
expect "the tool's SQL" Thrust "$(tevpf sql engine.pf 'select name from Engine' --csv | tail -1)"
gzip --test /usr/share/man/man1/tevpf.1.gz
bash -c 'source /usr/share/bash-completion/completions/tevpf && complete -p tevpf' >/dev/null
[[ -s /usr/share/zsh/vendor-completions/_tevpf ]]

# In one process, the module and the extension have the same file open.
expect "Python and SQLite" "480.0 [('Thrust', 480.0)]" "$(python3 -c '
import sqlite3, tevpf
database = sqlite3.connect(":memory:")
database.enable_load_extension(True)
database.load_extension("tevpf_sqlite")
with tevpf.open("engine.pf") as file:
    database.execute("create virtual table e using tevpf(\"engine.pf\", \"Engine\")")
    print(file.lists["Engine"]["Thrust"].value, database.execute("select name, value from e").fetchall())')"

mapfile -t names <<<"$names"
dpkg --remove "${names[@]}" >>../dpkg.log
dpkg --purge "${names[@]}" >>../dpkg.log 2>&1
cd ..
everything >after.txt
expect "what is left of the packages" "" "$(diff before.txt after.txt)"
expect "what dpkg remembers" "" "$(dpkg-query -W -f '${Package}\n' | grep tevpf || true)"

mkdir "/opt/any folder"
tar -xf ./*.tar.gz -C "/opt/any folder" --strip-components=1
expect "the archive's tool" 480 "$("/opt/any folder/bin/tevpf" get work/engine.pf Engine Thrust)"
PKG_CONFIG_PATH="/opt/any folder/lib/pkgconfig" pkg-config --cflags --libs tevpf >flags.txt
mapfile -t flags < <(xargs -n 1 <flags.txt)
cc engine.c "${flags[@]}" -o engine
expect "a program with the archive's library" "$said" "$(cd work && LD_LIBRARY_PATH="/opt/any folder/lib" ../engine)"

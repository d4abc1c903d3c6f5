# Installs the package in a clean Debian, uses it and removes it. Run there by debian.sh, as root. The last line is "N
# passed, N failed".
set -uo pipefail
cd /root
. /mnt/verdict.sh
export DEBIAN_FRONTEND=noninteractive
# Prints the status, after what apt says if it is not 0.
apt() {
  local status=0
  apt-get -qq -o Dpkg::Use-Pty=0 --no-install-recommends "$@" >/root/apt.log 2>&1 || { status=$?; tail -3 /root/apt.log; }
  echo $status
}

# First with nothing but what it depends on.
verdict 'apt installs it' 0 "$(apt install /mnt/talutil.deb)"
verdict 'its version' "$(dpkg-query -W -f '${Version}' talutil)" "$(talutil --version)"
verdict 'a call' B "$(talutil call GetData A,B,C, 1 2)"
printf 'Name,Sum\nZo\u00eb,3\n' >table.csv
verdict 'a report' %PDF- "$(talutil report table.csv --pdf - 2>&1 | head -c 5)"
verdict 'a setting' anne "$(talutil config set --database Main --user x S k anne && talutil config get --database Main --user x S k)"
verdict 'its manual page' 1 "$(zcat -f /usr/share/man/man1/talutil.1* | grep -c '^\.TH ')"
verdict 'its completion' clean \
  "$(. /usr/share/bash-completion/completions/talutil; COMP_WORDS=(talutil cle) COMP_CWORD=1; _talutil; echo "${COMPREPLY[*]}")"
# Then with what uses its libraries.
verdict 'apt installs Python and pkg-config' 0 "$(apt install python3 pkg-config)"
verdict 'its Python package' B "$(python3 -c 'import talutil; print(talutil.ORVUtils().GetData("A,B,C,", 1, 2))')"
verdict 'pkg-config finds it' -ltalutil "$(pkg-config --libs-only-l talutil | xargs)"
verdict 'apt removes it' 0 "$(apt purge talutil)"
# Settings belong to the user.
verdict 'what is left' /root/.local/share/talutil "$(find / -xdev -iname '*talutil*' -not -path '/mnt/*' -not -path '/proc/*')"

close_counts

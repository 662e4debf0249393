# Sourced by scripts that start a PostgreSQL server of their own.

# The folder with the programs of the newest version; empty if the package is not installed.
programs=$(find /usr/lib/postgresql -maxdepth 2 -name bin 2>/dev/null | sort -V | tail -1)

# Servers refuse to run as root.
as_server() { if [ "$(id -u)" = 0 ]; then setpriv --reuid=postgres --regid=postgres --clear-groups "$@"; else "$@"; fi; }

# free_port FROM: a port that nobody listens to, from a number on. The system gives no port below 32,768 to a client, so a
# client cannot connect to itself.
free_port() {
  local port=$1
  while (exec 3<>"/dev/tcp/127.0.0.1/$port") 2>/dev/null; do port=$((port + 1)); done
  echo "$port"
}

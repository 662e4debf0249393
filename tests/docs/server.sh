# Sourced by a session: starts a PostgreSQL server in a folder of its own. It ends with the shell of the session.
#
# The server has the host names of the page: clients find it at PGHOSTADDR and PGPORT, whatever host they name. Only TLS is
# accepted, with a certificate for db.example, whose authority is the file authority.pem of the home folder. The superuser is
# postgres, with the password `secret`.
. "$ROOT/scripts/postgresql.sh"
[ -n "$programs" ] || { echo "the package postgresql is not installed: no server to test with"; exit 77; }
servers=()

stop_servers() {
  local folder
  for folder in "${servers[@]}"; do
    as_server "$programs/pg_ctl" --pgdata "$folder/data" --mode immediate stop >/dev/null 2>&1
    rm -rf "$folder"
  done
}
trap stop_servers EXIT

# An authority, and a certificate for db.example.
certify() {
  local folder=$1
  openssl req -x509 -newkey rsa:2048 -nodes -days 2 -subj /CN=Authority -keyout "$folder/authority.key" -out ~/authority.pem
  openssl req -newkey rsa:2048 -nodes -subj /CN=db.example -keyout "$folder/server.key" -out "$folder/server.request"
  openssl x509 -req -days 2 -in "$folder/server.request" -CA ~/authority.pem -CAkey "$folder/authority.key" \
    -set_serial 1 -out "$folder/server.crt"
  chmod 600 "$folder/server.key"
} 2>/dev/null

start_server() {
  local folder
  folder=$(mktemp -d)
  servers+=("$folder")
  export PGHOSTADDR=127.0.0.1 PGPORT
  PGPORT=$(free_port $((20000 + $$ % 1250 * 4)))
  certify "$folder"
  echo secret >"$folder/password"
  [ "$(id -u)" != 0 ] || chown -R postgres "$folder"
  as_server "$programs/initdb" --no-sync --auth scram-sha-256 --username postgres --pwfile "$folder/password" \
    --encoding UTF8 --locale C.UTF-8 --pgdata "$folder/data" >/dev/null
  echo "hostssl all all 127.0.0.1/32 scram-sha-256" | as_server tee "$folder/data/pg_hba.conf" >/dev/null
  as_server tee -a "$folder/data/postgresql.conf" >/dev/null <<END
port = $PGPORT
listen_addresses = '127.0.0.1'
unix_socket_directories = ''
ssl = on
ssl_cert_file = '$folder/server.crt'
ssl_key_file = '$folder/server.key'
END
  as_server "$programs/pg_ctl" --pgdata "$folder/data" --log "$folder/log" --wait start >/dev/null
}

# Statements of its input, as the superuser.
sql() { PGPASSWORD=secret psql --no-psqlrc --quiet --set ON_ERROR_STOP=1 "host=db.example user=postgres sslmode=require dbname=postgres"; }

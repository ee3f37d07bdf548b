#!/usr/bin/env bash
# A ClickHouse server for trying things: server.sh DIRECTORY HTTP-PORT TCP-PORT. Everything that it
# keeps is in the directory; it ends with this script.
set -euo pipefail
mkdir -p "$1"
directory=$(realpath "$1")
cat > "$directory/config.xml" <<CONFIG
<yandex>
  <logger><level>warning</level><log>$directory/log</log><errorlog>$directory/errors</errorlog></logger>
  <http_port>$2</http_port>
  <tcp_port>$3</tcp_port>
  <listen_host>127.0.0.1</listen_host>
  <path>$directory/data/</path>
  <tmp_path>$directory/tmp/</tmp_path>
  <users_config>$directory/users.xml</users_config>
  <default_profile>default</default_profile>
  <default_database>default</default_database>
  <mark_cache_size>67108864</mark_cache_size>
</yandex>
CONFIG
cat > "$directory/users.xml" <<USERS
<yandex>
  <profiles><default/></profiles>
  <quotas><default/></quotas>
  <users>
    <default>
      <password/>
      <networks><ip>127.0.0.1</ip></networks>
      <profile>default</profile>
      <quota>default</quota>
    </default>
  </users>
</yandex>
USERS
exec clickhouse-server --config-file="$directory/config.xml"

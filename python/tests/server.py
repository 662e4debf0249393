"""A PostgreSQL server for the tests, in a folder of its own, that listens to a Unix socket there."""

from __future__ import annotations

import os
import pwd
import shutil
import signal
import subprocess
import tempfile
import time
from pathlib import Path

SETUP = Path(__file__).parents[2] / "adapters/postgresql/sql/setup.sql"
ACCOUNT = "postgres"  # of the Debian package, for tests that run as root: the server refuses to
ENVIRONMENT = {name: value for name, value in os.environ.items() if name != "LD_PRELOAD"}  # without a sanitizer


def programs() -> Path | None:
    """The folder with the programs of the newest server that is installed."""
    found = sorted(Path("/usr/lib/postgresql").glob("*/bin/postgres"), key=lambda each: float(each.parts[4]))
    return found[-1].parent if found else None


class Server:
    """Has the service `engine`, whose user may create projects. It ends with this object, and with the process."""

    def __init__(self) -> None:
        self._folder = Path(tempfile.mkdtemp(prefix="project-server-"))
        self._process: subprocess.Popen[bytes] | None = None
        if os.geteuid() == 0:
            os.chown(self._folder, pwd.getpwnam(ACCOUNT).pw_uid, -1)
        self._run("initdb", "--no-sync", "--username", "admin", "--auth", "trust", "--encoding", "UTF8", "--locale", "C.UTF-8",
                  "--pgdata", self._data)
        self.start()
        for statement in ("CREATE ROLE owner LOGIN CREATEROLE", "CREATE DATABASE projects OWNER owner"):
            self._sql("admin", "postgres", "--command", statement)
        self._sql("owner", "projects", "--single-transaction", "--file", SETUP)
        self.service_file = self._folder / "services"
        self.service_file.write_text(f"[engine]\nhost={self._folder}\nuser=owner\ndbname=projects\nsslmode=disable\n")

    @property
    def _data(self) -> Path:
        return self._folder / "data"

    def _command(self, program: str, *arguments: str | Path) -> list[str | Path]:
        as_account = ["--reuid", ACCOUNT, "--regid", ACCOUNT, "--clear-groups"] if os.geteuid() == 0 else []
        folder = programs()
        assert folder is not None, "the package postgresql is not installed"
        return ["setpriv", "--pdeathsig", "QUIT", *as_account, folder / program, *arguments]

    def _run(self, program: str, *arguments: str | Path) -> None:
        done = subprocess.run(self._command(program, *arguments), cwd=self._folder, capture_output=True, text=True,
                              env=ENVIRONMENT)
        assert done.returncode == 0, done.stdout + done.stderr

    def _sql(self, user: str, database: str, *arguments: str | Path) -> None:
        subprocess.run(["psql", "--no-psqlrc", "--quiet", "--set", "ON_ERROR_STOP=1", *arguments,
                        f"host={self._folder} user={user} dbname={database}"], check=True, stdout=subprocess.DEVNULL,
                       env=ENVIRONMENT)

    def start(self) -> None:
        """Starts the server, also after stop."""
        with open(self._folder / "log", "ab") as log:
            self._process = subprocess.Popen(
                self._command("postgres", "-D", self._data, "-k", self._folder, "-c", "listen_addresses="),
                cwd=self._folder, stdout=log, stderr=log, env=ENVIRONMENT)
        for _ in range(600):
            ready = subprocess.run([programs() / "pg_isready", "--quiet", "--host", self._folder],  # type: ignore[operator]
                                   env=ENVIRONMENT)
            if ready.returncode == 0:
                return
            time.sleep(0.1)
        raise AssertionError("the server does not start: " + (self._folder / "log").read_text())

    def stop(self) -> None:
        """Ends the server and its connections."""
        if self._process is not None:
            self._process.send_signal(signal.SIGINT)
            self._process.wait(60)
            self._process = None

    def close(self) -> None:
        """Ends the server and deletes its folder."""
        self.stop()
        shutil.rmtree(self._folder)

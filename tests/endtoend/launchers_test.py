#!/usr/bin/env python3
"""Compilers behind a launcher: compiler caches and farms, by the real programs of this machine."""

import contextlib
import json
import os
import socket
import subprocess
import time

from workspace_fixture import Workspace, equal, holds, in_workspace, lacks, project, run_tests, workspace_of

COUNT = 8
def files():
    sources = ["app.cpp"] + [f"part{number}.cpp" for number in range(1, COUNT)]
    listed = " ".join(f'"{source}"' for source in sources)
    made = {**workspace_of("app", settings="writeTokenEquivalent = false\n"),
            "tree/app/src/app.qrpj": project("Console Application", "app", f'"src" {{ "app.h" {listed} }}',
                                             "+cpp { -MMD '-DNAME=\"two words\"' }"),
            "tree/app/src/app.h": "inline const char* name() { return NAME; }\n",
            "tree/app/src/app.cpp": '@import "app.h"\n#include <cstdio>\nint main() { std::puts(name()); }\n'}
    made.update({f"tree/app/src/part{number}.cpp": f'int part{number}() {{ return {number}; }}\n'
                 for number in range(1, COUNT)})
    return made


def build(workspace, launcher, *arguments, **environment):
    workspace.clean()
    log = workspace.run("all.qrex", f"launcher = {launcher}", "jobs=4", *arguments, "failOnErrors=true", **environment)
    equal(workspace.shell("./out/lib/x64/Debug/app"), "two words\n")
    return log


def free_port():
    with socket.socket() as probe:
        probe.bind(("127.0.0.1", 0))
        return probe.getsockname()[1]


@in_workspace(files(), "ccache")
def test_ccache(workspace):
    own = {"CCACHE_DIR": str(workspace.path("cache")), "CCACHE_NOHASHDIR": "1", "CCACHE_BASEDIR": ""}

    def hits(build_it):
        subprocess.run(["ccache", "-z"], env={**os.environ, **own}, check=True, capture_output=True)
        build_it()
        told = subprocess.run(["ccache", "--print-stats"], env={**os.environ, **own}, check=True, capture_output=True,
                              text=True).stdout
        counts = dict(line.split("\t") for line in told.splitlines())
        return int(counts["direct_cache_hit"]), int(counts["cache_miss"])

    equal(hits(lambda: build(workspace, '"ccache"', **own)), (0, COUNT))
    equal(hits(lambda: build(workspace, '"ccache"', **own)), (COUNT, 0))
    equal(hits(lambda: build(workspace, '"ccache"', "commandFiles=false", **own)), (COUNT, 0))
    with Workspace(workspace.binary, files()) as second:
        equal(hits(lambda: build(second, '{ "ccache" }', **own)), (COUNT, 0))


@contextlib.contextmanager
def distccd(workspace):
    """A server; its process, port and log."""
    port, log = free_port(), workspace.path(f"server{time.monotonic_ns()}.log")
    with open(log, "w") as out:
        server = subprocess.Popen(
            ["distccd", "--daemon", "--no-detach", "--port", str(port), "--listen", "127.0.0.1", "--allow", "127.0.0.1",
             "--log-stderr", "--enable-tcp-insecure", "--jobs", "4"], stderr=out, start_new_session=True,
            env={**os.environ, "PATH": "/usr/local/bin:/usr/bin:/bin"})
    try:
        for _ in range(200):
            with contextlib.suppress(OSError), socket.create_connection(("127.0.0.1", port)):
                break
            time.sleep(0.05)
        yield server, port, log
    finally:
        with contextlib.suppress(ProcessLookupError):
            os.killpg(server.pid, 9)
        server.wait()


@in_workspace(files(), "distcc", "distccd")
def test_distcc(workspace):
    with distccd(workspace) as (_, port, log), distccd(workspace) as (other, other_port, other_log):
        farm = {"DISTCC_HOSTS": f"127.0.0.1:{port}/4 127.0.0.1:{other_port}/4", "DISTCC_DIR": str(workspace.path("distcc")),
                "DISTCC_BACKOFF_PERIOD": "0"}

        workspace.path("distcc").mkdir()

        def remote():
            return sum(each.read_text().count("COMPILE_OK") for each in (log, other_log))

        lacks(build(workspace, '"distcc"', **farm), "locally")
        equal(remote(), COUNT)
        # A source that does not compile there is an error as any, and counted once.
        workspace.append("tree/app/src/part1.cpp", "int part1() { return nothing; }\n")
        workspace.clean()
        log_of_error = workspace.run("all.qrex", 'launcher="distcc"', "jobs=4", **farm)
        holds(log_of_error, "tree/app/src/part1.cpp(2) ...", "0 warnings, ")
        workspace.write("tree/app/src/part1.cpp", files()["tree/app/src/part1.cpp"])
        # One server dies in the midst of the build.
        workspace.write("tools/dying", f'#!/bin/sh\ncase "$*" in *part3*) kill -9 -{other.pid};; esac\nexec distcc "$@"\n')
        holds(build(workspace, '{ "tools/dying" }', "commandFiles=false", **farm), "Completed.")
        farm = {"DISTCC_HOSTS": f"127.0.0.1:{other_port}", "DISTCC_DIR": farm["DISTCC_DIR"]}
        holds(build(workspace, '"distcc"', **farm), "distcc[", "running locally", "Completed.")  # told, and not counted


@in_workspace(files(), "sccache")
def test_sccache(workspace):
    own = {"SCCACHE_DIR": str(workspace.path("cache")), "SCCACHE_SERVER_PORT": str(free_port()),
           "SCCACHE_IDLE_TIMEOUT": "60"}
    workspace.shell("sccache --start-server", **own)  # else four first calls would each start one
    try:
        build(workspace, '"sccache"', **own)
        build(workspace, '"sccache"', **own)
        told = json.loads(workspace.shell("sccache --show-stats --stats-format=json", **own))["stats"]
    finally:
        workspace.shell("sccache --stop-server", **own)
    equal((told["cache_hits"]["counts"], told["requests_not_cacheable"]), ({"C/C++": COUNT}, 0))


@in_workspace(files(), "icecc")
def test_icecc(workspace):
    # Without a daemon it compiles on its own machine.
    lacks(build(workspace, '{ "icecc" }'), "error")


@in_workspace(files())
def test_the_missing_one_is_named(workspace):
    workspace.write("tools/pass", '#!/bin/sh\nexec "$@"\n')
    for launcher, path, message in (("absent", "/usr/bin", "ERROR: absent was not found on PATH\n"),
                                    ("pass", "/nowhere", "ERROR: gcc-4 was not found on PATH, which pass is to run\n")):
        workspace.clean()
        log = workspace.run("all.qrex", f'launcher = {{ "{launcher}" }}', f'PATH("x64") = {{ "tools" "{path}" }}')
        equal(log.count(message), COUNT)
        holds(log, f"0 warnings, {COUNT} errors")
    # One that dies leaves nothing that passes for an object.
    workspace.write("tools/pass", '#!/bin/sh\nwhile [ "$1" != -o ]; do shift; done\necho half > "$2"\nkill -9 $$\n')
    workspace.clean()
    holds(workspace.run("all.qrex", 'launcher = "pass"', "commandFiles=false"), "ERROR: pass was ended by signal 9", f"{COUNT} errors")
    equal(workspace.times("x64/**/*.o"), {})
    # The linker has none.
    workspace.write("tools/pass", '#!/bin/sh\ncase "$*" in *-c*) exec "$@";; esac\nexit 3\n')
    build(workspace, '"pass"')


@in_workspace(files())
def test_command_lines(workspace):
    log = build(workspace, '""', "commandFiles=false", "diagnostics=true")
    holds(log, "cmd /c gcc-4 -c -MMD '-DNAME=\"two words\"'", ' -o "x64/Debug/app/app.o" "qrexsource/x64/Debug/app/src/app.cpp"')
    lacks(log, "compiler.rsp")
    # Longer than any command line: a file again, which is said once.
    long = " ".join(f"-Wl,--trace-symbol={'x' * 1000}" for _ in range(3000))  # which the driver keeps to itself
    workspace.replace("tree/app/src/app.qrpj", "-MMD", f"-MMD {long}")
    equal(build(workspace, '""', "commandFiles=false").count("longer than the system's command lines"), 1)


run_tests(globals())

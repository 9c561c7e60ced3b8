#!/usr/bin/env python3
"""Programs of the runtime's library alone: under sanitizers, in threads, in plug-ins, with the other byte order, without memory."""

import re

from runtime_fixture import PLAIN, has_header, link, run_tour, translate
from workspace_fixture import ROOT, Skipped, data, equal, holds, need, run_tests

# The tour and the scenarios without memory.
ADDRESSES = "g++ -std=c++17 -g1 -fsanitize=address,undefined -fno-sanitize=bool -Wall -Werror -Wno-deprecated-declarations"
THREADS = "g++ -std=c++17 -g1 -O1 -fsanitize=thread -Wno-tsan"

# Loads plug-ins and unloads them. "own": the program holds a copy of their project itself.
HOST = data("library/host.cpp")


def test_undefined_behaviour(binary):
    """A $dep bool is copied ahead of its first value (docs/runtime.md), which -fsanitize=bool would tell."""
    need("g++")
    run_tour(binary, ADDRESSES)


def test_byte_order(binary):
    """Scalars are little-endian in archives; the forced switch turns them around, both ways."""
    need("g++")
    workspace, root = translate(binary, "order.qrws")
    with workspace:
        link(workspace, PLAIN, [f"{root}/order/src/order.cpp"], "plain")
        link(workspace, PLAIN + " -DVESK_SWAP_SCALARS", [f"{root}/order/src/order.cpp"], "swapped")
        plain, swapped = (workspace.shell(f"./{program}").splitlines() for program in ("plain", "swapped"))
        one = ",".join(["0"] * 15)
        equal(plain, ["[254]", "[1]", "[2,1]", "[4,3,2,1]", "[254,255,255,255,255,255,255,255]", f"[1,{one}]",
                      "[0,0,0,0,0,0,240,63]", "[2,97,98]", "[2,97,0,97,0]", "[2,1,0,2,0]", "[2,1,0,2,0]", "[1,1,0,0,0]",
                      "[1,3,0,1,99]", "numbers[300]", "nested[k][300]"])
        equal(swapped, ["[254]", "[1]", "[1,2]", "[1,2,3,4]", "[255,255,255,255,255,255,255,254]", f"[{one},1]",
                        "[63,240,0,0,0,0,0,0]", "[2,97,98]", "[2,0,97,0,97]", "[2,0,1,0,2]", "[2,0,1,0,2]", "[1,0,0,0,1]",
                        "[1,0,3,1,99]", "numbers[300]", "nested[k][300]"])


def run_under(binary, name, output, *compilers, sources=None, libraries="-lpthread", prepare=lambda workspace: None):
    need("g++", "setarch")
    workspace, root = translate(binary, f"{name}.qrws")
    with workspace:
        prepare(workspace)
        for compiler in compilers:
            link(workspace, compiler, [f"{root}/{name}/src/{source}.cpp" for source in sources or [name]], name, libraries)
            # Some kernels place the program where the sanitizer wants its own memory. AddressSanitizer warns of each use of
            # another stack.
            printed = workspace.shell(f"setarch -R ./{name} 2>errors || {{ cat errors; false; }}")
            equal(re.sub(r"(?m)^ +a", "a", printed), output)


def test_threads(binary):
    """A graph, archives, a connection and JSON in each thread do not meet those of others; all print whole lines, if
    with an indentation of another one's."""
    run_under(binary, "threads", "a line\n" * 80 + "flush left\n0 0 0 0 0\n", THREADS, ADDRESSES)


def make_certificates(workspace):
    """Those of the page, and such as are not taken."""
    page = (ROOT / "docs/runtime.md").read_text()
    commands = re.findall(r"(?m)^    (openssl req .*|openssl x509 .*)$", page)
    equal(len(commands), 5)
    sign = "openssl x509 -req -copy_extensions copy -CA authority.pem -CAkey authority.key"
    named = "openssl req -new -key server.key -subj /CN=localhost -addext subjectAltName=DNS:"
    workspace.shell(" && ".join([
        *commands, "for name in other late foreign stranger; do cp server.key $name.key; done",
        f"{named}elsewhere -out other.csr", f"{sign} -in other.csr -out other.pem -days 365",
        f"{named}localhost -out late.csr", f"{sign} -in late.csr -out late.pem -days -1",
        f"{named}localhost -x509 -out foreign.pem",
        f"{sign} -in server.csr -out stranger.pem -CA foreign.pem -CAkey foreign.key"]))


def test_sockets(binary):
    """Each transport: a server in one thread, stopped by another, and its clients in threads of their own; clients that
    leave, stall, flood or lie, no descriptors, methods that serve or call while they are called; who may enter and call."""
    need("g++", "openssl")
    if not has_header("boost/asio.hpp"):
        raise Skipped("boost/asio.hpp")
    with_tls = has_header("openssl/ssl.h")
    run_under(binary, "sockets", f"{4 + with_tls}\n", THREADS, ADDRESSES + " -Wno-unused-value", sources=["sockets"] + ["tls"] * with_tls,
              libraries="-lpthread" + " -lssl -lcrypto" * with_tls, prepare=make_certificates)
    if not with_tls:
        raise Skipped("openssl/ssl.h")


def test_memory(binary):
    """Each allocation of a scenario fails in turn: nothing is lost, destroyed twice or left wrong."""
    need("g++")
    workspace, root = translate(binary, "memory.qrws", "compilableText = true")
    with workspace:
        link(workspace, ADDRESSES, [f"{root}/memory/src/{name}.cpp" for name in ("containers", "graph", "memory", "values")], "memory")
        holds(workspace.shell("./memory"), " runs, 0 failures\n")


def test_modules(binary):
    """Two plug-ins and a program that hold copies of one project."""
    need("g++")
    workspace, root = translate(binary, "twice.qrws")
    with workspace:
        compiler = f"{PLAIN} -I{root}"
        objects = f"{root}/twice/src/twice.cpp library.o"
        workspace.shell(f"{PLAIN} -I{root} -c library.cpp")
        workspace.write("host.cpp", HOST)
        workspace.shell(f"{compiler} -shared {objects} -o a.so && cp a.so b.so")
        # A program that exports nothing has a registry of its own; its records and those of the plug-ins are copies.
        workspace.shell(f"{compiler} -DOWN host.cpp {objects} -o own")
        equal(workspace.shell("./own"), "7 7 Twice Twice Twice\n")
        # One that exports its symbols has the registry of all.
        workspace.shell(f"{compiler} -rdynamic host.cpp library.o -o host")
        equal(workspace.shell("./host"), "Twice Twice none\n")


run_tests(globals())

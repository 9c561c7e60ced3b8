#!/usr/bin/env python3
"""Whole runs with faults: errors in the middle, what is in the way, other runs. Failing calls and kills: tests/faults.

Usage: faults_test.py BINARY [TEST...]. Each test is a function that works in a folder of its own."""

import os
import re
import shutil
import subprocess
import time

from run_fixture import (BINARY, DEPENDENCIES, TRANSLATED, EACH_RUN, write, read, write_tree, run, expect, leftovers, contents, edit,
                         run_named)
from workspace_fixture import holds, lacks


# --- Errors in the middle

def test_nothing_is_lost_when_an_error_ends_the_run():
    write_tree()
    run()
    edit('tree/app/src/x.cpp', '@import "app/b.h"\n@import "app/a.h"\n$init { }\n$init { }\n')
    edit('tree/app/src/y.cpp', 'int y;\n$bad\n')
    text = run(status=1)
    holds(text, "\ntree/app/src/y.cpp(2) : error : '$bad' is not a valid directive")
    lacks(text, '\napp...')
    lacks(text, 'Completed')
    main_before = read(TRANSLATED + 'src/app.cpp')
    edit('tree/app/src/y.cpp', 'int y;\n')
    text = run('main.qrex', 'diagnostics=true')
    expect(re.findall(r'^Writing: .*/(.*)$', text, re.M) == ['y.cpp', 'app.cpp'], text)  # x.cpp was finished before
    expect(b'_Register_x1' in read(TRANSLATED + 'src/app.cpp') and b'_Register_x1' not in main_before, 'registration')


def test_a_main_source_that_is_compiled_alone_registers_all():
    write_tree()
    compiled = ['main.qrex', 'mode=compile', '$COMPILE_FILE_PATH = "tree/app/src/app.cpp"']
    run(*compiled)
    expect(b'_Register_x0' in read(TRANSLATED + 'src/app.cpp'), 'x.cpp was never translated')
    expect(not os.path.exists(TRANSLATED + 'src/x.cpp'), 'nor is it written')
    holds(run('main.qrex', 'diagnostics=true'), 'Writing: ' + TRANSLATED + 'src/x.cpp')
    alone = read(TRANSLATED + 'src/app.cpp')
    shutil.rmtree('qrexsource')
    run()
    expect(read(TRANSLATED + 'src/app.cpp') == alone, 'as a whole build writes it')
    edit('tree/app/src/y.cpp', '$bad\n')
    os.remove(DEPENDENCIES)
    holds(run(*compiled, status=1), "tree/app/src/y.cpp(1) : error : '$bad' is not a valid directive")


def test_a_failed_translation_keeps_its_imports():
    # b.h fails ahead of its import of c.h, and c.h changed as well: mending the former must not hide the latter
    write_tree({'tree/app/b.h': '@import "a.h"\n@import "c.h"\nint b;\n'})
    run()
    good = read('tree/app/a.h')
    good_time = os.stat('tree/app/a.h').st_mtime_ns
    edit('tree/app/c.h')
    edit('tree/app/a.h', '$bad\n')
    run(status=1)
    write('tree/app/a.h', good)
    os.utime('tree/app/a.h', ns=(good_time, good_time))
    text = run('main.qrex', 'diagnostics=true')
    holds(text, '* b.h\n', '* x.cpp\n', '* y.cpp\n')
    lacks(run('main.qrex', 'diagnostics=true'), '\n* ')


# --- Faults of the disk

def test_what_is_in_the_way():
    write_tree()
    write('qrexsource', 'a file')
    text = run(status=1)
    holds(text, f'Error: File error ({TRANSLATED}a.h) : The system cannot find the path specified.\n',)
    os.remove('qrexsource')
    os.makedirs(TRANSLATED + 'c.h')
    os.makedirs(TRANSLATED + 'n.txt')
    holds(run(status=1), f'Error: File error ({TRANSLATED}c.h) : ')
    os.rmdir(TRANSLATED + 'c.h')
    holds(run(), f'ERROR: Copy file tree/app/n.txt to {TRANSLATED}n.txt failed\n'
                 'ERROR : GetLastError() returned 5 : Access is denied.\n')
    shutil.rmtree('qrexsource')
    shutil.rmtree('out')
    os.makedirs('out/uinc/app/src/app.qrpj')
    os.makedirs('out/uinc/app/c.h')
    text = run()
    holds(text, 'Error: File error (out/uinc/app/src/app.qrpj) : ', '\n...Copy file failed\n', '\nCompleted')
    shutil.rmtree('out')
    write('out', 'a file')
    holds(run(), '\n...Copy file failed\n', '\nCompleted')


def test_standard_output_that_takes_nothing():
    write_tree({'tree/app/c.h': 'int c;\n' * 200000})
    run()
    wanted = without_times(contents('qrexsource', 'out'))
    shutil.rmtree('qrexsource')
    shutil.rmtree('out')
    expect(subprocess.run(f'"{BINARY}" main.qrex diagnostics=true >&-', shell=True).returncode == 0, 'closed')
    expect(without_times(contents('qrexsource', 'out')) == wanted, 'what was printed stands in a file')
    # a pipe that is full for a while and does not block
    reading, writing = os.pipe()
    os.set_blocking(writing, False)
    os.write(writing, b'.' * 60000)
    process = subprocess.Popen([BINARY, *['a="' + 'x' * 999 + '"'] * 60, 'main.qrex', 'mode=clean'], stdout=writing)
    os.close(writing)
    time.sleep(0.2)
    with os.fdopen(reading) as pipe:
        holds(pipe.read(), 'argv[60] = ', '\nCompleted')
    expect(process.wait() == 0, 'status')


# --- Runs that are killed

def without_times(files):
    return {path: content for path, content in files.items() if path not in EACH_RUN}


def test_runs_at_the_same_time():
    write_tree({'tree/app/c.h': 'int c;\n' * 100000})
    run()
    wanted = without_times(contents('qrexsource', 'out'))
    # each with the process numbers of the others, as in containers of their own
    apart = ['unshare', '--pid', '--fork']
    if subprocess.run([*apart, 'true'], stderr=subprocess.DEVNULL).returncode != 0:
        apart = []
    for _ in range(4):
        shutil.rmtree('qrexsource')
        shutil.rmtree('out')
        runs = [subprocess.Popen([*apart, BINARY, 'main.qrex'], stdout=subprocess.PIPE, text=True) for _ in range(4)]
        for process in runs:
            text = process.communicate()[0]
            expect(process.returncode == 0 and 'rror' not in text and 'failed' not in text, text)
        expect(without_times(contents('qrexsource', 'out')) == wanted and not leftovers(), leftovers())


run_named(globals())

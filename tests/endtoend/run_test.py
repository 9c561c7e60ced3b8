#!/usr/bin/env python3
"""Whole runs: modes, what a second run leaves alone, bad input, what is in the way, other runs.

Usage: run_test.py BINARY [TEST...]. Each test is a function that works in a folder of its own."""

import os
import re
import shutil
import subprocess
import time

from run_fixture import (BINARY, CONFIG, HEAD, PROJECT, DEPENDENCIES, TRANSLATED, EACH_RUN, JUNK, write, read,
                         write_tree, run, expect, files_of, leftovers, contents, times, changed, is_read_only, edit,
                         run_named)
from workspace_fixture import DRIVE, holds, lacks


# --- Modes

def test_a_second_run_leaves_all_alone():
    write_tree()
    text = run()
    holds(text, 'Qrex V2.20 Oct  7 2020\n', '$EXPORT_LIB = out/lib\n',
          'PATH = /usr/bin;/bin\nINCLUDE = inc\nLIB = lib\n',
          'Building workspace [ws/all.qrws]\n', 'Writing out/uinc/app/src/app.qrpj\n',
          '\n------------------------------------- app  [Debug|x64] ------------------------------------------\n')
    expect(re.search(r'\napp\.{85} +\d+\.\d\d ms\n\nCompleted\.{79} +\d+\.\d\d ms\n$', text), text)
    headers = ['app/a.h', 'app/b.h', 'app/c.h', 'app/n.txt']
    others = ['out/uinc/.qrwsroot', 'out/uinc/app/src/app.qrpj', 'out/uinc/ws/all.qrws']
    exported = [f'out/{kind}/{name}' for kind in ('tinc', 'uinc') for name in headers] + others
    expect(files_of('out') == sorted(exported), files_of('out'))
    expect(read('out/tinc/app/b.h') == read(TRANSLATED + 'b.h') != read('tree/app/b.h'), 'translated header')
    expect(read('out/uinc/app/b.h') == read('tree/app/b.h'), 'untranslated header')
    for path in files_of('out', 'qrexsource'):
        expect(is_read_only(path) == (path not in (DEPENDENCIES, 'out/uinc/.qrwsroot')), 'read-only flag of ' + path)
    before = times('.')
    bytes_before = contents('qrexsource', 'out')
    text = run()
    lacks(text, 'Writing')
    lacks(text, 'Deleting')
    holds(text, 'Skipping out/uinc/app/src/app.qrpj\n')
    expect(set(changed(before, times('.'))) <= EACH_RUN, changed(before, times('.')))
    expect(contents('qrexsource', 'out') == bytes_before, 'the same bytes, dependency file included')


def test_what_an_edit_makes_stale():
    write_tree()
    run()
    for source, stale in [('a.h', ['a.h', 'b.h', 'x.cpp']), ('b.h', ['b.h', 'x.cpp']), ('c.h', ['c.h', 'y.cpp']),
                          ('src/y.cpp', ['y.cpp']), ('n.txt', ['n.txt'])]:
        edit('tree/app/' + source)
        text = run('main.qrex', 'diagnostics=true')
        expect(re.findall(r'^\* (.*)$', text, re.M) == stale, f'{source}: {text}')
        lacks(run('main.qrex', 'diagnostics=true'), '\n* ')
    # what a .cpp registers is written into the main source
    edit('tree/app/src/y.cpp', '@import "app/c.h"\n$init { }\n')
    text = run('main.qrex', 'diagnostics=true')
    holds(text, '* y.cpp\n', f'Writing: {TRANSLATED}src/y.cpp\n', f'Writing: {TRANSLATED}src/app.cpp\n')
    lacks(text, '* app.cpp')
    holds(read(TRANSLATED + 'src/app.cpp').decode(), 'void _Register_x0()', 'void _Register_y0()')
    os.remove(TRANSLATED + 'c.h')
    expect(re.findall(r'^\* (.*)$', run('main.qrex', 'diagnostics=true'), re.M) == ['c.h'], 'a deleted output')
    write(DEPENDENCIES, JUNK)
    for line, told in ('jobs=1', f'No dependency file {DEPENDENCIES}\n'), ('rebuildAll=true', f'\nDeleting {DEPENDENCIES}\n'):
        text = run('main.qrex', 'diagnostics=true', line)
        holds(text, told)
        expect(text.count('\n* ') == 7, text)


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


def test_clean_compile_show():
    write_tree()
    run()
    holds(run('main.qrex', 'mode=show', '$COMPILE_FILE_PATH = "tree/app/src/x.cpp"'),
          'Showing generated file in workspace [ws/all.qrws]\n', f'\n{TRANSLATED}src/x.cpp(1)\n')
    edit('tree/app/src/y.cpp')
    before = times('.')
    text = run('main.qrex', 'mode=compile', '$COMPILE_FILE_PATH = "tree/app/src/y.cpp"')
    holds(text, 'Compiling file tree/app/src/y.cpp...\n', f'Deleting {TRANSLATED}src/y.cpp\n',
          '\n\nCompile completed....')
    expect(changed(before, times('.')) == [DEPENDENCIES, TRANSLATED + 'src/y.cpp'], changed(before, times('.')))
    for mode, path, message in [
            ('show', 'tree/none.h', '\nFile is not part of an qrex project\n'),
            ('show', 'nowhere/x.cpp', '\nSearch for .qrwsroot failed\n'),
            ('show', 'x.cpp', '\nSearch for .qrwsroot failed\n'),
            ('compile', 'tree/none.cpp', '\nCompilation aborted: File is not part of an qrex project\n'),
            ('compile', 'tree/app/a.h', '\nCompilation aborted: File is not a cpp, c or asm file\n'),
            ('compile', 'nowhere/x.cpp', '\nSearch for .qrwsroot failed\n')]:
        holds(run('main.qrex', 'mode=' + mode, f'$COMPILE_FILE_PATH = "{path}"', status=1), message)
    text = run('main.qrex', 'mode=clean')
    holds(text, 'Cleaning workspace [ws/all.qrws]\n', f'Deleting {DEPENDENCIES}\n', f'Deleting {TRANSLATED}a.h\n')
    expect(files_of('qrexsource') == [], 'all is deleted')
    lacks(run('main.qrex', 'mode=clean'), 'Deleting')


def test_missing_files_are_made():
    write_tree({'tree/app/c.h': None})
    holds(run('main.qrex', 'mode=gen'), 'Generating workspace [ws/all.qrws]\n', 'Creating missing file tree/app/c.h\n')
    lacks(run('main.qrex', 'mode=gen'), 'Creating')
    expect(read('tree/app/c.h') == b'', 'the missing file')
    write('tree/app/src/app.qrpj', PROJECT + '{ "no" { "such.h" } }')
    holds(run('main.qrex', 'mode=gen'), 'Creating missing file tree/app/no/such.h\nError creating tree/app/no/such.h\n')


def test_projects_that_write_the_same_files():
    # the last one's stay, as if the projects came one after the other; of the markers that of the first root stays
    names = [f'{prefix}{i}' for i in range(6) for prefix in ('p', 'build_p')]
    projects = {('over' if 'b' in name else 'tree') + f'/{name}/src/{name}.qrpj':
                f'$TARGET_TYPE = "Application" $ROOT_TO_PROJDIR = "{name}" qrex toolfiles {{ "of_{name}" }} {{ }}'
                for name in names}
    for _ in range(4):
        write_tree({**projects, 'tree/ws/all.qrws': '"all" { "' + '" "'.join(names) + '" }\n', 'over/.qrwsroot': 'over'})
        text = run('main.qrex', 'mode=gen', 'compiler=vc9', 'virtualTree += { "over" }')
        expect(re.findall(r'Writing (.*)\.vcproj', text) == [of for name in names for of in (name, 'build_' + name)], text)
        for i in range(6):
            holds(read(f'build_p{i}.vcproj').decode(), f'"of_build_p{i}"')
        expect(read('out/uinc/.qrwsroot') == b'', 'marker')
        for path in ['out', *(path for path in os.listdir('.') if path.endswith('.vcproj'))]:
            shutil.rmtree(path) if os.path.isdir(path) else os.remove(path)
    write_tree({'tree/app/src/app.qrpj': HEAD + 'config { "D|x" } +cpp { -one } config { "D|x" } { }'})
    expect(run('main.qrex', 'mode=gen').count('Writing make_app_x_D\n') == 2, 'a configuration that is there twice')
    holds(read('make_app_x_D').decode(), 'CXXFLAGS = \r\n')


def test_repackaged_program_stays_executable():
    write_tree({'tree/app/src/app.qrpj': '$TARGET_TYPE = "Application"\n$ROOT_TO_PROJDIR = "app"\nexport\n'
                                         'config { "Debug|x64" }\n{ }\n', 'tree/x64/Debug/app.exe': '#!/bin/sh\n'})
    os.chmod('tree/x64/Debug/app.exe', 0o755)
    run('main.qrex', 'repackageExecutableTargets=false')
    expect(files_of('out/lib') == [], 'not asked for')
    run()
    expect(os.access('out/lib/x64/Debug/app.exe', os.X_OK), 'execute permission')


def test_parallel_build():
    write_tree()
    os.rename('main.qrex', 'all.translate.qrex')
    write('tools/MSBuild', '#!/bin/sh\necho "$PATH" "$@" > log\nexit 3\n')
    os.chmod('tools/MSBuild', 0o755)
    text = run('*all.SLN', 'PATH("x64") = { "tools" "/bin" }')
    command = 'MSBuild /verbosity:minimal /m /t:Build "/p:Platform=x64;Configuration=Debug" build_all.SLN'
    holds(text, 'argv[1] = *all.SLN\n', '\nCompleted...', f'\n{command}\n{command} failed with error code 3\n'
          'Parallel build with devenv....')
    expect(read('log') == b'tools:/bin ' + command[8:].replace('"', '').encode() + b'\n', read('log'))
    text = run('*all.sln', 'compiler=vc9', 'mode=gen')
    holds(text, '\ndevenv build_all.sln /Build "Debug|x64"\n', f'failed with error code {9009 if DRIVE else 127}\n')


# --- Bad input: an orderly end with status 1, the place, and what is wrong

def test_bad_command_lines():
    holds(run('x="1"', status=1), ' --> adding variable $x=1\nUsage...\nQrex pathToConfigFile\n')
    expect(subprocess.run([BINARY], stdout=subprocess.PIPE).stdout ==
           b'Qrex V2.20 Oct  7 2020\nUsage...\nQrex pathToConfigFile\n', 'no argument')
    for argument in ['mode=clean', 'none.qrex', '.', '', '*x.qrex', '"unterminated', '/dev/null/x', 'none.sln']:
        name = argument.replace('.sln', '.qrex')
        holds(run(argument, status=1), f'argv[1] = {argument}\nException: Couldn\'t open file {name}\n')
    write('empty.qrex', '')
    holds(run('empty.qrex', status=1),
          "\nERROR:  Missing setting: 'virtualTree' not specified\nError in config file empty.qrex\n")
    run(b'\xff\xfe.qrex', status=1)


BAD_INPUT = [
    # changes to the tree, then what the output holds, in order
    ({'main.qrex': JUNK}, ['main.qrex(1) : ', '    while processing qrex config file : main.qrex\n']),
    ({'tree/ws/all.qrws': None}, ['\nError: Couldn\'t open workspace file ws/all.qrws\n']),
    ({'tree/ws/all.qrws': JUNK}, ['tree/ws/all.qrws(1) : ', '\nError in workspace file tree/ws/all.qrws\n']),
    ({'tree/ws/all.qrws': '"all" {\n"ws/b.qrws" }', 'tree/ws/b.qrws': '"b" {\n\n"ws/all.qrws" }'},
     ['\ntree/ws/b.qrws(3) : Workspace file includes itself : ws/all.qrws\n',
      '\ntree/ws/all.qrws(2) : while reading workspace file ws/b.qrws\n']),
    ({'tree/ws/all.qrws': '"all" ' + '{ "app" ' * 3000}, [' : Blocks nested too deeply\n']),
    ({'tree/app/src/app.qrpj': JUNK}, ['tree/app/src/app.qrpj(1) : ', 'while reading project file app/src/app.qrpj\n']),
    ({'tree/app/src/app.qrpj': HEAD + '{ ' + '"a" { ' * 3000}, [' : Blocks nested too deeply\n']),
    ({'main.qrex': CONFIG + 'workspaces = { "none" "app" }'},
     ["Error: Couldn't open project file none/src/none.qrpj\n", 'Error: There is no configuration Debug|x64 in project \n']),
    ({'tree/app/c.h': JUNK}, ['tree/app/c.h(1) : error : ']),
    ({'tree/app/c.h': None}, ["Couldn't open file tree/app/c.h\n"]),
]


def test_bad_input():
    for changes, pieces in BAD_INPUT:
        for name in os.listdir('.'):
            shutil.rmtree(name) if os.path.isdir(name) else os.remove(name)
        write_tree(changes)
        holds(run(status=1), *pieces)
        expect(not leftovers(), 'temporaries stay behind')


def test_symbolic_links_in_a_circle():
    write_tree({'tree/app/src/app.qrpj': PROJECT + '{ "*.h" * }'})
    os.symlink('.', 'tree/app/self')
    os.symlink('../app', 'tree/app/again')
    run()
    holds(read(DEPENDENCIES).decode(errors='replace'), 'app/a.h', 'app/b.h', 'app/c.h')
    lacks(read(DEPENDENCIES), b'self')


def test_identifier_file_that_cannot_be_written():
    write_tree()
    write('projects.guids', b'\x01\x03app' + bytes(range(16)))
    os.chmod('projects.guids', 0o444)
    holds(run(), "Error : Couldn't write projects.guids\n", '\nCompleted')
    expect(read('projects.guids')[-1] == 15, 'untouched')


# --- What is in the way, and other runs. Failing calls and kills: tests/faults

def without_times(files):
    return {path: content for path, content in files.items() if path not in EACH_RUN}


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
    if DRIVE:
        return  # not every system has pipes that do not block
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

#!/usr/bin/env python3
"""Random edit sessions: whatever was edited, a run must end with the files of a run that begins from nothing.

Usage: edit_session_test.py BINARY [SESSIONS [FIRST_SEED]]. A failed session prints its seed and its edits."""

import os
import random
import re
import shutil
import sys
import time

from workspace_fixture import SETTINGS, Workspace, run_tests

SESSIONS = int(sys.argv[2]) if len(sys.argv) > 2 else 8
FIRST_SEED = int(sys.argv[3]) if len(sys.argv) > 3 else 0
EDITS = 12

CONFIG = SETTINGS + 'workspaces = { "app" "vxObject" } translateOnly = true\n'
PROJECT = '$TARGET_TYPE = "Application"\n$ROOT_TO_PROJDIR = "%s"\nconfig { "Debug|x64" }\nqrex\n'
IOBJECT = 'Vesk/vxObject/IObject.h'
HEADERS = ['h0.h', 'h1.h', 'h2.h', 'h3.h', 'h4.h']
# In the order of the build but for app.cpp, which is the last. b, and h2 once it is there, are of a header's stem.
SOURCES = ['a.cpp', 'b.cpp', 'c.cpp', 'd.cpp', 'app.cpp']
LATE_SOURCES = ['_.cpp', 'h2.cpp', 'h3.cpp', 'z.cpp']

# What may stand in a file, by its name; the last is nothing to register.
DECLARATIONS = ['$enum+ E_%s { e };\n', '$init { }\n', '$uninit { }\n',
                'namespace n_%s { $type+ xvector<int32>; }\n', '$struct+ S_%s { };\n', 'int i_%s;\n']


class Session:
    def __init__(self, workspace, seed):
        self.workspace, self.random, self.log = workspace, random.Random(seed), []
        workspace.write('main.qrex', CONFIG)
        workspace.write('tree/.qrwsroot', '')
        workspace.write('tree/vxObject/src/vxObject.qrpj', PROJECT % 'Vesk/vxObject' + '{ "IObject.h" }\n')
        workspace.write(f'tree/{IOBJECT}', 'namespace vesk { $interface+ IObject { }; }\n')
        self.sources = list(SOURCES)
        self.imports, self.contents = {}, {}
        for name in HEADERS + SOURCES:
            self.make(name)
        self.write_project()
        os.makedirs(workspace.path('clean'))
        shutil.copy(workspace.path('main.qrex'), workspace.path('clean/main.qrex'))
        os.symlink('../tree', workspace.path('clean/tree'))

    def importable(self, name):
        """Headers import only those ahead of them: no cycles."""
        return [IOBJECT] + (HEADERS[:HEADERS.index(name)] if name in HEADERS else HEADERS)

    def make(self, name):
        self.imports[name] = [path for path in self.importable(name) if path == IOBJECT or self.random.random() < 0.4]
        self.contents[name] = [text for text in DECLARATIONS if self.random.random() < 0.3]
        self.write(name)

    def path(self, name):
        return f'tree/app/src/{name}'

    def write(self, name, wrong=''):
        imports = ''.join(f'@import "{path}"\n' for path in self.imports[name])
        body = ''.join(text.replace('%s', name.replace('.', '_')) for text in self.contents[name])
        self.write_now(self.path(name), imports + body + wrong)

    def write_now(self, path, text):
        """With a time of its own, finer than the ticks of the system's clock."""
        self.workspace.write(path, text)
        now = time.time_ns()
        os.utime(self.workspace.path(path), ns=(now, now))

    def write_project(self):
        names = ' '.join(f'"{name}"' for name in sorted(self.sources) + HEADERS)
        self.write_now('tree/app/src/app.qrpj', PROJECT % 'app' + '{ "src" { ' + names + ' } }\n')

    # --- Edits; each tells what it did

    def toggle_import(self):
        name = self.random.choice(self.sources + HEADERS)
        path = self.random.choice([path for path in self.importable(name) if path != IOBJECT] or [None])
        if not path:
            return 'nothing'
        imports = self.imports[name]
        imports.remove(path) if path in imports else imports.insert(self.random.randint(1, len(imports)), path)
        self.write(name)
        return f'{name} imports {imports}'

    def toggle_declaration(self):
        name = self.random.choice(self.sources + HEADERS)
        text = self.random.choice(DECLARATIONS)
        contents = self.contents[name]
        contents.remove(text) if text in contents else contents.append(text)
        self.write(name)
        return f'{name} holds {contents}'

    def add_source(self):
        names = [name for name in LATE_SOURCES if name not in self.sources]
        if not names:
            return 'nothing'
        name = self.random.choice(names)
        self.sources.append(name)
        self.make(name)
        self.write_project()
        return f'{name} is new and imports {self.imports[name]}'

    def remove_output(self):
        name = self.random.choice(self.sources)
        output = self.workspace.path(f'qrexsource/x64/Debug/app/src/{name}')
        if output.exists():
            output.chmod(0o644)
            output.unlink()
        return f'output of {name} removed'

    def edit(self):
        edits = [self.toggle_import] * 6 + [self.toggle_declaration] * 2 + [self.add_source, self.remove_output]
        self.log.append(self.random.choice(edits)())

    # --- Runs

    def run_in_part(self):
        """A run that an error ends, or of one file alone; the next one must make up for it."""
        name = self.random.choice(self.sources)
        if self.random.random() < 0.5:
            self.log.append(f'an error in {name}')
            self.write(name, wrong='$bad\n')
            self.workspace.run('main.qrex', status=1)
            self.write(name)
        else:
            self.log.append(f'{name} is compiled')
            self.workspace.run('main.qrex', 'mode=compile', f'$COMPILE_FILE_PATH = "{self.path(name)}"')

    @staticmethod
    def outputs(folder):
        return {str(path.relative_to(folder)): path.read_bytes() for path in (folder / 'qrexsource').rglob('*')
                if path.is_file() and path.suffix != '.qrexdep'}

    @staticmethod
    def unregistered(output):
        return re.findall(r'/(\w+\.\w+)\(1\) : error : No cpp directly imports', output)

    def run_and_compare(self):
        text = self.workspace.run('main.qrex')
        clean = self.workspace.path('clean')
        shutil.rmtree(clean / 'qrexsource', ignore_errors=True)
        clean_text = self.workspace.shell(f'cd clean && {self.workspace.binary} main.qrex')
        got, wanted = self.outputs(self.workspace.folder), self.outputs(clean)
        differing = sorted(name for name in {**got, **wanted} if got.get(name) != wanted.get(name))
        assert not differing, f'{differing} differ'
        assert self.unregistered(text) == self.unregistered(clean_text), 'declarations not registered'
        times = self.workspace.times('qrexsource/**/*.cpp')
        self.workspace.run('main.qrex')
        again = self.workspace.changed(times, 'qrexsource/**/*.cpp')
        assert not again, f'{again} are written again'

    def run(self):
        self.run_and_compare()
        for _ in range(EDITS):
            for _ in range(self.random.choice([1, 1, 2, 3])):
                self.edit()
            if self.random.random() < 0.2:
                self.run_in_part()
                if self.random.random() < 0.5:
                    self.edit()
            self.run_and_compare()
            self.log.append('run')


def test_an_incremental_run_ends_like_a_whole_one(binary):
    for seed in range(FIRST_SEED, FIRST_SEED + SESSIONS):
        with Workspace(binary, {}) as workspace:
            session = Session(workspace, seed)
            try:
                session.run()
            except Exception:
                print(f'session {seed}:', *session.log, sep='\n  ')
                raise


run_tests(globals())

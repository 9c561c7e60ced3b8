// What needs no editor: settings, and the problems that are read out of a log.
'use strict';

const assert = require('node:assert');
const fs = require('node:fs');
const path = require('node:path');
const { test } = require('node:test');

const ROOT = path.join(__dirname, '../../../editors/vscode');
const { initializationOptions, serverCommand, toolCommand } = require(path.join(ROOT, 'src/options'));
const { looksLikeSettings } = require(path.join(ROOT, 'src/settings_text'));
const manifest = require(path.join(ROOT, 'package.json'));
const { problemMatchers, problemPatterns } = manifest.contributes;
const REPOSITORY = path.join(__dirname, '../../..');

const settings = (given) => ({ serverPath: '', configuration: '', arguments: [], clangdPath: null, ...given });

test('what is not set is left to the server', () => {
  assert.deepStrictEqual(initializationOptions(settings({}), '/w'), {});
  assert.deepStrictEqual(initializationOptions(settings({ clangdPath: '' }), '/w'), { clangd: '' });
  const given = settings({ configuration: 'sub/a.qrex', clangdPath: '${workspaceFolder}/bin/clangd', arguments: ['jobs=1'] });
  assert.deepStrictEqual(initializationOptions(given, '/w'), { configuration: '/w/sub/a.qrex', clangd: '/w/bin/clangd', arguments: ['jobs=1'] });
});

test('a program without a folder is looked for in PATH', () => {
  assert.deepStrictEqual([serverCommand(settings({}), '/w'), toolCommand(settings({}), '/w')], ['qrex-lsp', 'Qrex']);
  const given = settings({ serverPath: 'build/qrex-lsp' });
  assert.deepStrictEqual([serverCommand(given, '/w'), toolCommand(given, '/w')], ['/w/build/qrex-lsp', '/w/build/Qrex']);
});

test('settings are told by their first statement', () => {
  const files = ['templates/workspace/settings.inc', 'templates/workspace/tree/common.inc', 'examples/first/tree/common.inc'];
  for (const file of files) assert.ok(looksLikeSettings(fs.readFileSync(path.join(REPOSITORY, file), 'utf8')), file);
  const ours = ['/* a */ @import "b.inc"\n$X = "1"', '@def f =\n{\n-g\n}\n+cpp { f }', 'mode = build', 'PATH("x") = { "/bin" }', 'subproj { "a" }'];
  const others = ['', '{ 1, 2 },', 'int n = 3;', '#include "a.h"', '@def f(x) = x\nint n = f(3);', '<?php $a = "x";', 'X(a, b)', 'config(a);'];
  assert.deepStrictEqual([...ours, ...others].filter(looksLikeSettings), ours);
});

// As the editor reads a log: colours are taken out; of matchers of several lines the last lines are asked first.
function problems(log) {
  const compiled = problemMatchers.map(({ name, pattern }) => {
    const { patterns, ...single } = problemPatterns.find((one) => `$${one.name}` === pattern);
    return { name, lines: (patterns || [single]).map((line) => ({ ...line, regexp: new RegExp(line.regexp) })) };
  });
  const found = [];
  const lines = log.split(/\r?\n/).map((line) => line.replace(/\x1b\[[\d;]*[A-Za-z]/g, ''));
  for (let end = 0; end < lines.length; ++end) {
    const byLength = [...compiled].sort((a, b) => b.lines.length - a.lines.length);
    for (const { lines: patterns } of byLength) {
      const matches = patterns.map(({ regexp }, at) => regexp.exec(lines[end - patterns.length + 1 + at] || ''));
      if (!matches.every(Boolean)) continue;
      const value = (name) => patterns.map((pattern, at) => pattern[name] && matches[at][pattern[name]]).find((one) => one);
      found.push(['file', 'line', 'column', 'severity', 'code', 'message'].map(value).filter(Boolean).join('|'));
      break;
    }
  }
  return found;
}

test('messages become problems at the lines of the sources', () => {
  assert.deepStrictEqual(problems(fs.readFileSync(path.join(__dirname, 'terminal.log'), 'utf8')), [
    'tree/zoo_core/api/animal.h|11|error|Unrecognised qualifier << : >> on $class+ animals::Animal',
    'tree/zoo_core/api/animal.h|9|warning|W1000|Metadata on forward declaration is ignored',
    'tree/zoo_app/src/zoo_app.cpp|46|error|invalid conversion from \'const char*\' to \'int\' [-fpermissive]',
    'tree/zoo_app/src/zoo_app.cpp|46|warning|unused variable \'unused\' [-Wunused-variable]',
    'tree/zoo_app/src/zoo_app.cpp|12|5|error|with lineDirectives',
  ]);
});

test('what the manifest names is packed, and no sources are', async () => {
  const { listFiles } = require(path.join(ROOT, 'node_modules/@vscode/vsce'));
  const packed = await listFiles({ cwd: ROOT, dependencies: false });
  const { grammars, languages, snippets } = manifest.contributes;
  const named = [manifest.main, ...[...grammars, ...snippets].map((one) => one.path), ...languages.map((one) => one.configuration)];
  assert.deepStrictEqual(named.map((name) => path.normalize(name)).filter((name) => !packed.includes(name)), []);
  assert.deepStrictEqual(packed.filter((name) => /^(src|node_modules)/.test(name)), []);
});

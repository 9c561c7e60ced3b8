// The packed extension in an editor without a window, with a stand-in for the server.
'use strict';

const assert = require('node:assert');
const fs = require('node:fs');
const Module = require('node:module');
const os = require('node:os');
const path = require('node:path');
const { after, before, test } = require('node:test');
const { makeEditor } = require('./editor');

const ROOT = path.join(__dirname, '../../../editors/vscode');
const SERVER = path.join(__dirname, '../server.py');
const manifest = require(path.join(ROOT, 'package.json'));

let folder, editor, extension;
const context = { subscriptions: [] };

/** Until what the server tells has come. */
async function until(holds) {
  for (let tries = 0; tries < 500; ++tries) {
    const value = await holds();
    if (value) return value;
    await new Promise((go) => setTimeout(go, 10));
  }
  throw new Error(`Not within 5 seconds: ${holds}`);
}

const state = () => editor.commands.get('test.state')();

before(async () => {
  folder = fs.mkdtempSync(path.join(os.tmpdir(), 'qrex-extension-'));
  editor = makeEditor(folder, { 'server.path': SERVER, 'configuration': 'all.qrex', 'arguments': ['config="Debug"'] }, ['b.qrex', 'a.qrex']);
  const load = Module._load;
  Module._load = (name, ...rest) => (name === 'vscode' ? editor.module : load(name, ...rest));
  extension = require(path.join(ROOT, 'dist/extension.js'));
  await extension.activate(context);
});

after(async () => {
  await extension.deactivate();
  fs.rmSync(folder, { recursive: true });
});

test('the server is started as the settings say', async () => {
  assert.deepStrictEqual(editor.errors, []);
  const { started } = await state();
  assert.deepStrictEqual(started.arguments, []);
  assert.strictEqual(started.folder, fs.realpathSync(folder));
  assert.deepStrictEqual(started.options, { configuration: path.join(folder, 'all.qrex'), arguments: ['config="Debug"'] });
});

test('each command of the manifest is there', () => {
  for (const { command } of manifest.contributes.commands) assert.ok(editor.commands.has(command), command);
});

test('documents of our languages are opened and their errors shown', async () => {
  editor.open('a.txt', 'plaintext', 'wrong');
  const source = editor.open('a.cpp', 'cpp', '$class wrong');
  const settings = editor.open('a.qrpj', 'qrex', 'wrong');
  const told = (document) => until(() => (editor.diagnostics.get(document.uri.toString()) || [])[0]);
  assert.strictEqual((await told(source)).message, 'wrong cpp');
  assert.strictEqual((await told(settings)).message, 'wrong qrex');
  const { documents } = await state();
  assert.deepStrictEqual(documents.map((uri) => path.basename(uri)), ['a.cpp', 'a.qrpj']);
});

test('settings in a file .inc are told from other texts', async () => {
  const ours = editor.open('common.inc', 'plaintext', '// shared\nconfig { "Debug|x64" }\n');
  const other = editor.open('table.inc', 'plaintext', '{ 1, 2, 3 },\n');
  await until(() => ours.languageId === 'qrex');
  assert.strictEqual(other.languageId, 'plaintext');
});

test('generated text is shown beside the source and follows it until it is closed', async () => {
  const source = editor.open('shown.cpp', 'cpp', 'int first;');
  await editor.run('qrex.openGenerated');
  const shown = editor.shown.at(-1);
  assert.strictEqual(shown.getText(), '// INT FIRST;');
  assert.strictEqual(shown.languageId, 'cpp');
  assert.deepStrictEqual((await state()).shown, [source.uri.toString()]);

  editor.edit(source, 'int second;');
  await until(() => shown.getText() === '// INT SECOND;');

  // A server that is started anew is asked for it again.
  await editor.configure('arguments', ['config="Release"']);
  assert.deepStrictEqual((await state()).started.options.arguments, ['config="Release"']);
  assert.deepStrictEqual((await state()).shown, [source.uri.toString()]);
  editor.edit(source, 'int third;');
  await until(() => shown.getText() === '// INT THIRD;');

  editor.close(shown);
  await until(async () => (await state()).shown.length === 0);
});

test('that there is no generated text is said', async () => {
  editor.open('none.cpp', 'cpp', 'int n;');
  await editor.run('qrex.openGenerated');
  assert.match(editor.errors.pop(), /no generated text/);
});

test('tasks run the tool beside the server, in the folder of the configuration', async () => {
  const provider = editor.tasks.get('qrex');
  const tasks = await provider.provideTasks();
  assert.deepStrictEqual(tasks.map((task) => task.name), ['build a.qrex', 'clean a.qrex', 'gen a.qrex', 'build b.qrex', 'clean b.qrex', 'gen b.qrex']);
  assert.strictEqual(tasks[0].group, 'build');
  const definition = { type: 'qrex', configuration: 'sub/all.qrex', arguments: ['jobs=1'] };
  const { execution, matchers, definition: kept } = provider.resolveTask({ definition, scope: editor.module.workspace.workspaceFolders[0] });
  assert.strictEqual(execution.process, path.join(__dirname, '../Qrex'));
  assert.deepStrictEqual(execution.args, ['all.qrex', 'config="Release"', 'jobs=1']);
  assert.strictEqual(execution.options.cwd, path.join(folder, 'sub'));
  assert.strictEqual(kept, definition);  // the editor takes no other one
  const known = manifest.contributes.problemMatchers.map(({ name }) => `$${name}`);
  assert.deepStrictEqual(matchers.filter((name) => !known.includes(name)), []);
});

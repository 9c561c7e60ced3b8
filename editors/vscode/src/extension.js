// Ties the server, the tasks and the view on generated text to the editor.
'use strict';

const path = require('path');
const vscode = require('vscode');
const { LanguageClient } = require('vscode-languageclient/node');
const { GeneratedTexts } = require('./generated');
const { initializationOptions, serverCommand } = require('./options');
const { looksLikeSettings } = require('./settings_text');
const { offeredTasks, taskRun } = require('./tasks');

const SCHEME = 'qrex-generated';
const LANGUAGES = ['cpp', 'c', 'qrex'];

/** @type {Session | undefined} */
let session;

/** @returns {import('./options').Settings} */
function readSettings() {
  const settings = vscode.workspace.getConfiguration('qrex');
  return {
    serverPath: settings.get('server.path', ''),
    configuration: settings.get('configuration', ''),
    arguments: settings.get('arguments', []),
    clangdPath: settings.get('clangd.path', null),
  };
}

function firstFolder() {
  const folders = vscode.workspace.workspaceFolders;
  return folders && folders.length > 0 ? folders[0].uri.fsPath : process.cwd();
}

// A server and what is shown of it. Of a server that is started anew the texts stay.
class Session {
  constructor() {
    this.changed = new vscode.EventEmitter();
    this.texts = new GeneratedTexts(
      (command, uri) => this.client.sendRequest('workspace/executeCommand', { command, arguments: [uri] }),
      (uri) => this.changed.fire(generatedUri(vscode.Uri.parse(uri))),
    );
    this.watcher = vscode.workspace.createFileSystemWatcher('**/*.{qrex,qrws,qrpj,inc,h,c,cpp}');
    this.client = this.makeClient();
  }

  makeClient() {
    const settings = readSettings();
    const folder = firstFolder();
    const client = new LanguageClient(
      'qrex',
      'Qrex',
      { command: serverCommand(settings, folder), options: { cwd: folder } },
      {
        documentSelector: LANGUAGES.map((language) => ({ scheme: 'file', language })),
        initializationOptions: initializationOptions(settings, folder),
        synchronize: { fileEvents: this.watcher },
      },
    );
    client.onNotification('qrex/generatedChanged', (notification) =>
      this.texts.update({ ...notification, uri: vscode.Uri.parse(notification.uri).toString() }),
    );
    return client;
  }

  async start() {
    await this.client.start();
    await this.texts.showAgain();
  }

  async restart() {
    await this.stop();
    this.client = this.makeClient();
    await this.start();
  }

  async stop() {
    if (this.client.needsStop()) await this.client.stop().catch(() => undefined);
  }
}

/** @param {vscode.Uri} source */
function generatedUri(source) {
  return vscode.Uri.from({ scheme: SCHEME, path: `${source.path} (generated)`, query: source.toString() });
}

async function openGenerated() {
  const editor = vscode.window.activeTextEditor;
  if (!session || !editor || editor.document.uri.scheme === SCHEME) return;
  const source = editor.document.uri;
  try {
    const { languageId } = await session.texts.show(source.toString());
    const shown = await vscode.workspace.openTextDocument(generatedUri(source));
    await vscode.languages.setTextDocumentLanguage(shown, languageId);
    await vscode.window.showTextDocument(shown, { viewColumn: vscode.ViewColumn.Beside, preserveFocus: true, preview: false });
  } catch (error) {
    vscode.window.showErrorMessage(`Qrex: ${error instanceof Error ? error.message : error}`);
  }
}

/** @type {vscode.TextDocumentContentProvider['provideTextDocumentContent']} */
async function provideGenerated(uri) {
  if (!session) return '';
  const known = session.texts.text(uri.query);
  return known !== undefined ? known : (await session.texts.show(uri.query)).text;
}

/**
 * @param {import('./tasks').Definition} definition
 * @param {vscode.WorkspaceFolder} folder
 */
function makeTask(definition, folder) {
  const run = taskRun(definition, readSettings(), folder.uri.fsPath);
  const execution = new vscode.ProcessExecution(run.command, run.arguments, { cwd: run.cwd });
  const task = new vscode.Task(/** @type {any} */ (definition), folder, run.name, 'Qrex', execution, run.matchers);
  if (run.group) task.group = run.group === 'build' ? vscode.TaskGroup.Build : vscode.TaskGroup.Clean;
  return task;
}

const taskProvider = {
  async provideTasks() {
    const tasks = [];
    for (const folder of vscode.workspace.workspaceFolders || []) {
      const found = await vscode.workspace.findFiles(new vscode.RelativePattern(folder, '*.qrex'));
      const names = found.map((uri) => path.basename(uri.fsPath)).sort();
      tasks.push(...offeredTasks(names).map((definition) => makeTask(definition, folder)));
    }
    return tasks;
  },

  /** @param {vscode.Task} task */
  resolveTask(task) {
    const folder = typeof task.scope === 'object' ? task.scope : (vscode.workspace.workspaceFolders || [])[0];
    const definition = /** @type {any} */ (task.definition);
    return folder && definition.configuration ? makeTask(definition, folder) : undefined;
  },
};

/** @param {vscode.TextDocument} document */
function recognise(document) {
  const named = document.uri.scheme === 'file' && document.uri.path.endsWith('.inc');
  if (named && document.languageId === 'plaintext' && looksLikeSettings(document.getText())) {
    vscode.languages.setTextDocumentLanguage(document, 'qrex');
  }
}

/** @param {vscode.ExtensionContext} context */
async function activate(context) {
  const made = (session = new Session());
  context.subscriptions.push(
    made.changed,
    made.watcher,
    vscode.commands.registerCommand('qrex.openGenerated', openGenerated),
    vscode.commands.registerCommand('qrex.restartServer', () => made.restart()),
    vscode.workspace.registerTextDocumentContentProvider(SCHEME, {
      onDidChange: made.changed.event,
      provideTextDocumentContent: provideGenerated,
    }),
    vscode.tasks.registerTaskProvider('qrex', taskProvider),
    vscode.workspace.onDidOpenTextDocument(recognise),
    vscode.workspace.onDidCloseTextDocument((document) => {
      // That a document becomes one of another language is told as its end, too.
      if (document.uri.scheme !== SCHEME || vscode.workspace.textDocuments.includes(document)) return;
      made.texts.hide(document.uri.query).catch(() => undefined);
    }),
    vscode.workspace.onDidChangeConfiguration((event) => {
      if (event.affectsConfiguration('qrex')) return made.restart();
    }),
  );
  vscode.workspace.textDocuments.forEach(recognise);
  // A server that is not found is told by the client; grammars, tasks and snippets work without it.
  await made.start().catch(() => undefined);
}

async function deactivate() {
  if (session) await session.stop();
}

module.exports = { activate, deactivate };

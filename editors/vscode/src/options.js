// What the server and the tool are called with, from the settings. Nothing here asks the editor.
'use strict';

const path = require('path');

/**
 * @typedef {object} Settings
 * @property {string} serverPath
 * @property {string} configuration
 * @property {string[]} arguments
 * @property {string | null} clangdPath
 */

/**
 * `${workspaceFolder}` is known in values of settings; what is left relative and has a folder begins in the workspace's.
 * @param {string} value
 * @param {string} folder
 */
function resolvePath(value, folder) {
  const text = value.split('${workspaceFolder}').join(folder);
  return text.includes('/') || text.includes(path.sep) ? path.resolve(folder, text) : text;
}

/**
 * @param {Settings} settings
 * @param {string} folder
 */
function serverCommand(settings, folder) {
  return resolvePath(settings.serverPath || 'qrex-lsp', folder);
}

/**
 * The tool lies beside the server; without a folder, both are found in PATH.
 * @param {Settings} settings
 * @param {string} folder
 */
function toolCommand(settings, folder) {
  const server = serverCommand(settings, folder);
  const name = process.platform === 'win32' ? 'Qrex.exe' : 'Qrex';
  return path.isAbsolute(server) ? path.join(path.dirname(server), name) : name;
}

/**
 * What is not set is left out, so that the server looks for it itself; an empty path of clangd says that there is none.
 * @param {Settings} settings
 * @param {string} folder
 */
function initializationOptions(settings, folder) {
  /** @type {{configuration?: string, arguments?: string[], clangd?: string}} */
  const options = {};
  if (settings.configuration) options.configuration = path.resolve(folder, resolvePath(settings.configuration, folder));
  if (settings.arguments.length > 0) options.arguments = settings.arguments;
  if (settings.clangdPath !== null) options.clangd = settings.clangdPath && resolvePath(settings.clangdPath, folder);
  return options;
}

module.exports = { initializationOptions, resolvePath, serverCommand, toolCommand };

// The tasks that a workspace offers, as data: what is run, where, and how it is called in lists.
'use strict';

const path = require('path');
const { toolCommand } = require('./options');

/** @typedef {import('./options').Settings} Settings */

/**
 * @typedef {object} Definition
 * @property {string} type
 * @property {string} configuration
 * @property {string} [mode]
 * @property {string[]} [arguments]
 */

const OFFERED = ['build', 'clean', 'gen'];
const MATCHERS = ['$qrex', '$qrex-mapped', '$qrex-compiler'];

/**
 * A run begins in the folder of its configuration, whose paths are relative to it. What the settings say stands ahead of what
 * the task says, so that a task has the last word.
 * @param {Definition} definition
 * @param {Settings} settings
 * @param {string} folder
 */
function taskRun(definition, settings, folder) {
  const file = path.resolve(folder, definition.configuration);
  const lines = [...settings.arguments, ...(definition.arguments || [])];
  if (definition.mode) lines.push(`mode=${definition.mode}`);
  const mode = definition.mode || 'run';
  return {
    name: `${mode} ${definition.configuration}`,
    command: toolCommand(settings, folder),
    arguments: [path.basename(file), ...lines],
    cwd: path.dirname(file),
    group: definition.mode === 'build' || definition.mode === 'clean' ? definition.mode : undefined,
    matchers: MATCHERS,
  };
}

/**
 * @param {string[]} configurations names of configurations, relative to their folder
 * @returns {Definition[]}
 */
function offeredTasks(configurations) {
  return configurations.flatMap((configuration) => OFFERED.map((mode) => ({ type: 'qrex', configuration, mode })));
}

module.exports = { MATCHERS, offeredTasks, taskRun };

// Packs the extension with the number of the release, which CMakeLists.txt alone has.
'use strict';

const fs = require('fs');
const path = require('path');
const { createVSIX } = require('@vscode/vsce');

const text = fs.readFileSync(path.join(__dirname, '../../CMakeLists.txt'), 'utf8');
const release = /^project\(Qrex VERSION (\d+\.\d+(?:\.\d+)?)/m.exec(text);
if (!release) throw new Error('CMakeLists.txt has no release number');
const version = release[1].split('.').length === 2 ? `${release[1]}.0` : release[1];

createVSIX({
  cwd: __dirname,
  version,
  updatePackageJson: false,
  packagePath: path.join(process.argv[2] || __dirname, `qrex-${version}.vsix`),
  dependencies: false, // all that is needed at run time is in the bundle
  allowMissingRepository: true,
  skipLicense: true,
}).catch((error) => {
  console.error(error.message);
  process.exitCode = 1;
});

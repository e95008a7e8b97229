// Runs the language server for Python files.

const { workspace } = require("vscode");
const { LanguageClient } = require("vscode-languageclient/node");

let client;

function activate() {
  const settings = workspace.getConfiguration("codeloom");
  const [command, ...args] = settings.get("command");
  client = new LanguageClient(
    "codeloom",
    "codeloom",
    { command, args },
    {
      documentSelector: [{ language: "python" }],
      initializationOptions: { workspaceDiagnostics: settings.get("workspaceDiagnostics") },
    },
  );
  return client.start();
}

function deactivate() {
  return client?.stop();
}

module.exports = { activate, deactivate };

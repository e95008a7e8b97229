"""`codeloom completion`: what completes commands and options in a shell."""

import argparse
from collections.abc import Iterator

from codeloom.cli.arguments import COMMANDS, command_named, parser_of
from codeloom.cli.command import Command, ExitStatus
from codeloom.cli.console import Console
from codeloom.cli.options import Options

SHELLS = ("bash", "zsh", "fish")

# Words by what goes before them: of a command its options, of an option its choices.
_BASH = """\
_codeloom() {{
    local current=${{COMP_WORDS[COMP_CWORD]}} before=${{COMP_WORDS[COMP_CWORD - 1]}} words=
    if [ "$COMP_CWORD" -eq 1 ]; then
        words="{commands}"
    else
        case "${{COMP_WORDS[1]}} $before" in
{choices}
        esac
        if [ -z "$words" ]; then
            case "${{COMP_WORDS[1]}}" in
{options}
            esac
            [[ $current == -* ]] || words=
        fi
    fi
    mapfile -t COMPREPLY < <(compgen -W "$words" -- "$current")
}}
complete -o default -o bashdefault -F _codeloom codeloom
"""
_ZSH = """\
#compdef codeloom
autoload -U +X bashcompinit && bashcompinit
"""


class CompletionCommand(Command):
    """Prints a script for a shell."""

    NAME = "completion"
    DESCRIPTION = "Print a script that completes commands and options, for your shell to read when it starts."
    EXAMPLES = (
        "cd ~/.local/share/bash-completion/completions",
        "codeloom completion bash > codeloom",
        "codeloom completion zsh >> ~/.zshrc",
        "codeloom completion fish > ~/.config/fish/completions/codeloom.fish",
    )

    @classmethod
    def add_arguments(cls, parser: argparse.ArgumentParser) -> None:
        """Add the shell."""
        parser.add_argument("shell", choices=SHELLS, help="bash, zsh or fish")

    def run(self, options: Options) -> ExitStatus:
        """Print the script."""
        console = Console()
        console.write(script_for(options.shell))
        return ExitStatus.SOUND


def script_for(shell: str) -> str:
    """The script that a shell reads."""
    if shell == "fish":
        return "".join(f"{row}\n" for row in _fish_rows())
    return (_ZSH if shell == "zsh" else "") + _BASH.format(
        commands=" ".join(COMMANDS),
        choices="\n".join(
            f'            "{command} {name}") words="{" ".join(map(str, action.choices))}" ;;'
            for command, action in _actions()
            if action.choices
            for name in action.option_strings or ("completion",)
        ),
        options="\n".join(
            f'                {command}) words="{" ".join(_options_of(command))}" ;;' for command in COMMANDS
        ),
    )


def _fish_rows() -> Iterator[str]:
    for name, (*_, help) in COMMANDS.items():
        yield f"complete -c codeloom -n __fish_use_subcommand -f -a {name} -d {_quoted(help)}"
    for command, action in _actions():
        row = f"complete -c codeloom -n '__fish_seen_subcommand_from {command}'"
        for option in action.option_strings:
            row += f" -l {option[2:]}" if option.startswith("--") else f" -s {option[1:]}"
        if action.choices:
            row += f" -x -a {_quoted(' '.join(map(str, action.choices)))}"
        elif action.nargs != 0:
            row += " -r" if action.option_strings else ""
        if action.option_strings or action.choices:
            yield f"{row} -d {_quoted((action.help or '').partition(';')[0])}"


def _quoted(text: str) -> str:
    return "'" + text.replace("\\", "\\\\").replace("'", "\\'") + "'"


def _options_of(command: str) -> Iterator[str]:
    for name, action in _actions():
        if name == command:
            yield from action.option_strings


def _actions() -> Iterator[tuple[str, argparse.Action]]:
    for name in COMMANDS:
        for action in parser_of(command_named(name))._actions:
            yield name, action

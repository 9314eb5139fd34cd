"""Runs what docs/editing.md shows for reviews in a scratch repository: the commands, the steps of both recipes and the
hooks must accept a sound change, and refuse one that loses an answer or leaves a mistake.

usage: reviews.py TOOL DATABASE DOCUMENT HOOKS
"""
import os
import pathlib
import re
import shutil
import subprocess
import sys
import tempfile


def sections(document):
    """The commands of each code block that has some, by the block's kind."""
    blocks = re.findall(r"^```(sh|yaml)\n(.*?)^```", document.read_text(encoding="utf-8"), re.MULTILINE | re.DOTALL)
    for kind, text in blocks:
        lines = text.splitlines() if kind == "sh" else re.findall(r"^ *- (?:run: )?(tarvik .*)", text, re.MULTILINE)
        if lines:
            yield lines


def entries(hooks):
    return re.findall(r"^  entry: (.*)", hooks.read_text(encoding="utf-8"), re.MULTILINE)


class Repository:
    def __init__(self, folder, tool, database):
        self.folder = folder
        commands = folder / "bin"
        commands.mkdir()
        (commands / "tarvik").symlink_to(tool)
        self.environment = {name: value for name, value in os.environ.items() if not name.startswith(("TARVIK_", "GIT_"))}
        self.environment |= {"PATH": f"{commands}:{os.environ['PATH']}", "HOME": str(folder), "GITHUB_BASE_REF": "main"}
        for name in ("AUTHOR", "COMMITTER"):
            self.environment |= {f"GIT_{name}_NAME": "N", f"GIT_{name}_EMAIL": "n@example.org"}
        shutil.copytree(database, folder / "work" / "database")
        self.run("git init --quiet --initial-branch=main . && git add . && git commit --quiet --message=start")
        self.run("git update-ref refs/remotes/origin/main HEAD && git checkout --quiet -b change")
        self.environment["CI_MERGE_REQUEST_DIFF_BASE_SHA"] = self.run("git rev-parse main").stdout.strip()

    def run(self, command):
        return subprocess.run(["sh", "-c", command], cwd=self.folder / "work", env=self.environment, check=False,
                              capture_output=True, text=True)

    def state(self):
        return self.run("git status --porcelain; git rev-parse HEAD; git stash list; git worktree list; git diff").stdout

    def edit(self, old, new):
        path = self.folder / "work" / "database" / "kestrel.acd"
        text = path.read_text(encoding="utf-8")
        assert old in text, old
        path.write_text(text.replace(old, new, 1), encoding="utf-8")

    def reset(self):
        self.run("git checkout --quiet .")


def main(tool, database, document, hooks):
    with tempfile.TemporaryDirectory() as scratch:
        repository = Repository(pathlib.Path(scratch), tool, database)
        blocks = list(sections(pathlib.Path(document)))
        assert len(blocks) == 3, blocks

        def statuses(lines):
            before = repository.state()
            results = [repository.run(line) for line in lines]
            assert repository.state() == before, "the repository has changed"
            return [result.returncode for result in results]

        for lines in blocks:
            assert [line.split()[1] for line in lines] == ["lint", "format", "diff"], lines
            assert statuses(lines) == [0, 0, 0], statuses(lines)
            repository.edit("PINS,140:BITS,418944", "PINS,140:BITS,418944:GRADE,5")  # a new answer is no loss
            assert statuses(lines) == [0, 0, 0], statuses(lines)
            repository.run("git commit --quiet --all --message=gain")
            assert statuses(lines)[2] == 0
            repository.run("git reset --quiet --hard main")
            repository.edit("VERIFY,Smap,ZORVA,USB2", "VERIFY,Smap,ZORVA")
            assert statuses(lines) == [0, 0, 1], statuses(lines)
            repository.reset()
            repository.edit("PROPERTY   =", "PROPERTY =")
            assert statuses(lines) == [0, 1, 0], statuses(lines)
            repository.reset()
            repository.edit("VERIFY,Smap", "VERFIY,Smap")
            assert statuses(lines)[0] == 1
            repository.reset()

        unknown = repository.run("tarvik diff --against nosuch database")
        assert unknown.returncode == 2 and 'git knows no revision "nosuch" in "database"' in unknown.stderr, unknown
        repository.run("mkdir later && cp database/* later")
        missing = repository.run("tarvik diff --against HEAD later")
        assert missing.returncode == 2, missing
        assert 'revision "HEAD" does not have the directory "later"' in missing.stderr, missing
        repository.run("rm -r later")

        # In a hook git names the repository by variables, which must not lead to another one.
        repository.environment |= {"GIT_DIR": ".git", "GIT_INDEX_FILE": ".git/index", "GIT_PREFIX": ""}
        assert statuses(["cd database && tarvik diff --against HEAD ."]) == [0]
        for name in ("GIT_DIR", "GIT_INDEX_FILE", "GIT_PREFIX"):
            del repository.environment[name]

        formatting, linting = entries(pathlib.Path(hooks))
        changed = "database/kestrel.acd database/base.acd"
        assert statuses([f"{formatting} {changed}", f"{linting} {changed}"]) == [0, 0]
        repository.edit("PROPERTY   =", "PROPERTY =")
        assert repository.run(f"{formatting} {changed}").returncode == 0
        assert not repository.run("git diff").stdout, "the hook brings the file into its form"
        repository.edit("VERIFY,Smap", "VERFIY,Smap")
        assert repository.run(f"{linting} {changed}").returncode == 1
    print(f"{len(blocks)} recipes and 2 hooks")
    return 0


if __name__ == "__main__":
    sys.exit(main(*sys.argv[1:]))

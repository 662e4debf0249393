#!/usr/bin/env python3
"""Creates a project of 100,000 files in 5,000 folders, with contents of various lengths and labels on a third of them.

    create_project.py FOLDER PROJECTCTL
"""

import pathlib
import random
import subprocess
import sys


def main() -> None:
    root, tool = pathlib.Path(sys.argv[1]), sys.argv[2]
    random.seed(1)
    labels: dict[str, list[str]] = {"Open": [], "Reviewed": [], "Approved": []}
    for part in range(100):
        for module in range(50):
            folder = root / f"part_{part:02}" / f"module_{module:02}"
            folder.mkdir(parents=True)
            for file in range(20):
                path = folder / f"source_{file:02}.cpp"
                path.write_text("int value = 0;\n" * min(2000, int(random.lognormvariate(4, 1.2))))
                if random.random() < 0.35:
                    labels[random.choice(list(labels))].append(str(path.relative_to(root)))
    run = lambda arguments, given="": subprocess.run([tool, *arguments], cwd=root, input=given, text=True, check=True)
    run(["init", "--name", "A large project"])
    run(["add", "--recursive", "."])
    run(["category", "create", "Status"])
    for label, files in labels.items():
        run(["label", "create", "Status", label])
        run(["label", "put", "Status", label, "-0"], "\0".join(files))


if __name__ == "__main__":
    main()

"""Generated files, written only when they change, so that nothing is compiled again without need."""

import os


class Output:
    """Files by path relative to the output folder, in the order in which they were added."""

    def __init__(self):
        self.files = {}

    def add(self, path, text):
        self.files[path] = text

    def write(self, folder):
        for path, text in self.files.items():
            full = os.path.join(folder, path)
            if read(full) != text:
                os.makedirs(os.path.dirname(full), exist_ok=True)
                with open(full, "w", encoding="utf-8") as stream:
                    stream.write(text)


def read(path):
    try:
        with open(path, encoding="utf-8") as stream:
            return stream.read()
    except OSError:
        return None

# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Finds a file of the phone from outside as the phone itself would, whatever links are on the way.

An absolute link begins at the phone's root, and no ".." leads above it. Every step opens what it
found by itself, and a link is read from the descriptor: so a change meanwhile cannot lead elsewhere.
"""

import errno
import os
import stat

MOST_LINKS = 40


class Located:
    """A path's last folder, the name there, and the descriptor of the file: None when there is none.
    `folder` and `file` are open while the object is used in a with statement.

    `follow` is whether a link at the end of the path is followed, `make` whether missing folders on
    the way are made."""

    def __init__(self, root, path, follow=True, make=False):
        self._folders = [os.open(root, os.O_PATH | os.O_DIRECTORY)]
        self.name = b"."
        self.file = None
        self._make = make
        try:
            self._walk(path, follow)
        except BaseException:
            self._close()
            raise

    def __enter__(self):
        return self

    def __exit__(self, *_):
        self._close()

    @property
    def folder(self):
        return self._folders[-1]

    def stat(self):
        if self.file is None:
            raise FileNotFoundError(errno.ENOENT, os.strerror(errno.ENOENT))
        return os.fstat(self.file)

    def _close(self):
        for descriptor in self._folders:
            os.close(descriptor)
        if self.file is not None:
            os.close(self.file)

    def _walk(self, path, follow):
        names = _names(path)
        links = 0
        while names:
            name = names.pop(0)
            if name == b"..":
                if len(self._folders) > 1:
                    os.close(self._folders.pop())
                continue
            file = self._open(name, is_last=not names)
            if file is None:
                self.name = name
                return
            mode = os.fstat(file).st_mode
            if stat.S_ISLNK(mode) and (names or follow):
                target = os.readlink(b"", dir_fd=file)
                os.close(file)
                links += 1
                if links > MOST_LINKS:
                    raise OSError(errno.ELOOP, os.strerror(errno.ELOOP))
                if target.startswith(b"/"):
                    self._back_to_root()
                names = _names(target) + names
            elif names:
                self._folders.append(file)
                if not stat.S_ISDIR(mode):
                    raise NotADirectoryError(errno.ENOTDIR, os.strerror(errno.ENOTDIR))
            else:
                self.name, self.file = name, file
                return
        self.name, self.file = b".", os.dup(self.folder)

    def _open(self, name, is_last):
        """A descriptor, or None for a missing file at the end of the path."""
        try:
            return os.open(name, os.O_PATH | os.O_NOFOLLOW, dir_fd=self.folder)
        except FileNotFoundError:
            if is_last:
                return None
            if not self._make:
                raise
            os.mkdir(name, 0o755, dir_fd=self.folder)
            return self._open(name, is_last)

    def _back_to_root(self):
        while len(self._folders) > 1:
            os.close(self._folders.pop())


def _names(path):
    return [name for name in path.split(b"/") if name not in (b"", b".")]

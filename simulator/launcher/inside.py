# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Reaches the files inside a phone from outside.

A program inside may replace any of them by a link, and a link that is followed outside leads to the
machine's files. So each folder on the way is opened separately, never through a link, and files are
named relative to the open folder.
"""

import os
import stat

from launcher.errors import PhoneError


class Folder:
    """The folder PATH below the folder ROOT, of which only ROOT may be reached through links.
    `make` makes what is missing, for this user only."""

    def __init__(self, root, path, make=False):
        self.path = f"{root}/{path}"
        folder = os.open(root, os.O_RDONLY | os.O_DIRECTORY)
        for name in path.split("/"):
            outer = folder
            try:
                if make and name not in os.listdir(outer):
                    os.mkdir(name, 0o700, dir_fd=outer)
                folder = os.open(name, os.O_RDONLY | os.O_DIRECTORY | os.O_NOFOLLOW, dir_fd=outer)
            except OSError:
                raise PhoneError(f"{self.path}: '{name}' is not a folder there; links are not "
                                 "followed") from None
            finally:
                os.close(outer)
        self.fd = folder  # open as long as this object is there

    def __del__(self):
        if hasattr(self, "fd"):
            os.close(self.fd)

    def _do(self, call, name, *arguments, **options):
        try:
            return call(name, *arguments, **options)
        except OSError as error:
            error.filename = f"{self.path}/{name}"
            raise

    def names(self):
        return os.listdir(self.fd)

    def kind(self, name):
        """The S_IF constant of a file, 0 when there is none."""
        try:
            return stat.S_IFMT(os.stat(name, dir_fd=self.fd, follow_symlinks=False).st_mode)
        except FileNotFoundError:
            return 0

    def open(self, name, flags):
        """A descriptor. Opening never waits, and creates only a file that is not there."""
        if flags & os.O_CREAT:
            flags |= os.O_EXCL
        return self._do(os.open, name, flags | os.O_NOFOLLOW | os.O_NONBLOCK, 0o644, dir_fd=self.fd)

    def make_fifo(self, name):
        self._do(os.mkfifo, name, dir_fd=self.fd)

    def remove(self, name):
        """Removes a file, if there is one."""
        try:
            self._do(os.unlink, name, dir_fd=self.fd)
        except FileNotFoundError:
            pass

    def rename(self, name, folder, new_name):
        """Moves a file to another folder, or to another name."""
        self._do(os.rename, name, new_name, src_dir_fd=self.fd, dst_dir_fd=folder.fd)

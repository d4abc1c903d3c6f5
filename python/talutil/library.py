"""Calls of the shared library."""

from __future__ import annotations

import ctypes
import json
import os
import weakref
from pathlib import Path
from typing import Any, Optional, Sequence

from .values import decode, encode


class RunTimeError(Exception):
    """A run-time error of a member, with the number and text that hosts know."""

    def __init__(self, number: int, description: str, source: str, written_back: dict[str, Any]) -> None:
        super().__init__(f"error {number}: {description}")
        self.number = number
        self.description = description
        self.source = source
        #: The arguments that the member wrote back before it failed, by name.
        self.written_back = written_back


def _load() -> ctypes.CDLL:
    beside = Path(__file__).resolve().parents[2] / "libtalutil.so.1"
    name = os.environ.get("TALUTIL_LIBRARY") or (str(beside) if beside.exists() else "libtalutil.so.1")
    library = ctypes.CDLL(name)
    library.talutil_open.argtypes = [ctypes.c_char_p]
    library.talutil_open.restype = ctypes.c_void_p
    library.talutil_open_failure.restype = ctypes.c_char_p
    library.talutil_call.argtypes = [ctypes.c_void_p, ctypes.c_char_p]
    library.talutil_call.restype = ctypes.c_void_p
    library.talutil_free.argtypes = [ctypes.c_void_p]
    library.talutil_free.restype = None
    library.talutil_close.argtypes = [ctypes.c_void_p]
    library.talutil_close.restype = None
    return library


_c = _load()


class Library:
    """A started library, with settings and objects of its own."""

    def __init__(self, code_page: Optional[int] = None) -> None:
        options = None if code_page is None else json.dumps({"code_page": code_page}).encode()
        self._handle = _c.talutil_open(options)
        if not self._handle:
            raise OSError("the library did not start: " + _c.talutil_open_failure().decode())
        self._objects: weakref.WeakValueDictionary[int, Object] = weakref.WeakValueDictionary()
        self._close = weakref.finalize(self, _c.talutil_close, self._handle)

    def close(self) -> None:
        """Ends the library; its objects cannot be used any more."""
        self._handle = None
        self._close()

    def request(self, request: dict[str, Any]) -> tuple[Any, dict[str, Any]]:
        """Sends a call; returns its result and what was written back. Raises RunTimeError."""
        if self._handle is None:
            raise ValueError("the library is closed")
        pointer = _c.talutil_call(self._handle, json.dumps(request).encode())
        if not pointer:
            raise MemoryError
        try:
            answer = json.loads(ctypes.string_at(pointer))
        finally:
            _c.talutil_free(pointer)
        written_back = {name: decode(value, self._object) for name, value in answer.get("arguments", {}).items()}
        if "error" in answer:
            error = answer["error"]
            raise RunTimeError(error["number"], error["description"], error["source"], written_back)
        return decode(answer["result"], self._object), written_back

    def create(self, class_name: str) -> Object:
        """Creates an object: ``cControlPosition``, ``Grid``, ``CommonDialog``, ``ZipControl`` or ``UnzipControl``."""
        return self.request({"create": class_name})[0]

    def _object(self, number: int) -> Object:
        known = self._objects.get(number)
        if known is None:
            known = Object(self, number)
            self._objects[number] = known
        return known

    def _release(self, number: int) -> None:
        if self._handle is not None:
            self.request({"release": number})


class Object:
    """An object, whose members are used by name: ``grid.put("Rows", 5)``, ``grid.get("TextMatrix", 0, 1)``.

    It is released with the last reference to it.
    """

    def __init__(self, library: Library, number: Optional[int] = None) -> None:
        self.library = library
        #: The number by which calls refer to it; None for the toolkit.
        self.object_number = number

    def __del__(self) -> None:
        if getattr(self, "object_number", None) is not None:
            try:
                self.library._release(self.object_number)
            except (TypeError, AttributeError, RunTimeError):  # The interpreter is ending.
                pass

    def _request(self, member: str, arguments: Sequence[Any]) -> tuple[Any, dict[str, Any]]:
        request: dict[str, Any] = {"call": member, "args": [encode(argument) for argument in arguments]}
        if self.object_number is not None:
            request["on"] = self.object_number
        return self.library.request(request)

    def call(self, member: str, *arguments: Any) -> Any:
        """Calls a method, or reads a property with its indexes; returns the result."""
        return self._request(member, arguments)[0]

    get = call

    def put(self, member: str, *arguments: Any) -> None:
        """Puts a property: its indexes, if it has any, and the value."""
        self._request(member, arguments)

"""A client that costs next to nothing: whole messages as bytes, over a connection that is kept as long as the server keeps it."""

import re
import socket

HEADER_END = b"\r\n\r\n"
#: The end of a chunked answer, with the fields that may follow the last piece.
LAST_PIECE = re.compile(rb"\r\n0\r\n(?:[^\r\n]+\r\n)*\r\n$")
#: As much as the end may take.
TAIL = 1024
PATIENCE = 120


class No_Answer(Exception):
    """The server has closed the connection, or has answered with another status than 200."""


def header_of(message):
    """The fields that servers compare with the message, and that name its operation."""
    space = "/".join(re.findall(r'<NAMESPACE NAME="([^"]*)"', re.search(r"<LOCALNAMESPACEPATH>.*?</LOCALNAMESPACEPATH>", message)[0]))
    if "<MULTIREQ>" in message:
        return ["CIMBatch: true"]
    method = re.search(r'<METHODCALL NAME="([^"]*)"', message)
    if not method:
        return [f"CIMMethod: {re.search(r'<IMETHODCALL NAME=.([^ >]*).[ >]', message)[1]}", f"CIMObject: {space}"]
    name = re.search(r'<INSTANCENAME CLASSNAME="([^"]*)">(.*?)</INSTANCENAME>', message)
    keys = re.findall(r'<KEYBINDING NAME="([^"]*)"><KEYVALUE[^>]*>([^<]*)<', name[2])
    path = f"{space}:{name[1]}." + ",".join(f'{key}="{value}"' for key, value in keys)
    return [f"CIMMethod: {method[1]}", f"CIMObject: {path.replace(' ', '%20')}"]


def request(message):
    """The bytes of a request. Long answers may come in pieces, which a server does that way only if its client says so."""
    body = message.encode()
    lines = [
        "POST /cimom HTTP/1.1", "Host: localhost", 'Content-Type: application/xml; charset="utf-8"', "TE: trailers",
        f"Content-Length: {len(body)}", "CIMOperation: MethodCall", *header_of(message), "", "",
    ]  # fmt: skip
    return "\r\n".join(lines).encode() + body


class Kept_Connection:
    """The answer of the last question stands in a buffer until the next one. `opened` counts connections."""

    def __init__(self, port):
        self.port = port
        self.socket = None
        self.buffer = bytearray(1 << 20)
        self.size = 0
        self.opened = 0

    def open(self):
        self.close()
        self.socket = socket.create_connection(("127.0.0.1", self.port), PATIENCE)
        self.socket.setsockopt(socket.IPPROTO_TCP, socket.TCP_NODELAY, 1)
        self.opened += 1

    def close(self):
        if self.socket:
            self.socket.close()
        self.socket = None

    def ask(self, sent):
        """Size of the whole answer to a request; once more over a new connection if the server has closed the kept one."""
        kept = self.socket is not None
        if not kept:
            self.open()
        try:
            return self._exchange(sent)
        except (No_Answer, OSError):
            self.close()
            if not kept or self.size:
                raise
        self.open()
        return self._exchange(sent)

    def _exchange(self, sent):
        self.size = 0
        self.socket.sendall(sent)
        while (at := self.buffer.find(HEADER_END, 0, self.size)) < 0:
            self._read()
        body = at + len(HEADER_END)
        said = bytes(self.buffer[:body]).lower()
        if b" 200 " not in said.partition(b"\r\n")[0]:
            raise No_Answer(said.decode("latin-1"))
        length = re.search(rb"\r\ncontent-length: *(\d+)", said)
        if length:
            while self.size < body + int(length[1]):
                self._read()
        else:
            # The first piece, too, stands behind the end of a line.
            while not LAST_PIECE.search(bytes(self.buffer[max(body - 2, self.size - TAIL) : self.size])):
                self._read()
        if b"\r\nconnection: close" in said:
            self.close()
        return self.size

    def _read(self):
        if self.size == len(self.buffer):
            self.buffer.extend(bytes(len(self.buffer)))
        with memoryview(self.buffer) as view:
            count = self.socket.recv_into(view[self.size :])
        if not count:
            raise No_Answer("the connection was closed")
        self.size += count

    def body(self):
        """The text of the last answer."""
        header, _, rest = bytes(self.buffer[: self.size]).partition(HEADER_END)
        if b"\r\ntransfer-encoding: chunked" not in header.lower():
            return rest.decode()
        pieces = []
        while rest:
            size, _, rest = rest.partition(b"\r\n")
            if not int(size.split(b";")[0], 16):
                break
            pieces.append(rest[: int(size, 16)])
            rest = rest[int(size, 16) + 2 :]
        return b"".join(pieces).decode()

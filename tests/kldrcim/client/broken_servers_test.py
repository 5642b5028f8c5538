"""Servers that go wrong: each has one clear line, and the program its end."""

import http.server
import socket
import threading
import unittest

from asking import run

HEAD = '<?xml version="1.0" encoding="utf-8" ?><CIM CIMVERSION="2.0" DTDVERSION="2.0"><MESSAGE ID="1" PROTOCOLVERSION="1.0">'
ANSWER = HEAD + '<SIMPLERSP><IMETHODRESPONSE NAME="{}">{}</IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM>'
ENUMERATED = "<IRETURNVALUE>{}</IRETURNVALUE>"
NAMED = '<INSTANCENAME CLASSNAME="X"><KEYBINDING NAME="K"><KEYVALUE VALUETYPE="string">{}</KEYVALUE></KEYBINDING></INSTANCENAME>'


def answer(name, content):
    return ANSWER.format(name, content).encode()


class Scripted(http.server.BaseHTTPRequestHandler):
    """Answers as the test says, and keeps what was asked."""

    protocol_version = "HTTP/1.1"

    def do_POST(self):
        self.server.asked.append(self.rfile.read(int(self.headers["Content-Length"])).decode())
        self.server.heads.append(dict(self.headers.items()))
        self.server.answer(self)

    def log_message(self, *_):
        pass

    def send(self, status, body=b"", length=True, **fields):
        self.send_response(status)
        for name, value in ({"Content-Type": "application/xml"} | fields).items():
            self.send_header(name.replace("_", "-"), value)
        if length:
            self.send_header("Content-Length", str(len(body)))
        else:
            self.close_connection = True
        self.end_headers()
        self.wfile.write(body)


class Broken_Servers(unittest.TestCase):
    def serve(self, handle):
        server = http.server.ThreadingHTTPServer(("127.0.0.1", 0), Scripted)
        server.daemon_threads = True
        server.asked, server.heads, server.answer = [], [], handle
        thread = threading.Thread(target=server.serve_forever)
        thread.start()
        self.addCleanup(thread.join)
        self.addCleanup(server.server_close)
        self.addCleanup(server.shutdown)
        return server, f"http://127.0.0.1:{server.server_port}"

    def ask(self, handle, *arguments):
        return run("--url", self.serve(handle)[1], *(arguments or ("ein", "X")))

    def refused(self, pattern, handle, *arguments, status=2):
        found, out, errors = self.ask(handle, *arguments)
        self.assertEqual((status, 1), (found, errors.count("\n")), errors)
        self.assertRegex(errors, pattern)
        return out

    def test_statuses_of_http(self):
        for status, fields, text in (
            (400, {"CIMError": "header-mismatch", "PGErrorDetail": "no%20such%0Athing"}, r"refused the request: header-mismatch: no such thing$"),
            (404, {}, r"is no CIM server, or a broken one: HTTP status 404$"),
            (403, {}, r"forbids it \(HTTP status 403\)$"),
            (503, {}, r"has no time now \(HTTP status 503\)$"),
            (302, {"Location": "http://elsewhere.invalid/"}, r"HTTP status 302$"),
        ):
            self.refused(r"^kldrcim: http://127\.0\.0\.1:\d+ .*" + text, lambda at: at.send(status, b"<p>", **fields))

    def test_what_is_no_message(self):
        for body in (b"", b"<html></html>", b"{}", HEAD.encode(), b'<!DOCTYPE x [<!ENTITY a "b">]><CIM/>', answer("X", "<BOGUS/>"),
                     answer("X", ENUMERATED.format("<INSTANCENAME/>"))):
            self.refused(r"is no CIM server, or a broken one: ", lambda at: at.send(200, body))

    def test_no_http_at_all(self):
        server = socket.create_server(("127.0.0.1", 0))
        self.addCleanup(server.close)

        def greet():
            connection, _ = server.accept()
            connection.recv(65536)
            connection.sendall(b"SSH-2.0-x\r\n")
            connection.close()

        thread = threading.Thread(target=greet)
        thread.start()
        self.addCleanup(thread.join)
        status, _, errors = run("--url", f"http://127.0.0.1:{server.getsockname()[1]}", "ein", "X")
        self.assertEqual(2, status)
        self.assertRegex(errors, r"is no CIM server: it does not speak HTTP\n$")

    def test_nobody_there(self):
        with socket.create_server(("127.0.0.1", 0)) as server:
            port = server.getsockname()[1]
        self.assertEqual((2, "", f"kldrcim: nobody listens at http://127.0.0.1:{port}: Connection refused\n"),
                         run("--url", f"http://127.0.0.1:{port}", "ein", "X"))
        self.assertEqual((2, "", "kldrcim: there is no host nosuch.invalid\n"), run("--url", "http://nosuch.invalid", "ein", "X"))

    def test_silence(self):
        over = threading.Event()
        self.addCleanup(over.set)
        self.refused(r"no answer from http://\S+ for 1 seconds; --timeout waits longer$", lambda at: over.wait(60), "--timeout", "1", "ein", "X")

    def test_the_end_in_the_middle(self):
        whole = answer("EnumerateInstanceNames", ENUMERATED.format(NAMED.format("a") + NAMED.format("b")))
        middle = whole.index(b"b</KEYVALUE>")

        def half(at):
            if b"GetClass" in at.server.asked[-1].encode():
                return at.send(200, answer("GetClass", '<ERROR CODE="6"></ERROR>'))
            at.send_response(200)
            at.send_header("Content-Length", str(len(whole)))
            at.end_headers()
            at.wfile.write(whole[:middle])
            at.close_connection = True

        # What came is written.
        self.assertEqual('root/kaldera:X.K="a"\n', self.refused(r"the connection to http://\S+ broke: ", half))

    def test_a_value_without_end(self):
        """More than a whole answer may have in memory is not waited for."""
        sent = []

        def endless(at):
            at.send_response(200)
            at.end_headers()
            at.close_connection = True
            try:
                at.wfile.write(answer("EnumerateInstanceNames", ENUMERATED.format(NAMED)).partition(b"{}")[0])
                while len(sent) < 4096:
                    at.wfile.write(b"x" * 0x10000)
                    sent.append(None)
            except OSError:
                pass

        self.assertEqual("", self.refused(r"^kldrcim: http://\S+ ", endless))
        self.assertLess(len(sent) * 0x10000, 80 << 20)

    def test_errors_with_the_servers_own_words(self):
        for error, text in (
            ('<ERROR CODE="1" DESCRIPTION="the &#x41;dapter&#10;is gone"></ERROR>', "CIM_ERR_FAILED (1): the Adapter is gone"),
            ('<ERROR CODE="6" DESCRIPTION="CIM_ERR_NOT_FOUND: The requested object"/>', "CIM_ERR_NOT_FOUND (6): The requested object"),
            ('<ERROR CODE="6" DESCRIPTION="CIM_ERR_NOT_FOUND"/>', "CIM_ERR_NOT_FOUND (6)"),
            ('<ERROR CODE="3"></ERROR>', "CIM_ERR_INVALID_NAMESPACE (3): the server has no namespace root/kaldera"),
        ):
            self.refused("^kldrcim: " + text.replace("(", r"\(").replace(")", r"\)") + "$", lambda at: at.send(200, answer("X", error)), status=1)

    def test_an_error_in_the_trailer(self):
        def send(at):
            at.send_response(200)
            at.send_header("Transfer-Encoding", "chunked")
            at.send_header("Trailer", "CIMStatusCode, CIMStatusCodeDescription")
            at.end_headers()
            body = answer("EnumerateInstanceNames", "")
            at.wfile.write(b"%x\r\n%s\r\n0\r\nCIMStatusCode: 2\r\nCIMStatusCodeDescription: go%%20away\r\n\r\n" % (len(body), body))

        self.refused(r"^kldrcim: CIM_ERR_ACCESS_DENIED \(2\): go away$", send, status=1)

    def test_odd_but_right(self):
        odd = answer("EnumerateInstances", ENUMERATED.format(
            "<VALUE.NAMEDINSTANCE>" + NAMED.format("a") + '<INSTANCE CLASSNAME="X" xml:lang="en"><!-- c -->'
            '<PROPERTY NAME="S" TYPE="string"/><PROPERTY NAME="T" TYPE="string"><VALUE><![CDATA[a<b]]>&#33;</VALUE></PROPERTY>'
            '<PROPERTY.ARRAY NAME="A" TYPE="uint8"><VALUE.ARRAY><VALUE>0x1F</VALUE><VALUE.NULL/></VALUE.ARRAY></PROPERTY.ARRAY>'
            '<PROPERTY NAME="E" TYPE="string" EMBEDDEDOBJECT="instance"><VALUE>&lt;INSTANCE CLASSNAME="Y"&gt;&lt;/INSTANCE&gt;</VALUE></PROPERTY>'
            "</INSTANCE></VALUE.NAMEDINSTANCE>"))

        def send(at):
            is_class = "GetClass" in at.server.asked[-1]
            at.send(200, answer("GetClass", '<ERROR CODE="6"></ERROR>') if is_class else odd, length=False, Content_Type="text/xml")

        status, out, errors = self.ask(send, "ei", "X", "--format", "mof")
        self.assertEqual((0, ""), (status, errors))
        self.assertEqual('instance of X {\n    T = "a<b!";\n    A = {31, NULL};\n    E = instance of Y {\n    };\n};\n', out.replace("    }", "    }"))

    def test_keys_are_asked_for_too(self):
        """Some servers give paths without the keys that a list of properties leaves out."""
        declared = '<CLASS NAME="X"><PROPERTY NAME="K" TYPE="string"><QUALIFIER NAME="Key" TYPE="boolean"><VALUE>TRUE</VALUE>' \
            '</QUALIFIER></PROPERTY><PROPERTY NAME="S" TYPE="string"/></CLASS>'
        found = "<VALUE.NAMEDINSTANCE>" + NAMED.format("a") + '<INSTANCE CLASSNAME="X"><PROPERTY NAME="K" TYPE="string"><VALUE>a' \
            '</VALUE></PROPERTY><PROPERTY NAME="S" TYPE="string"><VALUE>s</VALUE></PROPERTY></INSTANCE></VALUE.NAMEDINSTANCE>'

        def send(at):
            is_class = "GetClass" in at.server.asked[-1]
            at.send(200, answer("X", ENUMERATED.format(declared if is_class else found)))

        server, url = self.serve(send)
        status, out, errors = run("--url", url, "ei", "X", "--properties", "S", "--format", "mof")
        self.assertEqual((0, 'instance of X {\n    S = "s";\n};\n', ""), (status, out, errors))
        self.assertIn("<VALUE.ARRAY><VALUE>S</VALUE><VALUE>K</VALUE></VALUE.ARRAY>", server.asked[-1])

    def test_void_operations_with_an_empty_value(self):
        def send(at):
            is_class = "GetClass" in at.server.asked[-1]
            at.send(200, answer("GetClass", '<ERROR CODE="6"></ERROR>') if is_class else answer("DeleteInstance", "<IRETURNVALUE></IRETURNVALUE>"))

        self.assertEqual((0, "", ""), self.ask(send, "di", 'X.K="a"'))

    def test_control_characters_do_not_reach_the_terminal(self):
        self.refused(r"^kldrcim: CIM_ERR_FAILED \(1\): a b$", lambda at: at.send(200, answer("X", '<ERROR CODE="1" DESCRIPTION="a&#x9;b"/>')), status=1)
        # Nor the one that stands for Escape and a bracket.
        self.refused(r"^kldrcim: CIM_ERR_FAILED \(1\): a 31mb$", lambda at: at.send(200, answer("X", '<ERROR CODE="1" DESCRIPTION="a&#x9B;31mb"/>')), status=1)
        self.refused("is no CIM server, or a broken one: .*a control character in a name$", lambda at: at.send(200, answer("X", ENUMERATED.format(NAMED.format("a").replace('"K"', '"K&#x9B;"')))))

    def test_nor_do_those_of_values(self):
        named = NAMED.format("k&#x9B;1m&#xA0;")
        value = '<PROPERTY NAME="S" TYPE="string"><VALUE>v&#x9B;1m&#x7F;&#xA0;</VALUE></PROPERTY>'
        found = f'<VALUE.NAMEDINSTANCE>{named}<INSTANCE CLASSNAME="X">{value}</INSTANCE></VALUE.NAMEDINSTANCE>'

        def send(at):
            asked = at.server.asked[-1]
            at.send(200, answer("X", '<ERROR CODE="6"></ERROR>' if "GetClass" in asked else ENUMERATED.format(named if "Names" in asked else found)))

        url = self.serve(send)[1]
        self.assertEqual('root/kaldera:X.K="k\\x009B1m\u00a0"\n', run("--url", url, "ein", "X")[1])
        for form, shown in (("table", "v?1m?\u00a0"), ("mof", '"v\\x009B1m\\x007F\u00a0"'), ("json", "v\\u009b1m")):
            out = run("--url", url, "ei", "X", "--format", form)[1]
            self.assertIn(shown, out)
            self.assertNotRegex(out, "[\\x00-\\x09\\x0b-\\x1f\\x80-\\x9f]")

    def test_a_kept_connection_that_was_closed(self):
        def send(at):
            body = answer("GetClass", '<ERROR CODE="6"></ERROR>') if "GetClass" in at.server.asked[-1] else answer("EnumerateInstanceNames", "")
            at.send(200, body)
            at.close_connection = True

        self.assertEqual(0, self.ask(send)[0])

    def test_a_method_is_never_asked_twice(self):
        def send(at):
            if "METHODCALL NAME=\"M\"" in at.server.asked[-1]:
                at.close_connection = True
            else:
                at.send(200, answer("GetClass", '<ERROR CODE="6"></ERROR>'))

        server, url = self.serve(send)
        status, _, errors = run("--url", url, "cm", "X", "M")
        self.assertEqual(2, status)
        self.assertRegex(errors, r"the connection to http://\S+ broke: ")
        self.assertEqual(1, sum('NAME="M"' in asked for asked in server.asked))

    def test_what_is_asked(self):
        def send(at):
            at.send(200, answer("X", '<ERROR CODE="6"></ERROR>'))

        server, url = self.serve(send)
        run("--url", url, "cm", 'X.K="ä b"', "M", "A=1")
        self.assertEqual("MethodCall", server.heads[-1]["CIMOperation"])
        self.assertEqual("M", server.heads[-1]["CIMMethod"])
        self.assertEqual("root%2Fkaldera%3AX.K%3D%22%C3%A4%20b%22", server.heads[-1]["CIMObject"])
        self.assertEqual(("trailers", "TE"), (server.heads[-1]["TE"], server.heads[-1]["Connection"]))
        self.assertNotIn("Expect", server.heads[-1])
        self.assertNotIn("Authorization", server.heads[-1])
        run("--url", url, "ei", "X", "--properties", "A,B")
        asked = server.asked[-1]
        for name in ("LocalOnly", "IncludeQualifiers", "IncludeClassOrigin"):
            self.assertIn(f'<IPARAMVALUE NAME="{name}"><VALUE>FALSE</VALUE></IPARAMVALUE>', asked)
        self.assertIn('<IPARAMVALUE NAME="DeepInheritance"><VALUE>TRUE</VALUE></IPARAMVALUE>', asked)
        self.assertIn("<VALUE.ARRAY><VALUE>A</VALUE><VALUE>B</VALUE></VALUE.ARRAY>", asked)


if __name__ == "__main__":
    unittest.main()

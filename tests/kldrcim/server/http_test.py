"""CIM operations over HTTP: what a message and its headers may be, and what is refused."""

import http.client
import os
import re
import tempfile
import threading
import time
import unittest

from serving import (
    PATIENCE,
    Served,
    Serving_Case,
    basic,
    class_parameter,
    error_code,
    intrinsic,
    message,
    parameter,
    read_all,
    request,
    value_parameter,
    write_users,
)

#: Sanitizers have memory of their own, of which nothing is promised.
SANITIZED = bool(os.environ.get("KLDR_SANITIZE"))
#: Sanitizers make each of them ten times as dear, and watch no memory.
VERY_MANY = 5000 if SANITIZED else 100000
NAMES = intrinsic("EnumerateInstanceNames", class_parameter("ClassName", "CIM_FCPort"))
FCPORT = class_parameter("ClassName", "CIM_FCPort")


def several(*calls):
    return "<MULTIREQ>" + "".join(calls) + "</MULTIREQ>"


def post_bytes(body, *fields, version="1.1", method="POST"):
    head = [f"{method} /cimom HTTP/{version}", "Host: localhost", *fields, f"Content-Length: {len(body)}"]
    return ("\r\n".join(head) + "\r\n\r\n" + body).encode()


def chunks_of(body):
    """What a chunked body holds, and what stands behind it."""
    text = b""
    while True:
        size, _, body = body.partition(b"\r\n")
        if int(size, 16) == 0:
            return text, body
        text, body = text + body[: int(size, 16)], body[int(size, 16) + 2 :]


class Requests(Serving_Case):
    def status(self, body=NAMES, **headers):
        status, fields, text = self.served.post(body, **headers)
        if status != 200:
            self.assertEqual(text, "")
            self.assertEqual(fields["Content-Length"], "0")
            self.assertEqual(fields["Connection"].lower(), "close")
        return status, fields["CIMError"]

    def test_answer(self):
        status, fields, body = self.served.post(
            NAMES, CIMOperation="MethodCall", CIMMethod="EnumerateInstanceNames", CIMObject="root/kaldera"
        )
        self.assertEqual((status, fields["CIMOperation"]), (200, "MethodResponse"))
        self.assertEqual(fields["Content-Type"], 'application/xml; charset="utf-8"')
        self.assertTrue(body.startswith('<?xml version="1.0" encoding="utf-8" ?>\n<CIM CIMVERSION="2.0"'))
        self.assertIn('<MESSAGE ID="77" PROTOCOLVERSION="1.0">', body)
        self.assertEqual(body.count("<INSTANCENAME"), 5)

    def test_headers_may_be_missing_but_not_contradict(self):
        self.assertEqual(self.status(), (200, None))
        for value in ("root%2Fkaldera", "root/kaldera", "ROOT/Kaldera", "/root/kaldera/"):
            self.assertEqual(self.status(CIMObject=value), (200, None), value)
        self.assertEqual(self.status(CIMMethod="enumerateinstancenames"), (200, None))
        self.assertEqual(self.status(CIMMethod="GetInstance"), (400, "header-mismatch"))
        self.assertEqual(self.status(CIMObject="root/other"), (400, "header-mismatch"))
        self.assertEqual(self.status(CIMObject="root%2"), (400, "header-mismatch"))
        self.assertEqual(self.status(CIMOperation="Other"), (400, "unsupported-operation"))
        self.assertEqual(self.status(CIMProtocolVersion="1.4"), (200, None))
        self.assertEqual(self.status(CIMProtocolVersion="2.0"), (501, "unsupported-protocol-version"))

    def test_versions(self):
        call = request("EnumerateInstanceNames", FCPORT)
        self.assertEqual(self.status(message(call, dtd="2.4", version="1.4")), (200, None))
        self.assertEqual(self.status(message(call, dtd="3.0")), (501, "unsupported-dtd-version"))
        self.assertEqual(self.status(message(call, version="2.0")), (501, "unsupported-protocol-version"))
        self.assertEqual(
            self.status(message(call).replace('CIMVERSION="2', 'CIMVERSION="3')), (501, "unsupported-cim-version")
        )

    def test_what_is_no_message(self):
        for body in ("", "x", NAMES[:-1], NAMES + "x", "<!DOCTYPE CIM>" + NAMES, NAMES.replace("root", "\x01")):
            self.assertEqual(self.status(body), (400, "request-not-well-formed"), body[:40])
        two = request("GetClass") * 2
        for body in (
            "<CIM/>",
            "<VALUE/>",
            NAMES.replace(' ID="77"', ""),
            message(""),
            message(two),
            NAMES.replace("IMETHODCALL", "METHODCALL"),
            NAMES.replace("<LOCALNAMESPACEPATH>", "<UNKNOWN/><LOCALNAMESPACEPATH>"),
            message('<SIMPLEREQ><IMETHODCALL NAME="GetClass"/></SIMPLEREQ>'),
            message("<SIMPLEREQ/>"),
        ):
            status, error = self.status(body)
            self.assertEqual(status, 501 if "VERSION" not in body and "<CIM/>" in body else 400, body)
            self.assertIn(error, ("request-not-valid", "unsupported-cim-version"), body)

    def test_methods_of_pages(self):
        """What a path takes stands in Allow."""
        for path, allowed in (("/metrics", "GET, HEAD, POST"), ("/cimom", "POST")):
            status, fields, _ = self.served.ask("PUT", path, "x")
            self.assertEqual((status, fields["Allow"]), (405, allowed))

    def test_comments_and_unknown_attributes(self):
        odd = NAMES.replace("<CIM ", "<!-- c --><CIM other='1' ").replace("<SIMPLEREQ>", "<?pi x?><SIMPLEREQ xml:lang='de'>")
        self.assertEqual(self.status("\ufeff" + odd), (200, None))

    def test_content_types(self):
        for value in ("text/xml", 'application/xml;charset="UTF-8"', "application/xml; charset=utf-8", "Application/XML"):
            self.assertEqual(self.status(Content_Type=value)[0], 200, value)
        for value in ("text/plain", "application/json", "application/xml; charset=iso-8859-1"):
            self.assertEqual(self.status(Content_Type=value)[0], 415, value)
        self.assertEqual(self.status(Content_Encoding="gzip")[0], 415)

    def test_web_pages_are_kept_out(self):
        self.assertEqual(self.status(Origin="http://evil.example")[0], 403)
        answer = self.served.raw(post_bytes(NAMES).replace(b"Host: localhost", b"Host: evil.example:80"))
        self.assertTrue(answer.startswith(b"HTTP/1.1 403 "), answer)
        for host in (b"localhost:80", b"127.0.0.1", b"[::1]:5988"):
            answer = self.served.raw(post_bytes(NAMES, "Connection: close").replace(b"localhost", host))
            self.assertTrue(answer.startswith(b"HTTP/1.1 200 "), answer)

    def test_methods(self):
        for method, status in (("GET", b"405"), ("OPTIONS", b"405"), ("M-POST", b"501"), ("DELETE", b"405")):
            answer = self.served.raw(post_bytes(NAMES, method=method))
            self.assertTrue(answer.startswith(b"HTTP/1.1 " + status), answer)
        self.assertIn(b"Allow: POST", self.served.raw(b"GET / HTTP/1.1\r\nHost: localhost\r\n\r\n"))

    def test_kept_and_pipelined_connections(self):
        connection = http.client.HTTPConnection("127.0.0.1", self.served.port, timeout=PATIENCE)
        for _ in range(20):
            connection.request("POST", "/cimom", NAMES, {"Content-Type": "application/xml"})
            self.assertEqual(connection.getresponse().read().count(b"<INSTANCENAME"), 5)
        connection.close()
        both = self.served.raw(post_bytes(NAMES) + post_bytes(NAMES, "Connection: close"))
        self.assertEqual(both.count(b"<INSTANCENAME"), 10)

    def test_old_version(self):
        answer = self.served.raw(post_bytes(NAMES, version="1.0"))
        self.assertEqual(answer.count(b"<INSTANCENAME"), 5)

    def test_chunked_request(self):
        chunks = "".join(f"{len(part):x}\r\n{part}\r\n" for part in (NAMES[:100], NAMES[100:])) + "0\r\n\r\n"
        head = "POST /cimom HTTP/1.1\r\nHost: localhost\r\nTransfer-Encoding: chunked\r\n"
        answer = self.served.raw((head + "Connection: close\r\n\r\n" + chunks).encode())
        self.assertEqual(answer.count(b"<INSTANCENAME"), 5)
        # With an extension that nobody knows, and with fields behind it.
        odd = chunks.replace("\r\n", ";a=b\r\n", 1)[:-2] + "CIMStatusCode: 0\r\nX-More: y\r\n\r\n"
        both = self.served.raw(((head + "\r\n" + odd) + (head + "Connection: close\r\n\r\n" + chunks)).encode())
        self.assertEqual(both.count(b"<INSTANCENAME"), 10)
        endless = chunks[:-2] + "X-More: y\r\n" * 10000
        answer = self.served.raw((head + "\r\n" + endless).encode())
        self.assertNotIn(b"HTTP/1.1 200 ", answer)
        answer = self.served.raw((head + f"Content-Length: {len(chunks)}\r\n\r\n" + chunks).encode())
        self.assertTrue(answer.startswith(b"HTTP/1.1 400 "), answer)

    def test_expect_continue(self):
        with self.served.connect() as connection:
            head, body = post_bytes(NAMES, "Expect: 100-continue", "Connection: close").split(b"\r\n\r\n")
            connection.sendall(head + b"\r\n\r\n")
            self.assertTrue(connection.recv(1000).startswith(b"HTTP/1.1 100 "))
            connection.sendall(body)
            self.assertEqual(read_all(connection).count(b"<INSTANCENAME"), 5)

    def test_too_much(self):
        answer = self.served.raw(post_bytes(NAMES, "X-Long: " + "x" * 17000))
        self.assertTrue(answer.startswith(b"HTTP/1.1 431 "), answer[:200])
        answer = self.served.raw(post_bytes(NAMES, *[f"X-{i}: x" for i in range(120)]))
        self.assertTrue(answer.startswith(b"HTTP/1.1 431 "), answer[:200])
        answer = self.served.raw(b"POST / HTTP/1.1\r\nHost: localhost\r\nContent-Length: 99999999999\r\n\r\n")
        self.assertTrue(answer.startswith(b"HTTP/1.1 413 "), answer[:200])
        deep = message("<SIMPLEREQ>" + "<INSTANCENAME CLASSNAME='a'><VALUE.REFERENCE>" * 10000)
        self.assertIn(self.status(deep)[0], (400, 413))
        self.assertEqual(self.status()[0], 200)

    def test_endless_chunks(self):
        with self.served.connect() as connection:
            connection.sendall(b"POST / HTTP/1.1\r\nHost: localhost\r\nTransfer-Encoding: chunked\r\n\r\n")
            chunk = b"100000\r\n" + b" " * 0x100000 + b"\r\n"
            sent = 0
            try:
                for _ in range(40):
                    connection.sendall(chunk)
                    sent += 1
            except OSError:
                pass
        self.assertLess(sent, 40)

    def refused_at_once(self, operation, parameters):
        begin = time.monotonic()
        self.assertEqual(error_code(self.served.call(operation, parameters)), 4)
        if not SANITIZED:
            self.assertLess(time.monotonic() - begin, 3)

    def test_lists_that_would_take_long(self):
        """Each of them is looked at for each other one, or once for each association class."""
        names = "".join(f"<VALUE>p{each}</VALUE>" for each in range(900)) + "<VALUE>p899</VALUE>" * 400000
        self.refused_at_once("EnumerateInstances", FCPORT + parameter("PropertyList", f"<VALUE.ARRAY>{names}</VALUE.ARRAY>"))
        keys = "".join(f'<KEYBINDING NAME="k{each}"><KEYVALUE>x</KEYVALUE></KEYBINDING>' for each in range(200000))
        path = f'<INSTANCENAME CLASSNAME="KALDERA_FCPort">{keys}</INSTANCENAME>'
        self.refused_at_once("Associators", parameter("ObjectName", path))
        self.refused_at_once("GetInstance", parameter("InstanceName", path))

    def test_memory_of_a_request(self):
        before = self.served.resident()
        many = "<VALUE.ARRAY>" + "<VALUE/>" * 500000 + "</VALUE.ARRAY>"
        body = intrinsic("EnumerateInstances", FCPORT + parameter("PropertyList", many))
        self.assertEqual(self.status(body)[0], 200)
        if not SANITIZED:
            self.assertLess(self.served.resident("VmHWM") - before, 10 * len(body))


class Several_Requests(Serving_Case):
    """A message with several requests has an answer to each, in their order."""

    def ask(self, *calls, **headers):
        return self.served.post(message(several(*calls)), **headers)

    def codes(self, *calls):
        """The statuses of the answers."""
        status, _, body = self.ask(*calls)
        self.assertEqual(status, 200)
        self.assertEqual(body.count("<MULTIRSP>"), 1)
        answers = re.findall(r"<SIMPLERSP>.*?</SIMPLERSP>", body, re.S)
        return [error_code(each) for each in answers], answers

    def test_answers(self):
        codes, answers = self.codes(
            request("EnumerateInstanceNames", FCPORT),
            request("GetClass", class_parameter("ClassName", "CIM_None")),
            request("GetClass", FCPORT),
        )
        self.assertEqual(codes, [0, 6, 0])
        self.assertEqual(answers[0].count("<INSTANCENAME"), 5)
        self.assertIn('IMETHODRESPONSE NAME="GetClass"', answers[2])
        self.assertNotIn("INSTANCENAME", answers[1])

    def test_one_is_answered_as_many_are(self):
        self.assertEqual(self.codes(request("EnumerateInstanceNames", FCPORT))[0], [0])

    def test_methods(self):
        service = '<INSTANCENAME CLASSNAME="KALDERA_AgentService"><KEYBINDING NAME="Name">' \
            "<KEYVALUE>Kaldera Agent Service Provider</KEYVALUE></KEYBINDING></INSTANCENAME>"
        path = request("x").split("<LOCALNAMESPACEPATH>")[1].split("</LOCALNAMESPACEPATH>")[0]

        def method(name):
            return (
                f'<SIMPLEREQ><METHODCALL NAME="{name}"><LOCALINSTANCEPATH><LOCALNAMESPACEPATH>{path}</LOCALNAMESPACEPATH>'
                f'{service}</LOCALINSTANCEPATH><PARAMVALUE NAME="request"><VALUE>{{}}</VALUE></PARAMVALUE></METHODCALL></SIMPLEREQ>'
            )

        codes, answers = self.codes(method("executeMethod"), method("none"), request("EnumerateInstanceNames", FCPORT))
        self.assertEqual(codes, [0, 17, 0])
        self.assertIn('<METHODRESPONSE NAME="executeMethod">', answers[0])

    def test_long_answers(self):
        everything = request("EnumerateClasses", value_parameter("DeepInheritance", "TRUE") + value_parameter("LocalOnly", "FALSE"))
        codes, answers = self.codes(*[everything, request("GetClass", class_parameter("ClassName", "CIM_None"))] * 4)
        self.assertEqual(codes, [0, 6] * 4)
        self.assertEqual(len(set(answers)), 2)
        self.assertGreater(len(answers[0]), 1 << 19)

    def test_what_stood_before_a_bad_one_is_told(self):
        bad = request("GetInstance", parameter("InstanceName", "<INSTANCENAME/>"))
        self.assertEqual(self.codes(request("EnumerateInstanceNames", FCPORT), bad, request("GetClass", FCPORT))[0], [0, 4, 0])
        status, fields, _ = self.ask(bad, request("GetClass", FCPORT))
        self.assertEqual((status, fields["CIMError"]), (400, "request-not-valid"))

    def test_headers(self):
        both = [request("EnumerateInstanceNames", FCPORT)] * 2
        self.assertEqual(self.ask(*both, CIMOperation="MethodCall", CIMBatch="")[0], 200)
        for headers in ({"CIMMethod": "EnumerateInstanceNames"}, {"CIMObject": "root/kaldera"}):
            status, fields, _ = self.ask(*both, **headers)
            self.assertEqual((status, fields["CIMError"]), (400, "header-mismatch"))
        status, fields, _ = self.served.post(NAMES, CIMBatch="")
        self.assertEqual((status, fields["CIMError"]), (400, "header-mismatch"))

    def test_what_is_refused(self):
        one = request("EnumerateInstanceNames", FCPORT)
        for content in ("<MULTIREQ/>", several(one, "<SIMPLEREQ/>"), several(several(one)), several(one) * 2, several(one) + one):
            self.assertEqual(self.served.post(message(content))[0], 400, content)
        self.assertEqual(self.served.post(message(several(*[one] * 1000)))[0], 200)
        self.assertEqual(self.served.post(message(several(*[one] * 1001)))[0], 413)


class Slowness(Serving_Case):
    def test_trickled_headers_end_in_time(self):
        with self.served.connect() as connection:
            begin = time.monotonic()
            try:
                for byte in b"POST /cimom HTTP/1.1\r\nHost: localhost\r\n" * 3:
                    connection.sendall(bytes([byte]))
                    time.sleep(1)
            except OSError:
                pass
            self.assertLess(time.monotonic() - begin, 20)
            self.assertEqual(read_all(connection), b"")

    def test_many_connections(self):
        waiting = [self.served.connect() for _ in range(63)]
        try:
            self.assertEqual(error_code(self.served.call("EnumerateInstanceNames", FCPORT)), 0)
        finally:
            for each in waiting:
                each.close()

    def test_stopped_reader_holds_up_nobody(self):
        with self.served.connect() as connection:
            connection.sendall(post_bytes(intrinsic("EnumerateClasses", value_parameter("DeepInheritance", "TRUE"))) * 20)
            time.sleep(0.5)
            self.assertEqual(error_code(self.served.call("EnumerateInstanceNames", FCPORT)), 0)


class Too_Many(Serving_Case):
    """With a server of its own, in which nobody's connection is still about to end."""

    def test_one_connection_too_many(self):
        waiting = [self.served.connect() for _ in range(64)]
        try:
            with self.served.connect() as refused:
                self.assertEqual(read_all(refused), b"")
            waiting[0].sendall(b"GET /metrics HTTP/1.1\r\nHost: localhost\r\nConnection: close\r\n\r\n")
            self.assertIn(b"# EOF", read_all(waiting[0]))
            # Its place is free a moment after its end.
            end = time.monotonic() + PATIENCE
            while not self.is_served():
                self.assertLess(time.monotonic(), end)
                time.sleep(0.01)
        finally:
            for each in waiting:
                each.close()

    def is_served(self):
        try:
            return error_code(self.served.call("EnumerateInstanceNames", FCPORT)) == 0
        except (ConnectionError, http.client.HTTPException):
            return False


class Passwords(unittest.TestCase):
    def setUp(self):
        self.folder = tempfile.TemporaryDirectory()
        self.users = os.path.join(self.folder.name, "users")
        write_users(self.users, "änne", "pä:ss")

    def tearDown(self):
        self.folder.cleanup()

    def test_basic(self):
        served = Served("--users", self.users)

        def status(user, password):
            return served.post(NAMES, Authorization=basic(user, password))[0]

        code, fields, _ = served.post(NAMES)
        self.assertEqual(code, 401)
        self.assertTrue(fields["WWW-Authenticate"].startswith("Basic realm="))
        self.assertEqual(status("änne", "pä:ss"), 200)
        self.assertEqual(status("änne", "pä"), 401)
        self.assertEqual(status("other", "pä:ss"), 401)
        self.assertEqual(served.post(NAMES, Authorization="Basic !!!")[0], 401)
        self.assertEqual(served.post(NAMES, Authorization="Bearer x")[0], 401)
        self.assertEqual(served.stop(), 0)

    def refused(self, *options):
        with self.assertRaises(AssertionError) as caught:
            Served(*options)
        return str(caught.exception)

    def test_what_is_not_served(self):
        self.assertIn("can be reached from outside", self.refused("--listen", "0.0.0.0:0"))
        self.assertIn("can be reached from outside", self.refused("--listen", "0.0.0.0:0", "--users", self.users))
        self.assertIn("ADDRESS:PORT", self.refused("--listen", "5988"))
        self.assertIn("ADDRESS:PORT", self.refused("--listen", "127.0.0.1:99999"))
        self.assertIn("go together", self.refused("--tls-cert", "x"))
        self.assertIn("No such file", self.refused("--tls", "/proc/none", "x"))
        self.assertIn("--tls wants two values: CERT KEY", self.refused("--tls", "x"))
        self.assertIn("--tls wants two values: CERT KEY", self.refused("--tls=x", "y"))
        self.assertIn("No such file", self.refused("--users", "/proc/none"))
        os.chmod(self.users, 0o644)
        self.assertIn("others may read", self.refused("--users", self.users))
        os.chmod(self.users, 0o600)
        with open(self.users, "w", encoding="utf-8") as file:
            file.write("anne:plain\n")
        self.assertIn(":1: no", self.refused("--users", self.users))


class Streams(Serving_Case):
    """Answers that are longer than what is kept of them."""

    module = "KLDR_PLAIN_TOY"
    namespace = "root/toy"
    environment = {"TOY_MANY": str(VERY_MANY)}

    MANY = class_parameter("ClassName", "TOY_Many")

    def test_memory(self):
        self.served.call("EnumerateInstances", class_parameter("ClassName", "TOY_Item"))
        before = self.served.resident("VmHWM")
        with self.served.connect() as connection:
            connection.sendall(post_bytes(intrinsic("EnumerateInstances", self.MANY, self.namespace), "Connection: close"))
            answer = read_all(connection)
        self.assertIn(b"Transfer-Encoding: chunked", answer[:500])
        self.assertEqual(answer.count(b"<VALUE.NAMEDINSTANCE>"), VERY_MANY)
        self.assertTrue(answer.rstrip().endswith(b"</CIM>\n\r\n0"), answer[-100:])
        if not SANITIZED:
            self.assertLess(self.served.resident("VmHWM") - before, 10 << 20)

    def test_client_that_leaves(self):
        for _ in range(5):
            with self.served.connect() as connection:
                connection.sendall(post_bytes(intrinsic("EnumerateInstances", self.MANY, self.namespace)))
                connection.recv(10000)
        self.assertEqual(error_code(self.served.call("EnumerateInstances", class_parameter("ClassName", "TOY_Item"))), 0)


class Slow_Provider(Serving_Case):
    module = "KLDR_PLAIN_TOY"
    namespace = "root/toy"

    @classmethod
    def setUpClass(cls):
        cls.folder = tempfile.TemporaryDirectory()
        cls.fifo = os.path.join(cls.folder.name, "fifo")
        os.mkfifo(cls.fifo)
        cls.environment = {"TOY_MANY": "20000", "TOY_MANY_WAITS": cls.fifo}
        super().setUpClass()

    @classmethod
    def tearDownClass(cls):
        super().tearDownClass()
        cls.folder.cleanup()

    def go_on(self):
        with open(self.fifo, "wb"):
            pass

    @unittest.skipIf(SANITIZED, "half a minute of waiting shows a sanitizer nothing")
    def test_a_long_pause_in_an_answer(self):
        """Longer than a client may be silent, which reads all the while."""
        later = threading.Timer(33, self.go_on)
        later.start()
        body = intrinsic("EnumerateInstances", class_parameter("ClassName", "TOY_Many"), self.namespace)
        answer = self.served.raw(post_bytes(body, "Connection: close"))
        later.join()
        self.assertTrue(answer.endswith(b"0\r\n\r\n"), answer[-100:])
        text, _ = chunks_of(answer.partition(b"\r\n\r\n")[2])
        self.assertEqual(text.count(b"</VALUE.NAMEDINSTANCE>\n"), 20000)


class Broken_Streams(Serving_Case):
    module = "KLDR_PLAIN_TOY"
    namespace = "root/toy"
    environment = {"TOY_MANY": "20000", "TOY_MANY_FAILS": "1"}

    def test_failure_behind_what_was_sent(self):
        with self.served.connect() as connection:
            body = intrinsic("EnumerateInstances", class_parameter("ClassName", "TOY_Many"), self.namespace)
            connection.sendall(post_bytes(body))
            answer = read_all(connection)
        self.assertNotIn(b"</CIM>", answer)
        self.assertFalse(answer.endswith(b"0\r\n\r\n"), "the end of a good answer")

    def ask(self, *fields, version="1.1"):
        body = intrinsic("EnumerateInstances", class_parameter("ClassName", "TOY_Many"), self.namespace)
        return self.served.raw(post_bytes(body, "Connection: close, TE", *fields, version=version))

    def test_failure_for_clients_that_read_trailers(self):
        for asked in ("TE: trailers", "TE: chunked , Trailers;q=0.5"):
            answer = self.ask(asked)
            self.assertIn(b"\r\nTrailer: CIMStatusCode, CIMStatusCodeDescription\r\n", answer[:1000])
            text, end = chunks_of(answer.partition(b"\r\n\r\n")[2])
            self.assertEqual(text.count(b"</VALUE.NAMEDINSTANCE>\n"), 20000)
            self.assertTrue(text.endswith(b"\n</IRETURNVALUE></IMETHODRESPONSE></SIMPLERSP></MESSAGE></CIM>\n"), text[-100:])
            self.assertEqual(end, b"CIMStatusCode: 1\r\nCIMStatusCodeDescription: no%20more%20of%20them\r\n\r\n")

    def test_failure_for_others(self):
        for fields, version in (("TE: gzip", "1.1"), ("TE: trailersx", "1.1"), ("TE: trailers", "1.0")):
            self.assertNotIn(b"</CIM>", self.ask(fields, version=version))


class Short_Failures(Serving_Case):
    module = "KLDR_PLAIN_TOY"
    namespace = "root/toy"
    environment = {"TOY_MANY": "20", "TOY_MANY_FAILS": "1"}

    def test_failure_before_anything_was_sent(self):
        body = self.served.call("EnumerateInstances", class_parameter("ClassName", "TOY_Many"))
        self.assertEqual(error_code(body), 1)
        self.assertIn('DESCRIPTION="no more of them"', body)
        self.assertNotIn("IRETURNVALUE", body)


if __name__ == "__main__":
    unittest.main()

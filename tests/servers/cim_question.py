"""One intrinsic method call to a CIM server, as the smallest of clients sends it."""

import http.client
import re
from xml.sax.saxutils import escape

BODY = """<?xml version="1.0" encoding="utf-8"?>
<CIM CIMVERSION="2.0" DTDVERSION="2.0"><MESSAGE ID="1" PROTOCOLVERSION="1.0"><SIMPLEREQ>
<IMETHODCALL NAME="{method}"><LOCALNAMESPACEPATH>{path}</LOCALNAMESPACEPATH>{parameters}</IMETHODCALL>
</SIMPLEREQ></MESSAGE></CIM>
"""


class Cim_Error(Exception):
    """The server's own error: its code and its words."""

    def __init__(self, code, words):
        super().__init__(f"{code}: {words}")
        self.code = code


def ask(port, namespace, method, class_name, properties=None, timeout=30):
    """The answer's XML to a method that takes a class name: EnumerateInstanceNames, EnumerateInstances, GetClass and so on, with a
    list of properties if the method takes one.

    Raises Cim_Error if the server answers with an error, and OSError or http.client.HTTPException if it does not answer.
    """
    path = "".join(f'<NAMESPACE NAME="{escape(word)}"/>' for word in namespace.split("/"))
    parameters = f'<IPARAMVALUE NAME="ClassName"><CLASSNAME NAME="{escape(class_name)}"/></IPARAMVALUE>'
    if properties is not None:
        values = "".join(f"<VALUE>{escape(name)}</VALUE>" for name in properties)
        parameters += f'<IPARAMVALUE NAME="PropertyList"><VALUE.ARRAY>{values}</VALUE.ARRAY></IPARAMVALUE>'
    connection = http.client.HTTPConnection("127.0.0.1", port, timeout=timeout)
    try:
        connection.request(
            "POST", "/cimom", BODY.format(method=method, path=path, parameters=parameters).encode(),
            {
                "Content-Type": 'application/xml; charset="utf-8"', "CIMOperation": "MethodCall", "CIMMethod": method,
                "CIMObject": namespace,
            },
        )  # fmt: skip
        answer = connection.getresponse().read().decode("utf-8", "replace")
    finally:
        connection.close()
    error = re.search(r'<ERROR CODE="(\d+)"(?: DESCRIPTION="([^"]*)")?', answer)
    if error:
        raise Cim_Error(int(error[1]), error[2] or "")
    return answer


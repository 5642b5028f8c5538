#include "host/Cli_Options.h"

namespace KPRV::host {

const char* const cli_usage =
    R"usage(Usage: kldrcim [options] VERB ARGUMENT...

Calls a CMPI provider module directly, as a CIM server would, without a CIM server.

Verbs
  ei CLASS                          enumerate instances
  ein CLASS                         enumerate instance names
  gi PATH                           get one instance
  ci CLASS NAME=VALUE...            create an instance
  mi PATH NAME=VALUE...             modify the named properties of an instance
  di PATH                           delete an instance
  cm PATH METHOD [NAME=VALUE...]    call a method; PATH may name a class alone for a static one
  ai PATH                           instances associated with one (associators)
  ain PATH                          their names
  ri PATH                           associations that refer to an instance (references)
  rin PATH                          their names
  tree                              the host with its adapters, ports, targets and logical units, as a tree
  graph                             the same as Graphviz text: kldrcim graph | dot -Tsvg >host.svg
  profiles                          the registered profiles and what conforms to each, as a tree
  conform                           what a client of the Storage HBA profile expects, beside what it finds
  watch [CLASS]                     subscribe to indications (default: KALDERA_AlertIndication) and write each as it
                                    comes, until interrupted
  diag list                         the hardware tests, and the ports and adapters that they can be run on
  diag run TEST ELEMENT             run a test, by its name, on a port or adapter, by its address or PATH; the test
                                    takes the element out of service while it runs
  rpc METHOD [PARAMETER...]         call a method of the agent's JSON-RPC protocol; "+" stands before a further call
  rpc --list [PATTERN]              list its methods with their parameters
  rpc --raw TEXT                    send TEXT, or with "-" standard input, as it is; write the reply as it is
  flash ADAPTER URI                 update an adapter's firmware from file://PATH or tftp://HOST/FILE, through the module's
                                    installation service; ADAPTER is its DeviceID, with or without colons, or a PATH
  classes [PATTERN]                 list the classes that have a provider; * and ? match as in file names

Options
  --format table|json|mof   how results are written (default: table)
  --properties A,B,C        ask for these properties only
  --namespace NS            namespace of the classes (default: root/kaldera)
  --module FILE             provider library (default: libkldrprovider_Module.so beside this program, then in
                            ../lib/cim and /usr/lib/cim, then on the library search path)
  --user NAME               authenticated user that the provider sees (default: none)
  --server-instances FILE   JSON of what the server's own name spaces hold, for providers that ask the server
                            (default: it has none besides --namespace)
  --assoc CLASS             ai, ain, ri, rin: only this association class and its subclasses
                            (default: every one that can hold the class of PATH)
  --role ROLE               ai, ain, ri, rin: only where PATH stands in this role
  --result CLASS            ai, ain: only results of this class or a subclass
  --result-role ROLE        ai, ain: only results that stand in this role
  --filter NS               watch: a filter in this namespace, instead of --namespace; may be given several times
  --count N                 watch: end after N indications
  --software, --connectors  tree, graph: also firmware and drivers, cards and transceivers
  --ascii                   tree, profiles: no box-drawing characters (default where the locale is not UTF-8)
  --wait                    diag run: show the job while it runs, then its records
  --leaks                   say on standard error which CMPI objects the provider did not release
  --help, --version

Paths and values
  PATH is [namespace:]Class.Key="text",Key2=42,Key3=true; inside a text, \" and \\ stand for a quote and a backslash.
  A key that refers to another object holds its path as text: Ref="Class.Key=\"text\"".
  VALUE is read as the class declares it: text as it stands, numbers in decimal or 0x form, true or false, the 25
  characters of a datetime, a PATH for a reference. An array is {one, two}; NULL gives no value.

Parameters of rpc
  One word that begins with [ is the JSON array of all parameters. Otherwise each word is one: JSON if it begins with
  [, { or a quote; a string where --list says so; else a number, true, false or null if it is one, or a string.
  Before a parameter that begins with a minus sign, "--" ends the options.

Exit status
  0 success, also if only some of several associations failed (a warning names them); 1 the provider or the host
  answered a CIM status, the agent an error, or an update failed, which is named on standard error; 2 usage, no such test,
  element or adapter, or the module could not be loaded. conform: 1 something mandatory is missing. diag run --wait: 0 the
  test passed, 1 it failed; diag run: 3 the test was refused.

Examples
  kldrcim ei KALDERA_FCPort --properties DeviceID,PortType,Speed
  kldrcim ein KALDERA_FCPort
  kldrcim ain "$(kldrcim ein KALDERA_ComputerSystem)" --assoc KALDERA_PortControllerSystemDevice
  kldrcim tree --software
  kldrcim diag run SerdesLoopbackTest 10:00:02:4b:4c:10:00:00 --wait
  kldrcim watch --count 10 --properties Message,PerceivedSeverity,MessageID
  kldrcim rpc discovery.getPortByWwn 10:00:02:4b:4c:10:00:00
  kldrcim flash 20:00:02:4b:4c:10:00:00 file:///var/tmp/firmware.bin
  kldrcim --format mof gi 'KALDERA_AgentService.Name="agent"'
)usage";

} // namespace KPRV::host

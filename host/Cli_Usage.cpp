#include "host/Cli_Options.h"

namespace KPRV::host {

const char* const cli_usage =
    R"(Usage: kldrcim [options] VERB ARGUMENT...

Calls a CMPI provider module directly, as a CIM server would, without a CIM server.

Verbs
  ei CLASS                          enumerate instances
  ein CLASS                         enumerate instance names
  gi PATH                           get one instance
  ci CLASS NAME=VALUE...            create an instance
  mi PATH NAME=VALUE...             modify the named properties of an instance
  di PATH                           delete an instance
  cm PATH METHOD [NAME=VALUE...]    call a method; PATH may name a class alone for a static one
  classes [PATTERN]                 list the classes that have a provider; * and ? match as in file names

Options
  --format table|json|mof   how results are written (default: table)
  --properties A,B,C        ask for these properties only
  --namespace NS            namespace of the classes (default: root/kaldera)
  --module FILE             provider library (default: libkldrprovider_Module.so beside this program, then in
                            /usr/lib/cim, then on the library search path)
  --user NAME               authenticated user that the provider sees (default: none)
  --leaks                   say on standard error which CMPI objects the provider did not release
  --help, --version

Paths and values
  PATH is [namespace:]Class.Key="text",Key2=42,Key3=true; inside a text, \" and \\ stand for a quote and a backslash.
  A key that refers to another object holds its path as text: Ref="Class.Key=\"text\"".
  VALUE is read as the class declares it: text as it stands, numbers in decimal or 0x form, true or false, the 25
  characters of a datetime, a PATH for a reference. An array is {one, two}; NULL gives no value.

Exit status
  0 success; 1 the provider or the host answered a CIM status, which is named on standard error; 2 usage, or the
  module could not be loaded.

Examples
  kldrcim ei KALDERA_FCPort --properties DeviceID,PortType,Speed
  kldrcim ein KALDERA_FCPort
  kldrcim --format mof gi 'KALDERA_AgentService.Name="agent"'
)";

} // namespace KPRV::host

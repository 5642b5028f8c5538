#include "kldrcim/verbs/Cli_Profiles.h"

#include "kldrcim/formats/Branch_Text.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/formats/Profile_Text.h"
#include "kldrcim/verbs/Cli_Complaints.h"

namespace KPRV::kldrcim {

int write_profiles(const Cli_Options& options, Connection& connection)
{
    Association_Index index(connection);
    const std::vector<Profile_Branch> roots = walk_profiles(index, connection.classes());
    const std::vector<Provider_Failure>& failures = index.failures();
    if (!failures.empty() && same_name(failures.front().provider_class, profile_root_class))
        return complain(
            code_text(failures.front().rc) + ": no answer from " + failures.front().provider_class, 1);
    const std::string text = options.format == Cli_Options::Format::JSON
                                 ? profile_json(roots)
                                 : profile_text(roots, options.ascii || !locale_is_utf8());
    put(text);
    warn_of(failures);
    return 0;
}

} // namespace KPRV::kldrcim

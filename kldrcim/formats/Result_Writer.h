#pragma once

#include "broker/values/Receiver.h"
#include "kldrcim/words/Value_Words.h"

#include <memory>

namespace KPRV::kldrcim {

using namespace broker;

/// Writes results to standard output as they come, and keeps no more of them than it must.
class Result_Writer : public Receiver
{
public:
    /// To be called behind the last; of a `complete` answer, also if there was none.
    virtual void end(bool complete) = 0;
};

/// A JSON array: of instances as objects, of paths as texts.
std::unique_ptr<Result_Writer> json_writer(Words words);

/// One object or text a line.
std::unique_ptr<Result_Writer> json_lines_writer(Words words);

/// One `instance of` behind the other; of paths a line each.
std::unique_ptr<Result_Writer> mof_writer();

/// Instances as `Instances_Table` has them, sized by the first of them: `rows_that_size`, or fewer if there
/// are no more. One that has a property without a column begins a new table. Of paths a line each.
std::unique_ptr<Result_Writer> table_writer(const std::vector<std::string>* columns, std::size_t width,
                                            Words words);

inline constexpr std::size_t ROWS_THAT_SIZE = 1000;

} // namespace KPRV::kldrcim

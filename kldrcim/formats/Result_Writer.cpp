#include "kldrcim/formats/Result_Writer.h"

#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Format_Table.h"
#include "kldrcim/formats/Output.h"

#include <optional>

namespace KPRV::kldrcim {

namespace {

class Json_Writer final : public Result_Writer
{
public:
    explicit Json_Writer(Words words) : words_(words) {}

    bool instance(Instance_Value&& instance) override { return element(json_instance(instance, 2, words_)); }
    bool path(Path_Value&& path) override { return element(json_string(path_text(path))); }

    void end(bool complete) override
    {
        if (is_begun_)
            put("\n]\n");
        else if (complete)
            put("[]\n");
    }

private:
    bool element(const std::string& text)
    {
        put(is_begun_ ? ",\n  " : "[\n  ");
        put(text);
        is_begun_ = true;
        return true;
    }

    const Words words_;
    bool is_begun_ = false;
};

/// What has a line for each path.
class Line_Writer : public Result_Writer
{
public:
    bool path(Path_Value&& path) override
    {
        put(path_text(path) + "\n");
        return true;
    }
};

class Json_Lines_Writer final : public Result_Writer
{
public:
    explicit Json_Lines_Writer(Words words) : words_(words) {}

    bool instance(Instance_Value&& instance) override
    {
        put(json_line(json_instance(instance, 0, words_)));
        return true;
    }
    bool path(Path_Value&& path) override
    {
        put(json_string(path_text(path)) + "\n");
        return true;
    }
    void end(bool) override {}

private:
    const Words words_;
};

class Mof_Writer final : public Line_Writer
{
public:
    bool instance(Instance_Value&& instance) override
    {
        put(mof_instance(instance));
        return true;
    }
    void end(bool) override {}
};

class Table_Writer final : public Line_Writer
{
public:
    Table_Writer(const std::vector<std::string>* columns, std::size_t width, Words words)
        : columns_(columns), width_(width), words_(words)
    {
    }

    bool instance(Instance_Value&& instance) override
    {
        if (table_ && !table_->has_columns_for(instance))
            table_.reset();
        if (table_) {
            put(table_->between() + table_->row(instance));
            return true;
        }
        first_.push_back(std::move(instance));
        if (first_.size() == rows_that_size)
            begin();
        return true;
    }

    void end(bool) override
    {
        if (!first_.empty())
            begin();
    }

private:
    void begin()
    {
        put(is_begun_ ? "\n" : "");
        table_.emplace(first_, columns_, width_, words_);
        put(table_->head());
        for (std::size_t i = 0; i < first_.size(); ++i)
            put((i == 0 ? "" : table_->between()) + table_->row(first_[i]));
        first_.clear();
        is_begun_ = true;
    }

    const std::vector<std::string>* const columns_;
    const std::size_t width_;
    const Words words_;
    /// Of a table that is not sized yet.
    std::vector<Instance_Value> first_;
    std::optional<Instances_Table> table_;
    bool is_begun_ = false;
};

} // namespace

std::unique_ptr<Result_Writer> json_writer(Words words)
{
    return std::make_unique<Json_Writer>(words);
}

std::unique_ptr<Result_Writer> json_lines_writer(Words words)
{
    return std::make_unique<Json_Lines_Writer>(words);
}

std::unique_ptr<Result_Writer> mof_writer()
{
    return std::make_unique<Mof_Writer>();
}

std::unique_ptr<Result_Writer> table_writer(const std::vector<std::string>* columns, std::size_t width,
                                            Words words)
{
    return std::make_unique<Table_Writer>(columns, width, words);
}

} // namespace KPRV::kldrcim

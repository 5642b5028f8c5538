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
    explicit Json_Writer(Words words) : _words(words) {}

    bool instance(Instance_Value&& instance) override { return element(json_instance(instance, 2, _words)); }
    bool path(Path_Value&& path) override { return element(json_string(path_text(path))); }

    void end(bool complete) override
    {
        if (_is_begun)
            put("\n]\n");
        else if (complete)
            put("[]\n");
    }

private:
    bool element(const std::string& text)
    {
        put(_is_begun ? ",\n  " : "[\n  ");
        put(text);
        _is_begun = true;
        return true;
    }

    const Words _words;
    bool _is_begun = false;
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
    explicit Json_Lines_Writer(Words words) : _words(words) {}

    bool instance(Instance_Value&& instance) override
    {
        put(json_line(json_instance(instance, 0, _words)));
        return true;
    }
    bool path(Path_Value&& path) override
    {
        put(json_string(path_text(path)) + "\n");
        return true;
    }
    void end(bool) override {}

private:
    const Words _words;
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
        : _columns(columns), _width(width), _words(words)
    {
    }

    bool instance(Instance_Value&& instance) override
    {
        if (_table && !_table->has_columns_for(instance))
            _table.reset();
        if (_table) {
            put(_table->between() + _table->row(instance));
            return true;
        }
        _first.push_back(std::move(instance));
        if (_first.size() == ROWS_THAT_SIZE)
            begin();
        return true;
    }

    void end(bool) override
    {
        if (!_first.empty())
            begin();
    }

private:
    void begin()
    {
        put(_is_begun ? "\n" : "");
        _table.emplace(_first, _columns, _width, _words);
        put(_table->head());
        for (std::size_t i = 0; i < _first.size(); ++i)
            put((i == 0 ? "" : _table->between()) + _table->row(_first[i]));
        _first.clear();
        _is_begun = true;
    }

    const std::vector<std::string>* const _columns;
    const std::size_t _width;
    const Words _words;
    /// Of a table that is not sized yet.
    std::vector<Instance_Value> _first;
    std::optional<Instances_Table> _table;
    bool _is_begun = false;
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

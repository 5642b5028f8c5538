#include "kldrcim/local/Server_Instances_File.h"

#include "broker/values/Type_Words.h"
#include "kldrcim/input/Typed_Input.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <fstream>
#include <json/json.h>
#include <memory>
#include <sstream>
#include <stdexcept>
#include <system_error>

namespace KPRV::kldrcim {

namespace {

/// Why an entry was refused, and where it stands.
struct Refused : std::runtime_error
{
    Refused(std::size_t line_number, const std::string& reason)
        : std::runtime_error(reason), line(line_number)
    {
    }
    std::size_t line;
};

/// Reads the entries of one text. Its functions throw Refused.
class Reader
{
public:
    Reader(std::string text, const Class_Catalogue& catalogue, Server_Store& store)
        : _text(std::move(text)), _catalogue(catalogue), _store(store)
    {
    }

    void read()
    {
        const Json::Value list = parse();
        if (!list.isArray())
            refuse(list, "expected a list of entries");
        for (const Json::Value& entry : list)
            read_entry(entry);
    }

private:
    Json::Value parse() const
    {
        Json::CharReaderBuilder builder;
        builder["collectComments"] = false;
        builder["failIfExtra"] = true;
        builder["rejectDupKeys"] = true;
        builder["stackLimit"] = 64;
        const std::unique_ptr<Json::CharReader> reader(builder.newCharReader());
        Json::Value value;
        std::string errors;
        try {
            if (reader->parse(_text.data(), _text.data() + _text.size(), &value, &errors))
                return value;
        } catch (const std::exception&) {
            throw Refused(1, "nested too deeply");
        }
        // "* Line 3, Column 5\n  Missing ...\n"
        std::size_t line = 1;
        std::sscanf(errors.c_str(), "* Line %zu", &line);
        std::size_t from = errors.find("\n  ");
        if (from == std::string::npos)
            throw Refused(line, "not JSON");
        throw Refused(line, errors.substr(from + 3, errors.find('\n', from + 3) - from - 3));
    }

    [[noreturn]] void refuse(const Json::Value& value, const std::string& reason) const
    {
        auto end = _text.begin() + std::min<std::ptrdiff_t>(value.getOffsetStart(),
                                                            static_cast<std::ptrdiff_t>(_text.size()));
        throw Refused(1 + static_cast<std::size_t>(std::count(_text.begin(), end, '\n')), reason);
    }

    void check_members(const Json::Value& entry) const
    {
        static constexpr const char* known[] = {"namespace", "class", "superclass", "properties", "refuses"};
        if (!entry.isObject())
            refuse(entry, "expected an entry: an object with \"namespace\"");
        for (const std::string& name : entry.getMemberNames())
            if (std::find(std::begin(known), std::end(known), name) == std::end(known))
                refuse(entry[name], "an entry has no member \"" + name + "\"");
    }

    /// The text of a member; empty if it may be absent and is.
    std::string text_member(const Json::Value& entry, const char* name, bool needed) const
    {
        if (!entry.isMember(name) && !needed)
            return "";
        const Json::Value& member = entry[name];
        if (!member.isString() || member.asString().empty())
            refuse(entry.isMember(name) ? member : entry,
                   std::string("the entry needs a text \"") + name + "\"");
        return member.asString();
    }

    void read_entry(const Json::Value& entry)
    {
        check_members(entry);
        const std::string name_space = text_member(entry, "namespace", true);
        if (entry.isMember("refuses")) {
            _store.refuse(name_space, read_refusal(entry));
            return;
        }
        const std::string class_name = text_member(entry, "class", true);
        const std::string superclass = text_member(entry, "superclass", false);
        if (!superclass.empty() && _catalogue.is_known() && !_catalogue.find(superclass))
            refuse(entry["superclass"], "the module has no class " + superclass);
        if (!entry.isMember("properties")) {
            _store.add_class(name_space, class_name, superclass);
            return;
        }
        // Only an entry that is good to its end is put in.
        Instance_Value instance = read_instance(entry["properties"], class_name, superclass);
        _store.add_class(name_space, class_name, superclass);
        _store.add(name_space, std::move(instance));
    }

    CMPIrc read_refusal(const Json::Value& entry) const
    {
        if (entry.isMember("class") || entry.isMember("properties"))
            refuse(entry["refuses"], "\"refuses\" is for the whole name space, without \"class\"");
        const std::string name = text_member(entry, "refuses", true);
        const int rc = status_of_name(name);
        if (rc <= CMPI_RC_OK)
            refuse(entry["refuses"], "\"" + name + "\" is no CIM error; CIM_ERR_ACCESS_DENIED is one");
        return static_cast<CMPIrc>(rc);
    }

    Instance_Value read_instance(const Json::Value& properties, const std::string& class_name,
                                 const std::string& superclass) const
    {
        if (!properties.isObject())
            refuse(properties, "expected the properties: an object");
        Instance_Value instance = {{.class_name = class_name}, {}};
        const Class_Info* own = _catalogue.find(class_name);
        const Class_Info* info = own || superclass.empty() ? own : _catalogue.find(superclass);
        for (const std::string& name : properties.getMemberNames()) {
            const Json::Value& written = properties[name];
            const Feature_Info* feature = info ? info->property(name) : nullptr;
            // A subclass of its own may have properties of its own.
            if (own && !feature)
                refuse(written, class_name + " has no property \"" + name + "\"");
            Plain_Value value = feature ? typed(written, feature->type, class_name + "." + name)
                                        : guessed(written, class_name + "." + name);
            const std::string& spelled = feature ? feature->name : name;
            set_value(instance.properties, spelled, std::move(value));
        }
        // In the order of the class: members of JSON have none.
        for (const Feature_Info& feature : info ? info->properties : std::vector<Feature_Info>())
            if (const Plain_Value* value = instance.property(feature.name);
                feature.key && value && !value->null)
                set_value(instance.path.keys, feature.name, *value);
        return instance;
    }

    Plain_Value typed(const Json::Value& written, CMPIType type, const std::string& what) const
    {
        if (written.isNull())
            return Plain_Value::null_of(type);
        if (type & CMPI_ARRAY) {
            const auto element_type = static_cast<CMPIType>(type & ~CMPI_ARRAY);
            std::vector<Plain_Value> elements;
            if (!written.isArray())
                refuse_type(written, type, what);
            for (const Json::Value& element : written)
                elements.push_back(typed(element, element_type, what));
            return Plain_Value::array(element_type, std::move(elements));
        }
        const bool is_text = type == CMPI_string || type == CMPI_dateTime || type == CMPI_ref;
        const bool is_truth = type == CMPI_boolean;
        if (is_text ? !written.isString() : is_truth ? !written.isBool() : !is_number(written))
            refuse_type(written, type, what);
        if (type == CMPI_string)
            return Plain_Value::text(written.asString());
        Plain_Value value;
        std::string error;
        if (!typed_value(_catalogue, type, written.asString(), what, value, error))
            refuse(written, error);
        return value;
    }

    static bool is_number(const Json::Value& written) { return written.isNumeric() && !written.isBool(); }

    [[noreturn]] void refuse_type(const Json::Value& written, CMPIType type, const std::string& what) const
    {
        refuse(written, what + " is a " + type_word_name(type) + ", and what is written is none");
    }

    /// A value of a property that no class declares: by how it is written.
    Plain_Value guessed(const Json::Value& written, const std::string& what) const
    {
        if (written.isNull())
            return Plain_Value::null_of(CMPI_string);
        if (written.isArray()) {
            std::vector<Plain_Value> elements;
            for (const Json::Value& element : written) {
                elements.push_back(guessed(element, what));
                if (element.isArray() || elements.back().type != elements.front().type)
                    refuse(element, what + ": the elements of an array are values of one type");
            }
            const CMPIType type = elements.empty() ? CMPIType(CMPI_string) : elements.front().type;
            return Plain_Value::array(type, std::move(elements));
        }
        if (written.isString())
            return Plain_Value::text(written.asString());
        if (written.isBool())
            return Plain_Value::boolean(written.asBool());
        if (written.isUInt64())
            return Plain_Value::unsigned_number(CMPI_uint64, written.asUInt64());
        if (written.isInt64())
            return Plain_Value::signed_number(CMPI_sint64, written.asInt64());
        if (written.isDouble())
            return Plain_Value::real(CMPI_real64, written.asDouble());
        refuse(written, what + ": an object is no value of a property");
    }

    std::string _text;
    const Class_Catalogue& _catalogue;
    Server_Store& _store;
};

} // namespace

bool read_server_instances(const std::string& file, const Class_Catalogue& catalogue, Server_Store& store,
                           std::string& error)
{
    std::ifstream stream(file, std::ios::binary);
    std::ostringstream text;
    if (!stream || (!(text << stream.rdbuf()) && stream.bad())) {
        error = file + ": cannot be read: " + std::generic_category().message(errno);
        return false;
    }
    try {
        Reader(text.str(), catalogue, store).read();
        return true;
    } catch (const Refused& refused) {
        error = file + ":" + std::to_string(refused.line) + ": " + refused.what();
        return false;
    }
}

} // namespace KPRV::kldrcim

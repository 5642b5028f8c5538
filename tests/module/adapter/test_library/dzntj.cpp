// An adapter library whose entry points answer with their own names, so that a test can tell which one a
// variable holds. The ones that matter at start follow a script.

#include "tests/module/adapter/test_library/dzntj.h"

#include "module/adapter/CIMProviderZntj.h"

#include <json/reader.h>

#include <cstdio>
#include <memory>

#define EXPORTED extern "C" __attribute__((visibility("default")))

namespace {

Dzntj_Script script;

Json::Value named(const char* name, const Json::Value& request)
{
    if (std::string_view(name) != "init_hba_lib")
        return name;
    snprintf(script.init_request, sizeof script.init_request, "%s", request.toStyledString().c_str());
    Json::Value answer;
    const std::unique_ptr<Json::CharReader> reader(Json::CharReaderBuilder().newCharReader());
    const std::string_view text = script.init_answer;
    reader->parse(text.data(), text.data() + text.size(), &answer, nullptr);
    return answer;
}

} // namespace

EXPORTED Dzntj_Script* dzntj_script();
Dzntj_Script* dzntj_script()
{
    return &script;
}

// clang-format off
#define SIGNATURE_JsonReqFP(symbol)             Json::Value symbol(const Json::Value& request) { return named(#symbol, request); }
#define SIGNATURE_voidRetStrFP(symbol)          const char* symbol() { return script.version; }
#define SIGNATURE_voidRetUIntFP(symbol)         KPRV::uint32 symbol() { return script.adapters; }
#define SIGNATURE_voidRetIntFP(symbol)          KPRV::sint32 symbol() { script.goodbyes++; return 77; }
#define SIGNATURE_evtProcessCBRetVoidFP(symbol) void symbol(KPRV::evtProcessCB) {}
#define SIGNATURE_log4cxxMsgRetVoidFP(symbol)   void symbol(KPRV::log4cxxMsgCB) { script.log_callbacks++; }
// clang-format on

#define ENTRY_POINT(symbol, variable, signature) EXPORTED SIGNATURE_##signature(symbol)
#include "contracts/adapter/Entry_Points.def"

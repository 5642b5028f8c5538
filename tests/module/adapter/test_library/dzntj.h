#pragma once

/// What the library of the tests answers at start, and what it was told; reached through `dzntj_script`.
struct Dzntj_Script
{
    const char* version = "3.2.1";
    /// JSON.
    const char* init_answer = "{\"result\": 0}";
    unsigned adapters = 2;

    char init_request[64] = "";
    int log_callbacks = 0;
    int goodbyes = 0;
};

#pragma once

/* What a test can tell the simulated adapter library, beside its entry points. The functions are
 * exported by libdzntj.so; find them with dlsym, or use Simulator_Control.h, which does.
 *
 * A function that can refuse returns a null pointer when it has done what was asked, and otherwise
 * the reason, "NAME:LINE: REASON". Every text that is returned belongs to the library and is valid
 * until the same thread calls the next of these functions. All may be called from any thread. */

#ifdef __cplusplus
extern "C" {
#endif

#define SIMULATOR_EXPORT __attribute__((visibility("default")))

/* Puts an inventory and its faults in place of the present ones; INVENTORY.md tells its shape.
 * `name` is what refusals call the text. After a refusal the host has no adapters and init_hba_lib
 * answers an "error". It stays through free_hba_lib, until simulator_unload. */
SIMULATOR_EXPORT const char* simulator_load_text(const char* name, const char* text);
SIMULATOR_EXPORT const char* simulator_load_file(const char* path);

/* Goes back to the inventory that the environment names, to be read by the next call. */
SIMULATOR_EXPORT void simulator_unload(void);

/* Adds a fault, in JSON; INVENTORY.md tells its shape. To clear the faults releases whom they hold. */
SIMULATOR_EXPORT const char* simulator_add_fault(const char* json);
SIMULATOR_EXPORT void simulator_clear_faults(void);

/* Lets every recorded call go that a "hold" fault holds. */
SIMULATOR_EXPORT void simulator_release(void);

/* Waits until `count` calls of the entry point are recorded; 0 if that takes too long. A call that
 * a fault holds or delays is recorded before it waits. */
SIMULATOR_EXPORT int simulator_wait_for_calls(const char* symbol, unsigned count, unsigned milliseconds);

/* The calls of entry points in order, oldest first: a JSON array of {"call", "request"}. A callback
 * registration has the request {"callback": true}, or false for a null pointer. The latest 65,536
 * are kept, or as many as simulator_keep_calls has said, at least one. */
SIMULATOR_EXPORT const char* simulator_calls(void);
SIMULATOR_EXPORT void simulator_clear_calls(void);
SIMULATOR_EXPORT void simulator_keep_calls(unsigned most);

/* A JSON object: "initialised", "wantsEvents", "logCallback", "eventCallback" (booleans) and
 * "problem", the reason why the inventory was refused, or "". */
SIMULATOR_EXPORT const char* simulator_status(void);

/* Calls the registered callback on this thread; 0 if there is none. Events also need a caller that
 * has called register_for_events. */
SIMULATOR_EXPORT int simulator_log(int level, const char* file, int line, const char* text);
SIMULATOR_EXPORT int simulator_event(const char* text);

/* Makes an event occur: the library's own thread tells it, now or as soon as somebody wants events. */
SIMULATOR_EXPORT void simulator_queue_event(const char* text);

#ifdef __cplusplus
}
#endif

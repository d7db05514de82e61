extern "C" int function_of_no_library();

// Called only when this is, so that a lazy loader would not miss it.
extern "C" __attribute__((visibility("default"))) int get_relocated_dir() {
    return function_of_no_library();
}

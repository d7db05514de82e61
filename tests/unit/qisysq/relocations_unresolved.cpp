extern "C" int function_of_no_library();

// Lazy binding would not notice that the function is missing, because it is called only here.
extern "C" __attribute__((visibility("default"))) int get_relocated_dir() {
    return function_of_no_library();
}

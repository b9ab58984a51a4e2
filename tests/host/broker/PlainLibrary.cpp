// A library that is no provider.
extern "C" [[gnu::visibility("default")]] int plainNumber();
int plainNumber() {
    return 4;
}

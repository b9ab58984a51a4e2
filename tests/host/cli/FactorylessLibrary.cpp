// A shared library that is no provider.
extern "C" [[gnu::visibility("default")]] int nothingToSeeHere() {
    return 0;
}

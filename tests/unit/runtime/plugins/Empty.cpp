// A shared library that is no driver.
extern "C" int nothingToSeeHere();
extern "C" int nothingToSeeHere() {
    return 0;
}

// A library in the plug-in directory that lacks the registration entry.
extern "C" int HyracliTestNotAnEntry() { return 0; }

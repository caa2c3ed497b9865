// A program for the sake of its precompiled headers, which the test programs take over; see tests/CMakeLists.txt.
int main() {}

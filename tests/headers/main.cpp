// Stands for the headers that all test programs have compiled once; see this folder's CMakeLists.txt.
int main() {}

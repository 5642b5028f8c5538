// The program of which only the precompiled headers matter, which all tests share.
int main() {}

// Placeholder entry until the application object lands.
int main() { return 0; }

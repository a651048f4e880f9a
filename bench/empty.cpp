// What every static program costs.
int main() {}

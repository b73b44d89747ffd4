/* A host in C needs nothing more. */
void use_language(void);

void use_language(void) {}

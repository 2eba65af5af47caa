// Stands in for the header of another library that has the truth values as macros.
#define FALSE (0)
#define TRUE (!FALSE)

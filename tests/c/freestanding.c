/* The example as a program of another compiler, without any C library: the entry point is its own.
   It changes in.dcm to out.dcm in the current folder, then out.dcm to out_wide.dcm by wide paths.
 */
#include "scale.h"

#include "dcm_c.h"

/* The compiler refers to it where a program computes with floating-point numbers. */
int _fltused = 1;

__declspec(dllimport) void __stdcall ExitProcess(unsigned int code);

static double numbers[1024];

static void say_nothing(const char* text, size_t length)
{
    (void)text;
    (void)length;
}

static double* room(size_t count)
{
    return count <= sizeof numbers / sizeof *numbers ? numbers : NULL;
}

static dcm_result copy_by_wide_paths(void)
{
    dcm_document* document;
    dcm_result result = dcm_document_new(&document);
    if (result != DCM_OK)
        return result;
    result = dcm_document_open_wide(document, L"out.dcm");
    if (result == DCM_OK)
        result = dcm_document_save_wide(document, L"out_wide.dcm");
    dcm_document_free(document);
    return result;
}

void start(void)
{
    const surroundings system = {say_nothing, room};
    int result = scale(&system, "in.dcm", "out.dcm", "EngSpd_nLim_C", 2.0);
    if (result == 0)
        result = copy_by_wide_paths();
    ExitProcess((unsigned int)result);
}

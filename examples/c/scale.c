/* Reads a file, changes a parameter and writes the file again. This part of the example calls the C
   interface alone, so that it compiles for systems without a C library too. */
#include "scale.h"

#include "dcm_c.h"

static void say(const surroundings* system, const char* text)
{
    size_t length = 0;
    while (text[length] != '\0')
        ++length;
    system->say(text, length);
}

/* Shows a name with its unit. What is too long for the buffer is left out. */
static void show_parameter(const surroundings* system, const dcm_parameter* parameter)
{
    char text[256];
    size_t length;
    if (dcm_parameter_get_text(parameter, DCM_NAME, text, sizeof text, &length) == DCM_OK)
        system->say(text, length);
    if (dcm_parameter_get_text(parameter, DCM_UNIT, text, sizeof text, &length) == DCM_OK &&
        length != 0) {
        say(system, " [");
        system->say(text, length);
        say(system, "]");
    }
    say(system, "\n");
}

static void show_findings(const surroundings* system, const dcm_document* document)
{
    char message[2048];
    size_t count = 0, length;
    dcm_document_finding_count(document, &count);
    for (size_t i = 0; i < count; ++i) {
        if (dcm_document_finding_text(document, i, DCM_FINDING_MESSAGE, message, sizeof message,
                                      &length) == DCM_OK) {
            system->say(message, length);
            say(system, "\n");
        }
    }
}

static dcm_result scale_values(const surroundings* system, dcm_parameter* parameter, double factor)
{
    size_t count;
    double* values;
    dcm_result result = dcm_parameter_count(parameter, DCM_VALUES, &count);
    if (result != DCM_OK)
        return result;
    values = system->room(count);
    if (values == NULL)
        return DCM_ERROR_MEMORY;
    result = dcm_parameter_get_numbers(parameter, DCM_VALUES, values, count, &count);
    if (result != DCM_OK)
        return result;
    for (size_t i = 0; i < count; ++i)
        values[i] *= factor;
    return dcm_parameter_set_numbers(parameter, DCM_VALUES, values, count);
}

static dcm_result scale_file(const surroundings* system, dcm_document* document, const char* in,
                             const char* out, const char* name, double factor)
{
    dcm_parameter* parameter;
    size_t count;
    dcm_result result = dcm_document_open(document, in);
    show_findings(system, document);
    if (result != DCM_OK)
        return result;
    result = dcm_document_parameter_count(document, &count);
    if (result != DCM_OK)
        return result;
    for (size_t i = 0; i < count; ++i) {
        result = dcm_document_parameter(document, i, &parameter);
        if (result != DCM_OK)
            return result;
        show_parameter(system, parameter);
    }
    result = dcm_document_find(document, name, DCM_TERMINATED, NULL, &parameter);
    if (result != DCM_OK)
        return result;
    result = scale_values(system, parameter, factor);
    return result == DCM_OK ? dcm_document_save(document, out) : result;
}

int scale(const surroundings* system, const char* in, const char* out, const char* name,
          double factor)
{
    dcm_document* document;
    dcm_result result = dcm_set_code_page(1252);
    if (result == DCM_OK)
        result = dcm_document_new(&document);
    if (result == DCM_OK) {
        result = scale_file(system, document, in, out, name, factor);
        dcm_document_free(document);
    }
    if (result != DCM_OK) {
        say(system, dcm_last_error());
        say(system, "\n");
    }
    return result == DCM_OK ? 0 : 1;
}

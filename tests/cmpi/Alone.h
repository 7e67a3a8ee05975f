/* What must hold after any single header was included. */

#if defined(_CMPIDT_H_)

#if defined(CMPI_NO_SYNONYM_SUPPORT) == defined(CMPI_Long)
#error "the old type names must be there unless they are switched off"
#endif

#if defined(CMPI_VER_200) != (CMPI_VERSION >= 200) || !defined(CMPI_VER_100)
#error "the version gates must follow CMPI_VERSION"
#endif

#endif

/* ISO C wants a declaration in every translation unit. */
typedef int CmpiHeaderIsUsableAlone;

/*
 * CMPI 2.0: data types.
 *
 * Everything that crosses the line between a broker and a provider is made of these
 * types. Layout and values are fixed by the standard and must never change: providers
 * and brokers built years apart meet at run time.
 */
#ifndef _CMPIDT_H_
#define _CMPIDT_H_

#include "cmpipl.h"

#include "cmpios.h"

#ifdef __cplusplus
extern "C" {
#endif

/* ---- Version ----------------------------------------------------------------------- */

#define CMPIVersion100 100
#define CMPIVersion200 200

/* The interface version that the including project wants. */
#ifndef CMPI_VERSION
#define CMPI_VERSION CMPIVersion200
#endif

#if CMPI_VERSION != CMPIVersion100 && CMPI_VERSION != CMPIVersion200
#error "CMPI_VERSION must be 100 or 200."
#endif

/* Gates that sources test with #ifdef. The tables below are those of 2.0 in any case:
   slots are only ever appended, so a table of 1.0 is a prefix of them. */
#define CMPI_VER_80 1
#define CMPI_VER_85 1
#define CMPI_VER_86 1
#define CMPI_VER_87 1
#define CMPI_VER_90 1
#define CMPI_VER_100 1
#if CMPI_VERSION >= CMPIVersion200
#define CMPI_VER_200 1
#endif

/* The version of this set, as written into ftVersion and miVersion. */
#define CMPICurrentVersion CMPIVersion200

typedef int CMPIVersion;

/* ---- Objects and their tables --------------------------------------------------------
   An object is a handle and a table; the structs follow in cmpift.h. */

typedef struct _CMPIBroker CMPIBroker;
typedef struct _CMPIBrokerFT CMPIBrokerFT;
typedef struct _CMPIBrokerEncFT CMPIBrokerEncFT;
typedef struct _CMPIBrokerExtFT CMPIBrokerExtFT;
typedef struct _CMPIBrokerMemFT CMPIBrokerMemFT;

typedef struct _CMPIContext CMPIContext;
typedef struct _CMPIContextFT CMPIContextFT;
typedef struct _CMPIResult CMPIResult;
typedef struct _CMPIResultFT CMPIResultFT;
typedef struct _CMPIString CMPIString;
typedef struct _CMPIStringFT CMPIStringFT;
typedef struct _CMPIArray CMPIArray;
typedef struct _CMPIArrayFT CMPIArrayFT;
typedef struct _CMPIEnumeration CMPIEnumeration;
typedef struct _CMPIEnumerationFT CMPIEnumerationFT;
typedef struct _CMPIInstance CMPIInstance;
typedef struct _CMPIInstanceFT CMPIInstanceFT;
typedef struct _CMPIObjectPath CMPIObjectPath;
typedef struct _CMPIObjectPathFT CMPIObjectPathFT;
typedef struct _CMPIArgs CMPIArgs;
typedef struct _CMPIArgsFT CMPIArgsFT;
typedef struct _CMPIDateTime CMPIDateTime;
typedef struct _CMPIDateTimeFT CMPIDateTimeFT;
typedef struct _CMPISelectExp CMPISelectExp;
typedef struct _CMPISelectExpFT CMPISelectExpFT;
typedef struct _CMPISelectCond CMPISelectCond;
typedef struct _CMPISelectCondFT CMPISelectCondFT;
typedef struct _CMPISubCond CMPISubCond;
typedef struct _CMPISubCondFT CMPISubCondFT;
typedef struct _CMPIPredicate CMPIPredicate;
typedef struct _CMPIPredicateFT CMPIPredicateFT;
typedef struct _CMPIError CMPIError;
typedef struct _CMPIErrorFT CMPIErrorFT;

typedef struct _CMPIInstanceMI CMPIInstanceMI;
typedef struct _CMPIInstanceMIFT CMPIInstanceMIFT;
typedef struct _CMPIAssociationMI CMPIAssociationMI;
typedef struct _CMPIAssociationMIFT CMPIAssociationMIFT;
typedef struct _CMPIMethodMI CMPIMethodMI;
typedef struct _CMPIMethodMIFT CMPIMethodMIFT;
typedef struct _CMPIPropertyMI CMPIPropertyMI;
typedef struct _CMPIPropertyMIFT CMPIPropertyMIFT;
typedef struct _CMPIIndicationMI CMPIIndicationMI;
typedef struct _CMPIIndicationMIFT CMPIIndicationMIFT;

/* ---- Scalars ------------------------------------------------------------------------- */

typedef unsigned char CMPIBoolean; /* 0 is false, anything else is true */
typedef unsigned short CMPIChar16;
typedef unsigned char CMPIUint8;
typedef unsigned short CMPIUint16;
typedef unsigned int CMPIUint32;
typedef unsigned long long CMPIUint64;
typedef signed char CMPISint8;
typedef short CMPISint16;
typedef int CMPISint32;
typedef long long CMPISint64;
typedef float CMPIReal32;
typedef double CMPIReal64;

typedef unsigned int CMPICount;
typedef unsigned short CMPIType;       /* one of the type codes below */
typedef unsigned short CMPIValueState; /* the state bits below */
typedef unsigned int CMPIFlags;        /* the CMPI_FLAG_ bits below */

typedef void* CMPIMsgFileHandle;
typedef void CMPIGcStat;

typedef void* (*CMPIThreadFunc)(void*);
typedef void (*CMPIThreadOnceFunc)(void);
typedef void (*CMPIThreadKeyCleanupFunc)(void*);

/* ---- Values -------------------------------------------------------------------------- */

/* A block of memory; only context entries carry one. */
typedef struct _CMPIValuePtr {
    void* ptr;
    CMPICount length;
} CMPIValuePtr;

/* One value; which member is valid is said by the CMPIType beside it. */
typedef union _CMPIValue {
    CMPIUint64 uint64;
    CMPIUint32 uint32;
    CMPIUint16 uint16;
    CMPIUint8 uint8;
    CMPISint64 sint64;
    CMPISint32 sint32;
    CMPISint16 sint16;
    CMPISint8 sint8;
    CMPIReal64 real64;
    CMPIReal32 real32;
    CMPIBoolean boolean;
    CMPIChar16 char16;

    CMPIInstance* inst;
    CMPIObjectPath* ref;
    CMPIArgs* args;
    CMPISelectExp* filter;
    CMPIEnumeration* Enum;
    CMPIArray* array;
    CMPIString* string;
    char* chars; /* brokers take the text itself as value pointer, see CMPI_chars */
    CMPIDateTime* dateTime;
    CMPIValuePtr dataPtr;

    /* old names */
    CMPISint8 Byte;
    CMPISint16 Short;
    CMPISint32 Int;
    CMPISint64 Long;
    CMPIReal32 Float;
    CMPIReal64 Double;
} CMPIValue;

/* A value with its type and state. The value is undefined when the state has
   CMPI_nullValue or CMPI_badValue; the type too when it has CMPI_badValue. */
typedef struct _CMPIData {
    CMPIType type;
    CMPIValueState state;
    CMPIValue value;
} CMPIData;

/* Answers a property's value while a query is evaluated without an instance. */
typedef CMPIData CMPIAccessor(const char* propertyName, void* parm);

/* State bits. */
#define CMPI_goodValue 0x0000
#define CMPI_nullValue 0x0100
#define CMPI_keyValue 0x0200
#define CMPI_notFound 0x0400
#define CMPI_badValue 0x8000

/* ---- Type codes ---------------------------------------------------------------------- */

#define CMPI_null 0x0000

#define CMPI_SIMPLE 0x0002
#define CMPI_boolean 0x0002
#define CMPI_char16 0x0003

#define CMPI_REAL 0x0008
#define CMPI_real32 0x0008
#define CMPI_real64 0x000C

/* The bits of these masks overlap: tell integers apart by their exact codes. */
#define CMPI_UINT 0x0080
#define CMPI_SINT 0x00C0
#define CMPI_INTEGER 0x00C0
#define CMPI_uint8 0x0080
#define CMPI_uint16 0x0090
#define CMPI_uint32 0x00A0
#define CMPI_uint64 0x00B0
#define CMPI_sint8 0x00C0
#define CMPI_sint16 0x00D0
#define CMPI_sint32 0x00E0
#define CMPI_sint64 0x00F0

#define CMPI_ENC 0x1000
#define CMPI_instance 0x1000
#define CMPI_ref 0x1100
#define CMPI_args 0x1200
#define CMPI_class 0x1300
#define CMPI_filter 0x1400
#define CMPI_enumeration 0x1500
#define CMPI_string 0x1600
/* A zero-terminated text. In the value and type pairs of the tables the char* itself is
   passed as the CMPIValue*; the broker copies it and stores a CMPI_string. */
#define CMPI_chars 0x1700
#define CMPI_dateTime 0x1800
#define CMPI_ptr 0x1900
#define CMPI_charsptr 0x1A00

#define CMPI_ARRAY 0x2000
#define CMPI_SIMPLEA (CMPI_ARRAY | CMPI_SIMPLE)
#define CMPI_booleanA (CMPI_ARRAY | CMPI_boolean)
#define CMPI_char16A (CMPI_ARRAY | CMPI_char16)
#define CMPI_REALA (CMPI_ARRAY | CMPI_REAL)
#define CMPI_real32A (CMPI_ARRAY | CMPI_real32)
#define CMPI_real64A (CMPI_ARRAY | CMPI_real64)
#define CMPI_UINTA (CMPI_ARRAY | CMPI_UINT)
#define CMPI_SINTA (CMPI_ARRAY | CMPI_SINT)
#define CMPI_INTEGERA (CMPI_ARRAY | CMPI_INTEGER)
#define CMPI_uint8A (CMPI_ARRAY | CMPI_uint8)
#define CMPI_uint16A (CMPI_ARRAY | CMPI_uint16)
#define CMPI_uint32A (CMPI_ARRAY | CMPI_uint32)
#define CMPI_uint64A (CMPI_ARRAY | CMPI_uint64)
#define CMPI_sint8A (CMPI_ARRAY | CMPI_sint8)
#define CMPI_sint16A (CMPI_ARRAY | CMPI_sint16)
#define CMPI_sint32A (CMPI_ARRAY | CMPI_sint32)
#define CMPI_sint64A (CMPI_ARRAY | CMPI_sint64)
#define CMPI_ENCA (CMPI_ARRAY | CMPI_ENC)
#define CMPI_instanceA (CMPI_ARRAY | CMPI_instance)
#define CMPI_refA (CMPI_ARRAY | CMPI_ref)
#define CMPI_stringA (CMPI_ARRAY | CMPI_string)
#define CMPI_charsA (CMPI_ARRAY | CMPI_chars)
#define CMPI_dateTimeA (CMPI_ARRAY | CMPI_dateTime)
#define CMPI_charsptrA (CMPI_ARRAY | CMPI_charsptr)

/* Types of keys whose exact type the broker does not know. */
#define CMPI_keyInteger CMPI_sint64
#define CMPI_keyString CMPI_string
#define CMPI_keyBoolean CMPI_boolean
#define CMPI_keyRef CMPI_ref

/* Types of the two sides of a predicate; some codes are shared. */
#define CMPI_charString CMPI_string
#define CMPI_integerString (CMPI_string | CMPI_sint64)
#define CMPI_realString (CMPI_string | CMPI_real64)
#define CMPI_numericString (CMPI_string | CMPI_sint64 | CMPI_real64)
#define CMPI_booleanString (CMPI_string | CMPI_boolean)
#define CMPI_dateTimeString (CMPI_string | CMPI_dateTime)
#define CMPI_classNameString (CMPI_string | 0x0100)
#define CMPI_nameString (CMPI_string | 0x0800)

#ifndef CMPI_NO_SYNONYM_SUPPORT
#define CMPI_Byte CMPI_sint8
#define CMPI_Short CMPI_sint16
#define CMPI_Int CMPI_sint32
#define CMPI_Long CMPI_sint64
#define CMPI_Float CMPI_real32
#define CMPI_Double CMPI_real64
#define CMPI_ByteA CMPI_sint8A
#define CMPI_ShortA CMPI_sint16A
#define CMPI_IntA CMPI_sint32A
#define CMPI_LongA CMPI_sint64A
#define CMPI_FloatA CMPI_real32A
#define CMPI_DoubleA CMPI_real64A
#endif

/* ---- Status -------------------------------------------------------------------------- */

/* 1 to 17 are the status codes of CIM operations. */
typedef enum _CMPIrc {
    CMPI_RC_OK = 0,
    CMPI_RC_ERR_FAILED = 1,
    CMPI_RC_ERR_ACCESS_DENIED = 2,
    CMPI_RC_ERR_INVALID_NAMESPACE = 3,
    CMPI_RC_ERR_INVALID_PARAMETER = 4,
    CMPI_RC_ERR_INVALID_CLASS = 5,
    CMPI_RC_ERR_NOT_FOUND = 6,
    CMPI_RC_ERR_NOT_SUPPORTED = 7,
    CMPI_RC_ERR_CLASS_HAS_CHILDREN = 8,
    CMPI_RC_ERR_CLASS_HAS_INSTANCES = 9,
    CMPI_RC_ERR_INVALID_SUPERCLASS = 10,
    CMPI_RC_ERR_ALREADY_EXISTS = 11,
    CMPI_RC_ERR_NO_SUCH_PROPERTY = 12,
    CMPI_RC_ERR_TYPE_MISMATCH = 13,
    CMPI_RC_ERR_QUERY_LANGUAGE_NOT_SUPPORTED = 14,
    CMPI_RC_ERR_INVALID_QUERY = 15,
    CMPI_RC_ERR_METHOD_NOT_AVAILABLE = 16,
    CMPI_RC_ERR_METHOD_NOT_FOUND = 17,
    CMPI_RC_NO_MORE_ELEMENTS = 18, /* getNext past the end */
    CMPI_RC_ERR_SERVER_LIMITS_EXCEEDED = 27,
    CMPI_RC_ERR_QUERY_FEATURE_NOT_SUPPORTED = 29,
    CMPI_RC_DO_NOT_UNLOAD = 50, /* from cleanup: ask again later */
    CMPI_RC_NEVER_UNLOAD = 51,  /* from cleanup: ask only at shutdown */
    CMPI_RC_ERR_INVALID_HANDLE = 60,
    CMPI_RC_ERR_INVALID_DATA_TYPE = 61,
    CMPI_RC_ERR_NOT_IN_CODEPAGE = 62,
    CMPI_RC_ERROR_SYSTEM = 100,
    CMPI_RC_ERROR = 200
} CMPIrc;

/* The outcome of a call; msg may be NULL and belongs to the broker. */
typedef struct _CMPIStatus {
    CMPIrc rc;
    CMPIString* msg;
} CMPIStatus;

/* ---- Request flags and context entries ----------------------------------------------- */

#define CMPI_FLAG_LocalOnly 1
#define CMPI_FLAG_DeepInheritance 2
#define CMPI_FLAG_IncludeQualifiers 4
#define CMPI_FLAG_IncludeClassOrigin 8

#define CMPIInitNameSpace "CMPIInitNameSpace"     /* string, while a factory runs */
#define CMPIInvocationFlags "CMPIInvocationFlags" /* uint32, CMPI_FLAG_ bits */
#define CMPIPrincipal "CMPIPrincipal"             /* string, the caller */
#define CMPIRole "CMPIRole"                       /* string, "" if there is none */
#define CMPIAcceptLanguage "CMPIAcceptLanguage"   /* string, as the HTTP header */
#define CMPIContentLanguage "CMPIContentLanguage" /* string, as the HTTP header */

/* ---- What a broker offers ------------------------------------------------------------
   Each code includes the bits of what it builds upon. */

#define CMPI_MB_BasicRead 0x00000001
#define CMPI_MB_BasicWrite 0x00000003
#define CMPI_MB_InstanceManipulation 0x00000007
#define CMPI_MB_AssociationTraversal 0x00000009
#define CMPI_MB_QueryExecution 0x00000011
#define CMPI_MB_QueryNormalization 0x00000031
#define CMPI_MB_BasicQualifierSupport 0x00000047
#define CMPI_MB_Indications 0x00000081
#define CMPI_MB_OSEncapsulationSupport 0x00000100
#define CMPI_MB_Supports_MemEnhancements 0x00004000
#define CMPI_MB_Supports_Extended_Error 0x00008000

#define CMPI_MB_Class_0 CMPI_MB_BasicRead
#define CMPI_MB_Class_1 CMPI_MB_BasicWrite
#define CMPI_MB_Class_2 CMPI_MB_InstanceManipulation

/* ---- Queries, logging ---------------------------------------------------------------- */

typedef enum _CMPIPredOp {
    CMPI_PredOp_Equals = 1,
    CMPI_PredOp_NotEquals = 2,
    CMPI_PredOp_LessThan = 3,
    CMPI_PredOp_GreaterThanOrEquals = 4,
    CMPI_PredOp_GreaterThan = 5,
    CMPI_PredOp_LessThanOrEquals = 6,
    CMPI_PredOp_Isa = 7,
    CMPI_PredOp_NotIsa = 8,
    CMPI_PredOp_Like = 9,
    CMPI_PredOp_NotLike = 10,
    CMPI_PredOp_Not_Null = 11,
    CMPI_PredOp_Null = 12,
    CMPI_PredOp_And = 13,
    CMPI_PredOp_Or = 14
} CMPIPredOp;

typedef enum _CMPISelectCondType { CMPI_COND_DOC = 0, CMPI_COND_COD = 1 } CMPISelectCondType;

typedef enum _CMPISeverity {
    CMPI_SEV_ERROR = 1,
    CMPI_SEV_INFO = 2,
    CMPI_SEV_WARNING = 3,
    CMPI_DEV_DEBUG = 4 /* the odd prefix is the standard's */
} CMPISeverity;

typedef enum _CMPILevel { CMPI_LEV_INFO = 1, CMPI_LEV_WARNING = 2, CMPI_LEV_VERBOSE = 3 } CMPILevel;

/* ---- Error objects ------------------------------------------------------------------- */

typedef enum _CMPIErrorType {
    UnknownErrorType = 0,
    OtherErrorType = 1,
    CommunicationsError = 2,
    QualityOfServiceError = 3,
    SoftwareError = 4,
    HardwareError = 5,
    EnvironmentalError = 6,
    SecurityError = 7,
    OversubscriptionError = 8,
    Oversubscription_Error = OversubscriptionError, /* its name in older headers */
    UnavailableResourceError = 9,
    UnsupportedOperationError = 10
} CMPIErrorType;

typedef enum _CMPIErrorSeverity {
    ErrorSevUnknown = 0,
    ErrorSevLow = 2,
    ErrorSevMedium = 3,
    ErrorSevHigh = 4,
    ErrorSevFatal = 5
} CMPIErrorSeverity;

typedef enum _CMPIErrorSrcFormat {
    CMPIErrSrcUnknown = 0,
    CMPIErrSrcOther = 1,
    CIMObjectHandle = 2
} CMPIErrorSrcFormat;

typedef enum _CMPIErrorProbableCause {
    ErrorProbCauseUnknown = 0,
    ErrorProbCauseOther,
    Adapter_Card_Error,
    Application_Subsystem_Failure,
    Bandwidth_Reduced,
    Connection_Establishment_Error,
    Communications_Protocol_Error,
    Communications_Subsystem_Failure,
    ConfigurationCustomization_Error,
    Congestion,
    Corrupt_Data = 10,
    CPU_Cycles_Limit_Exceeded,
    DatasetModem_Error,
    Degraded_Signal,
    DTE_DCE_Interface_Error,
    Enclosure_Door_Open,
    Equipment_Malfunction,
    Excessive_Vibration,
    File_Format_Error,
    Fire_Detected,
    Flood_Detected = 20,
    Framing_Error,
    HVAC_Problem,
    Humidity_Unacceptable,
    IO_Device_Error,
    Input_Device_Error,
    LAN_Error,
    Non_Toxic_Leak_Detected,
    Local_Node_Transmission_Error,
    Loss_of_Frame,
    Loss_of_Signal = 30,
    Material_Supply_Exhausted,
    Multiplexer_Problem,
    Out_of_Memory,
    Output_Device_Error,
    Performance_Degraded,
    Power_Problem,
    Pressure_Unacceptable,
    Processor_Problem,
    Pump_Failure,
    Queue_Size_Exceeded = 40,
    Receive_Failure,
    Receiver_Failure,
    Remote_Node_Transmission_Error,
    Resource_at_or_Nearing_Capacity,
    Response_Time_Excessive,
    Retransmission_Rate_Excessive,
    Software_Error,
    Software_Program_Abnormally_Terminated,
    Software_Program_Error,
    Storage_Capacity_Problem = 50,
    Temperature_Unacceptable,
    Threshold_Crossed,
    Timing_Problem,
    Toxic_Leak_Detected,
    Transmit_Failure,
    Transmitter_Failure,
    Underlying_Resource_Unavailable,
    Version_Mismatch,
    Previous_Alert_Cleared,
    Login_Attempts_Failed = 60,
    Software_Virus_Detected,
    Hardware_Security_Breached,
    Denial_of_Service_Detected,
    Security_Credential_Mismatch,
    Unauthorized_Access,
    Alarm_Received,
    Loss_of_Pointer,
    Payload_Mismatch,
    Transmission_Error,
    Excessive_Error_Rate = 70,
    Trace_Problem,
    Element_Unavailable,
    Element_Missing,
    Loss_of_Multi_Frame,
    Broadcast_Channel_Failure,
    Invalid_Message_Received,
    Routing_Failure,
    Backplane_Failure,
    Identifier_Duplication,
    Protection_Path_Failure = 80,
    Sync_Loss_or_Mismatch,
    Terminal_Problem,
    Real_Time_Clock_Failure,
    Antenna_Failure,
    Battery_Charging_Failure,
    Disk_Failure,
    Frequency_Hopping_Failure,
    Loss_of_Redundancy,
    Power_Supply_Failure,
    Signal_Quality_Problem = 90,
    Battery_Discharging,
    Battery_Failure,
    Commercial_Power_Problem,
    Fan_Failure,
    Engine_Failure,
    Sensor_Failure,
    Fuse_Failure,
    Generator_Failure,
    Low_Battery,
    Low_Fuel = 100,
    Low_Water,
    Explosive_Gas,
    High_Winds,
    Ice_Buildup,
    Smoke,
    Memory_Mismatch,
    Out_of_CPU_Cycles,
    Software_Environment_Problem,
    Software_Download_Failure,
    Element_Reinitialized = 110,
    Timeout,
    Logging_Problems,
    Leak_Detected,
    Leak_Detected_113 = Leak_Detected, /* its name in older headers */
    Protection_Mechanism_Failure,
    Protecting_Resource_Failure,
    Database_Inconsistency,
    Authentication_Failure,
    Breach_of_Confidentiality,
    Cable_Tamper,
    Delayed_Information = 120,
    Duplicate_Information,
    Information_Missing,
    Information_Modification,
    Information_Out_of_Sequence,
    Key_Expired,
    Non_Repudiation_Failure,
    Out_of_Hours_Activity,
    Out_of_Service,
    Procedural_Error,
    Unexpected_Information = 130
} CMPIErrorProbableCause;

#ifdef __cplusplus
}
#endif

#endif /* _CMPIDT_H_ */

// CMPI 2.0 data types: the scalars, constants, enumerations and value unions of the Common Manageability
// Programming Interface, a published standard of The Open Group, in its binary form for x86-64 Linux.
//
// Object managers and providers built apart meet at these declarations: no name, value, size or offset may
// change.
#pragma once

// Scalars.
using CMPICount = unsigned int;
using CMPIBoolean = unsigned char;
using CMPIChar16 = unsigned short;
using CMPIUint8 = unsigned char;
using CMPIUint16 = unsigned short;
using CMPIUint32 = unsigned int;
using CMPIUint64 = unsigned long long;
using CMPISint8 = signed char;
using CMPISint16 = short;
using CMPISint32 = int;
using CMPISint64 = long long;
using CMPIReal32 = float;
using CMPIReal64 = double;
using CMPIType = unsigned short;
using CMPIValueState = unsigned short;
using CMPIMsgFileHandle = void*;
using CMPIGcStat = void;
using CMPIFlags = unsigned int;

// Objects and function tables; <cmpi/cmpift.h> has their layout. The tags are the standard's, reserved names
// though they are: C++ functions that take these types carry the tags in their symbols, and libraries built
// against another copy of the standard's headers must find those symbols.
struct _CMPIBrokerEncFT;
using CMPIBrokerEncFT = _CMPIBrokerEncFT;
struct _CMPIBrokerFT;
using CMPIBrokerFT = _CMPIBrokerFT;
struct _CMPIBrokerExtFT;
using CMPIBrokerExtFT = _CMPIBrokerExtFT;
struct _CMPIBrokerMemFT;
using CMPIBrokerMemFT = _CMPIBrokerMemFT;
struct _CMPIBroker;
using CMPIBroker = _CMPIBroker;
struct _CMPIContextFT;
using CMPIContextFT = _CMPIContextFT;
struct _CMPIContext;
using CMPIContext = _CMPIContext;
struct _CMPIResult;
using CMPIResult = _CMPIResult;
struct _CMPIResultFT;
using CMPIResultFT = _CMPIResultFT;
struct _CMPIError;
using CMPIError = _CMPIError;
struct _CMPIErrorFT;
using CMPIErrorFT = _CMPIErrorFT;
struct _CMPIInstance;
using CMPIInstance = _CMPIInstance;
struct _CMPIInstanceFT;
using CMPIInstanceFT = _CMPIInstanceFT;
struct _CMPIObjectPath;
using CMPIObjectPath = _CMPIObjectPath;
struct _CMPIObjectPathFT;
using CMPIObjectPathFT = _CMPIObjectPathFT;
struct _CMPISelectExp;
using CMPISelectExp = _CMPISelectExp;
struct _CMPISelectExpFT;
using CMPISelectExpFT = _CMPISelectExpFT;
struct _CMPISelectCond;
using CMPISelectCond = _CMPISelectCond;
struct _CMPISelectCondFT;
using CMPISelectCondFT = _CMPISelectCondFT;
struct _CMPISubCond;
using CMPISubCond = _CMPISubCond;
struct _CMPISubCondFT;
using CMPISubCondFT = _CMPISubCondFT;
struct _CMPIPredicate;
using CMPIPredicate = _CMPIPredicate;
struct _CMPIPredicateFT;
using CMPIPredicateFT = _CMPIPredicateFT;
struct _CMPIArgs;
using CMPIArgs = _CMPIArgs;
struct _CMPIArgsFT;
using CMPIArgsFT = _CMPIArgsFT;
struct _CMPIString;
using CMPIString = _CMPIString;
struct _CMPIStringFT;
using CMPIStringFT = _CMPIStringFT;
struct _CMPIArray;
using CMPIArray = _CMPIArray;
struct _CMPIArrayFT;
using CMPIArrayFT = _CMPIArrayFT;
struct _CMPIEnumeration;
using CMPIEnumeration = _CMPIEnumeration;
struct _CMPIEnumerationFT;
using CMPIEnumerationFT = _CMPIEnumerationFT;
struct _CMPIDateTime;
using CMPIDateTime = _CMPIDateTime;
struct _CMPIDateTimeFT;
using CMPIDateTimeFT = _CMPIDateTimeFT;
struct _CMPIInstanceMI;
using CMPIInstanceMI = _CMPIInstanceMI;
struct _CMPIInstanceMIFT;
using CMPIInstanceMIFT = _CMPIInstanceMIFT;
struct _CMPIAssociationMI;
using CMPIAssociationMI = _CMPIAssociationMI;
struct _CMPIAssociationMIFT;
using CMPIAssociationMIFT = _CMPIAssociationMIFT;
struct _CMPIMethodMI;
using CMPIMethodMI = _CMPIMethodMI;
struct _CMPIMethodMIFT;
using CMPIMethodMIFT = _CMPIMethodMIFT;
struct _CMPIPropertyMI;
using CMPIPropertyMI = _CMPIPropertyMI;
struct _CMPIPropertyMIFT;
using CMPIPropertyMIFT = _CMPIPropertyMIFT;
struct _CMPIIndicationMI;
using CMPIIndicationMI = _CMPIIndicationMI;
struct _CMPIIndicationMIFT;
using CMPIIndicationMIFT = _CMPIIndicationMIFT;

// Versions of the interface.
inline constexpr int CMPIVersion100 = 0x64;
inline constexpr int CMPICurrentVersion = 0xc8;
inline constexpr int CMPIVersion200 = 0xc8;

// Value types (CMPIData::type).
inline constexpr CMPIType CMPI_null = 0x0;
inline constexpr CMPIType CMPI_SIMPLE = 0x2;
inline constexpr CMPIType CMPI_boolean = 0x2;
inline constexpr CMPIType CMPI_keyBoolean = 0x2;
inline constexpr CMPIType CMPI_char16 = 0x3;
inline constexpr CMPIType CMPI_Float = 0x8;
inline constexpr CMPIType CMPI_REAL = 0x8;
inline constexpr CMPIType CMPI_real32 = 0x8;
inline constexpr CMPIType CMPI_Double = 0xc;
inline constexpr CMPIType CMPI_real64 = 0xc;
inline constexpr CMPIType CMPI_UINT = 0x80;
inline constexpr CMPIType CMPI_uint8 = 0x80;
inline constexpr CMPIType CMPI_uint16 = 0x90;
inline constexpr CMPIType CMPI_uint32 = 0xa0;
inline constexpr CMPIType CMPI_uint64 = 0xb0;
inline constexpr CMPIType CMPI_Byte = 0xc0;
inline constexpr CMPIType CMPI_INTEGER = 0xc0;
inline constexpr CMPIType CMPI_SINT = 0xc0;
inline constexpr CMPIType CMPI_sint8 = 0xc0;
inline constexpr CMPIType CMPI_Short = 0xd0;
inline constexpr CMPIType CMPI_sint16 = 0xd0;
inline constexpr CMPIType CMPI_Int = 0xe0;
inline constexpr CMPIType CMPI_sint32 = 0xe0;
inline constexpr CMPIType CMPI_Long = 0xf0;
inline constexpr CMPIType CMPI_keyInteger = 0xf0;
inline constexpr CMPIType CMPI_sint64 = 0xf0;
inline constexpr CMPIType CMPI_ENC = 0x1000;
inline constexpr CMPIType CMPI_instance = 0x1000;
inline constexpr CMPIType CMPI_keyRef = 0x1100;
inline constexpr CMPIType CMPI_ref = 0x1100;
inline constexpr CMPIType CMPI_args = 0x1200;
inline constexpr CMPIType CMPI_class = 0x1300;
inline constexpr CMPIType CMPI_filter = 0x1400;
inline constexpr CMPIType CMPI_enumeration = 0x1500;
inline constexpr CMPIType CMPI_charString = 0x1600;
inline constexpr CMPIType CMPI_keyString = 0x1600;
inline constexpr CMPIType CMPI_string = 0x1600;
inline constexpr CMPIType CMPI_booleanString = 0x1602;
inline constexpr CMPIType CMPI_realString = 0x160c;
inline constexpr CMPIType CMPI_integerString = 0x16f0;
inline constexpr CMPIType CMPI_numericString = 0x16fc;
inline constexpr CMPIType CMPI_chars = 0x1700;
inline constexpr CMPIType CMPI_classNameString = 0x1700;
inline constexpr CMPIType CMPI_dateTime = 0x1800;
inline constexpr CMPIType CMPI_ptr = 0x1900;
inline constexpr CMPIType CMPI_charsptr = 0x1a00;
inline constexpr CMPIType CMPI_dateTimeString = 0x1e00;
inline constexpr CMPIType CMPI_nameString = 0x1e00;
inline constexpr CMPIType CMPI_ARRAY = 0x2000;
inline constexpr CMPIType CMPI_SIMPLEA = 0x2002;
inline constexpr CMPIType CMPI_booleanA = 0x2002;
inline constexpr CMPIType CMPI_char16A = 0x2003;
inline constexpr CMPIType CMPI_FloatA = 0x2008;
inline constexpr CMPIType CMPI_REALA = 0x2008;
inline constexpr CMPIType CMPI_real32A = 0x2008;
inline constexpr CMPIType CMPI_DoubleA = 0x200c;
inline constexpr CMPIType CMPI_real64A = 0x200c;
inline constexpr CMPIType CMPI_UINTA = 0x2080;
inline constexpr CMPIType CMPI_uint8A = 0x2080;
inline constexpr CMPIType CMPI_uint16A = 0x2090;
inline constexpr CMPIType CMPI_uint32A = 0x20a0;
inline constexpr CMPIType CMPI_uint64A = 0x20b0;
inline constexpr CMPIType CMPI_ByteA = 0x20c0;
inline constexpr CMPIType CMPI_INTEGERA = 0x20c0;
inline constexpr CMPIType CMPI_SINTA = 0x20c0;
inline constexpr CMPIType CMPI_sint8A = 0x20c0;
inline constexpr CMPIType CMPI_ShortA = 0x20d0;
inline constexpr CMPIType CMPI_sint16A = 0x20d0;
inline constexpr CMPIType CMPI_IntA = 0x20e0;
inline constexpr CMPIType CMPI_sint32A = 0x20e0;
inline constexpr CMPIType CMPI_LongA = 0x20f0;
inline constexpr CMPIType CMPI_sint64A = 0x20f0;
inline constexpr CMPIType CMPI_ENCA = 0x3000;
inline constexpr CMPIType CMPI_instanceA = 0x3000;
inline constexpr CMPIType CMPI_refA = 0x3100;
inline constexpr CMPIType CMPI_stringA = 0x3600;
inline constexpr CMPIType CMPI_charsA = 0x3700;
inline constexpr CMPIType CMPI_dateTimeA = 0x3800;
inline constexpr CMPIType CMPI_charsptrA = 0x3a00;

// Value states (CMPIData::state).
inline constexpr CMPIValueState CMPI_goodValue = 0x0;
inline constexpr CMPIValueState CMPI_nullValue = 0x100;
inline constexpr CMPIValueState CMPI_keyValue = 0x200;
inline constexpr CMPIValueState CMPI_notFound = 0x400;
inline constexpr CMPIValueState CMPI_badValue = 0x8000;

// Invocation flags: bits of the context entry "CMPIInvocationFlags".
inline constexpr CMPIFlags CMPI_FLAG_LocalOnly = 0x1;
inline constexpr CMPIFlags CMPI_FLAG_DeepInheritance = 0x2;
inline constexpr CMPIFlags CMPI_FLAG_IncludeQualifiers = 0x4;
inline constexpr CMPIFlags CMPI_FLAG_IncludeClassOrigin = 0x8;

// Broker capabilities (CMPIBrokerFT::brokerCapabilities).
inline constexpr unsigned int CMPI_MB_BasicRead = 0x1;
inline constexpr unsigned int CMPI_MB_Class_0 = 0x1;
inline constexpr unsigned int CMPI_MB_BasicWrite = 0x3;
inline constexpr unsigned int CMPI_MB_Class_1 = 0x3;
inline constexpr unsigned int CMPI_MB_Class_2 = 0x7;
inline constexpr unsigned int CMPI_MB_InstanceManipulation = 0x7;
inline constexpr unsigned int CMPI_MB_AssociationTraversal = 0x9;
inline constexpr unsigned int CMPI_MB_QueryExecution = 0x11;
inline constexpr unsigned int CMPI_MB_QueryNormalization = 0x31;
inline constexpr unsigned int CMPI_MB_BasicQualifierSupport = 0x47;
inline constexpr unsigned int CMPI_MB_Indications = 0x81;
inline constexpr unsigned int CMPI_MB_OSEncapsulationSupport = 0x100;
inline constexpr unsigned int CMPI_MB_Supports_PropertyMI = 0x100;
inline constexpr unsigned int CMPI_MB_Supports_IndicationMI = 0x200;
inline constexpr unsigned int CMPI_MB_Supports_IndicationPolling = 0x400;
inline constexpr unsigned int CMPI_MB_Supports_QueryNormalization = 0x800;
inline constexpr unsigned int CMPI_MB_Supports_Qualifier = 0x1000;
inline constexpr unsigned int CMPI_MB_Supports_Schema = 0x3000;
inline constexpr unsigned int CMPI_MB_Supports_MemEnhancements = 0x4000;
inline constexpr unsigned int CMPI_MB_Supports_Extended_Error = 0x8000;

// Names of context entries.
inline constexpr const char* CMPIAcceptLanguage = "CMPIAcceptLanguage";
inline constexpr const char* CMPIContentLanguage = "CMPIContentLanguage";
inline constexpr const char* CMPIInitNameSpace = "CMPIInitNameSpace";
inline constexpr const char* CMPIInvocationFlags = "CMPIInvocationFlags";
inline constexpr const char* CMPIPrincipal = "CMPIPrincipal";
inline constexpr const char* CMPIRole = "CMPIRole";

enum CMPIrc : int {
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
  CMPI_RC_DO_NOT_UNLOAD = 50,
  CMPI_RC_NEVER_UNLOAD = 51,
  CMPI_RC_ERR_INVALID_HANDLE = 60,
  CMPI_RC_ERR_INVALID_DATA_TYPE = 61,
  CMPI_RC_ERROR_SYSTEM = 100,
  CMPI_RC_ERROR = 200,
};

enum CMPIPredOp : int {
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
  CMPI_PredOp_Or = 14,
};

enum CMPISeverity : int {
  CMPI_SEV_ERROR = 1,
  CMPI_SEV_INFO = 2,
  CMPI_SEV_WARNING = 3,
  CMPI_DEV_DEBUG = 4,
};

enum CMPILevel : int {
  CMPI_LEV_INFO = 1,
  CMPI_LEV_WARNING = 2,
  CMPI_LEV_VERBOSE = 3,
};

enum CMPISelectCondType : int {
  CMPI_COND_DOC = 0,
  CMPI_COND_COD = 1,
};

enum CMPIErrorType : int {
  UnknownErrorType = 0,
  OtherErrorType = 1,
  CommunicationsError = 2,
  QualityOfServiceError = 3,
  SoftwareError = 4,
  HardwareError = 5,
  EnvironmentalError = 6,
  SecurityError = 7,
  Oversubscription_Error = 8,
  UnavailableResourceError = 9,
  UnsupportedOperationError = 10,
};

enum CMPIErrorSeverity : int {
  ErrorSevUnknown = 0,
  ErrorSevLow = 2,
  ErrorSevMedium = 3,
  ErrorSevHigh = 4,
  ErrorSevFatal = 5,
};

/// Probable cause of an error; carried as a number.
enum CMPIErrorProbableCause : int {};

enum CMPIErrorSrcFormat : int {
  CMPIErrSrcUnknown = 0,
  CMPIErrSrcOther = 1,
  CIMObjectHandle = 2,
};

struct CMPIValuePtr {
  void* ptr;
  CMPICount length;
};

union CMPIValue {
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
  char* chars;
  CMPIDateTime* dateTime;
  CMPIValuePtr dataPtr;
  CMPISint8 Byte;
  CMPISint16 Short;
  CMPISint32 Int;
  CMPISint64 Long;
  CMPIReal32 Float;
  CMPIReal64 Double;
};

struct CMPIData {
  CMPIType type;
  CMPIValueState state;
  CMPIValue value;
};

struct CMPIStatus {
  CMPIrc rc;
  CMPIString* msg;
};

/// Reads a property of the object behind `parm` by name, for the evaluation of a select expression.
using CMPIAccessor = CMPIData(const char*, void*);

#pragma once

#include "platform/hosted/win32.h"

/// Making folders and letting others into them, under the platform's names.
///
/// The host has no access lists of Windows' kind, but every user of it is in the group of users. So a list is, here,
/// what one entry for a group can ask for: whether everybody is let in. Everybody then gets all rights to the folder,
/// and, where the entry is inherited and the host's file system knows default rights, to what is later made in it. On a
/// file system that does not, later files have the rights that their makers give them.

using SECURITY_INFORMATION = DWORD;
using PSID = void*;
using PSECURITY_DESCRIPTOR = void*;
using HLOCAL = void*;

/// An access list, as far as there is one here.
struct ACL {
    BOOL everybody;  // lets everybody do everything
    BOOL inherited;  // what is later made in the folder too
};
using PACL = ACL*;

struct SID_IDENTIFIER_AUTHORITY {
    BYTE Value[6];
};
using PSID_IDENTIFIER_AUTHORITY = SID_IDENTIFIER_AUTHORITY*;

#define SECURITY_NT_AUTHORITY \
    { 0, 0, 0, 0, 0, 5 }

inline constexpr DWORD SECURITY_BUILTIN_DOMAIN_RID = 32;
inline constexpr DWORD DOMAIN_ALIAS_RID_USERS = 545;
inline constexpr DWORD READ_CONTROL = 0x20000;
inline constexpr DWORD WRITE_DAC = 0x40000;
inline constexpr DWORD GENERIC_ALL = 0x10000000;
inline constexpr DWORD OPEN_EXISTING = 3;
inline constexpr DWORD FILE_FLAG_BACKUP_SEMANTICS = 0x2000000;
inline constexpr SECURITY_INFORMATION DACL_SECURITY_INFORMATION = 4;
inline constexpr DWORD SUB_CONTAINERS_AND_OBJECTS_INHERIT = 3;

enum SE_OBJECT_TYPE { SE_UNKNOWN_OBJECT_TYPE = 0, SE_FILE_OBJECT = 1 };
enum ACCESS_MODE { NOT_USED_ACCESS = 0, GRANT_ACCESS = 1 };
enum MULTIPLE_TRUSTEE_OPERATION { NO_MULTIPLE_TRUSTEE = 0 };
enum TRUSTEE_FORM { TRUSTEE_IS_SID = 0 };
enum TRUSTEE_TYPE { TRUSTEE_IS_UNKNOWN = 0, TRUSTEE_IS_GROUP = 2 };

struct TRUSTEE_W {
    TRUSTEE_W* pMultipleTrustee;
    MULTIPLE_TRUSTEE_OPERATION MultipleTrusteeOperation;
    TRUSTEE_FORM TrusteeForm;
    TRUSTEE_TYPE TrusteeType;
    wchar_t* ptstrName;  // the group itself, in the shape of a name
};

struct EXPLICIT_ACCESS_W {
    DWORD grfAccessPermissions;
    ACCESS_MODE grfAccessMode;
    DWORD grfInheritance;
    TRUSTEE_W Trustee;
};
using PEXPLICIT_ACCESS_W = EXPLICIT_ACCESS_W*;

/// `security` is not looked at.
BOOL CreateDirectoryW(const wchar_t* path, LPSECURITY_ATTRIBUTES security);
/// Opens a folder that is there, for its access list; other arguments than those for that fail.
HANDLE CreateFileW(const wchar_t* path, DWORD access, DWORD share, LPSECURITY_ATTRIBUTES security, DWORD disposition,
                   DWORD flags, HANDLE templateFile);

/// Gives the access list of a folder, inside a descriptor that the caller frees with LocalFree(). Owner, group and the
/// list of what is watched are not given.
DWORD GetSecurityInfo(HANDLE folder, SE_OBJECT_TYPE type, SECURITY_INFORMATION wanted, PSID* owner, PSID* group,
                      PACL* list, PACL* watched, PSECURITY_DESCRIPTOR* descriptor);
/// Puts the access list in force.
DWORD SetSecurityInfo(HANDLE folder, SE_OBJECT_TYPE type, SECURITY_INFORMATION given, PSID owner, PSID group, PACL list,
                      PACL watched);
/// A new list, of `list` (may be null) and the entries, that the caller frees with LocalFree(). Only the group of users
/// (authority 5, 32 and 545) can be granted anything, and only everything.
DWORD SetEntriesInAclW(DWORD count, PEXPLICIT_ACCESS_W entries, PACL list, PACL* result);
HLOCAL LocalFree(HLOCAL block);

BOOL AllocateAndInitializeSid(PSID_IDENTIFIER_AUTHORITY authority, BYTE count, DWORD first, DWORD second, DWORD third,
                              DWORD fourth, DWORD fifth, DWORD sixth, DWORD seventh, DWORD eighth, PSID* sid);
PVOID FreeSid(PSID sid);

# The SPDX 2.3 document of scripts/list-parts, from its tables: `files` (owner, name, SHA-1, SHA-256), `parts` (key, name,
# version, licence, package URL, source archive and its SHA-256), `links` (program, part) and `codes` (owner, code).

def rows($text): $text | split("\n") | map(select(. != "") | split("\t"));
def file_id($owner; $index): "SPDXRef-File-\($owner)-\($index)";
def part_id($key): "SPDXRef-Package-\($key)";
def sha256($value): [{algorithm: "SHA256", checksumValue: $value}];

(rows($files) | group_by(.[0]) | map({key: .[0][0], value: .}) | from_entries) as $by_owner
| (rows($codes) | map({key: .[0], value: .[1]}) | from_entries) as $code
| ($by_owner.release | map({key: .[1], value: .[3]}) | from_entries) as $shipped
| ["hvdeploy.exe", "hvinstaller.exe"] as $programs
| {
    spdxVersion: "SPDX-2.3",
    dataLicense: "CC0-1.0",
    SPDXID: "SPDXRef-DOCUMENT",
    name: $name,
    documentNamespace: $namespace,
    creationInfo: {created: $created, creators: ["Organization: Halvorn LLC", "Tool: list-parts-\($version)"]},
    packages: (
        [{
            SPDXID: part_id("release"), name: $name, downloadLocation: "NOASSERTION", supplier: "Organization: Halvorn LLC",
            licenseConcluded: "NOASSERTION", licenseDeclared: "NOASSERTION", copyrightText: "NOASSERTION",
            filesAnalyzed: true, packageVerificationCode: {packageVerificationCodeValue: $code.release}
        }]
        + ($programs | map({
            SPDXID: part_id(.), name: ., versionInfo: $version, packageFileName: ., downloadLocation: "NOASSERTION",
            supplier: "Organization: Halvorn LLC", filesAnalyzed: false, checksums: sha256($shipped[.]),
            licenseConcluded: "MIT", licenseDeclared: "MIT", copyrightText: "NOASSERTION"
        }))
        + (rows($parts) | map({
            SPDXID: part_id(.[0]), name: .[1], versionInfo: .[2], downloadLocation: "NOASSERTION",
            licenseConcluded: .[3], licenseDeclared: .[3], copyrightText: "NOASSERTION",
            filesAnalyzed: true, packageVerificationCode: {packageVerificationCodeValue: $code[.[0]]},
            externalRefs: [{referenceCategory: "PACKAGE-MANAGER", referenceType: "purl", referenceLocator: .[4]}]
        } + (if .[5] == "" then {} else {packageFileName: .[5], checksums: sha256(.[6])} end)))
    ),
    files: [$by_owner | to_entries[] | .key as $owner | .value | to_entries[] | {
        SPDXID: file_id($owner; .key), fileName: "./\(if $owner == "release" then "" else $owner + "/" end)\(.value[1])",
        checksums: [{algorithm: "SHA1", checksumValue: .value[2]}, {algorithm: "SHA256", checksumValue: .value[3]}],
        licenseConcluded: "NOASSERTION", copyrightText: "NOASSERTION"
    }],
    hasExtractedLicensingInfos: [
        {licenseId: "LicenseRef-mingw-w64", name: "mingw-w64 and winpthreads", extractedText: $mingw}
    ],
    relationships: (
        [{spdxElementId: "SPDXRef-DOCUMENT", relationshipType: "DESCRIBES", relatedSpdxElement: part_id("release")}]
        + ($programs | map({
            spdxElementId: part_id("release"), relationshipType: "CONTAINS", relatedSpdxElement: part_id(.)
        }))
        + [$by_owner | to_entries[] | .key as $owner | .value | to_entries[] | {
            spdxElementId: part_id($owner), relationshipType: "CONTAINS", relatedSpdxElement: file_id($owner; .key)
        }]
        + (rows($links) | map({
            spdxElementId: part_id(.[0]), relationshipType: "STATIC_LINK", relatedSpdxElement: part_id(.[1])
        }))
    )
}

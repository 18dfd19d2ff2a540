// BMimeType's questions that look through the whole database.

#include <Message.h>
#include <MimeDatabase.h>
#include <MimeType.h>

#include <algorithm>
#include <vector>

namespace {

// The signatures of the applications that list exactly this type among those they open.
status_t ApplicationsFor(const std::string& type, std::vector<std::string>& signatures) {
    std::vector<std::string> installed;
    if (status_t status = MimeDatabase::List(installed); status != B_OK)
        return status;
    const std::string wanted = FoldedType(type);
    for (const std::string& signature : installed) {
        MimeRecord record(signature);
        BMessage types;
        if (MimeDatabase::Read(signature, record) != B_OK ||
            record.GetList(MimeRecord::List::supportedTypes, types) != B_OK)
            continue;
        const char* supported = nullptr;
        for (int32 i = 0; types.FindString("types", i, &supported) == B_OK; i++) {
            if (FoldedType(supported) == wanted) {
                signatures.push_back(signature);
                break;
            }
        }
    }
    return B_OK;
}

void AddAll(BMessage& message, const char* field, const std::vector<std::string>& texts) {
    for (const std::string& text : texts)
        message.AddString(field, text.c_str());
}

} // namespace

status_t BMimeType::GetSupportingApps(BMessage* signatures) const {
    if (signatures == nullptr)
        return B_BAD_VALUE;
    if (mStatus != B_OK)
        return B_NO_INIT;
    std::vector<std::string> forType;
    std::vector<std::string> forSupertype;
    status_t status = ApplicationsFor(mType, forType);
    BMimeType superType;
    if (status == B_OK && GetSupertype(&superType) == B_OK)
        status = ApplicationsFor(superType.mType, forSupertype);
    if (status != B_OK)
        return status;
    std::erase_if(forSupertype, [&forType](const std::string& signature) {
        return std::find(forType.begin(), forType.end(), signature) != forType.end();
    });
    signatures->MakeEmpty();
    AddAll(*signatures, "applications", forType);
    AddAll(*signatures, "applications", forSupertype);
    signatures->AddInt32("be:sub", static_cast<int32>(forType.size()));
    signatures->AddInt32("be:super", static_cast<int32>(forSupertype.size()));
    return B_OK;
}

status_t BMimeType::GetInstalledSupertypes(BMessage* superTypes) {
    if (superTypes == nullptr)
        return B_BAD_VALUE;
    std::vector<std::string> types;
    if (status_t status = MimeDatabase::List(types); status != B_OK)
        return status;
    for (std::string& type : types)
        type.resize(std::min(type.find('/'), type.size()));
    std::sort(types.begin(), types.end());
    types.erase(std::unique(types.begin(), types.end()), types.end());
    superTypes->MakeEmpty();
    AddAll(*superTypes, "super_types", types);
    return B_OK;
}

status_t BMimeType::GetInstalledTypes(BMessage* types) {
    return GetInstalledTypes(nullptr, types);
}

status_t BMimeType::GetInstalledTypes(const char* superType, BMessage* types) {
    if (types == nullptr)
        return B_BAD_VALUE;
    std::string prefix;
    if (superType != nullptr) {
        BMimeType checked(superType);
        if (!checked.IsSupertypeOnly())
            return B_BAD_VALUE;
        prefix = FoldedType(superType) + "/";
    }
    std::vector<std::string> installed;
    if (status_t status = MimeDatabase::List(installed); status != B_OK)
        return status;
    std::erase_if(installed, [&prefix](const std::string& type) { return !type.starts_with(prefix); });
    types->MakeEmpty();
    AddAll(*types, "types", installed);
    return B_OK;
}

status_t BMimeType::GetWildcardApps(BMessage* wildcardApps) {
    BMimeType everything("application/octet-stream");
    return everything.GetSupportingApps(wildcardApps);
}

#include <Message.h>

#include "MessageCodec.h"
#include "MessageDelivery.h"
#include <Messenger.h>

#include <algorithm>
#include <cstring>
#include <utility>
#include <vector>

BMessage::BMessage() = default;

BMessage::BMessage(uint32 code) : what(code) {}

BMessage::BMessage(const BMessage& other)
    : what(other.what), mFields(other.mFields), mCurrentSpecifier(other.mCurrentSpecifier) {}

BMessage::~BMessage() {
    AnswerThatThereIsNone();
}

// A sender in another process that does not even take this does not hold up the one who lets a message go.
void BMessage::AnswerThatThereIsNone() {
    constexpr bigtime_t kPatience = 1'000'000;
    if (!IsSourceWaiting())
        return;
    BMessage none(B_NO_REPLY);
    SendReply(&none, BMessenger(), kPatience);
}

BMessage& BMessage::operator=(const BMessage& other) {
    if (this == &other)
        return *this;
    AnswerThatThereIsNone();
    what = other.what;
    mFields = other.mFields;
    mCurrentSpecifier = other.mCurrentSpecifier;
    mDelivery = Delivery();
    return *this;
}

BMessage::BMessage(BMessage&& other) noexcept {
    Take(other);
}

BMessage& BMessage::operator=(BMessage&& other) noexcept {
    if (this == &other)
        return *this;
    AnswerThatThereIsNone();
    Take(other);
    return *this;
}

void BMessage::Take(BMessage& other) {
    what = std::exchange(other.what, 0);
    mFields = std::exchange(other.mFields, MessageFields());
    mCurrentSpecifier = std::exchange(other.mCurrentSpecifier, -1);
    mDelivery = std::exchange(other.mDelivery, Delivery());
}

status_t BMessage::GetInfo(type_code typeRequested, int32 index, char** nameFound, type_code* typeFound,
                           int32* countFound) const {
    if (index < 0)
        return B_BAD_INDEX;
    int32 seen = 0;
    for (const MessageField& field : mFields.All()) {
        if ((typeRequested != B_ANY_TYPE && field.type != typeRequested) || seen++ != index)
            continue;
        if (nameFound != nullptr)
            *nameFound = const_cast<char*>(field.name.c_str());
        if (typeFound != nullptr)
            *typeFound = field.type;
        if (countFound != nullptr)
            *countFound = static_cast<int32>(field.CountItems());
        return B_OK;
    }
    return seen == 0 ? B_NAME_NOT_FOUND : B_BAD_INDEX;
}

status_t BMessage::GetInfo(const char* name, type_code* typeFound, int32* countFound) const {
    const MessageField* field = name != nullptr ? mFields.Find(name) : nullptr;
    if (typeFound != nullptr)
        *typeFound = field != nullptr ? field->type : 0;
    if (countFound != nullptr)
        *countFound = field != nullptr ? static_cast<int32>(field->CountItems()) : 0;
    if (name == nullptr)
        return B_BAD_VALUE;
    return field != nullptr ? B_OK : B_NAME_NOT_FOUND;
}

status_t BMessage::GetInfo(const char* name, type_code* typeFound, bool* fixedSize) const {
    const status_t status = GetInfo(name, typeFound);
    if (status == B_OK && fixedSize != nullptr)
        *fixedSize = mFields.Find(name)->fixedSize;
    return status;
}

int32 BMessage::CountNames(type_code type) const {
    const auto& fields = mFields.All();
    return static_cast<int32>(std::count_if(fields.begin(), fields.end(), [type](const MessageField& field) {
        return type == B_ANY_TYPE || field.type == type;
    }));
}

bool BMessage::IsEmpty() const {
    return mFields.All().empty();
}

bool BMessage::IsSystem() const {
    const auto isCapital = [this](int shift) {
        const uint32 letter = (what >> shift) & 0xff;
        return letter >= 'A' && letter <= 'Z';
    };
    return what >> 24 == '_' && isCapital(16) && isCapital(8) && isCapital(0);
}

bool BMessage::IsReply() const {
    return mDelivery.isReply;
}

status_t BMessage::Rename(const char* oldName, const char* newName) {
    if (oldName == nullptr || newName == nullptr || std::strlen(newName) > kMaxFieldNameLength)
        return B_BAD_VALUE;
    MessageField* field = mFields.Find(oldName);
    if (field == nullptr)
        return B_NAME_NOT_FOUND;
    const MessageField* other = mFields.Find(newName);
    if (other != nullptr && other != field)
        return B_NAME_IN_USE;
    field->name = newName;
    return B_OK;
}

bool BMessage::WasDelivered() const {
    return mDelivery.delivered;
}

bool BMessage::IsSourceWaiting() const {
    return mDelivery.sourceWaiting && !mDelivery.replied;
}

bool BMessage::IsSourceRemote() const {
    // Without a return address it came from here.
    return mDelivery.delivered && mDelivery.replyTo.token != 0 &&
           !MessageDelivery::IsThisTeam(mDelivery.replyTo.team);
}

BMessenger BMessage::ReturnAddress() const {
    return MessageDelivery::MessengerTo(mDelivery.delivered ? mDelivery.replyTo : MessengerAddress());
}

const BMessage* BMessage::Previous() const {
    return mDelivery.previous.get();
}

bool BMessage::WasDropped() const {
    return mDelivery.dropped;
}

BPoint BMessage::DropPoint(BPoint* offset) const {
    if (offset != nullptr)
        *offset = mDelivery.dropOffset;
    return mDelivery.dropPoint;
}

status_t BMessage::SendReply(uint32 command, BHandler* replyTo) {
    BMessage reply(command);
    return SendReply(&reply, replyTo);
}

status_t BMessage::SendReply(BMessage* reply, BHandler* replyTo, bigtime_t timeout) {
    return SendReply(reply, BMessenger(replyTo), timeout);
}

status_t BMessage::SendReply(BMessage* reply, BMessenger replyTo, bigtime_t timeout) {
    if (reply == nullptr)
        return B_BAD_VALUE;
    return MessageDelivery::Reply(*this, *reply, MessageDelivery::AddressOf(replyTo), timeout);
}

status_t BMessage::SendReply(uint32 command, BMessage* replyToReply) {
    BMessage reply(command);
    return SendReply(&reply, replyToReply);
}

status_t BMessage::SendReply(BMessage* reply, BMessage* replyToReply, bigtime_t sendTimeout,
                             bigtime_t replyTimeout) {
    if (reply == nullptr || replyToReply == nullptr)
        return B_BAD_VALUE;
    return MessageDelivery::ReplyAndWait(*this, *reply, replyToReply, sendTimeout, replyTimeout);
}

ssize_t BMessage::FlattenedSize() const {
    return static_cast<ssize_t>(flattened_message_size(mFields));
}

status_t BMessage::Flatten(char* buffer, ssize_t size) const {
    if (buffer == nullptr)
        return B_BAD_VALUE;
    const uint64 needed = flattened_message_size(mFields);
    if (needed > kMaxMessageSize || size < 0 || static_cast<uint64>(size) < needed)
        return B_NO_MEMORY;
    flatten_message(what, mFields, buffer);
    return B_OK;
}

status_t BMessage::Flatten(BDataIO* stream, ssize_t* size) const {
    if (stream == nullptr)
        return B_BAD_VALUE;
    const uint64 needed = flattened_message_size(mFields);
    if (needed > kMaxMessageSize)
        return B_NO_MEMORY;
    std::vector<char> form(static_cast<size_t>(needed));
    flatten_message(what, mFields, form.data());
    size_t written = 0;
    const status_t status = stream->WriteExactly(form.data(), form.size(), &written);
    if (size != nullptr)
        *size = static_cast<ssize_t>(written);
    return status;
}

status_t BMessage::Unflatten(const char* buffer) {
    size_t size = 0;
    const status_t status = buffer != nullptr ? read_message_header(buffer, &size) : B_BAD_VALUE;
    if (status == B_OK)
        return Unflatten(buffer, size);
    *this = BMessage();
    return status;
}

status_t BMessage::Unflatten(const char* buffer, size_t size) {
    BMessage read;
    const status_t status =
        buffer != nullptr ? unflatten_message({buffer, size}, &read.what, &read.mFields) : B_BAD_VALUE;
    int32 specifiers = 0;
    if (status == B_OK && read.GetInfo("specifiers", nullptr, &specifiers) == B_OK)
        read.mCurrentSpecifier = specifiers - 1;
    *this = std::move(read);
    return status;
}

status_t BMessage::Unflatten(BDataIO* stream) {
    if (stream == nullptr) {
        *this = BMessage();
        return B_BAD_VALUE;
    }
    std::vector<char> form(kMessageHeaderSize);
    size_t totalSize = 0;
    status_t status = stream->ReadExactly(form.data(), form.size());
    if (status == B_OK)
        status = read_message_header(form.data(), &totalSize);
    // Piece by piece: the header may promise far more than the stream holds.
    constexpr size_t kPiece = size_t{64} * 1024;
    while (status == B_OK && form.size() < totalSize) {
        const size_t have = form.size();
        form.resize(have + std::min(kPiece, totalSize - have));
        status = stream->ReadExactly(form.data() + have, form.size() - have);
    }
    if (status == B_OK)
        return Unflatten(form.data(), form.size());
    *this = BMessage();
    return status;
}

status_t BMessage::RemoveData(const char* name, int32 index) {
    MessageField* field = name != nullptr ? mFields.Find(name) : nullptr;
    if (name == nullptr)
        return B_BAD_VALUE;
    if (field == nullptr)
        return B_NAME_NOT_FOUND;
    if (index < 0 || static_cast<uint32>(index) >= field->CountItems())
        return B_BAD_INDEX;
    if (field->CountItems() == 1)
        mFields.Remove(field);
    else
        field->RemoveItem(static_cast<uint32>(index));
    return B_OK;
}

status_t BMessage::RemoveName(const char* name) {
    if (name == nullptr)
        return B_BAD_VALUE;
    const MessageField* field = mFields.Find(name);
    if (field == nullptr)
        return B_NAME_NOT_FOUND;
    mFields.Remove(field);
    return B_OK;
}

status_t BMessage::MakeEmpty() {
    mFields.Clear();
    mCurrentSpecifier = -1;
    return B_OK;
}

status_t BMessage::Append(const BMessage& other) {
    MessageFields joined = mFields;
    for (const MessageField& field : other.mFields.All()) {
        for (uint32 index = 0; index < field.CountItems(); index++) {
            const status_t status =
                joined.Add(field.name, field.type, field.fixedSize, field.ItemAt(index), field.CountItems());
            if (status != B_OK)
                return status;
        }
    }
    mFields = std::move(joined);
    return B_OK;
}

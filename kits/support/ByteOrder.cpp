#include <ByteOrder.h>

namespace {

// 0 for a type without a byte order.
size_t element_size(type_code type) {
    switch (type) {
    case B_INT16_TYPE:
    case B_UINT16_TYPE:
        return 2;
    case B_INT32_TYPE:
    case B_UINT32_TYPE:
    case B_FLOAT_TYPE:
    case B_TIME_TYPE:
    case B_RGB_32_BIT_TYPE:
    case B_POINT_TYPE:
    case B_RECT_TYPE:
        return 4;
    case B_INT64_TYPE:
    case B_UINT64_TYPE:
    case B_DOUBLE_TYPE:
    case B_OFF_T_TYPE:
        return 8;
    case B_SIZE_T_TYPE:
    case B_SSIZE_T_TYPE:
        return sizeof(size_t);
    case B_POINTER_TYPE:
    case B_OBJECT_TYPE:
        return sizeof(void*);
    default:
        return 0;
    }
}

bool action_swaps(swap_action action) {
    switch (action) {
    case B_SWAP_HOST_TO_LENDIAN:
    case B_SWAP_LENDIAN_TO_HOST:
        return B_HOST_IS_BENDIAN;
    case B_SWAP_HOST_TO_BENDIAN:
    case B_SWAP_BENDIAN_TO_HOST:
        return B_HOST_IS_LENDIAN;
    case B_SWAP_ALWAYS:
        return true;
    }
    return false;
}

} // namespace

status_t swap_data(type_code type, void* data, size_t length, swap_action action) {
    const size_t size = element_size(type);
    if (size == 0)
        return B_BAD_TYPE;
    if (length % size != 0 || (data == nullptr && length > 0))
        return B_BAD_VALUE;
    if (!action_swaps(action))
        return B_OK;
    char* bytes = static_cast<char*>(data);
    for (char* element = bytes; element != bytes + length; element += size) {
        for (size_t low = 0, high = size - 1; low < high; low++, high--) {
            const char kept = element[low];
            element[low] = element[high];
            element[high] = kept;
        }
    }
    return B_OK;
}

bool is_type_swapped(type_code type) {
    return element_size(type) != 0;
}

#pragma once

namespace cv::ua {

// A service structure lists its fields once, in wire order, in a static
// template Visit(self, visitor); the encoder and the decoder walk that list.
template <class T, class V>
concept StructureFor = requires(T& t, V& v) {
    T::Visit(t, v);
};

}  // namespace cv::ua
